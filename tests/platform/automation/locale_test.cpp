// SPDX-License-Identifier: MIT
#include <cmath>
#include <limits>
#include <random>

#include <gtest/gtest.h>

#include "automation/locale.h"

namespace {

using automation::FormatNumber;
using automation::ParseNumber;

TEST(AutomationLocale, NumbersPrintLikePercentFifteenG)
{
    EXPECT_EQ(FormatNumber(0.1), "0.1");
    EXPECT_EQ(FormatNumber(1e20), "1E+20");
    EXPECT_EQ(FormatNumber(40972.2125810185), "40972.2125810185");
    EXPECT_EQ(FormatNumber(123456789012345.0), "123456789012345");
    EXPECT_EQ(FormatNumber(1e15), "1E+15");
    EXPECT_EQ(FormatNumber(0.0001), "0.0001");
    EXPECT_EQ(FormatNumber(0.00001), "1E-05");
    EXPECT_EQ(FormatNumber(-2.5), "-2.5");
    EXPECT_EQ(FormatNumber(1.0 / 3), "0.333333333333333");
    EXPECT_EQ(FormatNumber(2.0 / 3), "0.666666666666667");
    EXPECT_EQ(FormatNumber(0.0), "0");
    EXPECT_EQ(FormatNumber(-0.0), "0");
    EXPECT_EQ(FormatNumber(1e300 * 10), "1E+301");
    EXPECT_EQ(FormatNumber(std::numeric_limits<double>::infinity()), "INF");
    EXPECT_EQ(FormatNumber(-std::numeric_limits<double>::infinity()), "-INF");
    EXPECT_EQ(FormatNumber(std::nan("")), "NAN");
    EXPECT_EQ(FormatNumber(0.1f, automation::kFloatDigits), "0.1");
    EXPECT_EQ(FormatNumber(1234567.0, 3), "1.23E+06");
}

TEST(AutomationLocale, NumberForms)
{
    const std::pair<const char *, double> good[] = {
        {"0", 0},       {"42", 42},        {" 42 ", 42},     {"\t-3.5\n", -3.5}, {"+7", 7},
        {".5", 0.5},    {"5.", 5},         {"1E+20", 1e20},  {"1e-5", 1e-5},     {"-0", 0},
        {"1e-400", 0},  {"00012", 12},     {"2.5E3", 2500}};
    for (auto [text, expected] : good) {
        double value = -1;
        EXPECT_TRUE(ParseNumber(std::string_view(text), value)) << text;
        EXPECT_EQ(value, expected) << text;
    }
    for (const char *text : {"", " ", ".", "-", "+-1", "1,5", "1,000", "1 000", "1e", "1e+",
                             "e5", "0x1A", "inf", "nan", "1.2.3", "12abc", "1e400", "- 1"}) {
        double value = -1;
        EXPECT_FALSE(ParseNumber(std::string_view(text), value)) << text;
        EXPECT_EQ(value, -1) << "a refused text leaves the value alone: " << text;
    }
    double value = 0;
    EXPECT_TRUE(ParseNumber(std::u16string_view(u" 12.25 "), value));
    EXPECT_EQ(value, 12.25);
    EXPECT_FALSE(ParseNumber(std::u16string_view(u"12\u00A0"), value));
    EXPECT_FALSE(ParseNumber(std::u16string_view(u"\uFF11"), value)) << "no wide digits";
}

TEST(AutomationLocale, WhatPrintsParsesBack)
{
    std::mt19937_64 random(20120304);
    std::uniform_real_distribution<double> mantissa(-10, 10);
    std::uniform_int_distribution<int> exponent(-300, 300);
    for (int i = 0; i < 20000; ++i) {
        const double x = mantissa(random) * std::pow(10.0, exponent(random));
        const std::string text = FormatNumber(x);
        double back = 0;
        ASSERT_TRUE(ParseNumber(text, back)) << text;
        // Fifteen significant digits are off by at most half a unit of the last.
        EXPECT_LE(std::fabs(back - x), std::fabs(x) * 5e-15) << text;
        EXPECT_EQ(FormatNumber(back), text);
    }
}

TEST(AutomationLocale, DateTextRoundTrip)
{
    const double point = 40972.0 + (5 * 3600 + 6 * 60 + 7) / 86400.0;
    for (ULONG flags : {0u, ULONG{VAR_TIMEVALUEONLY}, ULONG{VAR_DATEVALUEONLY}}) {
        const auto text = automation::FormatDateText(point, flags);
        ASSERT_TRUE(text.has_value());
        std::u16string wide(text->begin(), text->end());
        const auto back = automation::ParseDateText(wide, flags);
        ASSERT_TRUE(back.has_value()) << *text;
        const double expected = flags == VAR_TIMEVALUEONLY   ? (5 * 3600 + 6 * 60 + 7) / 86400.0
                                : flags == VAR_DATEVALUEONLY ? 40972.0
                                                             : point;
        EXPECT_EQ(*back, expected) << *text;
    }
    EXPECT_FALSE(automation::FormatDateText(1e7, 0).has_value());
    EXPECT_FALSE(automation::FormatDateText(std::nan(""), 0).has_value());
    EXPECT_FALSE(automation::ParseDateText(u"2012-02-30", 0).has_value());
}

}  // namespace
