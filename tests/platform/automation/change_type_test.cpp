// SPDX-License-Identifier: MIT
#include <cmath>
#include <string>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/values.h"
#include "expect_hr.h"

namespace {

using automation::Variant;

// The text of a conversion to VT_BSTR, or the failure code as text.
std::string AsText(const Variant &v, USHORT flags = 0)
{
    Variant out;
    const HRESULT hr = VariantChangeType(out.Ptr(), &v.Raw(), flags, VT_BSTR);
    if (FAILED(hr)) return "failed " + std::to_string(hr);
    return automation::BstrToUtf8(out.Raw().bstrVal);
}

HRESULT Change(const Variant &v, VARTYPE vt, Variant &out, USHORT flags = 0)
{
    return VariantChangeType(out.Ptr(), &v.Raw(), flags, vt);
}

TEST(AutomationChangeType, EmptyBecomesZeroBlankOrFalse)
{
    Variant out;
    EXPECT_HR(S_OK, Change(Variant(), VT_I4, out));
    EXPECT_EQ(out.Raw().lVal, 0);
    EXPECT_HR(S_OK, Change(Variant(), VT_R8, out));
    EXPECT_EQ(out.Raw().dblVal, 0.0);
    EXPECT_HR(S_OK, Change(Variant(), VT_DATE, out));
    EXPECT_EQ(out.Raw().date, 0.0);
    EXPECT_HR(S_OK, Change(Variant(), VT_BOOL, out));
    EXPECT_EQ(out.Raw().boolVal, VARIANT_FALSE);
    EXPECT_HR(S_OK, Change(Variant(), VT_BSTR, out));
    ASSERT_EQ(out.Type(), VT_BSTR);
    ASSERT_NE(out.Raw().bstrVal, nullptr);
    EXPECT_EQ(SysStringLen(out.Raw().bstrVal), 0u);
    EXPECT_HR(S_OK, Change(Variant(), VT_NULL, out));
    EXPECT_EQ(out.Type(), VT_NULL);
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant(), VT_ERROR, out));
}

TEST(AutomationChangeType, NullAndErrorOnlyToThemselves)
{
    Variant null;
    null.Ptr()->vt = VT_NULL;
    Variant out;
    for (VARTYPE vt : {VT_EMPTY, VT_I2, VT_I4, VT_R4, VT_R8, VT_DATE, VT_BSTR, VT_BOOL, VT_ERROR})
        EXPECT_HR(DISP_E_TYPEMISMATCH, Change(null, vt, out)) << vt;
    EXPECT_HR(S_OK, Change(null, VT_NULL, out));
    EXPECT_EQ(out.Type(), VT_NULL);

    const Variant error = Variant::Error(DISP_E_PARAMNOTFOUND);
    for (VARTYPE vt : {VT_EMPTY, VT_NULL, VT_I2, VT_I4, VT_R4, VT_R8, VT_DATE, VT_BSTR, VT_BOOL})
        EXPECT_HR(DISP_E_TYPEMISMATCH, Change(error, vt, out)) << vt;
    EXPECT_HR(S_OK, Change(error, VT_ERROR, out));
    EXPECT_EQ(out.Raw().scode, DISP_E_PARAMNOTFOUND);
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::I4(3), VT_ERROR, out));
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::I4(3), VT_EMPTY, out));
}

TEST(AutomationChangeType, BooleanIsMinusOne)
{
    Variant out;
    EXPECT_HR(S_OK, Change(Variant::Bool(true), VT_I4, out));
    EXPECT_EQ(out.Raw().lVal, -1);
    EXPECT_HR(S_OK, Change(Variant::Bool(true), VT_R8, out));
    EXPECT_EQ(out.Raw().dblVal, -1.0);
    EXPECT_HR(S_OK, Change(Variant::Bool(false), VT_I2, out));
    EXPECT_EQ(out.Raw().iVal, 0);
    EXPECT_EQ(AsText(Variant::Bool(true)), "-1");
    EXPECT_EQ(AsText(Variant::Bool(false)), "0");
    EXPECT_EQ(AsText(Variant::Bool(true), VARIANT_ALPHABOOL), "True");
    EXPECT_EQ(AsText(Variant::Bool(false), VARIANT_ALPHABOOL), "False");

    EXPECT_HR(S_OK, Change(Variant::R8(0.25), VT_BOOL, out));
    EXPECT_EQ(out.Raw().boolVal, VARIANT_TRUE);
    EXPECT_HR(S_OK, Change(Variant::I4(0), VT_BOOL, out));
    EXPECT_EQ(out.Raw().boolVal, VARIANT_FALSE);
    for (const char *text : {"True", " true ", "TRUE", "-1", "2.5"}) {
        EXPECT_HR(S_OK, Change(Variant::String(text), VT_BOOL, out)) << text;
        EXPECT_EQ(out.Raw().boolVal, VARIANT_TRUE) << text;
    }
    for (const char *text : {"False", "false", "0", " 0.0 "}) {
        EXPECT_HR(S_OK, Change(Variant::String(text), VT_BOOL, out)) << text;
        EXPECT_EQ(out.Raw().boolVal, VARIANT_FALSE) << text;
    }
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::String("yes"), VT_BOOL, out));
}

