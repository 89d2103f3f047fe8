// SPDX-License-Identifier: MIT
// The import through the module: what the host object holds after ReadData
// on real workbooks, with the layout given in the string or by a template.
#include <gtest/gtest.h>

#include <clocale>

#include <string>
#include <vector>

#include "bridge/module_bridge.h"
#include "hostseries/memory_series.h"
#include "support/files.h"
#include "support/temp_dir.h"

namespace {

using bridge_testing::Fixture;

const std::string kHeaders = "ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;";

// An item as the host object holds it.
struct Item {
    std::string title;
    LONG itemType = 0;  // identifier of the units library
    LONG unit = 0;
    LONG valueType = 0;
    std::vector<double> values;
    bool operator==(const Item &) const = default;
};

void PrintTo(const Item &item, std::ostream *out)
{
    *out << item.title << " " << item.itemType << " " << item.unit << " " << item.valueType << " "
         << ::testing::PrintToString(item.values);
}

struct Read {
    HRESULT hr = S_OK;
    std::string error;
    std::vector<std::string> messages;
    std::vector<Item> items;
    std::vector<DATE> times;
    double deleteValue = 0.0;
};

Read ReadBook(const std::string &book, const std::string &spec, bool inspectFirst = false)
{
    auto series = testing_host::MakeSeries(book, spec, false);
    auto bridge = bridge_testing::MakeModuleBridge();
    testing_host::MessageBoxes boxes;
    bridge->SetHostSeries(series.Get());
    Read read;
    if (inspectFirst) {
        SHORT fits = 0;
        EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits));
        EXPECT_EQ(fits, SHORT(VARIANT_TRUE));
    }
    SetErrorInfo(0, nullptr);
    read.hr = bridge->ReadData();
    read.error = testing_host::TakeErrorDescription();
    read.messages = boxes.texts;
    for (LONG i = 1; i <= testing_host::ItemCount(series.Get()); ++i) {
        auto hostItem = hostseries::ItemAt(*series.Get(), i);
        Item item;
        automation::Bstr title;
        hostItem->GetTitle(title.Out());
        item.title = title.Utf8();
        hostItem->GetItemType(&item.itemType);
        hostItem->GetItemUnit(&item.unit);
        hostItem->GetValueType(&item.valueType);
        item.values = hostseries::ReadValues(*hostItem.Get());
        read.items.push_back(item);
    }
    read.times = hostseries::ReadTimes(*series.Get());
    series->GetDeleteValue(&read.deleteValue);
    return read;
}

// 2024-03-01 00:00:00 as a date serial, and an hour.
constexpr DATE kMarch1 = 45352.0;
constexpr DATE kHour = 1.0 / 24.0;

void ExpectTimes(const std::vector<DATE> &actual, const std::vector<DATE> &expected)
{
    ASSERT_EQ(actual.size(), expected.size());
    for (size_t i = 0; i < actual.size(); ++i) EXPECT_NEAR(actual[i], expected[i], 1e-9) << "step " << i + 1;
}

std::vector<double> Floats(std::vector<double> values)
{
    for (double &v : values) v = double(float(v));  // the host holds 32-bit floats
    return values;
}

