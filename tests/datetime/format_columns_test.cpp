// SPDX-License-Identifier: MIT
// Columns, classes and titles of date/time formats.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "datetime/date_time_util.h"

namespace {

TEST(FormatColumns, ColumnCount)
{
    const struct {
        const char *format;
        int columns;
    } cases[] = {
        {"", 1},                          // a true date value
        {"YYYY/MM/DD HH:mm:ss", 1},
        {"YYYY|MM|DD|HH|mm|ss", 6},
        {"YYYY-MM-DD|HH:mm:ss", 2},
        {"\"YYYY|MM|DD\"", 1},            // quoted: one column, bars included
        {"  \"YYYY|MM\"  ", 1},           // quoted after trimming
        {"|||", 0},
        {"   ", 0},
        {"YYYY||MM", 2},                  // empty parts vanish
        {"|YYYY|", 1},
        {"YYYY |MM ", 2},
    };
    for (const auto &c : cases)
        EXPECT_EQ(CDateTimeUtil::GetFormatColumnCount(c.format), c.columns) << c.format;
}

TEST(FormatColumns, ColumnFormat)
{
    std::string column = "stale";
    EXPECT_TRUE(CDateTimeUtil::GetColumnFormat(1, "YYYY-MM-DD | HH:mm:ss", column));
    EXPECT_EQ(column, "HH:mm:ss");
    EXPECT_TRUE(CDateTimeUtil::GetColumnFormat(0, "YYYY-MM-DD | HH:mm:ss", column));
    EXPECT_EQ(column, "YYYY-MM-DD");
    // Past the last column: false and an empty column format.
    EXPECT_FALSE(CDateTimeUtil::GetColumnFormat(2, "YYYY-MM-DD | HH:mm:ss", column));
    EXPECT_EQ(column, "");
    column = "stale";
    EXPECT_FALSE(CDateTimeUtil::GetColumnFormat(-1, "YYYY|MM", column));
    EXPECT_EQ(column, "");
    EXPECT_TRUE(CDateTimeUtil::GetColumnFormat(2, "YYYY||MM|DD", column));
    EXPECT_EQ(column, "DD");
    // A part of blanks alone trims to nothing.
    EXPECT_FALSE(CDateTimeUtil::GetColumnFormat(1, "YYYY|  |MM", column));
    EXPECT_EQ(column, "");
    EXPECT_FALSE(CDateTimeUtil::GetColumnFormat(0, "", column));
    EXPECT_EQ(column, "");

    // A quoted format is one column: its text without the quotes.
    EXPECT_TRUE(CDateTimeUtil::GetColumnFormat(0, "\"YYYY/MM/DD hh:mm:ss\"", column));
    EXPECT_EQ(column, "YYYY/MM/DD hh:mm:ss");
    column = "kept";
    EXPECT_FALSE(CDateTimeUtil::GetColumnFormat(1, "\"YYYY/MM/DD hh:mm:ss\"", column));
    EXPECT_EQ(column, "kept");
    EXPECT_TRUE(CDateTimeUtil::GetColumnFormat(0, "  \" YYYY|MM \"  ", column));
    EXPECT_EQ(column, "YYYY|MM");
    EXPECT_TRUE(CDateTimeUtil::GetColumnFormat(0, "\"\"", column));
    EXPECT_EQ(column, "");
}

TEST(FormatColumns, Classify)
{
    const struct {
        const char *format;
        int kind;
    } cases[] = {
        {"HH:mm:ss", kFormatTimeOnly},
        {"YYYY-MM-DD", kFormatDateOnly},
        {"YYYY/MM/DD HH:mm:ss", kFormatDateAndTime},
        {"YYYY-MM-DDTHH:mm:ss", kFormatDateAndTime},
        {"yyyy/MM/dd hh:mm:ss", kFormatDateAndTime},
        {"DD/MM", kFormatIncomplete},      // too short to be searched
        {"YMDHms", kFormatIncomplete},     // all letters, but 6 characters
        {"YMDHms  ", kFormatDateAndTime},  // the same at 8 characters
        {"YY.MM.DD", kFormatDateOnly},     // date letters, no H
        {"DD-MM-YYYY HH:mm", kFormatDateOnly},  // no second
        {"HH:MM:SS", kFormatIncomplete},   // M is the month, not the minute
        {"yyyy-mm-dd", kFormatIncomplete}, // m is the minute, not the month
        {"YYYY|MM|DD|HH|mm|ss", kFormatDateAndTime},
        {"", kFormatIncomplete},
    };
    for (const auto &c : cases)
        EXPECT_EQ(CDateTimeUtil::ClassifyFormat(c.format), c.kind) << c.format;
}

TEST(FormatColumns, ColumnTitle)
{
    const struct {
        const char *columnFormat;
        const char *title;
    } cases[] = {
        {"YYYY/MM/DD HH:mm:ss", "Date/time"},
        {"YYYY-MM-DD", "Date"},
        {"HH:mm:ss", "Time"},
        {"HH:mm", "Hour:Minute"},
        {"YYYY", "Year"},
        {"DD/MM", "Day/Month"},
        {"MM-YYYY", "Month-Year"},
        {"ss", "Second"},
        {"YYYY-QQ-MM", "Year-Month"},  // a field of another letter adds nothing
        {"mm:", "Minute:"},            // the separator behind the last field
        {"", ""},
    };
    for (const auto &c : cases) {
        std::string title = "stale";
        EXPECT_TRUE(CDateTimeUtil::GetColumnTitle(c.columnFormat, title));
        EXPECT_EQ(title, c.title) << c.columnFormat;
    }
}

TEST(FormatColumns, ColumnTitlesAreAppended)
{
    std::vector<std::string> titles = {"before"};
    EXPECT_TRUE(CDateTimeUtil::GetColumnTitles("YYYY|MM|DD", titles));
    EXPECT_EQ(titles, (std::vector<std::string>{"before", "Year", "Month", "Day"}));

    titles.clear();
    EXPECT_TRUE(CDateTimeUtil::GetColumnTitles("YYYY-MM-DD|HH:mm:ss", titles));
    EXPECT_EQ(titles, (std::vector<std::string>{"Date", "Time"}));

    titles.clear();
    EXPECT_TRUE(CDateTimeUtil::GetColumnTitles("\"YYYY/MM/DD hh:mm:ss\"", titles));
    EXPECT_EQ(titles, (std::vector<std::string>{"Date/time"}));

    // A column of true dates has no fields to name.
    titles.clear();
    EXPECT_TRUE(CDateTimeUtil::GetColumnTitles("", titles));
    EXPECT_EQ(titles, (std::vector<std::string>{""}));
}

}  // namespace
