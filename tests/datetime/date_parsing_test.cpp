// SPDX-License-Identifier: MIT
// Text and fields to points in time, and the order of two points.
#include <gtest/gtest.h>

#include <cmath>
#include <iomanip>
#include <string>

#include "cell_arrays.h"
#include "datetime/date_time_util.h"

namespace {

using datetime_test::kMarch4th2012;
using datetime_test::kOneSecond;
using datetime_test::kSixMinutesPastFive;

constexpr double kTolerance = 1e-9;

SYSTEMTIME Fields(int year, int month, int day, int hour = 0, int minute = 0, int second = 0)
{
    SYSTEMTIME st{};
    st.wYear = static_cast<WORD>(year);
    st.wMonth = static_cast<WORD>(month);
    st.wDay = static_cast<WORD>(day);
    st.wHour = static_cast<WORD>(hour);
    st.wMinute = static_cast<WORD>(minute);
    st.wSecond = static_cast<WORD>(second);
    return st;
}

TEST(DateParsing, WorkedExampleGivesTheKnownSerial)
{
    DateValue date;
    ASSERT_TRUE(CDateTimeUtil::ParseDateTimeFields(date, "2012/03/04 05:06:07",
                                                   "YYYY/MM/DD HH:mm:ss"));
    EXPECT_EQ(date.status, kDateValid);
    EXPECT_NEAR(date.serial, 40972.212581, 5e-7);
    EXPECT_NEAR(date.serial, kMarch4th2012 + kSixMinutesPastFive, kTolerance);
}

TEST(DateParsing, AllFields)
{
    const struct {
        const char *text;
        const char *format;
        double serial;
    } cases[] = {
        {"2012-03-04", "YYYY-MM-DD", kMarch4th2012},                  // time 00:00:00
        {"04-03-2012 05:06", "DD-MM-YYYY HH:mm", kMarch4th2012 + (5 * 3600 + 6 * 60) / 86400.0},
        {"2012", "YYYY-MM-DD", 40909.0},                               // 1 January 2012
        {"2012-03-04 05:06:07 99", "YYYY-MM-DD HH:mm:ss", kMarch4th2012 + kSixMinutesPastFive},
        {"2012-99-03", "YYYY-QQ-MM", 40969.0},                         // Q passed over: 1 March
        {"2012 3 4 5 6 7", "YYYY|MM|DD|HH|mm|ss", kMarch4th2012 + kSixMinutesPastFive},
        {"2012/3-4T5:6.7", "YYYY-MM-DD HH:mm:ss", kMarch4th2012 + kSixMinutesPastFive},
        {"", "", 2.0},                                                 // 1 January 1900
    };
    for (const auto &c : cases) {
        DateValue date;
        ASSERT_TRUE(CDateTimeUtil::ParseDateTimeFields(date, c.text, c.format)) << c.text;
        EXPECT_EQ(date.status, kDateValid) << c.text;
        EXPECT_NEAR(date.serial, c.serial, kTolerance) << c.text;
    }
}

TEST(DateParsing, FieldsOutOfRangeAreRefused)
{
    const struct {
        const char *text;
        const char *format;
    } cases[] = {
        {"2012-03-04 24:00:00", "YYYY-MM-DD HH:mm:ss"},  // 24:00 is no time of day
        {"2012-03-04 05:06:60", "YYYY-MM-DD HH:mm:ss"},
        {"2012-03-04 05:60:00", "YYYY-MM-DD HH:mm:ss"},
        {"2012-13-04", "YYYY-MM-DD"},
        {"2012-03-32", "YYYY-MM-DD"},
        {"2012-03-00", "YYYY-MM-DD"},
        {"99-03-04", "YYYY-MM-DD"},
        {"12-03-04", "YY-MM-DD"},                         // two-digit years, even under YY
        {"10000-03-04", "YYYY-MM-DD"},
        {"2012-xx-04", "YYYY-MM-DD"},                     // not a number
    };
    for (const auto &c : cases) {
        DateValue date{123.0, kDateValid};
        EXPECT_FALSE(CDateTimeUtil::ParseDateTimeFields(date, c.text, c.format)) << c.text;
        EXPECT_EQ(date.serial, 123.0) << c.text;
    }
}

TEST(DateParsing, DayTheMonthLacksReadsButIsInvalid)
{
    DateValue date;
    EXPECT_TRUE(CDateTimeUtil::ParseDateTimeFields(date, "2012-04-31", "YYYY-MM-DD"));
    EXPECT_EQ(date.status, kDateInvalid);
    EXPECT_TRUE(CDateTimeUtil::ParseDateTimeFields(date, "2011-02-29", "YYYY-MM-DD"));
    EXPECT_EQ(date.status, kDateInvalid);
    EXPECT_TRUE(CDateTimeUtil::ParseDateTimeFields(date, "2012-02-29", "YYYY-MM-DD"));
    EXPECT_EQ(date.status, kDateValid);
}

TEST(DateParsing, DateFieldsAlone)
{
    int year = 0, month = 0, day = 0;
    EXPECT_TRUE(CDateTimeUtil::ParseDateFields(year, month, day, "2012-03-04 99:99:99",
                                               "YYYY-MM-DD HH:mm:ss"));  // time not read
    EXPECT_EQ(year, 2012);
    EXPECT_EQ(month, 3);
    EXPECT_EQ(day, 4);

    EXPECT_TRUE(CDateTimeUtil::ParseDateFields(year, month, day, "1999", "YYYY|MM|DD"));
    EXPECT_EQ(year, 1999);
    EXPECT_EQ(month, 1);
    EXPECT_EQ(day, 1);

    EXPECT_TRUE(CDateTimeUtil::ParseDateFields(year, month, day, "05:06:07", "HH:mm:ss"));
    EXPECT_EQ(year, 1900);

    year = month = day = 7;
    EXPECT_FALSE(CDateTimeUtil::ParseDateFields(year, month, day, "12-03-04", "YYYY-MM-DD"));
    EXPECT_FALSE(CDateTimeUtil::ParseDateFields(year, month, day, "2012-13-04", "YYYY-MM-DD"));
    EXPECT_EQ(year, 7);
    EXPECT_EQ(month, 7);
    EXPECT_EQ(day, 7);
}

TEST(DateParsing, TimeFieldsAlone)
{
    int hour = 0, minute = 0, second = 0;
    EXPECT_TRUE(CDateTimeUtil::ParseTimeFields(hour, minute, second, "99999-99-99 05:06:07",
                                               "YYYY-MM-DD HH:mm:ss"));  // date not read
    EXPECT_EQ(hour, 5);
    EXPECT_EQ(minute, 6);
    EXPECT_EQ(second, 7);

    hour = minute = second = 0;
    EXPECT_TRUE(CDateTimeUtil::ParseTimeFields(hour, minute, second, "05:06", "HH:mm:ss"));
    EXPECT_EQ(hour, 5);
    EXPECT_EQ(minute, 6);
    EXPECT_EQ(second, 0);

    hour = minute = second = 1;
    EXPECT_FALSE(CDateTimeUtil::ParseTimeFields(hour, minute, second, "24:00:00", "HH:mm:ss"));
    EXPECT_FALSE(CDateTimeUtil::ParseTimeFields(hour, minute, second, "23:59:60", "HH:mm:ss"));
    EXPECT_EQ(hour, 1);
    EXPECT_EQ(minute, 1);
    EXPECT_EQ(second, 1);
}

TEST(DateParsing, MakeDateValueRoundTrip)
{
    DATE serial = -5.0;
    EXPECT_TRUE(CDateTimeUtil::MakeDateValue(Fields(2012, 3, 4, 5, 6, 7), serial));
    EXPECT_NEAR(serial, kMarch4th2012 + kSixMinutesPastFive, kTolerance);
    EXPECT_TRUE(CDateTimeUtil::MakeDateValue(Fields(2012, 2, 29), serial));
    EXPECT_NEAR(serial, kMarch4th2012 - 4, kTolerance);
    EXPECT_TRUE(CDateTimeUtil::MakeDateValue(Fields(1899, 12, 30), serial));
    EXPECT_NEAR(serial, 0.0, kTolerance);
    EXPECT_TRUE(CDateTimeUtil::MakeDateValue(Fields(9999, 12, 31, 23, 59, 59), serial));

    // Fields that make no date leave the serial alone.
    serial = -5.0;
    for (const SYSTEMTIME &bad : {Fields(2012, 4, 31), Fields(2011, 2, 29), Fields(2012, 13, 1),
                                  Fields(2012, 3, 4, 24), Fields(2012, 3, 4, 5, 60),
                                  Fields(2012, 3, 4, 5, 6, 60), Fields(2012, 3, 0)}) {
        EXPECT_FALSE(CDateTimeUtil::MakeDateValue(bad, serial))
            << bad.wYear << "-" << bad.wMonth << "-" << bad.wDay << " " << bad.wHour << ":"
            << bad.wMinute << ":" << bad.wSecond;
    }
    EXPECT_EQ(serial, -5.0);
}

TEST(DateParsing, LocaleText)
{
    DateValue date;
    EXPECT_TRUE(CDateTimeUtil::ParseDateTimeText(date, "2012-03-04 05:06:07", 0, LOCALE_USER_DEFAULT));
    EXPECT_EQ(date.status, kDateValid);
    EXPECT_NEAR(date.serial, kMarch4th2012 + kSixMinutesPastFive, kTolerance);

    EXPECT_TRUE(CDateTimeUtil::ParseDateTimeText(date, "05:06:07", VAR_TIMEVALUEONLY, 1024));
    EXPECT_NEAR(date.serial, kSixMinutesPastFive, kTolerance);

    EXPECT_TRUE(CDateTimeUtil::ParseDateTimeText(date, "2012-03-04 05:06:07", VAR_DATEVALUEONLY, 1024));
    EXPECT_NEAR(date.serial, kMarch4th2012, kTolerance);

    // A text that is no date: invalid, serial 0.
    for (const char *text : {"no date", "", "2012-04-31"}) {
        date = DateValue{77.0, kDateValid};
        EXPECT_FALSE(CDateTimeUtil::ParseDateTimeText(date, text, 0, 1024)) << text;
        EXPECT_EQ(date.status, kDateInvalid) << text;
        EXPECT_EQ(date.serial, 0.0) << text;
    }
}

TEST(DateParsing, StrictlyLaterWithHalfSecond)
{
    const double t = kMarch4th2012 + kSixMinutesPastFive;
    const struct {
        double previous;
        double current;
        bool later;
    } cases[] = {
        {t, t, false},                               // equal
        {t, t - kOneSecond, false},                  // a step back
        {t, t + 0.4 * kOneSecond, false},            // within half a second forward
        {t, t - 0.4 * kOneSecond, false},            // and back
        {t, t + 0.6 * kOneSecond, true},
        {t, t + kOneSecond, true},                   // exactly a second
        {t, t + 1.0, true},
        {0.0, HalfSecond, true},                     // the first date against 0.0
        {0.0, 0.99 * HalfSecond, false},
        {0.0, -1.0, false},
        {0.0, t, true},
        {-1.0, -1.25, true},                         // 29 Dec 1899 00:00, then 06:00
        {-1.25, -1.0, false},
        {-1.25, -0.5, true},                         // 06:00 on the 29th, then 12:00 on the 30th
    };
    for (const auto &c : cases)
        EXPECT_EQ(CDateTimeUtil::IsStrictlyLater(c.previous, c.current), c.later)
            << std::setprecision(17) << c.previous << " -> " << c.current;
    EXPECT_DOUBLE_EQ(HalfSecond, 5.787037037037037e-06);
}

}  // namespace
