// SPDX-License-Identifier: MIT
// The export run through WriteData, read back through a workbook session.
#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <tuple>
#include <string>
#include <vector>

#include "automation/values.h"
#include "bridge/export_host.h"
#include "support/files.h"
#include "support/message_boxes.h"
#include "support/temp_dir.h"
#include "workbook/excel_obj.h"

namespace {

using Texts = std::vector<std::string>;

using bridge_testing::AddItem;
using bridge_testing::Export;
using bridge_testing::MakeHost;

// The first sheet of a saved workbook, read through a session of its own.
class Sheet {
public:
    explicit Sheet(const std::string &path)
    {
        std::string error;
        EXPECT_TRUE(excel_.StartExcel(error) && excel_.OpenWorkbook(path, error) && excel_.SelectSheet(1, error)) << error;
    }
    ~Sheet()
    {
        excel_.CloseWorkbook(0);
        excel_.QuitExcel();
    }
    // The displayed texts of a row, empty cells as "".
    Texts Row(int row, int col, int count)
    {
        Texts texts;
        excel_.ReadRowTexts(row, col, count, texts);
        return texts;
    }
    double Number(int row, int col)
    {
        automation::Variant value, number;
        excel_.ReadCell(row, col, value);
        if (FAILED(VariantChangeType(number.Out(), &value.Raw(), 0, VT_R8))) return NAN;
        return number.Raw().dblVal;
    }
    bool IsEmpty(int row, int col) { return Row(row, col, 1) == Texts{""}; }

private:
    CExcelObj excel_;
};

TEST(ExportWrite, HeaderRowsThatCoincideShareCells)
{
    struct Case {
        std::string rows;
        std::vector<Texts> texts;  // rows 1 to 3 over the two items
    };
    const Case cases[] = {
        {"UnitTypeRow=1;UnitRow=1;ValueTypeRow=2;",
         {{"Rainfall[millimeter]", "Discharge[liter/sec]"}, {"Accumulated", "Reverse_Mean_Step_Accumulated"}, {"", ""}}},
        {"UnitTypeRow=1;UnitRow=2;ValueTypeRow=1;",
         {{"Rainfall:Accumulated", "Discharge:Reverse_Mean_Step_Accumulated"}, {"millimeter", "liter/sec"}, {"", ""}}},
        {"UnitTypeRow=2;UnitRow=1;ValueTypeRow=1;",
         {{"millimeter:Accumulated", "liter/sec:Reverse_Mean_Step_Accumulated"}, {"Rainfall", "Discharge"}, {"", ""}}},
        {"UnitTypeRow=3;UnitRow=2;ValueTypeRow=1;",
         {{"Accumulated", "Reverse_Mean_Step_Accumulated"}, {"millimeter", "liter/sec"}, {"Rainfall", "Discharge"}}},
        // Header rows that a string leaves out are not written.
        {"UnitRow=2;", {{"", ""}, {"millimeter", "liter/sec"}, {"", ""}}},
    };
    testing_host::TempDir dir;
    const std::string book = dir.File("headers.xlsx");
    for (const Case &c : cases) {
        SCOPED_TRACE(c.rows);
        auto host = MakeHost(book, "DateTimeCol=1;StartRow=5;ItemDescriptionRow=4;" + c.rows, 1);
        AddItem(*host.Get(), ItemDataTypeFloat, {1}, "A", 4, 1, 1);
        AddItem(*host.Get(), ItemDataTypeFloat, {2}, "B", 3, 2, 4);
        ASSERT_HR(S_OK, Export(*host.Get()));
        Sheet sheet(book);
        for (int row = 1; row <= 3; ++row) EXPECT_EQ(sheet.Row(row, 2, 2), c.texts[size_t(row - 1)]) << "row " << row;
        EXPECT_EQ(sheet.Row(4, 1, 3), (Texts{"", "A", "B"}));
        EXPECT_EQ(sheet.Row(5, 2, 2), (Texts{"1", "2"}));
    }
}

TEST(ExportWrite, EveryHandledDataTypeBecomesANumberAndAnUnhandledOneEndsTheRows)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("types.xlsx");
    auto host = MakeHost(book, "DateTimeCol=2;StartRow=5;UnitTypeRow=1;UnitRow=2;ValueTypeRow=3;ItemDescriptionRow=4;", 2);
    AddItem(*host.Get(), ItemDataTypeFloat, {0.1, 2}, "float", 2, 1, 0);
    AddItem(*host.Get(), ItemDataTypeDouble, {0.1, 3}, "double", 2, 2, 5);
    AddItem(*host.Get(), ItemDataTypeInt32, {-2147483648.0, 4}, "int32", 2, 9, 2);
    AddItem(*host.Get(), ItemDataTypeUInt32, {4294967295.0, 5}, "uint32", 0, 0, -1);
    AddItem(*host.Get(), ItemDataTypeInt16, {-32768, 6}, "int16");
    AddItem(*host.Get(), ItemDataTypeUInt16, {65535, 7}, "uint16");
    AddItem(*host.Get(), ItemDataTypeDouble, {21, 22}, "unhandled")->SetDataType(ItemDataType(3));
    AddItem(*host.Get(), ItemDataTypeDouble, {31, 32}, "after");
    EXPECT_HR(S_OK, Export(*host.Get()));

