// SPDX-License-Identifier: MIT
#include <cstdint>
#include <cstring>

#include <gtest/gtest.h>

#include "automation/automation.h"

namespace {

uint32_t PrefixOf(BSTR b)
{
    uint32_t count;
    std::memcpy(&count, reinterpret_cast<const char *>(b) - 4, sizeof count);
    return count;
}

TEST(AutomationBstr, LayoutIsByteCountTextAndZero)
{
    BSTR b = SysAllocString(u"abc");
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(PrefixOf(b), 6u);
    EXPECT_EQ(std::u16string_view(b, 4), std::u16string_view(u"abc\0", 4));
    EXPECT_EQ(SysStringLen(b), 3u);
    EXPECT_EQ(SysStringByteLen(b), 6u);
    SysFreeString(b);

    BSTR empty = SysAllocString(u"");
    ASSERT_NE(empty, nullptr);
    EXPECT_EQ(SysStringLen(empty), 0u);
    EXPECT_EQ(empty[0], 0);
    SysFreeString(empty);
}

TEST(AutomationBstr, NullArguments)
{
    EXPECT_EQ(SysAllocString(nullptr), nullptr);
    EXPECT_EQ(SysStringLen(nullptr), 0u);
    EXPECT_EQ(SysStringByteLen(nullptr), 0u);
    SysFreeString(nullptr);
    EXPECT_EQ(SysReAllocString(nullptr, u"x"), FALSE);
    EXPECT_EQ(SysReAllocStringLen(nullptr, u"x", 1), FALSE);
}

TEST(AutomationBstr, AllocLenKeepsEmbeddedZerosAndZeroesNullSource)
{
    BSTR b = SysAllocStringLen(u"a\0b", 3);
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(SysStringLen(b), 3u);
    EXPECT_EQ(std::u16string_view(b, 3), std::u16string_view(u"a\0b", 3));
    EXPECT_EQ(b[3], 0);
    SysFreeString(b);

    BSTR blank = SysAllocStringLen(nullptr, 5);
    ASSERT_NE(blank, nullptr);
    EXPECT_EQ(SysStringLen(blank), 5u);
    for (int i = 0; i <= 5; ++i) EXPECT_EQ(blank[i], 0) << i;
    SysFreeString(blank);

    // A length that cannot be held gives no string rather than a short one.
    EXPECT_EQ(SysAllocStringLen(nullptr, 0xFFFFFFFFu), nullptr);
}

TEST(AutomationBstr, ByteLenCountsBytes)
{
    BSTR b = SysAllocStringByteLen("abc", 3);
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(SysStringByteLen(b), 3u);
    EXPECT_EQ(SysStringLen(b), 1u);
    const char *bytes = reinterpret_cast<const char *>(b);
    EXPECT_EQ(std::string(bytes, 3), "abc");
    EXPECT_EQ(bytes[3], 0);
    EXPECT_EQ(bytes[4], 0);
    SysFreeString(b);

    BSTR zeroed = SysAllocStringByteLen(nullptr, 4);
    ASSERT_NE(zeroed, nullptr);
    EXPECT_EQ(SysStringByteLen(zeroed), 4u);
    EXPECT_EQ(zeroed[0], 0);
    EXPECT_EQ(zeroed[1], 0);
    EXPECT_EQ(zeroed[2], 0);
    SysFreeString(zeroed);
}

TEST(AutomationBstr, ReAlloc)
{
    BSTR b = SysAllocString(u"hello world");
    ASSERT_EQ(SysReAllocString(&b, u"hi"), TRUE);
    EXPECT_EQ(std::u16string_view(b), u"hi");
    EXPECT_EQ(SysStringLen(b), 2u);

    // The new text may come from the old string itself.
    ASSERT_EQ(SysReAllocString(&b, u"hello world"), TRUE);
    ASSERT_EQ(SysReAllocString(&b, b + 6), TRUE);
    EXPECT_EQ(std::u16string_view(b), u"world");

    ASSERT_EQ(SysReAllocStringLen(&b, u"abcdef", 3), TRUE);
    EXPECT_EQ(std::u16string_view(b, SysStringLen(b)), u"abc");

    // A null source keeps the old text as far as it reaches.
    ASSERT_EQ(SysReAllocStringLen(&b, nullptr, 5), TRUE);
    EXPECT_EQ(SysStringLen(b), 5u);
    EXPECT_EQ(std::u16string_view(b, 5), std::u16string_view(u"abc\0\0", 5));
    ASSERT_EQ(SysReAllocStringLen(&b, nullptr, 2), TRUE);
    EXPECT_EQ(std::u16string_view(b, SysStringLen(b)), u"ab");
    EXPECT_EQ(b[2], 0);

    ASSERT_EQ(SysReAllocString(&b, nullptr), TRUE);
    EXPECT_EQ(b, nullptr);
    ASSERT_EQ(SysReAllocString(&b, u"new"), TRUE);
    EXPECT_EQ(std::u16string_view(b), u"new");
    SysFreeString(b);
}

}  // namespace
