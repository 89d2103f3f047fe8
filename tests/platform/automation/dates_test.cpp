// SPDX-License-Identifier: MIT
// Date serials: days since 30 December 1899, the fraction the time of day,
// run backwards before the epoch.
#include <cmath>
#include <cstdio>
#include <string>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/text.h"
#include "automation/values.h"
#include "support/expect_hr.h"

namespace {

constexpr double kSecond = 1.0 / 86400;
constexpr DATE kTime = (5 * 3600 + 6 * 60 + 7) / 86400.0;  // 05:06:07
constexpr DATE kPoint = 40972.0 + kTime;                     // on 4 March 2012

SYSTEMTIME Fields(int y, int mo, int d, int h = 0, int mi = 0, int s = 0)
{
    SYSTEMTIME st{};
    st.wYear = WORD(y), st.wMonth = WORD(mo), st.wDay = WORD(d);
    st.wHour = WORD(h), st.wMinute = WORD(mi), st.wSecond = WORD(s);
    return st;
}

std::string Text(const SYSTEMTIME &st)
{
    char text[40];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d %02d:%02d:%02d", st.wYear, st.wMonth, st.wDay, st.wHour, st.wMinute,
                  st.wSecond);
    return text;
}

// The fields of a serial as text, or "refused".
std::string FieldsOf(DATE serial)
{
    SYSTEMTIME st{};
    return VariantTimeToSystemTime(serial, &st) ? Text(st) : "refused";
}

std::string Print(DATE serial, ULONG flags = 0)
{
    automation::Bstr text;
    return FAILED(VarBstrFromDate(serial, LOCALE_USER_DEFAULT, flags, text.Out())) ? "refused" : text.Utf8();
}

HRESULT Read(const char *text, ULONG flags, DATE &serial)
{
    return VarDateFromStr(automation::Utf8ToUtf16(text).c_str(), LOCALE_USER_DEFAULT, flags, &serial);
}

TEST(AutomationDates, FieldsOfSerials)
{
    // Breaking down rounds to the nearest second; between -1 and 0 is the epoch's own day.
    const std::pair<DATE, const char *> rounded[] = {
        {40972.5 + 0.4 * kSecond, "2012-03-04 12:00:00"}, {40972.5 + 0.6 * kSecond, "2012-03-04 12:00:01"},
        {40972.0 - 0.3 * kSecond, "2012-03-04 00:00:00"}, {-1.0 - (86400 - 0.2) * kSecond, "1899-12-30 00:00:00"},
        {-0.25, "1899-12-30 06:00:00"}, {-1.25, "1899-12-29 06:00:00"}, {2958465.99998843, "9999-12-31 23:59:59"},
        {2958466.0, "refused"}, {-657435.0, "refused"}, {std::nan(""), "refused"}, {INFINITY, "refused"}};
    for (auto [serial, text] : rounded) EXPECT_EQ(FieldsOf(serial), text) << serial;
    for (SYSTEMTIME st : {Fields(2012, 4, 31), Fields(2011, 2, 29), Fields(2012, 13, 1), Fields(99, 12, 31),
                          Fields(2012, 3, 4, 24)}) {
        DATE serial = 123;
        EXPECT_FALSE(SystemTimeToVariantTime(&st, &serial) || serial != 123) << Text(st);
    }
}