    Sheet sheet(book);
    // Value type 5 has no name; a unit outside the catalogue shows its number,
    // and so do type and unit of an item that has none.
    EXPECT_EQ(sheet.Row(1, 3, 4), (Texts{"Water Level", "Water Level", "Water Level", "0"}));
    EXPECT_EQ(sheet.Row(2, 3, 4), (Texts{"meter", "centimeter", "0", "0"}));
    EXPECT_EQ(sheet.Row(3, 2, 8), (Texts{"", "Instantaneous", "5", "Step_Accumulated", "-1", "Instantaneous",
                                         "Instantaneous", "Instantaneous"}));
    const double firstRow[] = {double(0.1f), 0.1, -2147483648.0, 4294967295.0, -32768, 65535};
    for (int i = 0; i < 6; ++i) EXPECT_EQ(sheet.Number(5, 3 + i), firstRow[i]) << "column " << 3 + i;
    // The unhandled type stops the run in its first row: nothing from it on.
    EXPECT_TRUE(sheet.IsEmpty(5, 9));
    EXPECT_TRUE(sheet.IsEmpty(5, 10));
    EXPECT_TRUE(sheet.IsEmpty(6, 2));
    EXPECT_TRUE(sheet.IsEmpty(6, 3));
}

TEST(ExportWrite, DeleteValueRowAndSplitDateTimeColumns)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("delval.xlsx");
    // The delete value in its own row, at column c; the format's two fields
    // make two date/time columns.
    auto shared = MakeHost(book, "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD|HH:mm:ss;StartRow=4;UnitTypeRow=1;UnitRow=1;"
                                 "ValueTypeRow=1;ItemDescriptionRow=2;DelValRow=3;", 2);
    shared->SetDeleteValue(-99.5);
    AddItem(*shared.Get(), ItemDataTypeDouble, {-99.5, 6}, "A", 2, 1, 0);
    EXPECT_HR(S_OK, Export(*shared.Get()));
    {
        Sheet sheet(book);
        EXPECT_EQ(sheet.Row(1, 1, 3), (Texts{"", "", "Water Level[meter]:Instantaneous"}));
        EXPECT_EQ(sheet.Row(2, 1, 3), (Texts{"Date", "Time", "A"}));
        EXPECT_EQ(sheet.Number(3, 1), -99.5);
        EXPECT_EQ(sheet.Row(4, 1, 3), (Texts{"2020-01-02", "03:04:05", "-99.5"}));
        EXPECT_EQ(sheet.Row(5, 1, 3), (Texts{"2020-01-02", "03:04:06", "6"}));
    }
    // Without the row, a value equal in single precision is an empty cell.
    auto none = MakeHost(book, "DateTimeCol=2;StartRow=4;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;", 2);
    none->SetDeleteValue(-99.5);
    AddItem(*none.Get(), ItemDataTypeDouble, {-99.50000001, -99.6}, "A");
    EXPECT_HR(S_OK, Export(*none.Get()));
    Sheet sheet(book);
    EXPECT_TRUE(sheet.IsEmpty(4, 3));
    EXPECT_EQ(sheet.Number(5, 3), -99.6);
}

