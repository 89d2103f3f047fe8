// SPDX-License-Identifier: MIT
// Where the date/time of a specification string stands.
#include <gtest/gtest.h>

#include <string>

#include "datetime/date_value.h"
#include "specification/specification.h"

namespace {

struct Layout {
    int column = -7;
    int columnCount = -7;
    int mode = kModeNone;
    std::string format = "stale";
};

Layout LayoutOf(const std::string &specification, Layout start = {})
{
    CSpecification spec;
    EXPECT_TRUE(spec.GetDateTimeLayout(specification, start.column, start.columnCount, start.mode,
                                       start.format));
    return start;
}

TEST(DateTimeLayout, FirstPresentKeyDecides)
{
    const struct {
        const char *specification;
        int column;
        int columnCount;
        int mode;
        const char *format;
    } cases[] = {
        {"DateTimeCol=2;DateTimeFormat=YYYY|MM|DD|HH|mm|ss;TimeCol=5;TimeFormat=HH:mm:ss;DateCol=7;",
         2, 6, kModeDateAndTime, "YYYY|MM|DD|HH|mm|ss"},
        {"DateCol=7;TimeCol=5;DateTimeCol=2;", 2, 1, kModeDateAndTime, ""},
        {"TimeCol=3;TimeFormat=HH:mm:ss;DateCol=1;DateFormat=YYYY-MM-DD;", 3, 1,
         kModeTimeWithGlobalDate, "HH:mm:ss"},
        {"DateCol=4;DateFormat=YYYY|MM|DD;", 4, 3, kModeDateWithGlobalTime, "YYYY|MM|DD"},
        // A date column without a format holds true dates.
        {"DateCol=4;", 4, 1, kModeDateWithGlobalTime, ""},
        // Only the format key of the layout's own key counts.
        {"DateTimeCol=1;DateFormat=YYYY|MM;TimeFormat=HH|mm;", 1, 1, kModeDateAndTime, ""},
        {"DateTimeCol=1;DateTimeFormat=\"YYYY|MM|DD\";", 1, 1, kModeDateAndTime, "\"YYYY|MM|DD\""},
        {"StartRow=3;DateTimeCol=12;DateTimeFormat=YYYY-MM-DD|HH:mm:ss;", 12, 2, kModeDateAndTime,
         "YYYY-MM-DD|HH:mm:ss"},
        {"DateTimeCol=;", 0, 1, kModeDateAndTime, ""},
    };
    for (const auto &c : cases) {
        const Layout layout = LayoutOf(c.specification);
        EXPECT_EQ(layout.column, c.column) << c.specification;
        EXPECT_EQ(layout.columnCount, c.columnCount) << c.specification;
        EXPECT_EQ(layout.mode, c.mode) << c.specification;
        EXPECT_EQ(layout.format, c.format) << c.specification;
    }
}

TEST(DateTimeLayout, WithoutLayoutKeysTheCallersValuesStay)
{
    Layout start;
    start.column = 9;
    start.mode = kModeNone;
    start.format = "YYYY|MM";
    for (const char *specification : {"", "StartRow=3;", "datetimecol=2;", "DateTimeFormat=YYYY;"}) {
        const Layout layout = LayoutOf(specification, start);
        EXPECT_EQ(layout.column, 9) << specification;
        EXPECT_EQ(layout.mode, kModeNone) << specification;
        EXPECT_EQ(layout.format, "YYYY|MM") << specification;
        // The column count is that of the format as it stands.
        EXPECT_EQ(layout.columnCount, 2) << specification;
    }
    start.format = "";
    EXPECT_EQ(LayoutOf("StartRow=3;", start).columnCount, 1);
}

}  // namespace