// Every 5th day of the whole range, each at a time of day of its own, through
// fields, UDATE and text.
TEST(AutomationDates, RoundTripsOverAllYears)
{
    int checked = 0;
    for (long day = -657434; day <= 2958465; day += 5) {
        const long secondsOfDay = (day * 7919L % 86400 + 86400) % 86400;
        const DATE serial = day < 0 ? day - secondsOfDay / 86400.0 : day + secondsOfDay / 86400.0;
        SYSTEMTIME st{};
        ASSERT_TRUE(VariantTimeToSystemTime(serial, &st)) << serial;
        ASSERT_EQ(st.wHour * 3600 + st.wMinute * 60 + st.wSecond, secondsOfDay) << serial;
        DATE back = 0;
        ASSERT_TRUE(SystemTimeToVariantTime(&st, &back)) << serial;
        ASSERT_EQ(back, serial);
        UDATE ud{};
        ASSERT_HR(S_OK, VarUdateFromDate(serial, 0, &ud));
        ASSERT_EQ(Text(ud.st), Text(st));
        ASSERT_EQ(ud.st.wDayOfWeek, ((day % 7) + 7 + 6) % 7) << "the epoch was a Saturday";
        SYSTEMTIME newYear = Fields(st.wYear, 1, 1);
        ASSERT_TRUE(SystemTimeToVariantTime(&newYear, &back));
        ASSERT_EQ(ud.wDayOfYear, day - static_cast<long>(back) + 1) << serial;

        const std::string text = Print(serial);
        DATE parsed = 0;
        ASSERT_HR(S_OK, Read(text.c_str(), 0, parsed)) << text;
        ASSERT_EQ(FieldsOf(parsed), Text(st)) << text;
        ++checked;
    }
    EXPECT_GT(checked, 700000);
}

TEST(AutomationDates, TextBothWays)
{
    const std::pair<std::pair<DATE, ULONG>, const char *> printed[] = {
        {{kPoint, 0}, "2012-03-04 05:06:07"}, {{40972.0, 0}, "2012-03-04"}, {{kTime, 0}, "05:06:07"},
        {{0.0, 0}, "00:00:00"}, {{-1.25, 0}, "1899-12-29 06:00:00"}, {{-657434.0, 0}, "0100-01-01"},
        {{kPoint, VAR_TIMEVALUEONLY}, "05:06:07"}, {{kPoint, VAR_DATEVALUEONLY}, "2012-03-04"},
        {{40972.0, VAR_TIMEVALUEONLY}, "00:00:00"}, {{0.5, VAR_DATEVALUEONLY}, "1899-12-30"}, {{2958466.0, 0}, "refused"}};
    for (auto [in, text] : printed) EXPECT_EQ(Print(in.first, in.second), text) << in.first << " flags " << in.second;

    const std::pair<std::pair<const char *, ULONG>, DATE> read[] = {
        {{"2012-03-04 05:06:07", 0}, kPoint}, {{"2012/03/04 05:06:07", 0}, kPoint}, {{"  2012-3-4\t 5:06:07 ", 0}, kPoint},
        {{"2012-03-04", 0}, 40972.0}, {{"05:06:07", 0}, kTime}, {{"05:06", 0}, (5 * 3600 + 6 * 60) / 86400.0},
        {{"1899-12-29 06:00:00", 0}, -1.25}, {{"2012-03-04 05:06:07", VAR_TIMEVALUEONLY}, kTime},
        {{"2012-03-04 05:06:07", VAR_DATEVALUEONLY}, 40972.0}, {{"05:06:07", VAR_DATEVALUEONLY}, 0.0},
        {{"2012-03-04", VAR_TIMEVALUEONLY}, 0.0}};
    for (auto [in, expected] : read) {
        DATE serial = -99;
        EXPECT_HR(S_OK, Read(in.first, in.second, serial)) << in.first << " flags " << in.second;
        EXPECT_EQ(serial, expected) << in.first << " flags " << in.second;
    }
    for (const char *bad : {"", "   ", "abc", "2012-04-31", "2011-02-29", "24:00:00", "12:60", "12:00:60",
                            "2012-03-04T05:06:07", "2012-03", "2012-03/04", "99-01-01", "10000-01-01",
                            "2012-03-04 05:06:07 x", "40972", "2012-003-04", "05:06:07 2012-03-04", "2012 03 04"}) {
        DATE serial = -99;
        EXPECT_HR(DISP_E_TYPEMISMATCH, Read(bad, 0, serial)) << '"' << bad << '"';
        EXPECT_EQ(serial, -99) << bad;
    }
}

}  // namespace
