// SPDX-License-Identifier: MIT
// The export run through WriteData, read back through the workbook session.
#include <gtest/gtest.h>

#include <cmath>
#include <fstream>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "bridge/header_rows.h"
#include "hostseries/memory_series.h"
#include "shell/message_box.h"
#include "support/expect_hr.h"
#include "support/temp_dir.h"
#include "support/test_host.h"
#include "workbook/excel_obj.h"

namespace {

using automation::ComPtr;

// 2020-01-02 03:04:05 and the two seconds after it.
constexpr DATE kFirstTime = 43832.0 + (3 * 3600 + 4 * 60 + 5) / 86400.0;
constexpr double kSecond = 1.0 / 86400.0;

struct MessageBoxes {
    std::vector<std::string> texts;
    shell::ScopedMessageSink sink{
        [this](std::string_view text, std::string_view) { texts.emplace_back(text); }};
};

// A host object with a time axis of steps seconds and the given path and string.
ComPtr<IHostSeries> MakeHost(const std::string &path, const std::string &spec, int steps)
{
    auto series = testing_host::MakeSeries(path, spec);
    std::vector<DATE> times;
    for (int t = 0; t < steps; ++t) times.push_back(kFirstTime + t * kSecond);
    hostseries::SetAxisTimes(*series.Get(), times);
    return series;
}

// An item with its catalogue attributes given by sequence numbers.
ComPtr<IHostItem> AddItem(IHostSeries &series, ItemDataType type, std::vector<double> values,
                          const std::string &title, LONG typeSeq = 0, LONG unitSeq = 0, LONG valueType = 0)
{
    auto item = hostseries::AddItemWithValues(series, type, values, title);
    if (typeSeq) item->SetItemType(typeSeq);
    if (unitSeq) item->SetItemUnit(unitSeq);
    item->SetValueType(valueType);
    return item;
}

HRESULT Export(IHostSeries &series)
{
    ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    bridge->SetHostSeries(&series);
    return bridge->WriteData();
}

// The first sheet of a saved workbook, read through a session of its own.
class Sheet {
public:
    explicit Sheet(const std::string &path, int number = 1)
    {
        std::string error;
        EXPECT_TRUE(excel_.StartExcel(error)) << error;
        EXPECT_TRUE(excel_.OpenWorkbook(path, error)) << error;
        EXPECT_TRUE(excel_.SelectSheet(number, error)) << error;
    }
    ~Sheet()
    {
        excel_.CloseWorkbook(0);
        excel_.QuitExcel();
    }
    automation::Variant Cell(int row, int col)
    {
        automation::Variant value;
        excel_.ReadCell(row, col, value);
        return value;
    }
    // The displayed texts of a row, empty cells as "".
    std::vector<std::string> Texts(int row, int col, int count)
    {
        std::vector<std::string> texts;
        excel_.ReadRowTexts(row, col, count, texts);
        return texts;
    }
    double Number(int row, int col)
    {
        const automation::Variant value = Cell(row, col);
        automation::Variant number;
        if (FAILED(VariantChangeType(number.Out(), &value.Raw(), 0, VT_R8))) return NAN;
        return number.Raw().dblVal;
    }
    bool IsEmpty(int row, int col) { return Cell(row, col).Type() == VT_EMPTY; }
    CExcelObj &Session() { return excel_; }

private:
    CExcelObj excel_;
};

using Texts = std::vector<std::string>;

TEST(ComposeHeaderRows, RowsThatCoincideShareCells)
{
    const Texts t = {"Rainfall", "Discharge"}, u = {"mm", "l/s"}, v = {"Accumulated", "Instantaneous"};
    struct Case {
        int typeRow, unitRow, valueRow;
        std::vector<Texts> lists;
    };
    const Case cases[] = {
        {1, 1, 1, {{"Rainfall[mm]:Accumulated", "Discharge[l/s]:Instantaneous"}}},
        {1, 1, 2, {{"Rainfall[mm]", "Discharge[l/s]"}, {"Accumulated", "Instantaneous"}}},
        {1, 2, 1, {{"Rainfall:Accumulated", "Discharge:Instantaneous"}, {"mm", "l/s"}}},
        {2, 1, 1, {{"Rainfall", "Discharge"}, {"mm:Accumulated", "l/s:Instantaneous"}}},
        {3, 2, 1, {{"Rainfall", "Discharge"}, {"mm", "l/s"}, {"Accumulated", "Instantaneous"}}},
    };
    for (const Case &c : cases) {
        std::vector<Texts> lists = {{"stale"}};
        EXPECT_EQ(ComposeHeaderRows(t, u, v, lists, c.typeRow, c.unitRow, c.valueRow), int(c.lists.size()));
        EXPECT_EQ(lists, c.lists) << c.typeRow << c.unitRow << c.valueRow;
    }
    std::vector<Texts> untouched = {{"stale"}};
    EXPECT_EQ(ComposeHeaderRows(t, {"mm"}, v, untouched, 1, 1, 1), 0);
    EXPECT_EQ(untouched, (std::vector<Texts>{{"stale"}}));
    std::vector<Texts> none;
    EXPECT_EQ(ComposeHeaderRows({}, {}, {}, none, 1, 2, 3), 3);
    EXPECT_EQ(none, (std::vector<Texts>{{}, {}, {}}));
}

TEST(ExportWrite, EmptyStringWritesTheDefaultLayoutToANewWorkbook)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("new.xlsx");
    auto host = MakeHost(book, "", 3);
    AddItem(*host.Get(), ItemDataTypeFloat, {1.5, -9999, 2.25}, "Gauge A", 4, 1, 1);
    AddItem(*host.Get(), ItemDataTypeDouble, {0.1, 1e300, -3}, "Gauge B", 3, 2, 4);
    EXPECT_HR(S_OK, Export(*host.Get()));
    EXPECT_EQ(testing_host::Specification(host.Get()),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;");

    Sheet sheet(book);
    EXPECT_EQ(sheet.Texts(1, 1, 4),
              (Texts{"", "Rainfall[millimeter]:Accumulated", "Discharge[liter/sec]:Reverse_Mean_Step_Accumulated", ""}));
    // The empty format stands for true dates; its column has no field to name.
    EXPECT_EQ(sheet.Texts(2, 1, 4), (Texts{"", "Gauge A", "Gauge B", ""}));
    for (int t = 0; t < 3; ++t) {
        EXPECT_NEAR(sheet.Number(3 + t, 1), kFirstTime + t * kSecond, 1e-9) << "row " << 3 + t;
        EXPECT_EQ(sheet.Texts(3 + t, 1, 1)[0].substr(0, 10), "2020/01/02");
    }
    EXPECT_EQ(sheet.Number(3, 2), 1.5);
    EXPECT_TRUE(sheet.IsEmpty(4, 2));  // the delete value, with no DelValRow
    EXPECT_EQ(sheet.Number(5, 2), 2.25);
    EXPECT_EQ(sheet.Number(3, 3), 0.1);
    EXPECT_EQ(sheet.Number(4, 3), 1e300);
    EXPECT_EQ(sheet.Number(5, 3), -3);
    EXPECT_TRUE(sheet.IsEmpty(6, 1));
    EXPECT_TRUE(sheet.IsEmpty(3, 4));
    EXPECT_EQ(sheet.Session().GetSheetCount(), 1);
}

TEST(ExportWrite, EveryDataTypeBecomesANumberAndAnUnhandledOneStopsTheRun)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("types.xlsx");
    auto host = MakeHost(book, "DateTimeCol=2;StartRow=4;UnitTypeRow=1;UnitRow=2;ValueTypeRow=3;"
                               "ItemDescriptionRow=3;",
                         2);
    AddItem(*host.Get(), ItemDataTypeFloat, {0.1, 2}, "float", 2, 1, 0);
    AddItem(*host.Get(), ItemDataTypeDouble, {0.1, 3}, "double", 2, 2, 5);
    AddItem(*host.Get(), ItemDataTypeInt32, {-2147483648.0, 4}, "int32", 2, 9, 2);
    AddItem(*host.Get(), ItemDataTypeUInt32, {4294967295.0, 3000000000.0}, "uint32");
    AddItem(*host.Get(), ItemDataTypeInt16, {-32768, 32767}, "int16");
    AddItem(*host.Get(), ItemDataTypeUInt16, {65535, 7}, "uint16");
    EXPECT_HR(S_OK, Export(*host.Get()));