TEST(ImportRead, LayoutsReadIntoItemsTimesAndDeleteValue)
{
    const std::vector<DATE> threeHours = {kMarch1, kMarch1 + kHour, kMarch1 + 2 * kHour};
    struct Case {
        const char *what;
        std::string spec;
        std::vector<Item> items;
        std::vector<DATE> times;
        double deleteValue = -9999.0;  // the host's own
        bool inspectFirst = false;
        const char *numericLocale = "C";  // the C library's, while the read runs
    };
    const Case cases[] = {
        // Column order; the date/time column gives no item; an empty cell and
        // a word read as the delete value.
        {"both sides of the date/time", "DateTimeCol=2;StartRow=5;" + kHeaders + "DeleteValue=-1;ExcelSheet=1;",
         {{"West", 1000, 2101, 0, Floats({0.1, -1.0, 3.25, -1.0})}, {"East", 1001, 2201, 3, Floats({1e-3, 2, 3, 4})},
          {"North", 1002, 2300, 2, {5, 6, 7, 8}}},
         {kMarch1, kMarch1 + kHour, kMarch1 + 2 * kHour, kMarch1 + 3 * kHour}, -1.0},
        {"one shared header row", "DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=2;ValueTypeRow=2;ExcelSheet=2;",
         {{"Gauge", 1000, 2100, 3, {1, 2}}, {"Pipe", 1001, 2201, 1, {3, 4}}}, {kMarch1, kMarch1 + kHour}},
        // Global texts win over the rows; a unit may be an abbreviation in any case.
        {"global texts", "DateTimeCol=1;StartRow=5;" + kHeaders + "GlobalUnitType=water level;GlobalUnit=CM;GlobalValueType=ACCUMULATED;ExcelSheet=7;",
         {{"S1 a", 1000, 2101, 1, {1, 2, 3}}, {"S1 b", 1000, 2101, 1, {4, 5, 6}}, {"S1 c", 1000, 2101, 1, {7, 8, 9}}}, threeHours},
        // An attribute that doesn't resolve leaves type and unit unset, and the read goes on.
        {"unknown type", "DateTimeCol=1;StartRow=5;" + kHeaders + "GlobalUnitType=Flux;ExcelSheet=7;",
         {{"S1 a", 0, 0, 0, {1, 2, 3}}, {"S1 b", 0, 0, 0, {4, 5, 6}}, {"S1 c", 0, 0, 0, {7, 8, 9}}}, threeHours},
        // The inspection leaves the workbook to the read.
        {"two sheets after an inspection", "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=7,8;",
         {{"S1 a", 1000, 2100, 0, {1, 2, 3}}, {"S1 b", 1000, 2100, 0, {4, 5, 6}}, {"S1 c", 1000, 2100, 0, {7, 8, 9}},
          {"S2 a", 1002, 2300, 1, {10, 11, 12}}, {"S2 b", 1002, 2300, 1, {13, 14, 15}}},
         threeHours, -9999.0, true},
        {"delete value row", "DateTimeCol=1;StartRow=6;" + kHeaders + "DelValRow=5;ExcelSheet=3;",
         {{"Level", 1000, 2100, 0, {-999, 2, -999}}}, threeHours, -999.0},
        // The string's DeleteValue wins over the row, and passes through 32 bits.
        {"DeleteValue and row", "DateTimeCol=1;StartRow=6;" + kHeaders + "DeleteValue=0.1;DelValRow=5;ExcelSheet=3;",
         {{"Level", 1000, 2100, 0, {-999, 2, -999}}}, threeHours, double(0.1f)},
        // A decimal point whatever the locale's.
        {"DeleteValue in a decimal-comma locale", "DateTimeCol=1;StartRow=6;" + kHeaders + "DeleteValue=-9999.5;ExcelSheet=3;",
         {{"Level", 1000, 2100, 0, {-999, 2, -999}}}, threeHours, -9999.5, false, "de_DE.UTF-8"},
        {"DeleteValue no number", "DateTimeCol=1;StartRow=6;" + kHeaders + "DeleteValue=abc;ExcelSheet=3;",
         {{"Level", 1000, 2100, 0, {-999, 2, -999}}}, threeHours, 0.0},
        // A row cell that is a word keeps the host's delete value.
        {"delete value word", "DateTimeCol=1;StartRow=6;" + kHeaders + "DelValRow=5;ExcelSheet=9;",
         {{"Level", 1000, 2100, 0, {-9999, 2}}}, {kMarch1, kMarch1 + kHour}},
        {"time of day and GlobalDate", "TimeCol=1;TimeFormat=HH:mm:ss;GlobalDate=2024-03-01;StartRow=5;" + kHeaders + "ExcelSheet=4;",
         {{"Level", 1000, 2100, 0, {1, 2, 3}}}, {kMarch1 + 0.25, kMarch1 + 0.25 + kHour / 2, kMarch1 + 7 * kHour + 15.0 / 86400}},
        {"no data rows", "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=6;",
         {{"Level", 1000, 2100, 0, {}}, {"Flow", 1001, 2200, 1, {}}}, {}},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.what);
        ASSERT_NE(std::setlocale(LC_NUMERIC, c.numericLocale), nullptr);
        const Read read = ReadBook(Fixture("import.xlsx"), c.spec, c.inspectFirst);
        std::setlocale(LC_NUMERIC, "C");
        EXPECT_HR(S_OK, read.hr);
        EXPECT_TRUE(read.messages.empty());
        EXPECT_EQ(read.items, c.items);
        ExpectTimes(read.times, c.times);
        EXPECT_EQ(read.deleteValue, c.deleteValue);
    }
}

TEST(ImportRead, FaultsLeaveNoItems)
{
    // Two equal times: the run stops, says where, and leaves no item.
    const Read equal = ReadBook(Fixture("import.xlsx"), "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=5;");
    const std::string fault = "The date and time is not in ascending order - error at time step 2.";
    EXPECT_HR(E_FAIL, equal.hr);
    EXPECT_EQ(equal.error, fault);
    EXPECT_EQ(equal.messages, std::vector<std::string>{fault});
    EXPECT_TRUE(equal.items.empty());
    // No StartRow: the run fails with an empty text.
    const Read noStart = ReadBook(Fixture("import.xlsx"), "DateTimeCol=1;" + kHeaders + "ExcelSheet=7;");
    EXPECT_HR(E_FAIL, noStart.hr);
    EXPECT_EQ(noStart.error, "");
    EXPECT_TRUE(noStart.messages.empty());
    const Read below = ReadBook(Fixture("import.xlsx"), "DateTimeCol=1;StartRow=1048577;" + kHeaders + "ExcelSheet=7;");
    EXPECT_EQ(below.error, "StartRow=1048577 lies below a sheet's last row, 1048576: give the first data row a number "
                           "from 1 to 1048576.");
}

