// SPDX-License-Identifier: MIT
// Columns, classes and titles of date/time formats.
#include <gtest/gtest.h>

#include <string>

#include "datetime/date_time_util.h"

namespace {

TEST(FormatColumns, ColumnsOfAFormat)
{
    EXPECT_EQ(CDateTimeUtil::GetFormatColumnCount(""), 1);  // a true date value
    // column: what the column format holds afterwards; columns: the count of the whole format.
    const struct { const char *format; int index; bool found; const char *column; int columns; } cases[] = {
        {"YYYY-MM-DD | HH:mm:ss", 0, true, "YYYY-MM-DD", 2},
        {"YYYY-MM-DD | HH:mm:ss", 1, true, "HH:mm:ss", 2},
        {"YYYY-MM-DD | HH:mm:ss", 2, false, "", 2},  // past the last column: emptied
        {"YYYY|MM", -1, false, "", 2},
        {"YYYY||MM|DD", 2, true, "DD", 3},           // empty parts vanish
        {"YYYY|  |MM", 1, false, "", 3},             // a column of blanks has no format
        {"|||", 0, false, "", 0},
        {"YYYY|MM|DD|HH|mm|ss", 5, true, "ss", 6},
        // A quoted format is one column: its text without the quotes, bars included.
        {"\"YYYY/MM/DD hh:mm:ss\"", 0, true, "YYYY/MM/DD hh:mm:ss", 1},
        {"\"YYYY/MM/DD hh:mm:ss\"", 1, false, "stale", 1},  // left alone
        {"  \" YYYY|MM \"  ", 0, true, "YYYY|MM", 1},
        {"\"\"", 0, true, "", 1},
    };
    for (const auto &c : cases) {
        std::string column = "stale";
        EXPECT_EQ(CDateTimeUtil::GetColumnFormat(c.index, c.format, column), c.found) << c.format << " " << c.index;
        EXPECT_EQ(column, c.column) << c.format << " " << c.index;
        EXPECT_EQ(CDateTimeUtil::GetFormatColumnCount(c.format), c.columns) << c.format;
    }
}

TEST(FormatColumns, Classify)
{
    const struct { const char *format; int kind; } cases[] = {
        {"HH:mm:ss", kFormatTimeOnly}, {"YYYY-MM-DD", kFormatDateOnly}, {"YYYY-MM-DDTHH:mm:ss", kFormatDateAndTime},
        {"yyyy/MM/dd hh:mm:ss", kFormatDateAndTime}, {"YYYY|MM|DD|HH|mm|ss", kFormatDateAndTime},
        {"YMDHms", kFormatIncomplete},     // all letters, but 6 characters
        {"YMDHms  ", kFormatDateAndTime},  // the same at 8 characters
        {"DD-MM-YYYY HH:mm", kFormatDateOnly},  // no second
        {"HH:MM:SS", kFormatIncomplete},   // M is the month, not the minute
        {"yyyy-mm-dd", kFormatIncomplete}, // m is the minute, not the month
    };
    for (const auto &c : cases) EXPECT_EQ(CDateTimeUtil::ClassifyFormat(c.format), c.kind) << c.format;
}

TEST(FormatColumns, ColumnTitle)
{
    const struct { const char *columnFormat; const char *title; } cases[] = {
        {"YYYY/MM/DD HH:mm:ss", "Date/time"}, {"YYYY-MM-DD", "Date"}, {"HH:mm:ss", "Time"}, {"HH:mm", "Hour:Minute"},
        {"DD/MM", "Day/Month"}, {"YYYY-QQ-MM", "Year-Month"},  // a field of another letter adds nothing
        {"mm:", "Minute:"}, {"", ""},                          // the separator behind the last field
    };
    for (const auto &c : cases) {
        std::string title = "stale";
        EXPECT_TRUE(CDateTimeUtil::GetColumnTitle(c.columnFormat, title));
        EXPECT_EQ(title, c.title) << c.columnFormat;
    }
}

}  // namespace