    Sheet sheet(book);
    // Value type 5 has no name; a unit outside the catalogue shows its number,
    // and so do type and unit of an item that has none.
    EXPECT_EQ(sheet.Texts(1, 3, 4), (Texts{"Water Level", "Water Level", "Water Level", "0"}));
    EXPECT_EQ(sheet.Texts(2, 3, 4), (Texts{"meter", "centimeter", "0", "0"}));
    // The value types share the title row and overwrite the titles from c + k.
    EXPECT_EQ(sheet.Texts(3, 2, 4), (Texts{"", "Instantaneous", "5", "Step_Accumulated"}));
    EXPECT_EQ(sheet.Number(4, 3), double(0.1f));  // widened, not rounded to 0.1
    EXPECT_EQ(sheet.Number(4, 4), 0.1);
    EXPECT_EQ(sheet.Number(4, 5), -2147483648.0);
    EXPECT_EQ(sheet.Number(4, 6), 4294967295.0);  // stays positive
    EXPECT_EQ(sheet.Number(5, 6), 3000000000.0);
    EXPECT_EQ(sheet.Number(4, 7), -32768);
    EXPECT_EQ(sheet.Number(4, 8), 65535);
    EXPECT_EQ(sheet.Number(5, 8), 7);
    EXPECT_TRUE(sheet.IsEmpty(4, 1));  // nothing left of the date/time column
}