TEST(AutomationChangeType, NumbersToText)
{
    EXPECT_EQ(AsText(Variant::I4(-2147483647 - 1)), "-2147483648");
    EXPECT_EQ(AsText(Variant::I2(-7)), "-7");
    EXPECT_EQ(AsText(Variant::R8(0.1)), "0.1");
    EXPECT_EQ(AsText(Variant::R8(1e20)), "1E+20");
    EXPECT_EQ(AsText(Variant::R8(40972.2125810185)), "40972.2125810185");
    EXPECT_EQ(AsText(Variant::R8(-2.5)), "-2.5");
    EXPECT_EQ(AsText(Variant::R4(0.1f)), "0.1") << "a float prints with 7 digits";
    EXPECT_EQ(AsText(Variant::R4(16777216.0f)), "1.677722E+07");
    EXPECT_EQ(AsText(Variant::Date(40972.0)), "2012-03-04");
    EXPECT_EQ(AsText(Variant::Error(E_FAIL)).rfind("failed ", 0), 0u);
}

TEST(AutomationChangeType, TextToNumbers)
{
    Variant out;
    EXPECT_HR(S_OK, Change(Variant::String("  42  "), VT_I4, out));
    EXPECT_EQ(out.Type(), VT_I4);
    EXPECT_EQ(out.Raw().lVal, 42);
    EXPECT_HR(S_OK, Change(Variant::String("-1.5E+2"), VT_R8, out));
    EXPECT_EQ(out.Raw().dblVal, -150.0);
    EXPECT_HR(S_OK, Change(Variant::String("2.5"), VT_I2, out));
    EXPECT_EQ(out.Raw().iVal, 2) << "halves go to the even neighbour";
    EXPECT_HR(S_OK, Change(Variant::String(".5"), VT_R4, out));
    EXPECT_EQ(out.Raw().fltVal, 0.5f);
    for (const char *text : {"", " ", "1,000", "12abc", "0x10", "1 2", "inf", "nan", "--1", "1e"})
        EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::String(text), VT_R8, out)) << text;
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::String("1e400"), VT_R8, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::String("2147483648"), VT_I4, out));
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::String("\xC3\xA9"), VT_I4, out));

    Variant nullText;
    nullText.Ptr()->vt = VT_BSTR;  // a null BSTR is the empty text
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(nullText, VT_I4, out));
    EXPECT_HR(S_OK, Change(nullText, VT_BSTR, out));
}

TEST(AutomationChangeType, RoundingHalfToEvenAndOverflow)
{
    const std::pair<double, LONG> cases[] = {{0.5, 0},   {1.5, 2},    {2.5, 2},  {3.5, 4},
                                             {-0.5, 0},  {-1.5, -2},  {-2.5, -2}, {2.4999, 2},
                                             {2.5001, 3}, {-2.6, -3}, {1e9, 1000000000}};
    Variant out;
    for (auto [in, expected] : cases) {
        ASSERT_HR(S_OK, Change(Variant::R8(in), VT_I4, out)) << in;
        EXPECT_EQ(out.Raw().lVal, expected) << in;
    }
    EXPECT_HR(S_OK, Change(Variant::R8(2147483647.4), VT_I4, out));
    EXPECT_EQ(out.Raw().lVal, 2147483647);
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(2147483647.5), VT_I4, out));
    EXPECT_HR(S_OK, Change(Variant::R8(-2147483648.5), VT_I4, out)) << "rounds to even, in range";
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(-2147483649.0), VT_I4, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(std::nan("")), VT_I4, out));
    EXPECT_HR(S_OK, Change(Variant::R8(32767.0), VT_I2, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::I4(32768), VT_I2, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::I4(-32769), VT_I2, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::I4(-1), VT_UI1, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(1e39), VT_R4, out));
    EXPECT_HR(S_OK, Change(Variant::I4(70000), VT_R4, out));
    EXPECT_EQ(out.Raw().fltVal, 70000.0f);
    EXPECT_HR(S_OK, Change(Variant::Date(40972.75), VT_I4, out));
    EXPECT_EQ(out.Raw().lVal, 40973);
}

