// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "automation/automation.h"
#include "counting_unknown.h"
#include "expect_hr.h"

namespace {

using automation::testing::CountingUnknown;

TEST(AutomationVariant, InitAndClearNullOrBadType)
{
    VARIANT v;
    v.vt = VT_I4;
    v.lVal = 7;
    VariantInit(&v);
    EXPECT_EQ(v.vt, VT_EMPTY);
    VariantInit(nullptr);  // no crash

    EXPECT_HR(E_INVALIDARG, VariantClear(nullptr));
    for (VARTYPE bad : {VARTYPE{VT_VARIANT}, VARTYPE{0x0FFF}, VARTYPE{VT_ARRAY | VT_EMPTY},
                        VARTYPE{0x1000 | VT_I4}, VARTYPE{15}}) {
        v.vt = bad;
        v.lVal = 1;
        EXPECT_HR(DISP_E_BADVARTYPE, VariantClear(&v)) << bad;
        EXPECT_EQ(v.vt, bad) << "a variant that cannot be cleared is left alone";
    }
}

TEST(AutomationVariant, ClearReleasesWhatItOwnsOnly)
{
    CountingUnknown object;
    VARIANT v;
    VariantInit(&v);
    v.vt = VT_DISPATCH;
    v.pdispVal = &object;
    object.AddRef();
    EXPECT_HR(S_OK, VariantClear(&v));
    EXPECT_EQ(object.refs, 1u);
    EXPECT_EQ(v.vt, VT_EMPTY);

    IUnknown *unknown = &object;
    v.vt = VT_BYREF | VT_UNKNOWN;
    v.byref = &unknown;
    EXPECT_HR(S_OK, VariantClear(&v));
    EXPECT_EQ(object.refs, 1u) << "a reference is not owned";

    v.vt = VT_UNKNOWN;
    v.punkVal = nullptr;
    EXPECT_HR(S_OK, VariantClear(&v));

    v.vt = VT_BSTR;
    v.bstrVal = SysAllocString(u"text");
    EXPECT_HR(S_OK, VariantClear(&v));
    EXPECT_EQ(v.vt, VT_EMPTY);
}

TEST(AutomationVariant, ClearOfLockedArrayFails)
{
    VARIANT v;
    VariantInit(&v);
    v.vt = VT_ARRAY | VT_I4;
    v.parray = SafeArrayCreateVector(VT_I4, 0, 2);
    ASSERT_HR(S_OK, SafeArrayLock(v.parray));
    EXPECT_HR(DISP_E_ARRAYISLOCKED, VariantClear(&v));
    EXPECT_EQ(v.vt, VT_ARRAY | VT_I4);
    ASSERT_HR(S_OK, SafeArrayUnlock(v.parray));
    EXPECT_HR(S_OK, VariantClear(&v));
}

TEST(AutomationVariant, CopyIsDeep)
{
    VARIANT src, dst;
    VariantInit(&src);
    VariantInit(&dst);
    src.vt = VT_BSTR;
    src.bstrVal = SysAllocString(u"text");
    ASSERT_HR(S_OK, VariantCopy(&dst, &src));
    EXPECT_EQ(dst.vt, VT_BSTR);
    EXPECT_NE(dst.bstrVal, src.bstrVal);
    EXPECT_EQ(std::u16string_view(dst.bstrVal), u"text");

    // The destination is cleared first; an interface gets a reference.
    CountingUnknown object;
    src.vt = VT_UNKNOWN;
    SysFreeString(src.bstrVal);
    src.punkVal = &object;
    ASSERT_HR(S_OK, VariantCopy(&dst, &src));
    EXPECT_EQ(dst.punkVal, &object);
    EXPECT_EQ(object.refs, 2u);
    EXPECT_HR(S_OK, VariantClear(&dst));
    EXPECT_EQ(object.refs, 1u);

    // A reference is copied as it is.
    LONG number = 5;
    src.vt = VT_BYREF | VT_I4;
    src.byref = &number;
    ASSERT_HR(S_OK, VariantCopy(&dst, &src));
    EXPECT_EQ(dst.byref, &number);

    // A null BSTR stays null.
    src.vt = VT_BSTR;
    src.bstrVal = nullptr;
    ASSERT_HR(S_OK, VariantCopy(&dst, &src));
    EXPECT_EQ(dst.vt, VT_BSTR);
    EXPECT_EQ(dst.bstrVal, nullptr);
}

TEST(AutomationVariant, CopyOfArrayIsDeep)
{
    VARIANT src, dst;
    VariantInit(&dst);
    src.vt = VT_ARRAY | VT_BSTR;
    src.parray = SafeArrayCreateVector(VT_BSTR, 0, 1);
    LONG index = 0;
    BSTR text = SysAllocString(u"element");
    ASSERT_HR(S_OK, SafeArrayPutElement(src.parray, &index, text));
    SysFreeString(text);

    ASSERT_HR(S_OK, VariantCopy(&dst, &src));
    ASSERT_NE(dst.parray, src.parray);
    BSTR *a = nullptr, *b = nullptr;
    ASSERT_HR(S_OK, SafeArrayAccessData(src.parray, reinterpret_cast<void **>(&a)));
    ASSERT_HR(S_OK, SafeArrayAccessData(dst.parray, reinterpret_cast<void **>(&b)));
    EXPECT_NE(a[0], b[0]);
    EXPECT_EQ(std::u16string_view(b[0]), u"element");
    SafeArrayUnaccessData(src.parray);
    SafeArrayUnaccessData(dst.parray);
    EXPECT_HR(S_OK, VariantClear(&src));
    EXPECT_HR(S_OK, VariantClear(&dst));
}

TEST(AutomationVariant, CopyOddArguments)
{
    VARIANT v, w;
    VariantInit(&v);
    VariantInit(&w);
    EXPECT_HR(E_INVALIDARG, VariantCopy(nullptr, &v));
    EXPECT_HR(E_INVALIDARG, VariantCopy(&v, nullptr));

    v.vt = VT_BSTR;
    v.bstrVal = SysAllocString(u"same");
    EXPECT_HR(S_OK, VariantCopy(&v, &v));
    EXPECT_EQ(std::u16string_view(v.bstrVal), u"same") << "copy onto itself keeps the value";

    w.vt = 0x0FFF;
    EXPECT_HR(DISP_E_BADVARTYPE, VariantCopy(&v, &w));
    EXPECT_EQ(v.vt, VT_BSTR) << "a failed copy leaves the destination alone";
    EXPECT_HR(S_OK, VariantClear(&v));
}

}  // namespace
