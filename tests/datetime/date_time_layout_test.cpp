// SPDX-License-Identifier: MIT
// Where the date/time of a specification string stands.
#include <gtest/gtest.h>

#include <string>

#include "datetime/date_value.h"
#include "specification/specification.h"

namespace {

TEST(DateTimeLayout, FirstPresentKeyDecides)
{
    const struct { const char *specification; int column, columnCount, mode; const char *format; } cases[] = {
        {"DateTimeCol=2;DateTimeFormat=YYYY|MM|DD|HH|mm|ss;TimeCol=5;TimeFormat=HH:mm:ss;DateCol=7;",
         2, 6, kModeDateAndTime, "YYYY|MM|DD|HH|mm|ss"},
        {"DateCol=7;TimeCol=5;DateTimeCol=2;", 2, 1, kModeDateAndTime, ""},
        {"TimeCol=3;TimeFormat=HH:mm:ss;DateCol=1;DateFormat=YYYY-MM-DD;", 3, 1, kModeTimeWithGlobalDate, "HH:mm:ss"},
        {"DateCol=4;DateFormat=YYYY|MM|DD;", 4, 3, kModeDateWithGlobalTime, "YYYY|MM|DD"},
        {"DateCol=4;", 4, 1, kModeDateWithGlobalTime, ""},  // true dates
        // Only the format key of the layout's own key counts.
        {"DateTimeCol=1;DateFormat=YYYY|MM;TimeFormat=HH|mm;", 1, 1, kModeDateAndTime, ""},
        {"DateTimeCol=1;DateTimeFormat=\"YYYY|MM|DD\";", 1, 1, kModeDateAndTime, "\"YYYY|MM|DD\""},
        {"DateTimeCol=;", 0, 1, kModeDateAndTime, ""},
        // Without a layout key the caller's values stay; the count is that of the format as it stands.
        {"", 9, 2, kModeNone, "YYYY|MM"},
        {"datetimecol=2;DateTimeFormat=YYYY;", 9, 2, kModeNone, "YYYY|MM"},
    };
    for (const auto &c : cases) {
        int column = 9, columnCount = -7, mode = kModeNone;
        std::string format = "YYYY|MM";
        EXPECT_TRUE(CSpecification().GetDateTimeLayout(c.specification, column, columnCount, mode, format));
        EXPECT_EQ(column, c.column) << c.specification;
        EXPECT_EQ(columnCount, c.columnCount) << c.specification;
        EXPECT_EQ(mode, c.mode) << c.specification;
        EXPECT_EQ(format, c.format) << c.specification;
    }
}

}  // namespace