TEST(ExportWrite, ValueTypeRowNamesAndNumbers)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("valuetypes.xlsx");
    auto host = MakeHost(book, "DateTimeCol=1;StartRow=5;UnitTypeRow=1;UnitRow=2;ValueTypeRow=3;ItemDescriptionRow=4;", 1);
    for (LONG v : {0, 1, 2, 3, 4, 5, 6, -1}) AddItem(*host.Get(), ItemDataTypeDouble, {1}, "v", 1, 1, v);
    EXPECT_HR(S_OK, Export(*host.Get()));
    Sheet sheet(book);
    EXPECT_EQ(sheet.Texts(3, 2, 8),
              (Texts{"Instantaneous", "Accumulated", "Step_Accumulated", "Mean_Step_Accumulated",
                     "Reverse_Mean_Step_Accumulated", "5", "6", "-1"}));
    EXPECT_EQ(sheet.Texts(1, 2, 1), (Texts{"Undefined"}));
    EXPECT_EQ(sheet.Texts(2, 2, 1), (Texts{"undefined"}));
}

TEST(ExportWrite, UnhandledDataTypeKeepsTheValuesBeforeItAndEndsTheRows)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("stop.xlsx");
    auto host = MakeHost(book, "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;", 3);
    AddItem(*host.Get(), ItemDataTypeDouble, {11, 12, 13}, "first");
    auto unhandled = AddItem(*host.Get(), ItemDataTypeDouble, {21, 22, 23}, "second");
    unhandled->SetDataType(ItemDataType(3));
    AddItem(*host.Get(), ItemDataTypeDouble, {31, 32, 33}, "third");
    EXPECT_HR(S_OK, Export(*host.Get()));
    Sheet sheet(book);
    EXPECT_EQ(sheet.Texts(2, 1, 4), (Texts{"", "first", "second", "third"}));
    EXPECT_NEAR(sheet.Number(3, 1), kFirstTime, 1e-9);
    EXPECT_EQ(sheet.Number(3, 2), 11);
    EXPECT_TRUE(sheet.IsEmpty(3, 3));
    EXPECT_TRUE(sheet.IsEmpty(3, 4));
    EXPECT_TRUE(sheet.IsEmpty(4, 1));
    EXPECT_TRUE(sheet.IsEmpty(4, 2));
}

