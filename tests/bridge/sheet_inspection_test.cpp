// SPDX-License-Identifier: MIT
// The inspection of workbooks through the module: every message that it
// raises, reached by a sheet that provokes it, and the layouts that pass.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "bridge/module_bridge.h"

namespace {

using bridge_testing::Fixture;
using bridge_testing::Inspect;

const std::string kHeaders = "ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;";
const std::string kTrueDates = "DateTimeCol=1;StartRow=5;" + kHeaders;
const std::string kTextDates = "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=5;" + kHeaders;

TEST(SheetInspection, EachFailedCheckTellsWhyInItsOwnWordsAndFittingLayoutsPass)
{
    struct Case {
        std::string spec;
        std::string message;  // "" for a layout that fits
    };
    const Case cases[] = {
        // The sheet's own number, not its place in the list.
        {kTrueDates + "ExcelSheet=1,2;", "There should be 2 columns at least in sheet 2."},
        {"DateTimeCol=1;StartRow=50;" + kHeaders + "ExcelSheet=1;", "There is no date/time in the row 50."},
        {kTrueDates + "ExcelSheet=4;", "The unit type or unit is not valid."},
        {kTrueDates + "ExcelSheet=5;", "TS Import error: incorrect data format detected in line 6."},
        {kTrueDates + "ExcelSheet=6;", "Date/Time Field needs to be of type DATE in row 6, column 1."},
        {kTrueDates + "ExcelSheet=7;",
         "There is an error in the date/time at: (2024-03-01 02:00:00). Dates and times must always increase."},
        {kTrueDates + "ExcelSheet=8;", "The Date/Time value (starting at Row 6)  is invalid."},
        {kTrueDates + "ExcelSheet=1,9;", "The sheets don't share the same date/time."},
        {kTextDates + "ExcelSheet=10;",
         "Can not parse the date time in row 6, column 1. The data value in file is not corresponding to Date/Time format."},
        {kTextDates + "ExcelSheet=11;",
         "There is an error in the date or time data. Dates and times must always increase"},
        // An unknown type in the runs on both sides of the date/time column.
        {"DateTimeCol=2;StartRow=5;" + kHeaders + "ExcelSheet=14;", "The unit type or unit is not valid."},
        {kTrueDates + "ExcelSheet=15;", "The unit type or unit is not valid."},
        {kTrueDates + "ExcelSheet=16;", "The value type is not valid."},
        // What the import reads right passes: a first row at the base
        // moment, and rows 0.4 seconds apart (compared at the millisecond).
        {kTrueDates + "ExcelSheet=18;", ""},
        {kTrueDates + "ExcelSheet=19;", ""},
        {kTrueDates + "ExcelSheet=1;", ""},
        {kTrueDates, ""},  // no sheet key: the first sheet
        // Value types as text: 1, a name behind a prefix in any case, and 5;
        // a number, and 6: an export writes value types beyond the names so.
        {kTrueDates + "ExcelSheet=12;", ""},
        {kTrueDates + "ExcelSheet=3;", ""},
        {kTrueDates + "ExcelSheet=13;", ""},
        // One filled header cell serves all the columns.
        {kTrueDates + "ExcelSheet=17;", ""},
        // Exactly enough apart: more than half a second.
        {kTrueDates + "ExcelSheet=20;", ""},
        // A sheet named twice shares its time with itself.
        {kTrueDates + "ExcelSheet=1,1;", ""},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.spec);
        const auto result = Inspect(Fixture("inspection.xlsx"), c.spec, false);
        EXPECT_HR(c.message.empty() ? S_OK : E_FAIL, result.hr);
        EXPECT_EQ(result.fits, c.message.empty() ? SHORT(VARIANT_TRUE) : 0);
        EXPECT_EQ(result.messages, c.message.empty() ? std::vector<std::string>{} : std::vector<std::string>{c.message});
    }
}

TEST(SheetInspection, SilentFlagHidesMessagesAndLetsSheetsDiffer)
{
    const std::string book = Fixture("inspection.xlsx");
    // A failed check still fails, with nothing shown and no error info.
    SetErrorInfo(0, nullptr);
    auto failed = Inspect(book, kTrueDates + "ExcelSheet=4;", true);
    EXPECT_HR(E_FAIL, failed.hr);
    EXPECT_EQ(failed.fits, 0);
    EXPECT_TRUE(failed.messages.empty());
    EXPECT_EQ(testing_host::TakeErrorDescription(), "<none>");

    // Sheets a tenth of a second apart pass while silent.
    auto differing = Inspect(book, kTrueDates + "ExcelSheet=1,9;", true);
    EXPECT_HR(S_OK, differing.hr);
    EXPECT_EQ(differing.fits, SHORT(VARIANT_TRUE));
    EXPECT_TRUE(differing.messages.empty());

    // A sheet text that doesn't parse fails with no message at all.
    auto badList = Inspect(book, kTrueDates + "ExcelSheet=1,99;", false);
    EXPECT_HR(E_FAIL, badList.hr);
    EXPECT_EQ(badList.fits, 0);
    EXPECT_TRUE(badList.messages.empty());
}

}  // namespace
