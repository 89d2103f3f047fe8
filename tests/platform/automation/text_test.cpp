// SPDX-License-Identifier: MIT
// Text: UTF-8 and UTF-16 both ways, and numbers with fifteen significant
// digits out, plain decimal forms in.
#include <cmath>
#include <random>
#include <tuple>

#include <gtest/gtest.h>

#include "automation/locale.h"
#include "automation/text.h"

namespace {

using automation::FormatNumber;
using automation::ParseNumber;
using automation::Utf16ToUtf8;
using automation::Utf8ToUtf16;

TEST(AutomationText, WellFormedTextConvertsBothWays)
{
    const std::pair<std::string, std::u16string> cases[] = {
        {"\xC3\xA9t\xE2\x82\xAC", u"\u00E9t\u20AC"}, {"\xF0\x9F\x98\x80", u"\U0001F600"},  // a surrogate pair
        {"\xF4\x8F\xBF\xBF", u"\U0010FFFF"}, {std::string("a\0b", 3), std::u16string(u"a\0b", 3)},
    };
    for (const auto &[utf8, utf16] : cases) {
        EXPECT_EQ(Utf8ToUtf16(utf8), utf16) << utf8;
        EXPECT_EQ(Utf16ToUtf8(utf16), utf8) << utf8;
    }
}

TEST(AutomationText, IllFormedTextBecomesReplacementCharacters)
{
    const std::pair<std::string, std::u16string> utf8Cases[] = {
        {"a\x80z", u"a\uFFFDz"},       {"a\xC3", u"a\uFFFD"},
        {"\xC3(", u"\uFFFD("},         {"\xC0\xAF", u"\uFFFD\uFFFD"},  // overlong
        {"\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},                     // an encoded surrogate
        {"\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},           // beyond U+10FFFF
        {"\xE2\x82", u"\uFFFD"},       {"\xFF", u"\uFFFD"},
    };
    for (const auto &[utf8, utf16] : utf8Cases) EXPECT_EQ(Utf8ToUtf16(utf8), utf16);
    const std::pair<std::u16string, std::string> utf16Cases[] = {
        {u"a\xD800z", "a\xEF\xBF\xBDz"}, {u"\xDC00", "\xEF\xBF\xBD"}, {u"\xDE00\xD83D", "\xEF\xBF\xBD\xEF\xBF\xBD"}};
    for (const auto &[utf16, utf8] : utf16Cases) EXPECT_EQ(Utf16ToUtf8(utf16), utf8);
}

TEST(AutomationLocale, OnlyPlainDecimalFormsAreRead)
{
    const std::pair<const char *, double> good[] = {{" 42 ", 42}, {"\t-3.5\n", -3.5}, {"+7", 7},    {".5", 0.5},
                                                    {"5.", 5},    {"1e-5", 1e-5},       {"1e-400", 0}, {"00012", 12}};
    for (auto [text, expected] : good) {
        double value = -1;
        EXPECT_TRUE(ParseNumber(std::string_view(text), value)) << text;
        EXPECT_EQ(value, expected) << text;
    }
    for (const char *text : {"", " ", ".", "-", "+-1", "1,5", "1 000", "1e", "1e+", "e5", "0x1A", "inf", "nan", "1.2.3",
                             "12abc", "1e400", "- 1"}) {
        double value = -1;
        EXPECT_FALSE(ParseNumber(std::string_view(text), value)) << text;
        EXPECT_EQ(value, -1) << "a refused text leaves the value alone: " << text;
    }
}

TEST(AutomationLocale, WhatPrintsReadsBack)
{
    std::mt19937_64 random(20120304);
    for (int i = 0; i < 20000; ++i) {
        const double x = std::uniform_real_distribution<double>(-10, 10)(random) *
                         std::pow(10.0, std::uniform_int_distribution<int>(-300, 300)(random));
        const std::string text = FormatNumber(x);
        double back = 0;
        ASSERT_TRUE(ParseNumber(text, back)) << text;
        EXPECT_LE(std::fabs(back - x), std::fabs(x) * 5e-15) << text;  // half a unit of the 15th digit
        EXPECT_EQ(FormatNumber(back), text);
    }
}

}  // namespace

TEST(AutomationText, MessageExcerptQuotesEscapesAndCuts)
{
    const std::tuple<std::string, size_t, std::string> cases[] = {
        {"", 40, "\"\""},
        {"say \"hi\" \\ there", 40, "\"say \\\"hi\\\" \\\\ there\""},
        {std::string("a\n\t\r\0\x1F\x7F", 7), 40, "\"a\\n\\t\\r\\x00\\x1F\\x7F\""},
        {"a\x80\xC3(\xFF", 40, "\"a\\x80\\xC3(\\xFF\""},             // bytes that are no UTF-8
        {"\xC3\xA9\xE2\x82\xAC\xEF\xBF\xBD", 40, "\"\xC3\xA9\xE2\x82\xAC\xEF\xBF\xBD\""},  // é € and U+FFFD itself
        {"abcde", 5, "\"abcde\""},
        {"abcdef", 5, "\"abcde...\" (6 bytes)"},
        {"\xC3\xA9\xC3\xA9\xC3\xA9", 2, "\"\xC3\xA9\xC3\xA9...\" (6 bytes)"},  // whole characters only
        {"\xF0\x9F\x98\x80x", 1, "\"\xF0\x9F\x98\x80...\" (5 bytes)"},
        {std::string(5242880, 'x'), 3, "\"xxx...\" (5242880 bytes)"},
    };
    for (const auto &[text, max, excerpt] : cases) EXPECT_EQ(automation::MessageExcerpt(text, max), excerpt) << text.substr(0, 20);
}