TEST(ExportWrite, DeleteValueRowWritesTheMarkerAndTheMissingValuesAsNumbers)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("delval.xlsx");
    // The delete value row shares the title row: the title wins column c.
    auto host = MakeHost(book, "DateTimeCol=2;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=4;UnitTypeRow=1;"
                               "UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;DelValRow=2;",
                         2);
    host->SetDeleteValue(-99.5);
    AddItem(*host.Get(), ItemDataTypeFloat, {-99.5, 1}, "A");
    EXPECT_HR(S_OK, Export(*host.Get()));
    {
        Sheet sheet(book);
        EXPECT_EQ(sheet.Texts(2, 2, 2), (Texts{"Date/time", "A"}));
        EXPECT_EQ(sheet.Number(4, 3), -99.5);
        EXPECT_EQ(sheet.Number(5, 3), 1);
    }
    // A row of its own holds the delete value as a number in column c.
    auto own = MakeHost(book, "DateTimeCol=2;StartRow=4;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;"
                              "ItemDescriptionRow=2;DelValRow=3;",
                        2);
    own->SetDeleteValue(-99.5);
    AddItem(*own.Get(), ItemDataTypeDouble, {-99.5, -99.50000001}, "A");
    EXPECT_HR(S_OK, Export(*own.Get()));
    Sheet sheet(book);
    EXPECT_EQ(sheet.Number(3, 2), -99.5);
    EXPECT_EQ(sheet.Number(4, 3), -99.5);
    EXPECT_EQ(sheet.Number(5, 3), -99.50000001);

    // Without the row, a value equal in single precision is an empty cell.
    auto none = MakeHost(book, "DateTimeCol=2;StartRow=4;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;", 2);
    none->SetDeleteValue(-99.5);
    AddItem(*none.Get(), ItemDataTypeDouble, {-99.50000001, -99.6}, "A");
    EXPECT_HR(S_OK, Export(*none.Get()));
    Sheet after(book);
    EXPECT_TRUE(after.IsEmpty(4, 3));
    EXPECT_EQ(after.Number(5, 3), -99.6);
    EXPECT_TRUE(after.IsEmpty(3, 2));  // the old marker was cleared
}

TEST(ExportWrite, FormatWithTwoFieldsWritesTwoDateTimeColumns)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("split.xlsx");
    auto host = MakeHost(book, "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD|HH:mm:ss;StartRow=3;UnitTypeRow=1;"
                               "UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;",
                         2);
    AddItem(*host.Get(), ItemDataTypeDouble, {5, 6}, "A", 2, 1, 0);
    EXPECT_HR(S_OK, Export(*host.Get()));
    Sheet sheet(book);
    EXPECT_EQ(sheet.Texts(2, 1, 3), (Texts{"Date", "Time", "A"}));
    EXPECT_EQ(sheet.Texts(1, 1, 3), (Texts{"", "", "Water Level[meter]:Instantaneous"}));
    EXPECT_EQ(sheet.Texts(3, 1, 3), (Texts{"2020-01-02", "03:04:05", "5"}));
    EXPECT_EQ(sheet.Texts(4, 1, 3), (Texts{"2020-01-02", "03:04:06", "6"}));
}

TEST(ExportWrite, NoItemsWritesTheTimeColumnAlone)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("empty.xlsx");
    auto host = MakeHost(book, "DateTimeCol=1;DateTimeFormat=YYYY/MM/DD HH:mm:ss;StartRow=3;UnitTypeRow=1;"
                               "UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;",
                         2);
    EXPECT_HR(S_OK, Export(*host.Get()));
    Sheet sheet(book);
    EXPECT_EQ(sheet.Texts(2, 1, 2), (Texts{"Date/time", ""}));
    EXPECT_TRUE(sheet.IsEmpty(1, 1));
    EXPECT_TRUE(sheet.IsEmpty(1, 2));
    EXPECT_FALSE(sheet.IsEmpty(3, 1));
    EXPECT_FALSE(sheet.IsEmpty(4, 1));
    EXPECT_TRUE(sheet.IsEmpty(3, 2));
}

TEST(ExportWrite, WithoutAPlaceForTheDataTheSheetIsSavedCleared)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("cleared.xlsx");
    auto first = MakeHost(book, "", 2);
    AddItem(*first.Get(), ItemDataTypeDouble, {1, 2}, "A");
    ASSERT_HR(S_OK, Export(*first.Get()));
    for (const char *spec : {"DateTimeCol=1;UnitTypeRow=1;", "StartRow=3;ItemDescriptionRow=2;",
                             "DateTimeCol=0;StartRow=3;", "DateTimeCol=1;StartRow=-2;"}) {
        auto host = MakeHost(book, spec, 2);
        AddItem(*host.Get(), ItemDataTypeDouble, {1, 2}, "A");
        EXPECT_HR(S_OK, Export(*host.Get())) << spec;
        Sheet sheet(book);
        EXPECT_TRUE(sheet.IsEmpty(2, 1)) << spec;
        EXPECT_TRUE(sheet.IsEmpty(3, 2)) << spec;
    }
    // Header rows that a string leaves out are not written; the rest is.
    auto partial = MakeHost(book, "DateTimeCol=1;StartRow=2;UnitRow=1;", 1);
    AddItem(*partial.Get(), ItemDataTypeDouble, {4}, "A", 2, 3);
    EXPECT_HR(S_OK, Export(*partial.Get()));
    Sheet sheet(book);
    EXPECT_EQ(sheet.Texts(1, 1, 2), (Texts{"", "millimeter"}));
    EXPECT_EQ(sheet.Number(2, 2), 4);
}

