// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "automation/com_error.h"
#include "automation/values.h"
#include "expect_hr.h"

namespace {

using automation::Bstr;
using automation::SafeArray;
using automation::Variant;

TEST(AutomationValues, Factories)
{
    EXPECT_EQ(Variant::Empty().Type(), VT_EMPTY);
    EXPECT_EQ(Variant::I4(-5).Raw().lVal, -5);
    EXPECT_EQ(Variant::I4(-5).Type(), VT_I4);
    EXPECT_EQ(Variant::I2(300).Raw().iVal, 300);
    EXPECT_EQ(Variant::I2(300).Type(), VT_I2);
    EXPECT_EQ(Variant::R4(1.5f).Raw().fltVal, 1.5f);
    EXPECT_EQ(Variant::R4(1.5f).Type(), VT_R4);
    EXPECT_EQ(Variant::R8(2.25).Raw().dblVal, 2.25);
    EXPECT_EQ(Variant::R8(2.25).Type(), VT_R8);
    EXPECT_EQ(Variant::Date(40972.5).Raw().date, 40972.5);
    EXPECT_EQ(Variant::Date(40972.5).Type(), VT_DATE);
    EXPECT_EQ(Variant::Bool(true).Raw().boolVal, VARIANT_TRUE);
    EXPECT_EQ(Variant::Bool(false).Raw().boolVal, VARIANT_FALSE);
    EXPECT_EQ(Variant::Bool(false).Type(), VT_BOOL);
    EXPECT_EQ(Variant::Missing().Type(), VT_ERROR);
    EXPECT_HR(DISP_E_PARAMNOTFOUND, Variant::Missing().Raw().scode);
    const Variant text = Variant::String("Zeit \xE2\x82\xAC");
    ASSERT_EQ(text.Type(), VT_BSTR);
    EXPECT_EQ(automation::BstrToUtf8(text.Raw().bstrVal), "Zeit \xE2\x82\xAC");

    SAFEARRAY *psa = SafeArrayCreateVector(VT_R8, 0, 3);
    const Variant array = Variant::Array(VT_R8, psa);
    EXPECT_EQ(array.Type(), VT_ARRAY | VT_R8);
    EXPECT_EQ(array.Raw().parray, psa);
}

TEST(AutomationValues, CopiesAreDeepAndMovesAreNot)
{
    Variant original = Variant::String("text");
    Variant copy = original;
    EXPECT_NE(copy.Raw().bstrVal, original.Raw().bstrVal);
    EXPECT_EQ(automation::BstrToUtf8(copy.Raw().bstrVal), "text");

    const BSTR held = original.Raw().bstrVal;
    Variant moved = std::move(original);
    EXPECT_EQ(moved.Raw().bstrVal, held);
    EXPECT_EQ(original.Type(), VT_EMPTY);  // NOLINT: checking the moved-from state

    VARIANT raw = moved.Detach();
    EXPECT_EQ(moved.Type(), VT_EMPTY);
    EXPECT_HR(S_OK, VariantClear(&raw));
}

TEST(AutomationValues, FailedCopyThrowsComError)
{
    Variant broken;
    broken.Ptr()->vt = 0x0FFF;
    try {
        Variant copy = broken;
        FAIL() << "copy of a bad variant type succeeded";
    } catch (const automation::ComError &e) {
        EXPECT_HR(DISP_E_BADVARTYPE, e.Code());
    }
    broken.Ptr()->vt = VT_EMPTY;
}

TEST(AutomationValues, BstrAndSafeArrayOwners)
{
    Bstr text("abc");
    EXPECT_EQ(text.Utf8(), "abc");
    BSTR raw = text.Detach();
    EXPECT_EQ(text.Get(), nullptr);
    Bstr again = Bstr::Attach(raw);
    EXPECT_EQ(again.Get(), raw);

    SafeArray array(SafeArrayCreateVector(VT_BSTR, 0, 2));
    ASSERT_NE(array.Get(), nullptr);
    LONG index = 1;
    ASSERT_HR(S_OK, SafeArrayPutElement(array.Get(), &index, again.Get()));
    SafeArray moved = std::move(array);
    EXPECT_EQ(array.Get(), nullptr);  // NOLINT: checking the moved-from state
    EXPECT_NE(moved.Get(), nullptr);
}

}  // namespace