// Dates come in as the workbook shows them, whether it counts from 1900 or
// from 1904: a date column and a time column (apart, true cells or text), a
// time that rounds up to midnight carried into the next day, global dates as
// users type them. A global text or a row that gives no time fails both the
// inspection and the import with the same words.
TEST(ImportRead, DatesAndTimesComeInAsTheWorkbookShowsThem)
{
    const std::vector<DATE> midnight = {kMarch1, kMarch1 + 0.5, kMarch1 + 1};
    const std::string noDate = " is no date: write it as 2024-03-01.";
    const std::string kBeyondXfd = "The date/time columns reach column 16385, but a sheet ends at column 16384 (XFD): "
                                   "give the date/time column a number from 1 to 16384.";
    struct Case {
        std::string spec;
        std::vector<DATE> times;
        std::string fault;
    };
    const Case cases[] = {
        {"DateCol=1;TimeCol=3;ExcelSheet=1;", {kMarch1, kMarch1 + 0.5, kMarch1 + 2}, ""},
        {"TimeCol=1;GlobalDate=2024-03-01;ExcelSheet=2;", midnight, ""},
        {"TimeCol=1;GlobalDate=2024/03/01;ExcelSheet=2;", midnight, ""},
        {"TimeCol=1;GlobalDate=01.03.2024;ExcelSheet=2;", midnight, ""},
        {"DateCol=3;DateFormat=YYYY-MM-DD;TimeCol=1;TimeFormat=HH:mm:ss;ExcelSheet=4;", {kMarch1, kMarch1 + 0.5}, ""},
        {"TimeCol=1;GlobalDate=1st March;ExcelSheet=2;", {}, "GlobalDate \"1st March\"" + noDate},
        {"TimeCol=1;GlobalDate=03/2024;ExcelSheet=2;", {}, "GlobalDate \"03/2024\"" + noDate},
        {"TimeCol=1;GlobalDate=;ExcelSheet=2;", {}, "GlobalDate \"\"" + noDate},
        {"TimeCol=1;ExcelSheet=2;", {},
         "GlobalDate is missing: the time column (TimeCol) needs the date of its rows, such as GlobalDate=2024-03-01."},
        {"DateCol=1;GlobalTime=24:00;ExcelSheet=1;", {}, "GlobalTime \"24:00\" is no time of day: write it as 05:06:07."},
        {"DateTimeCol=16385;ExcelSheet=1;", {}, kBeyondXfd},
        {"DateCol=1;TimeCol=16385;ExcelSheet=1;", {}, kBeyondXfd},
        {"DateTimeCol=1;DateTimeFormat=YYYY-MM-DD;ExcelSheet=3;", {},
         "Can not parse the date time in row 6, column 1. \"2012-04-31\" gives no date and time: check each field "
         "against the format, and the day against its month and year."},
    };
    for (const char *book : {"dates.xlsx", "dates1904.xlsx"})
        for (const Case &c : cases) {
            SCOPED_TRACE(std::string(book) + " " + c.spec);
            const std::string spec = "StartRow=5;" + kHeaders + c.spec;
            const auto inspection = bridge_testing::Inspect(Fixture(book), spec, false);
            EXPECT_EQ(inspection.messages, c.fault.empty() ? std::vector<std::string>{} : std::vector<std::string>{c.fault});
            const Read read = ReadBook(Fixture(book), spec);
            EXPECT_HR(c.fault.empty() ? S_OK : E_FAIL, read.hr);
            EXPECT_EQ(read.error, c.fault.empty() ? "<none>" : c.fault);
            EXPECT_EQ(read.items.size(), c.fault.empty() ? 1u : 0u);  // the date and time columns give none
            if (c.fault.empty()) ExpectTimes(read.times, c.times);
        }
    // A row that gives no time never becomes the base moment.
    const Read unreadable = ReadBook(Fixture("import.xlsx"), "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=5;" +
                                                               kHeaders + "ExcelSheet=10;");
    EXPECT_HR(E_FAIL, unreadable.hr);
    EXPECT_EQ(unreadable.error.substr(0, 59), "Can not parse the date time in row 5, column 1. \"bad\" gives");
}

