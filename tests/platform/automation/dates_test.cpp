// SPDX-License-Identifier: MIT
#include <cmath>
#include <string>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/text.h"
#include "automation/values.h"
#include "expect_hr.h"

namespace {

SYSTEMTIME Fields(int y, int mo, int d, int h = 0, int mi = 0, int s = 0, int ms = 0)
{
    SYSTEMTIME st{};
    st.wYear = static_cast<WORD>(y);
    st.wMonth = static_cast<WORD>(mo);
    st.wDay = static_cast<WORD>(d);
    st.wHour = static_cast<WORD>(h);
    st.wMinute = static_cast<WORD>(mi);
    st.wSecond = static_cast<WORD>(s);
    st.wMilliseconds = static_cast<WORD>(ms);
    return st;
}

bool SameFields(const SYSTEMTIME &a, const SYSTEMTIME &b)
{
    return a.wYear == b.wYear && a.wMonth == b.wMonth && a.wDay == b.wDay &&
           a.wHour == b.wHour && a.wMinute == b.wMinute && a.wSecond == b.wSecond;
}

std::string Print(DATE serial, ULONG flags = 0)
{
    automation::Bstr text;
    const HRESULT hr = VarBstrFromDate(serial, LOCALE_USER_DEFAULT, flags, text.Out());
    return FAILED(hr) ? "failed" : text.Utf8();
}

HRESULT Read(const char *text, ULONG flags, DATE &serial)
{
    const std::u16string wide = automation::Utf8ToUtf16(text);
    return VarDateFromStr(wide.c_str(), LOCALE_USER_DEFAULT, flags, &serial);
}

TEST(AutomationDates, KnownPoint)
{
    SYSTEMTIME st = Fields(2012, 3, 4, 5, 6, 7);
    DATE serial = 0;
    ASSERT_TRUE(SystemTimeToVariantTime(&st, &serial));
    EXPECT_NEAR(serial, 40972.212581, 5e-7);
    EXPECT_EQ(serial, 40972.0 + (5 * 3600 + 6 * 60 + 7) / 86400.0);

    SYSTEMTIME back{};
    ASSERT_TRUE(VariantTimeToSystemTime(serial, &back));
    EXPECT_TRUE(SameFields(st, back));
    EXPECT_EQ(back.wDayOfWeek, 0) << "4 March 2012 was a Sunday";
    EXPECT_EQ(back.wMilliseconds, 0);

    UDATE ud{};
    EXPECT_HR(S_OK, VarUdateFromDate(serial, 0, &ud));
    EXPECT_TRUE(SameFields(st, ud.st));
    EXPECT_EQ(ud.wDayOfYear, 31 + 29 + 4);
    EXPECT_EQ(ud.st.wDayOfWeek, 0);
}

TEST(AutomationDates, SerialsBeforeTheEpochRunTheirFractionBackwards)
{
    SYSTEMTIME st = Fields(1899, 12, 29, 6);
    DATE serial = 0;
    ASSERT_TRUE(SystemTimeToVariantTime(&st, &serial));
    EXPECT_EQ(serial, -1.25);
    SYSTEMTIME back{};
    ASSERT_TRUE(VariantTimeToSystemTime(-1.25, &back));
    EXPECT_TRUE(SameFields(st, back));

    // Between -1 and 0 the date is 30 December 1899 itself.
    ASSERT_TRUE(VariantTimeToSystemTime(-0.25, &back));
    EXPECT_TRUE(SameFields(Fields(1899, 12, 30, 6), back));
    ASSERT_TRUE(VariantTimeToSystemTime(0.0, &back));
    EXPECT_TRUE(SameFields(Fields(1899, 12, 30), back));
    EXPECT_EQ(back.wDayOfWeek, 6);
}

TEST(AutomationDates, RefusedFields)
{
    DATE serial = 123;
    const SYSTEMTIME refused[] = {
        Fields(2012, 3, 4, 24),       Fields(2012, 3, 4, 5, 60),  Fields(2012, 3, 4, 5, 6, 60),
        Fields(2012, 4, 31),          Fields(2011, 2, 29),        Fields(2012, 0, 1),
        Fields(2012, 13, 1),          Fields(2012, 1, 0),         Fields(99, 12, 31),
        Fields(10000, 1, 1),          Fields(0, 0, 0)};
    for (SYSTEMTIME st : refused) {
        EXPECT_FALSE(SystemTimeToVariantTime(&st, &serial))
            << st.wYear << "-" << st.wMonth << "-" << st.wDay << " " << st.wHour << ":"
            << st.wMinute << ":" << st.wSecond;
    }
    EXPECT_EQ(serial, 123) << "a refused call leaves the serial alone";
    SYSTEMTIME leap = Fields(2012, 2, 29);
    EXPECT_TRUE(SystemTimeToVariantTime(&leap, &serial));
    EXPECT_FALSE(SystemTimeToVariantTime(nullptr, &serial));
    EXPECT_FALSE(SystemTimeToVariantTime(&leap, nullptr));
    EXPECT_FALSE(VariantTimeToSystemTime(1.0, nullptr));
}

TEST(AutomationDates, YearLimitsAndMilliseconds)
{
    SYSTEMTIME first = Fields(100, 1, 1), last = Fields(9999, 12, 31, 23, 59, 59);
    DATE serial = 0;
    ASSERT_TRUE(SystemTimeToVariantTime(&first, &serial));
    EXPECT_EQ(serial, -657434.0);
    ASSERT_TRUE(SystemTimeToVariantTime(&last, &serial));
    EXPECT_NEAR(serial, 2958465.99998843, 1e-8);

    SYSTEMTIME st{};
    EXPECT_FALSE(VariantTimeToSystemTime(2958466.0, &st));
    EXPECT_FALSE(VariantTimeToSystemTime(-657435.0, &st));
    EXPECT_FALSE(VariantTimeToSystemTime(std::nan(""), &st));
    EXPECT_FALSE(VariantTimeToSystemTime(INFINITY, &st));
    UDATE ud;
    EXPECT_HR(E_INVALIDARG, VarUdateFromDate(1e7, 0, &ud));
    EXPECT_HR(E_INVALIDARG, VarUdateFromDate(1.0, 0, nullptr));

    // Milliseconds are not read.
    SYSTEMTIME withMs = Fields(2012, 3, 4, 5, 6, 7, 999);
    SYSTEMTIME withoutMs = Fields(2012, 3, 4, 5, 6, 7);
    DATE a = 0, b = 0;
    ASSERT_TRUE(SystemTimeToVariantTime(&withMs, &a));
    ASSERT_TRUE(SystemTimeToVariantTime(&withoutMs, &b));
    EXPECT_EQ(a, b);
}

TEST(AutomationDates, BreakingDownRoundsToTheNearestSecond)
{
    const double second = 1.0 / 86400;
    SYSTEMTIME st{};
    ASSERT_TRUE(VariantTimeToSystemTime(40972.5 + 0.4 * second, &st));
    EXPECT_TRUE(SameFields(Fields(2012, 3, 4, 12), st));
    ASSERT_TRUE(VariantTimeToSystemTime(40972.5 + 0.6 * second, &st));
    EXPECT_TRUE(SameFields(Fields(2012, 3, 4, 12, 0, 1), st));
    ASSERT_TRUE(VariantTimeToSystemTime(40972.0 - 0.3 * second, &st));
    EXPECT_TRUE(SameFields(Fields(2012, 3, 4), st)) << "23:59:59.7 rounds into the next day";
    ASSERT_TRUE(VariantTimeToSystemTime(-1.0 - (86400 - 0.2) * second, &st));
    EXPECT_TRUE(SameFields(Fields(1899, 12, 30), st)) << "backwards fraction rounds forward too";
}

// Every 5th day of the whole range, each at a time of day of its own.
TEST(AutomationDates, RoundTripsOverAllYears)
{
    SYSTEMTIME first = Fields(100, 1, 1);
    DATE start = 0;
    ASSERT_TRUE(SystemTimeToVariantTime(&first, &start));
    int checked = 0;
    for (long day = static_cast<long>(start); day <= 2958465; day += 5) {
        const long secondsOfDay = (day * 7919L % 86400 + 86400) % 86400;
        const double fraction = static_cast<double>(secondsOfDay) / 86400;
        const DATE serial = day < 0 ? day - fraction : day + fraction;
        SYSTEMTIME st{};
        ASSERT_TRUE(VariantTimeToSystemTime(serial, &st)) << serial;
        EXPECT_EQ(st.wHour * 3600 + st.wMinute * 60 + st.wSecond, secondsOfDay) << serial;
        DATE back = 0;
        ASSERT_TRUE(SystemTimeToVariantTime(&st, &back)) << serial;
        ASSERT_EQ(back, serial) << serial;

        UDATE ud{};
        ASSERT_HR(S_OK, VarUdateFromDate(serial, 0, &ud));
        ASSERT_TRUE(SameFields(st, ud.st));
        ASSERT_EQ(ud.st.wDayOfWeek, ((day % 7) + 7 + 6) % 7) << "the epoch was a Saturday";

        DATE parsed = 0;
        const std::string text = Print(serial);
        ASSERT_HR(S_OK, Read(text.c_str(), 0, parsed)) << text;
        SYSTEMTIME reread{};
        ASSERT_TRUE(VariantTimeToSystemTime(parsed, &reread));
        ASSERT_TRUE(SameFields(st, reread)) << text;
        ++checked;
    }
    EXPECT_GT(checked, 700000);
}

TEST(AutomationDates, DayOfYear)
{
    UDATE ud{};
    DATE serial = 0;
    SYSTEMTIME last = Fields(2012, 12, 31);
    ASSERT_TRUE(SystemTimeToVariantTime(&last, &serial));
    ASSERT_HR(S_OK, VarUdateFromDate(serial, 0, &ud));
    EXPECT_EQ(ud.wDayOfYear, 366);
    SYSTEMTIME firstDay = Fields(2013, 1, 1);
    ASSERT_TRUE(SystemTimeToVariantTime(&firstDay, &serial));
    ASSERT_HR(S_OK, VarUdateFromDate(serial, 0, &ud));
    EXPECT_EQ(ud.wDayOfYear, 1);
    EXPECT_EQ(ud.st.wDayOfWeek, 2) << "1 January 2013 was a Tuesday";
}

TEST(AutomationDates, PrintedText)
{
    const DATE point = 40972.0 + (5 * 3600 + 6 * 60 + 7) / 86400.0;
    EXPECT_EQ(Print(point), "2012-03-04 05:06:07");
    EXPECT_EQ(Print(40972.0), "2012-03-04");
    EXPECT_EQ(Print(point - 40972.0), "05:06:07");
    EXPECT_EQ(Print(0.0), "00:00:00");
    EXPECT_EQ(Print(-1.25), "1899-12-29 06:00:00");
    EXPECT_EQ(Print(-657434.0), "0100-01-01");
    EXPECT_EQ(Print(point, VAR_TIMEVALUEONLY), "05:06:07");
    EXPECT_EQ(Print(point, VAR_DATEVALUEONLY), "2012-03-04");
    EXPECT_EQ(Print(40972.0, VAR_TIMEVALUEONLY), "00:00:00");
    EXPECT_EQ(Print(0.5, VAR_DATEVALUEONLY), "1899-12-30");
    EXPECT_EQ(Print(2958466.0), "failed");
    EXPECT_HR(E_INVALIDARG, VarBstrFromDate(1.0, LOCALE_USER_DEFAULT, 0, nullptr));
}

TEST(AutomationDates, ReadText)
{
    const DATE point = 40972.0 + (5 * 3600 + 6 * 60 + 7) / 86400.0;
    const DATE time = (5 * 3600 + 6 * 60 + 7) / 86400.0;
    struct Case {
        const char *text;
        ULONG flags;
        DATE expected;
    };
    const Case cases[] = {
        {"2012-03-04 05:06:07", 0, point},
        {"2012/03/04 05:06:07", 0, point},
        {"  2012-3-4\t 5:06:07 ", 0, point},
        {"2012-03-04", 0, 40972.0},
        {"05:06:07", 0, time},
        {"05:06", 0, (5 * 3600 + 6 * 60) / 86400.0},
        {"1899-12-29 06:00:00", 0, -1.25},
        {"2012-03-04 05:06:07", VAR_TIMEVALUEONLY, time},
        {"2012-03-04 05:06:07", VAR_DATEVALUEONLY, 40972.0},
        {"05:06:07", VAR_DATEVALUEONLY, 0.0},
        {"2012-03-04", VAR_TIMEVALUEONLY, 0.0},
        {"05:06:07", VAR_TIMEVALUEONLY, time},
        {"00:00:00", 0, 0.0},
    };
    for (const Case &c : cases) {
        DATE serial = -99;
        EXPECT_HR(S_OK, Read(c.text, c.flags, serial)) << c.text << " flags " << c.flags;
        EXPECT_EQ(serial, c.expected) << c.text << " flags " << c.flags;
    }

    for (const char *bad : {"", "   ", "abc", "2012-04-31", "2011-02-29", "24:00:00", "12:60",
                            "12:00:60", "2012-03-04T05:06:07", "2012-03", "2012-03/04",
                            "99-01-01", "10000-01-01", "2012-03-04 05:06:07 x", "2012-03-04 x",
                            "40972", "2012-003-04", "05:06:07 2012-03-04", "2012 03 04"}) {
        DATE serial = -99;
        EXPECT_HR(DISP_E_TYPEMISMATCH, Read(bad, 0, serial)) << '"' << bad << '"';
        EXPECT_EQ(serial, -99) << bad;
    }
    DATE serial;
    EXPECT_HR(E_INVALIDARG, VarDateFromStr(nullptr, LOCALE_USER_DEFAULT, 0, &serial));
    EXPECT_HR(E_INVALIDARG, VarDateFromStr(u"2012-03-04", LOCALE_USER_DEFAULT, 0, nullptr));
}

}  // namespace
