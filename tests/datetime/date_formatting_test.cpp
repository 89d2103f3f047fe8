// SPDX-License-Identifier: MIT
// Points in time to text.
#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "datetime/date_time_util.h"

namespace {

// 4 March 2012 05:06:07.
const DateValue kWorked{40972.0 + (5 * 3600 + 6 * 60 + 7) / 86400.0, kDateValid};
const DateValue kInvalid{kWorked.serial, kDateInvalid};
const DateValue kNotANumber{std::numeric_limits<double>::quiet_NaN(), kDateValid};

TEST(DateFormatting, ByPattern)
{
    const struct { DateValue date; std::string pattern; const char *text; } cases[] = {
        {kWorked, "%Y/%m/%d %H:%M:%S", "2012/03/04 05:06:07"},
        // Day of the week and of the year are filled in: a Sunday, the 64th day of a leap year.
        {kWorked, "%A %j", "Sunday 064"},
        {DateValue{2.0, kDateValid}, "%Y-%m-%d %j", "1900-01-01 001"}, {kWorked, "plain", "plain"},
        {kWorked, std::string(300, 'x'), ""},  // beyond the buffer: empty, not cut or overrun
        {kInvalid, "%Y", "Invalid DateTime"}, {kInvalid, "", "Invalid DateTime"},
        {kNotANumber, "%Y/%m/%d", "Invalid DateTime"}, {kNotANumber, "text", "Invalid DateTime"},
    };
    for (const auto &c : cases) EXPECT_EQ(CDateTimeUtil::FormatDate(c.date, c.pattern), c.text) << c.pattern;
    // The same in the words of a locale.
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kWorked, VAR_TIMEVALUEONLY, LOCALE_USER_DEFAULT), "05:06:07");
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kInvalid, 0, LOCALE_USER_DEFAULT), "Invalid DateTime");
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kNotANumber, 0, LOCALE_USER_DEFAULT), "Invalid DateTime");
}

TEST(DateFormatting, ByDateTimeFormat)
{
    const struct { DateValue date; const char *format; const char *text; } cases[] = {
        {kWorked, "YYYY-MM-DDTHH:mm:ss", "2012-03-04T05:06:07"},  // T is a separator and stays
        {kWorked, "yy.M.d h:m:s", "2012.03.04 05:06:07"},          // letter counts don't matter
        {kWorked, "YYYY//MM  DD", "2012/03 04"},                   // a run gives its first character
        {kWorked, "--YYYY", "2012"},                               // leading separators vanish
        {kWorked, "HH:", "05:"},                                   // the one behind the last field
        {kWorked, "YYYY-QQ-DD", "2012-04"},                        // Q and its separator are dropped
        {kWorked, "", ""}, {kInvalid, "YYYY-MM", "Invalid DateTime-Invalid DateTime"},
    };
    for (const auto &c : cases) EXPECT_EQ(CDateTimeUtil::ExpandFormat(c.date, c.format), c.text) << c.format;
    // Each field as the pattern shows it, from the year 100 (three digits) to
    // 9999 and at all times of a day.
    for (double serial = -657434.0; serial < 2958466.0; serial += 3217.123457) {
        const DateValue date{serial, kDateValid};
        EXPECT_EQ(CDateTimeUtil::ExpandFormat(date, "YYYY|MM|DD|HH|mm|ss"),
                  CDateTimeUtil::FormatDate(date, "%Y|%m|%d|%H|%M|%S")) << serial;
    }
}

}  // namespace