TEST(AutomationChangeType, Dates)
{
    Variant out;
    EXPECT_HR(S_OK, Change(Variant::R8(40972.2125810185), VT_DATE, out));
    EXPECT_EQ(out.Type(), VT_DATE);
    EXPECT_EQ(out.Raw().date, 40972.2125810185);
    EXPECT_HR(S_OK, Change(Variant::Date(-1.25), VT_R8, out));
    EXPECT_EQ(out.Raw().dblVal, -1.25);
    EXPECT_HR(S_OK, Change(Variant::I4(2), VT_DATE, out));
    EXPECT_EQ(out.Raw().date, 2.0);
    // Serials outside the years 100 to 9999 are no dates.
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(2958466.0), VT_DATE, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(-657435.0), VT_DATE, out));
    EXPECT_HR(DISP_E_OVERFLOW, Change(Variant::R8(std::nan("")), VT_DATE, out));

    EXPECT_HR(S_OK, Change(Variant::String(" 2012/03/04 05:06:07 "), VT_DATE, out));
    SYSTEMTIME st{};
    ASSERT_TRUE(VariantTimeToSystemTime(out.Raw().date, &st));
    EXPECT_EQ(st.wYear, 2012);
    EXPECT_EQ(st.wSecond, 7);
    EXPECT_EQ(AsText(out), "2012-03-04 05:06:07");
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::String("2012-04-31"), VT_DATE, out));
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::String("40972"), VT_DATE, out));
    EXPECT_EQ(AsText(Variant::Date(0.0)), "00:00:00");
}

TEST(AutomationChangeType, InPlaceAndFailureLeavesDestination)
{
    Variant v = Variant::R8(12.5);
    ASSERT_HR(S_OK, VariantChangeType(v.Ptr(), v.Ptr(), 0, VT_BSTR));
    EXPECT_EQ(v.Type(), VT_BSTR);
    EXPECT_EQ(automation::BstrToUtf8(v.Raw().bstrVal), "12.5");
    ASSERT_HR(S_OK, VariantChangeType(v.Ptr(), v.Ptr(), 0, VT_I4));
    EXPECT_EQ(v.Raw().lVal, 12);

    Variant error = Variant::Error(0x800A07FA);  // a cell error stays what it was
    EXPECT_HR(DISP_E_TYPEMISMATCH, VariantChangeType(error.Ptr(), error.Ptr(), 0, VT_BSTR));
    EXPECT_EQ(error.Type(), VT_ERROR);
    EXPECT_EQ(error.Raw().scode, static_cast<SCODE>(0x800A07FA));

    Variant kept = Variant::String("kept");
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::String("x"), VT_R8, kept));
    EXPECT_EQ(kept.Type(), VT_BSTR);
    EXPECT_EQ(automation::BstrToUtf8(kept.Raw().bstrVal), "kept");
}

TEST(AutomationChangeType, OddArgumentsAndTypes)
{
    Variant v = Variant::I4(1);
    EXPECT_HR(E_INVALIDARG, VariantChangeType(nullptr, &v.Raw(), 0, VT_I4));
    EXPECT_HR(E_INVALIDARG, VariantChangeType(v.Ptr(), nullptr, 0, VT_I4));
    EXPECT_HR(DISP_E_BADVARTYPE, VariantChangeType(v.Ptr(), v.Ptr(), 0, 0x0FFF));
    EXPECT_HR(DISP_E_BADVARTYPE, VariantChangeType(v.Ptr(), v.Ptr(), 0, VT_BYREF | VT_I4));
    EXPECT_HR(DISP_E_BADVARTYPE, VariantChangeType(v.Ptr(), v.Ptr(), 0, VT_CY));

    Variant out;
    Variant array = Variant::Array(VT_I4, SafeArrayCreateVector(VT_I4, 0, 1));
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(array, VT_I4, out));
    EXPECT_HR(DISP_E_TYPEMISMATCH, Change(Variant::I4(1), VT_UNKNOWN, out));
    EXPECT_HR(S_OK, Change(array, VT_ARRAY | VT_I4, out));
    EXPECT_NE(out.Raw().parray, array.Raw().parray);

    // A reference is read through.
    double number = 2.75;
    Variant ref;
    ref.Ptr()->vt = VT_BYREF | VT_R8;
    ref.Ptr()->byref = &number;
    EXPECT_HR(S_OK, Change(ref, VT_BSTR, out));
    EXPECT_EQ(automation::BstrToUtf8(out.Raw().bstrVal), "2.75");
    EXPECT_HR(S_OK, VariantChangeTypeEx(out.Ptr(), &ref.Raw(), LOCALE_SYSTEM_DEFAULT, 0, VT_R8));
    EXPECT_EQ(out.Raw().dblVal, 2.75);
}

}  // namespace
