// SPDX-License-Identifier: MIT
// The import through the module: what the host object holds after ReadData
// on real workbooks.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "bridge/module_bridge.h"
#include "hostseries/memory_series.h"

namespace {

using automation::ComPtr;
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
    *out << "{" << item.title << ", " << item.itemType << ", " << item.unit << ", " << item.valueType << ", [";
    for (double v : item.values) *out << v << " ";
    *out << "]}";
}

struct Read {
    HRESULT hr = S_OK;
    std::string error;
    std::vector<std::string> messages;
    std::vector<Item> items;
    std::vector<DATE> times;
    LONG stepCount = -1;
    double deleteValue = 0.0;
};

Read ReadBook(const std::string &book, const std::string &spec, bool inspectFirst = false)
{
    auto series = testing_host::MakeSeries(book, spec, false);
    auto bridge = bridge_testing::MakeModuleBridge();
    bridge_testing::MessageBoxes boxes;
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
    const LONG count = testing_host::ItemCount(series.Get());
    for (LONG i = 1; i <= count; ++i) {
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
    ComPtr<IHostTimeAxis> axis;
    series->GetTimeAxis(axis.Out());
    axis->GetStepCount(&read.stepCount);
    read.times = hostseries::ReadTimes(*series.Get());
    series->GetDeleteValue(&read.deleteValue);
    return read;
}

// 2024-03-01 00:00:00 as a date serial, and an hour.
constexpr DATE kMarch1 = 45352.0;
constexpr DATE kHour = 1.0 / 24.0;

std::vector<DATE> Hours(int count, DATE start = kMarch1)
{
    std::vector<DATE> times;
    for (int i = 0; i < count; ++i) times.push_back(start + i * kHour);
    return times;
}

void ExpectTimes(const std::vector<DATE> &actual, const std::vector<DATE> &expected)
{
    ASSERT_EQ(actual.size(), expected.size());
    for (size_t i = 0; i < actual.size(); ++i) EXPECT_NEAR(actual[i], expected[i], 1e-9) << "step " << i + 1;
}

TEST(ImportRead, DataOnBothSidesOfTheDateTimeColumn)
{
    const std::string spec = "DateTimeCol=2;StartRow=5;" + kHeaders + "DeleteValue=-1;ExcelSheet=1;";
    const Read read = ReadBook(Fixture("import.xlsx"), spec);
    EXPECT_HR(S_OK, read.hr);
    EXPECT_TRUE(read.messages.empty());
    EXPECT_EQ(read.deleteValue, -1.0);
    ExpectTimes(read.times, Hours(4));
    // Column order; the date/time column gives no item. 0.1 comes back as the
    // nearest 32-bit float; an empty cell and a word as the delete value.
    const std::vector<Item> expected = {
        {"West", 1000, 2101, 0, {double(0.1f), -1.0, 3.25, -1.0}},
        {"East", 1001, 2201, 3, {double(1e-3f), 2.0, 3.0, 4.0}},
        {"North", 1002, 2300, 2, {5.0, 6.0, 7.0, 8.0}},
    };
    EXPECT_EQ(read.items, expected);

    // Without a title row the items are named by their columns.
    const Read untitled = ReadBook(Fixture("import.xlsx"),
                                   "DateTimeCol=2;StartRow=5;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ExcelSheet=1;");
    EXPECT_HR(S_OK, untitled.hr);
    ASSERT_EQ(untitled.items.size(), 3u);
    EXPECT_EQ(untitled.items[0].title, "A");
    EXPECT_EQ(untitled.items[1].title, "C");
    EXPECT_EQ(untitled.items[2].title, "D");
    EXPECT_EQ(untitled.items[2].values, expected[2].values);
}

TEST(ImportRead, AttributesFromOneSharedHeaderRowAndFromGlobalTexts)
{
    const Read shared = ReadBook(Fixture("import.xlsx"),
                                 "DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=2;"
                                 "ValueTypeRow=2;ExcelSheet=2;");
    EXPECT_HR(S_OK, shared.hr);
    const std::vector<Item> expected = {
        {"Gauge", 1000, 2100, 3, {1.0, 2.0}},
        {"Pipe", 1001, 2201, 1, {3.0, 4.0}},
    };
    EXPECT_EQ(shared.items, expected);

    // Global texts win over the rows; a unit may be an abbreviation in any case.
    const Read global = ReadBook(Fixture("import.xlsx"),
                                 "DateTimeCol=1;StartRow=5;" + kHeaders +
                                     "GlobalUnitType=water level;GlobalUnit=CM;GlobalValueType=ACCUMULATED;ExcelSheet=7;");
    EXPECT_HR(S_OK, global.hr);
    ASSERT_EQ(global.items.size(), 3u);
    for (const Item &item : global.items) {
        EXPECT_EQ(item.itemType, 1000);
        EXPECT_EQ(item.unit, 2101);
        EXPECT_EQ(item.valueType, 1);
    }

    // An attribute that doesn't resolve stays unset, and the read goes on.
    const Read unknown = ReadBook(Fixture("import.xlsx"),
                                  "DateTimeCol=1;StartRow=5;" + kHeaders + "GlobalUnitType=Flux;ExcelSheet=7;");
    EXPECT_HR(S_OK, unknown.hr);
    ASSERT_EQ(unknown.items.size(), 3u);
    EXPECT_EQ(unknown.items[0].itemType, 0);
    EXPECT_EQ(unknown.items[0].unit, 0);
    EXPECT_EQ(unknown.items[0].valueType, 0);
    EXPECT_EQ(unknown.items[0].values, (std::vector<double>{1.0, 2.0, 3.0}));
}

TEST(ImportRead, DeleteValueFromTheStringOrFromARow)
{
    const std::string book = Fixture("import.xlsx");
    const std::string rows = "DateTimeCol=1;StartRow=6;" + kHeaders;
    const Read fromRow = ReadBook(book, rows + "DelValRow=5;ExcelSheet=3;");
    EXPECT_HR(S_OK, fromRow.hr);
    EXPECT_EQ(fromRow.deleteValue, -999.0);
    ASSERT_EQ(fromRow.items.size(), 1u);
    EXPECT_EQ(fromRow.items[0].values, (std::vector<double>{-999.0, 2.0, -999.0}));

    // The string's DeleteValue wins over the row, and passes through 32 bits.
    const Read fromString = ReadBook(book, rows + "DeleteValue=0.1;DelValRow=5;ExcelSheet=3;");
    EXPECT_EQ(fromString.deleteValue, double(0.1f));
    EXPECT_EQ(ReadBook(book, rows + "DeleteValue=abc;ExcelSheet=3;").deleteValue, 0.0);

    // A row cell that is a word keeps the host's delete value.
    const Read word = ReadBook(book, rows + "DelValRow=5;ExcelSheet=9;");
    EXPECT_HR(S_OK, word.hr);
    EXPECT_EQ(word.deleteValue, -9999.0);
    ASSERT_EQ(word.items.size(), 1u);
    EXPECT_EQ(word.items[0].values, (std::vector<double>{-9999.0, 2.0}));
}

TEST(ImportRead, TimeAxisLayoutsAndFaults)
{
    const std::string book = Fixture("import.xlsx");
    // Times of day in the cells, the date from GlobalDate.
    const Read split = ReadBook(book, "TimeCol=1;TimeFormat=HH:mm:ss;GlobalDate=2024-03-01;StartRow=5;" + kHeaders +
                                          "ExcelSheet=4;");
    EXPECT_HR(S_OK, split.hr);
    ExpectTimes(split.times, {kMarch1 + 0.25, kMarch1 + 0.25 + kHour / 2, kMarch1 + 7 * kHour + 15.0 / 86400});
    ASSERT_EQ(split.items.size(), 1u);
    EXPECT_EQ(split.items[0].values, (std::vector<double>{1.0, 2.0, 3.0}));

    // Two equal times: the run stops, says where, and leaves no item.
    const Read equal = ReadBook(book, "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=5;");
    const std::string fault = "The date and time is not in ascending order - error at time step 2.";
    EXPECT_HR(E_FAIL, equal.hr);
    EXPECT_EQ(equal.error, fault);
    EXPECT_EQ(equal.messages, std::vector<std::string>{fault});
    EXPECT_TRUE(equal.items.empty());
    EXPECT_EQ(equal.stepCount, 3);

    // No data rows: the axis is empty, the items stand without data.
    const Read empty = ReadBook(book, "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=6;");
    EXPECT_HR(S_OK, empty.hr);
    EXPECT_EQ(empty.stepCount, 0);
    ASSERT_EQ(empty.items.size(), 2u);
    EXPECT_EQ(empty.items[0].title, "Level");
    EXPECT_TRUE(empty.items[1].values.empty());

    // A first row that doesn't parse gives 0.0 and no fault by itself.
    const Read unreadable = ReadBook(book, "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=5;" + kHeaders +
                                               "ExcelSheet=10;");
    EXPECT_HR(S_OK, unreadable.hr);
    ExpectTimes(unreadable.times, {0.0, kMarch1 + kHour, kMarch1 + 2 * kHour});

    // No StartRow: the run fails with an empty text.
    const Read noStart = ReadBook(book, "DateTimeCol=1;" + kHeaders + "ExcelSheet=7;");
    EXPECT_HR(E_FAIL, noStart.hr);
    EXPECT_EQ(noStart.error, "");
    EXPECT_TRUE(noStart.messages.empty());
}

TEST(ImportRead, TwoSheetsShareOneTimeAxis)
{
    const std::string spec = "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=7,8;";
    for (const bool inspectFirst : {false, true}) {
        SCOPED_TRACE(inspectFirst ? "after an inspection" : "read alone");
        const Read read = ReadBook(Fixture("import.xlsx"), spec, inspectFirst);
        EXPECT_HR(S_OK, read.hr);
        ExpectTimes(read.times, Hours(3));
        std::vector<std::string> titles;
        for (const Item &item : read.items) titles.push_back(item.title);
        EXPECT_EQ(titles, (std::vector<std::string>{"S1 a", "S1 b", "S1 c", "S2 a", "S2 b"}));
        ASSERT_EQ(read.items.size(), 5u);
        EXPECT_EQ(read.items[3], (Item{"S2 a", 1002, 2300, 1, {10.0, 11.0, 12.0}}));
    }
}

TEST(ImportRead, TheSampleWorkbookReadsWhole)
{
    const Read read = ReadBook(std::string(VANTREL_SOURCE_DIR) + "/samples/hydrometric.xlsx",
                               "DateTimeCol=1;StartRow=5;" + kHeaders + "ExcelSheet=1,2;", true);
    EXPECT_HR(S_OK, read.hr);
    EXPECT_EQ(read.stepCount, 48);
    ASSERT_EQ(read.items.size(), 5u);
    EXPECT_EQ(read.items[4].title, "Ardmore air temperature");
    EXPECT_EQ(read.items[4].itemType, 1008);
    EXPECT_EQ(read.items[4].unit, 2600);
    EXPECT_EQ(read.items[3].valueType, 2);
    EXPECT_EQ(read.items[0].values.size(), 48u);
}

}  // namespace
