// SPDX-License-Identifier: MIT
#include <cstdlib>
#include <string>

#include <gtest/gtest.h>

#include "automation/guid.h"
#include "automation/text.h"
#include "expect_hr.h"

namespace {

using automation::GuidToString;

TEST(AutomationGuid, Constants)
{
    EXPECT_EQ(GuidToString(IID_IUnknown), "{00000000-0000-0000-C000-000000000046}");
    EXPECT_EQ(GuidToString(IID_IClassFactory), "{00000001-0000-0000-C000-000000000046}");
    EXPECT_EQ(GuidToString(IID_IDispatch), "{00020400-0000-0000-C000-000000000046}");
    EXPECT_EQ(GuidToString(IID_IErrorInfo), "{1CF2B120-547D-101B-8E65-08002B2BD119}");
    EXPECT_EQ(GuidToString(IID_ICreateErrorInfo), "{22F03340-547D-101B-8E65-08002B2BD119}");
    EXPECT_EQ(GuidToString(IID_ISupportErrorInfo), "{DF0B3D60-548F-101B-8E65-08002B2BD119}");
    EXPECT_EQ(GuidToString(IID_NULL), "{00000000-0000-0000-0000-000000000000}");
}

TEST(AutomationGuid, StringFromGuid2)
{
    OLECHAR buffer[40];
    EXPECT_EQ(StringFromGUID2(IID_IErrorInfo, buffer, 39), 39);
    EXPECT_EQ(std::u16string_view(buffer), u"{1CF2B120-547D-101B-8E65-08002B2BD119}");
    buffer[0] = u'?';
    EXPECT_EQ(StringFromGUID2(IID_IErrorInfo, buffer, 38), 0) << "no room for the zero";
    EXPECT_EQ(buffer[0], u'?');
    EXPECT_EQ(StringFromGUID2(IID_IErrorInfo, nullptr, 39), 0);
}

TEST(AutomationGuid, ClsidFromString)
{
    CLSID clsid{};
    ASSERT_HR(S_OK, CLSIDFromString(u"{1CF2B120-547D-101B-8E65-08002B2BD119}", &clsid));
    EXPECT_TRUE(clsid == IID_IErrorInfo);
    ASSERT_HR(S_OK, CLSIDFromString(u"{df0b3d60-548f-101b-8e65-08002b2bd119}", &clsid));
    EXPECT_TRUE(clsid == IID_ISupportErrorInfo);

    const char16_t *malformed[] = {
        u"",
        u"1CF2B120-547D-101B-8E65-08002B2BD119",
        u"{1CF2B120-547D-101B-8E65-08002B2BD119",
        u"{1CF2B120-547D-101B-8E65-08002B2BD119}x",
        u"{1CF2B120-547D-101B-8E6508002B2BD119-}",
        u"{1CF2B12G-547D-101B-8E65-08002B2BD119}",
        u"{1CF2B120_547D-101B-8E65-08002B2BD119}",
        u"{ 1CF2B12-547D-101B-8E65-08002B2BD119}",
        u"Excel.Application",
    };
    for (const char16_t *text : malformed) {
        clsid = IID_IUnknown;
        EXPECT_HR(CO_E_CLASSSTRING, CLSIDFromString(text, &clsid))
            << automation::Utf16ToUtf8(text);
        EXPECT_TRUE(clsid == IID_IUnknown) << "a refused text leaves the CLSID alone";
    }
    EXPECT_HR(E_INVALIDARG, CLSIDFromString(nullptr, &clsid));
    EXPECT_HR(E_INVALIDARG, CLSIDFromString(u"{00000000-0000-0000-0000-000000000000}", nullptr));
}

TEST(AutomationGuid, TextRoundTrip)
{
    std::srand(7);
    for (int i = 0; i < 200; ++i) {
        GUID g;
        auto *bytes = reinterpret_cast<unsigned char *>(&g);
        for (size_t b = 0; b < sizeof g; ++b) bytes[b] = static_cast<unsigned char>(std::rand());
        OLECHAR text[39];
        ASSERT_EQ(StringFromGUID2(g, text, 39), 39);
        EXPECT_EQ(automation::Utf16ToUtf8(text), GuidToString(g));
        GUID back{};
        ASSERT_HR(S_OK, CLSIDFromString(text, &back));
        EXPECT_TRUE(back == g);
    }
}

TEST(AutomationTaskMemory, AllocAndFree)
{
    void *block = CoTaskMemAlloc(64);
    ASSERT_NE(block, nullptr);
    static_cast<char *>(block)[63] = 1;
    CoTaskMemFree(block);
    void *empty = CoTaskMemAlloc(0);
    EXPECT_NE(empty, nullptr);
    CoTaskMemFree(empty);
    CoTaskMemFree(nullptr);
}

}  // namespace