// A host string naming an open template of the fixture's layout, with the
// given attributes and extension lists.
std::string OpenTemplate(const testing_host::TempDir &dir, const std::string &attributes, const std::string &lists)
{
    const std::string path = dir.File("open.xml");
    testing_host::WriteFile(path, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<MSExcelVantrelSpecification "
                                  "GlobalDate=\"2024-03-01\" GlobalTime=\"00:00:00\" DateTimeCol=\"1\" StartRow=\"5\" " +
                                      attributes + "><MSExcelVantrelSpecificationExtension>" + lists +
                                      "</MSExcelVantrelSpecificationExtension></MSExcelVantrelSpecification>");
    return "TemplateFilePath=" + path + ";";
}

std::string List(const std::string &name, const std::vector<std::string> &texts)
{
    std::string list = "<" + name + "s>";
    for (const std::string &text : texts) list += "<" + name + ">" + text + "</" + name + ">";
    return list + "</" + name + "s>";
}

// Only a template brings selected items and lists of titles, item types,
// units and value types; the host reaches them by a template reference.
TEST(ImportRead, TemplateSelectionAndListsReachTheRead)
{
    const std::string rows = "ItemDescriptionRow=\"1\" UseUnitTypeRow=\"true\" UnitTypeRow=\"2\" UseUnitRow=\"true\" "
                             "UnitRow=\"3\" UseValueTypeRow=\"true\" ValueTypeRow=\"4\" ExcelSheet=";
    // Options 2 and 1 leave types, units, value types and titles to the lists.
    const std::string noRows = "UseUnitTypeOption=\"2\" UseUnitOption=\"2\" UseValueTypeOption=\"2\" "
                               "UseItemTitleOption=\"1\" ExcelSheet=\"7\"";
    const std::string types = List("ItemType", {"Water Level", "discharge", "Rainfall"});
    const std::string valueTypes = List("ValueType", {"Instantaneous", "accumulated", "Step_Accumulated"});
    const Item s1a{"S1 a", 1000, 2100, 0, {1, 2, 3}}, s1b{"S1 b", 1000, 2100, 0, {4, 5, 6}},
        s1c{"S1 c", 1000, 2100, 0, {7, 8, 9}}, s2a{"S2 a", 1002, 2300, 1, {10, 11, 12}}, s2b{"S2 b", 1002, 2300, 1, {13, 14, 15}};
    struct Case {
        const char *what;
        std::string attributes, lists;
        std::vector<Item> items;
    };
    const Case cases[] = {
        {"selection", rows + "\"7\" SelItems=\"0,2\"", "", {s1a, s1c}},
        {"an empty piece selects nothing", rows + "\"7\" SelItems=\"2,,1\"", "", {s1b, s1c}},
        {"no selection: all", rows + "\"7\" SelItems=\"\"", "", {s1a, s1b, s1c}},
        // The second sheet's items are numbered after those the first kept.
        {"over two sheets", rows + "\"7,8\" SelItems=\"0,2,3\"", "", {s1a, s1c, s2a, s2b}},
        {"counted after the kept", rows + "\"7,8\" SelItems=\"1\"", "", {s1b, s2a}},
        {"full lists", noRows, List("ItemTitle", {"One", "Two", "Three"}) + types + List("ItemUnit", {"cm", "l/s", "inch"}) + valueTypes,
         {{"One", 1000, 2101, 0, {1, 2, 3}}, {"Two", 1001, 2201, 1, {4, 5, 6}}, {"Three", 1002, 2303, 2, {7, 8, 9}}}},
        // Fewer titles: the rest named by their columns. A unit list of
        // another length leaves the units unset and keeps the types.
        {"short titles and units", noRows, List("ItemTitle", {"One"}) + types + List("ItemUnit", {"cm"}) + valueTypes,
         {{"One", 1000, 0, 0, {1, 2, 3}}, {"C", 1001, 0, 1, {4, 5, 6}}, {"D", 1002, 0, 2, {7, 8, 9}}}},
        // A type list of another length fails the types of the whole sheet.
        {"short types", noRows, List("ItemType", {"Water Level"}) + List("ItemUnit", {"cm", "l/s", "inch"}) + valueTypes,
         {{"B", 0, 0, 0, {1, 2, 3}}, {"C", 0, 0, 1, {4, 5, 6}}, {"D", 0, 0, 2, {7, 8, 9}}}},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.what);
        testing_host::TempDir dir;
        const Read read = ReadBook(Fixture("import.xlsx"), OpenTemplate(dir, c.attributes, c.lists));
        EXPECT_HR(S_OK, read.hr);
        EXPECT_TRUE(read.messages.empty());
        EXPECT_EQ(read.items, c.items);
    }
}

}  // namespace
