// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "automation/text.h"

namespace {

using automation::Utf16ToUtf8;
using automation::Utf8ToUtf16;

TEST(AutomationText, WellFormedBothWays)
{
    const std::pair<std::string, std::u16string> cases[] = {
        {"", u""},
        {"plain", u"plain"},
        {"\xC3\xA9t\xC3\xA9", u"\u00E9t\u00E9"},        // two-byte forms
        {"\xE2\x82\xAC 5", u"\u20AC 5"},                  // three bytes
        {"\xF0\x9F\x98\x80", u"\U0001F600"},              // a surrogate pair
        {"\xF4\x8F\xBF\xBF", u"\U0010FFFF"},              // the last code point
        {std::string("a\0b", 3), std::u16string(u"a\0b", 3)},
    };
    for (const auto &[utf8, utf16] : cases) {
        EXPECT_EQ(Utf8ToUtf16(utf8), utf16) << utf8;
        EXPECT_EQ(Utf16ToUtf8(utf16), utf8) << utf8;
    }
    EXPECT_EQ(Utf8ToUtf16("\xF0\x9F\x98\x80").size(), 2u);
}

TEST(AutomationText, IllFormedUtf8BecomesReplacementCharacters)
{
    const std::pair<std::string, std::u16string> cases[] = {
        {"a\x80z", u"a\uFFFDz"},                    // a lone continuation byte
        {"a\xC3", u"a\uFFFD"},                      // cut short at the end
        {"\xC3(", u"\uFFFD("},                      // cut short by a plain character
        {"\xC0\xAF", u"\uFFFD\uFFFD"},              // an overlong form
        {"\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},    // an encoded surrogate
        {"\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},  // beyond U+10FFFF
        {"\xE2\x82", u"\uFFFD"},                    // one broken sequence, one replacement
        {"\xFF", u"\uFFFD"},
    };
    for (const auto &[utf8, utf16] : cases) EXPECT_EQ(Utf8ToUtf16(utf8), utf16);
}

TEST(AutomationText, UnpairedSurrogatesBecomeReplacementCharacters)
{
    EXPECT_EQ(Utf16ToUtf8(u"a\xD800z"), "a\xEF\xBF\xBDz");
    EXPECT_EQ(Utf16ToUtf8(u"\xDC00"), "\xEF\xBF\xBD");
    EXPECT_EQ(Utf16ToUtf8(u"\xD83D"), "\xEF\xBF\xBD");
    EXPECT_EQ(Utf16ToUtf8(u"\xDE00\xD83D"), "\xEF\xBF\xBD\xEF\xBF\xBD") << "wrong order";
}

TEST(AutomationText, Bstrs)
{
    EXPECT_EQ(automation::BstrToUtf8(nullptr), "");
    BSTR b = automation::AllocBstr("\xE2\x82\xAC\xF0\x9F\x98\x80");
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(SysStringLen(b), 3u);
    EXPECT_EQ(automation::BstrToUtf8(b), "\xE2\x82\xAC\xF0\x9F\x98\x80");
    SysFreeString(b);
    BSTR empty = automation::AllocBstr("");
    ASSERT_NE(empty, nullptr) << "the empty text is a string, not a null";
    EXPECT_EQ(SysStringLen(empty), 0u);
    SysFreeString(empty);
}

}  // namespace
