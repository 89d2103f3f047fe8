// SPDX-License-Identifier: MIT
// Text to points in time, and the order of two points.
#include <gtest/gtest.h>

#include <cmath>
#include <iomanip>
#include <string>

#include "datetime/date_time_util.h"

namespace {

// 4 March 2012, and 05:06:07 as a fraction of a day.
constexpr double kMarch4th2012 = 40972.0;
constexpr double kOneSecond = 1.0 / 86400.0;
constexpr double kSixMinutesPastFive = (5 * 3600 + 6 * 60 + 7) * kOneSecond;

constexpr double kWorked = kMarch4th2012 + kSixMinutesPastFive;

TEST(DateParsing, TextByFormat)
{
    const struct { const char *text; const char *format; double serial; int status; } cases[] = {
        {"2012-03-04", "YYYY-MM-DD", kMarch4th2012, kDateValid},  // time 00:00:00
        {"04-03-2012 05:06", "DD-MM-YYYY HH:mm", kWorked - 7 * kOneSecond, kDateValid},
        {"2012", "YYYY-MM-DD", 40909.0, kDateValid},              // 1 January 2012
        {"2012-03-04 05:06:07 99", "YYYY-MM-DD HH:mm:ss", kWorked, kDateValid},
        {"2012-99-03", "YYYY-QQ-MM", 40969.0, kDateValid},        // Q passed over: 1 March
        {"2012 3 4 5 6 7", "YYYY|MM|DD|HH|mm|ss", kWorked, kDateValid},
        {"2012/3-4T5:6.7", "YYYY-MM-DD HH:mm:ss", kWorked, kDateValid},
        {"", "", 2.0, kDateValid},                                // 1 January 1900
        {"2012-02-29", "YYYY-MM-DD", kMarch4th2012 - 4, kDateValid},
        {"2012-04-31", "YYYY-MM-DD", -1, kDateInvalid},  // fields in range that make no date
    };
    for (const auto &c : cases) {
        DateValue date;
        ASSERT_TRUE(CDateTimeUtil::ParseDateTimeFields(date, c.text, c.format)) << c.text;
        EXPECT_EQ(date.status, c.status) << c.text;
        EXPECT_TRUE(c.status != kDateValid || std::abs(date.serial - c.serial) < 1e-9) << c.text << ": " << date.serial;
    }
}

TEST(DateParsing, LocaleText)
{
    const struct { const char *text; ULONG flags; bool parsed; double serial; } cases[] = {
        {"2012-03-04 05:06:07", 0, true, kWorked}, {"05:06:07", VAR_TIMEVALUEONLY, true, kSixMinutesPastFive},
        {"2012-03-04 05:06:07", VAR_DATEVALUEONLY, true, kMarch4th2012},
        // A text that is no date: invalid, serial 0.
        {"no date", 0, false, 0.0}, {"", 0, false, 0.0}, {"2012-04-31", 0, false, 0.0},
    };
    for (const auto &c : cases) {
        DateValue date{77.0, kDateValid};
        EXPECT_EQ(CDateTimeUtil::ParseDateTimeText(date, c.text, c.flags, LOCALE_USER_DEFAULT), c.parsed) << c.text;
        EXPECT_EQ(date.status, c.parsed ? kDateValid : kDateInvalid) << c.text;
        EXPECT_NEAR(date.serial, c.serial, 1e-9) << c.text;
    }
}

TEST(DateParsing, StrictlyLaterByHalfASecond)
{
    const double t = kWorked;
    const struct { double previous; double current; bool later; } cases[] = {
        {t, t, false}, {t, t + 0.4 * kOneSecond, false}, {t, t - 0.4 * kOneSecond, false},  // within half a second
        {t, t + 0.6 * kOneSecond, true}, {t, t + kOneSecond, true},
        {0.0, 0.51 * kOneSecond, true}, {0.0, 0.49 * kOneSecond, false}, {0.0, -1.0, false},  // the first date
        {-1.0, -1.25, true},                         // 29 Dec 1899 00:00, then 06:00
        {-1.25, -1.0, false},
        {-1.25, -0.5, true},                         // 06:00 on the 29th, then 12:00 on the 30th
    };
    for (const auto &c : cases)
        EXPECT_EQ(CDateTimeUtil::IsStrictlyLater(c.previous, c.current), c.later)
            << std::setprecision(17) << c.previous << " -> " << c.current;
}

}  // namespace