TEST(ExportWrite, SaveTemplateReferenceIsExpandedOnceAndAFailedOneReported)
{
    testing_host::TempDir dir;
    const std::string book = dir.File("templated.xlsx");
    const std::string good = dir.File("save.xml");
    std::ofstream(good) << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                           "<MSExcelVantrelSpecification xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n"
                           "DateTimeCol=\"2\" UseDTFormat=\"true\" DateTimeFormat=\"YYYY.MM.DD|HH:mm\" "
                           "UnitTypeRow=\"1\" UnitRow=\"2\" ValueTypeRow=\"2\" ItemDescriptionRow=\"3\" "
                           "StartRow=\"5\" UseDelValNotEmpty=\"true\" DeleteValueRow=\"4\" />";
    MessageBoxes boxes;
    auto host = MakeHost(book, "TemplateFilePath=" + good + ";StartRow=99;", 1);
    AddItem(*host.Get(), ItemDataTypeDouble, {-9999}, "A", 4, 1, 1);
    EXPECT_HR(S_OK, Export(*host.Get()));
    EXPECT_EQ(testing_host::Specification(host.Get()),
              "DateTimeCol=2;DateTimeFormat=YYYY.MM.DD|HH:mm;StartRow=5;UnitTypeRow=1;UnitRow=2;"
              "ValueTypeRow=2;ItemDescriptionRow=3;DelValRow=4;");
    EXPECT_TRUE(boxes.texts.empty());
    {
        Sheet sheet(book);
        EXPECT_EQ(sheet.Texts(1, 4, 1), (Texts{"Rainfall"}));
        EXPECT_EQ(sheet.Texts(2, 4, 1), (Texts{"millimeter:Accumulated"}));
        EXPECT_EQ(sheet.Texts(3, 2, 3), (Texts{"Date", "Hour:Minute", "A"}));
        EXPECT_EQ(sheet.Number(4, 2), -9999);
        EXPECT_EQ(sheet.Texts(5, 2, 3), (Texts{"2020.01.02", "03:04", "-9999"}));
    }

    // An open template has no place in the short schema: message 134, and the
    // run goes on with the string as it stood.
    const std::string open = dir.File("open.xml");
    std::ofstream(open) << "<?xml version=\"1.0\"?><MSExcelVantrelSpecification ExcelSheet=\"1\" "
                           "GlobalDate=\"2020-01-01\" GlobalTime=\"00:00:00\"/>";
    const std::string reference = "TemplateFilePath=" + open + ";DateTimeCol=1;StartRow=7;";
    auto failed = MakeHost(book, reference, 1);
    AddItem(*failed.Get(), ItemDataTypeDouble, {8}, "B");
    EXPECT_HR(S_OK, Export(*failed.Get()));
    EXPECT_EQ(boxes.texts, (Texts{"The xml File is not valid."}));
    EXPECT_EQ(testing_host::Specification(failed.Get()), reference);
    Sheet sheet(book);
    EXPECT_EQ(sheet.Number(7, 2), 8);
    EXPECT_TRUE(sheet.IsEmpty(5, 4));

    // A reference without a path, or not in the first piece, is left alone.
    for (const std::string &spec : {std::string("TemplateFilePath=;StartRow=3;DateTimeCol=1;"),
                                   "StartRow=3;TemplateFilePath=" + good + ";DateTimeCol=1;"}) {
        auto plain = MakeHost(book, spec, 1);
        EXPECT_HR(S_OK, Export(*plain.Get()));
        EXPECT_EQ(testing_host::Specification(plain.Get()), spec);
    }
    EXPECT_EQ(boxes.texts.size(), 1u);
}

}  // namespace