TEST(ExportWrite, ALayoutThatCantHoldTheSeriesIsRefusedBeforeTheWorkbookIsTouched)
{
    struct Case {
        std::string spec;
        int steps;
        int items;
        std::string message;
        double last = 2;  // the last value of each item
    };
    const std::string rows = "UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;";
    const Case cases[] = {
        {"DateTimeCol=1;" + rows, 2, 1, "StartRow is missing: give the first data row of the export (StartRow=3, for one)."},
        {"DateTimeCol=1;StartRow=-2;", 2, 1, "StartRow=-2 names no row: the first data row is 1 or more."},
        {"StartRow=3;" + rows, 2, 1, "DateTimeCol is missing: give the column of the date and time (DateTimeCol=1, for one)."},
        {"DateTimeCol=0;StartRow=3;", 2, 1, "DateTimeCol=0 names no column: the date/time column is 1 or more."},
        {"DateTimeCol=1;StartRow=3;" + rows + "DelValRow=3;", 2, 1,
         "DelValRow=3 is not above StartRow=3: the header rows stand above the first data row."},
        {"DateTimeCol=1;StartRow=3;" + rows + "DelValRow=2;", 2, 1,
         "ItemDescriptionRow=2 and DelValRow=2 name the same row: give each its own row (only the item type, unit "
         "and value type rows may share one)."},
        {"DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=2;ItemDescriptionRow=2;", 2, 1,
         "ItemDescriptionRow=2 and UnitRow=2 name the same row: give each its own row (only the item type, unit "
         "and value type rows may share one)."},
        {"DateTimeCol=1;DateTimeFormat=YYYYMMDD;StartRow=3;", 2, 1,
         "DateTimeFormat=YYYYMMDD can't be written: each field is one letter repeated (YYYY, MM, DD, HH, mm, ss), "
         "with one of the separators / T:-.| between two fields."},
        {"DateTimeCol=1;DateTimeFormat=||;StartRow=3;", 2, 1,
         "DateTimeFormat=|| has no field: give a format such as YYYY-MM-DD HH:mm:ss, or leave the key out."},
        {"DateTimeCol=1;DateTimeFormat=YYYY-MM-DD;StartRow=3;", 2, 1,
         "Time step 1 (2020-01-02 03:04:05) would not read back as itself but as 2020-01-02 00:00:00 under "
         "DateTimeFormat=YYYY-MM-DD: give a format with every field of the time steps (YYYY-MM-DD HH:mm:ss, for one)."},
        {"DateTimeCol=16383;StartRow=3;", 2, 2,
         "The export needs columns up to 16385 (2 items beside 1 date/time column from DateTimeCol=16383), but a "
         "sheet ends at column 16384 (XFD): export fewer items or move the date/time column to the left."},
        {"DateTimeCol=1;StartRow=1048576;", 2, 1,
         "The export needs rows up to 1048577 (2 time steps from StartRow=1048576), but a sheet ends at row 1048576: "
         "export fewer time steps or start them higher."},
        {"TemplateFilePath=/no/such/save.xml;", 2, 1, "Can not Open the xml file."},
        {"DateTimeCol=1;StartRow=3;", 2, 2, "Item 1 holds no number (NaN) at time step 2, which no cell can hold. Nothing was written.", NAN},
    };
    testing_host::TempDir dir;
    const std::string book = dir.File("kept.xlsx"), fresh = dir.File("fresh.xlsx");
    auto first = MakeHost(book, "", 2);
    AddItem(*first.Get(), ItemDataTypeDouble, {1, 2}, "A");
    ASSERT_HR(S_OK, Export(*first.Get()));
    const std::string before = testing_host::ReadFile(book);
    for (const Case &c : cases) {
        SCOPED_TRACE(c.spec);
        for (const std::string &path : {book, fresh}) {
            testing_host::MessageBoxes boxes;
            auto host = MakeHost(path, c.spec, c.steps);
            for (int i = 0; i < c.items; ++i) AddItem(*host.Get(), ItemDataTypeDouble, {1, c.last}, "A");
            EXPECT_HR(E_FAIL, Export(*host.Get()));
            EXPECT_EQ(testing_host::TakeErrorDescription(), c.message);
            EXPECT_EQ(boxes.texts, (Texts{c.message}));
            EXPECT_EQ(testing_host::Specification(host.Get()), c.spec);
        }
        EXPECT_EQ(testing_host::ReadFile(book), before);
        EXPECT_FALSE(std::filesystem::exists(fresh));
    }
}

TEST(ExportWrite, ItemsRunToTheLastColumnOfTheSheet)
{
    // 710 items with the default layout: columns beyond ZZ, up to AAI. A
    // layout that ends in column XFD fits as well.
    testing_host::TempDir dir;
    const std::string book = dir.File("wide.xlsx");
    for (const auto &[spec, items, lastColumn] : {std::tuple{std::string(), 710, 711},
                                                  std::tuple{std::string("DateTimeCol=16382;StartRow=2;ItemDescriptionRow=1;"), 2, 16384}}) {
        auto host = MakeHost(book, spec, 2);
        for (int i = 1; i <= items; ++i) AddItem(*host.Get(), ItemDataTypeDouble, {double(i), 0}, "T" + std::to_string(i));
        ASSERT_HR(S_OK, Export(*host.Get()));
        Sheet sheet(book);
        EXPECT_EQ(sheet.Row(spec.empty() ? 2 : 1, lastColumn, 1), Texts{"T" + std::to_string(items)});
        EXPECT_EQ(sheet.Number(spec.empty() ? 3 : 2, lastColumn), items);
    }
}

TEST(ExportWrite, SaveTemplateReferenceIsExpandedOnceAndAFailedOneReported)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("templated.xlsx");
    const std::string good = dir.File("save.xml");
    testing_host::WriteFile(good, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<MSExcelVantrelSpecification "
                                  "DateTimeCol=\"2\" UseDTFormat=\"true\" DateTimeFormat=\"YYYY.MM.DD|HH:mm:ss\" "
                                  "UnitTypeRow=\"1\" UnitRow=\"2\" ValueTypeRow=\"2\" ItemDescriptionRow=\"3\" "
                                  "StartRow=\"5\" UseDelValNotEmpty=\"true\" DeleteValueRow=\"4\" />");
    testing_host::MessageBoxes boxes;
    auto host = MakeHost(book, "TemplateFilePath=" + good + ";StartRow=99;", 1);
    AddItem(*host.Get(), ItemDataTypeDouble, {-9999}, "A", 4, 1, 1);
    EXPECT_HR(S_OK, Export(*host.Get()));
    EXPECT_EQ(testing_host::Specification(host.Get()),
              "DateTimeCol=2;DateTimeFormat=YYYY.MM.DD|HH:mm:ss;StartRow=5;UnitTypeRow=1;UnitRow=2;"
              "ValueTypeRow=2;ItemDescriptionRow=3;DelValRow=4;");
    EXPECT_TRUE(boxes.texts.empty());
    // An open template has no place in the short schema: the export is
    // refused with the message, and the workbook and the string stay.
    const std::string open = dir.File("open.xml");
    testing_host::WriteFile(open, "<?xml version=\"1.0\"?><MSExcelVantrelSpecification ExcelSheet=\"1\" "
                                  "GlobalDate=\"2020-01-01\" GlobalTime=\"00:00:00\"/>");
    const std::string reference = "TemplateFilePath=" + open + ";DateTimeCol=1;StartRow=7;";
    auto failed = MakeHost(book, reference, 1);
    AddItem(*failed.Get(), ItemDataTypeDouble, {8}, "B");
    EXPECT_HR(E_FAIL, Export(*failed.Get()));
    EXPECT_EQ(boxes.texts, (Texts{"The xml File is not valid."}));
    EXPECT_EQ(testing_host::Specification(failed.Get()), reference);
    Sheet sheet(book);
    EXPECT_TRUE(sheet.IsEmpty(7, 2));
    EXPECT_EQ(sheet.Number(5, 4), -9999);
}

}  // namespace
