// SPDX-License-Identifier: MIT
// VariantChangeType: what each conversion gives, read from the raw fields.
#include <charconv>
#include <climits>
#include <cmath>
#include <string>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/values.h"
#include "support/expect_hr.h"

namespace {

using automation::Variant;
using vantrel::testing::HrText;

std::string Shortest(double value)
{
    char text[32];
    return std::string(text, std::to_chars(text, text + sizeof text, value).ptr);
}

// "TYPE value" of the result, or the failure code; a failure must leave the
// destination as it was.
std::string Converted(const Variant &in, VARTYPE to, USHORT flags = 0)
{
    Variant out = Variant::String("kept");
    const HRESULT hr = VariantChangeType(out.Ptr(), &in.Raw(), flags, to);
    const VARIANT &v = out.Raw();
    const bool kept = v.vt == VT_BSTR && automation::BstrToUtf8(v.bstrVal) == "kept";
    if (FAILED(hr)) return HrText(hr) + (kept ? "" : " (destination changed)");
    switch (v.vt) {
    case VT_I2: return "I2 " + std::to_string(v.iVal);
    case VT_I4: return "I4 " + std::to_string(v.lVal);
    case VT_R4: return "R4 " + Shortest(v.fltVal);
    case VT_R8: return "R8 " + Shortest(v.dblVal);
    case VT_DATE: return "DATE " + Shortest(v.date);
    case VT_BOOL: return v.boolVal == VARIANT_TRUE ? "BOOL true" : v.boolVal ? "BOOL odd" : "BOOL false";
    case VT_BSTR: return v.bstrVal ? "BSTR " + automation::BstrToUtf8(v.bstrVal) : "BSTR <null>";
    case VT_NULL: return "NULL";
    case VT_ERROR: return "ERROR " + HrText(v.scode);
    default: return "vt " + std::to_string(v.vt);
    }
}

Variant Null()
{
    Variant v;
    v.Ptr()->vt = VT_NULL;
    return v;
}

const std::string kMismatch = HrText(DISP_E_TYPEMISMATCH), kOverflow = HrText(DISP_E_OVERFLOW);

TEST(AutomationChangeType, Conversions)
{
    using V = Variant;
    struct Case {
        Variant in;
        VARTYPE to;
        std::string expected;
        USHORT flags = 0;
    };
    const Case cases[] = {
        // Empty is zero, blank or false; null and error only become themselves.
        {V(), VT_I4, "I4 0"}, {V(), VT_BSTR, "BSTR "}, {V(), VT_BOOL, "BOOL false"}, {V(), VT_NULL, "NULL"},
        {V(), VT_ERROR, kMismatch}, {Null(), VT_I4, kMismatch}, {Null(), VT_BSTR, kMismatch}, {Null(), VT_NULL, "NULL"},
        {V::Missing(), VT_BSTR, kMismatch}, {V::Missing(), VT_ERROR, "ERROR 0x80020004"}, {V::I4(3), VT_ERROR, kMismatch},
        // True is -1, and text in both directions.
        {V::Bool(true), VT_I4, "I4 -1"}, {V::Bool(true), VT_R8, "R8 -1"}, {V::Bool(true), VT_BSTR, "BSTR -1"},
        {V::Bool(true), VT_BSTR, "BSTR True", VARIANT_ALPHABOOL}, {V::R8(0.25), VT_BOOL, "BOOL true"},
        {V::String(" true "), VT_BOOL, "BOOL true"}, {V::String("2.5"), VT_BOOL, "BOOL true"},
        {V::String(" 0.0 "), VT_BOOL, "BOOL false"}, {V::String("yes"), VT_BOOL, kMismatch},
        // Numbers to text print as the engine shows them, with 15 digits (7 for a float).
        {V::I4(INT_MIN), VT_BSTR, "BSTR -2147483648"}, {V::R8(0.1), VT_BSTR, "BSTR 0.1"},
        {V::R8(1e20), VT_BSTR, "BSTR 1E+20"}, {V::R8(40972.2125810185), VT_BSTR, "BSTR 40972.2125810185"},
        {V::R8(2.0 / 3), VT_BSTR, "BSTR 0.666666666666667"}, {V::R8(1e15), VT_BSTR, "BSTR 1E+15"},
        {V::R8(123456789012345.0), VT_BSTR, "BSTR 123456789012345"}, {V::R8(0.00001), VT_BSTR, "BSTR 1E-05"},
        {V::R4(0.1f), VT_BSTR, "BSTR 0.1"}, {V::R4(16777216.0f), VT_BSTR, "BSTR 1.677722E+07"},
        {V::Date(40972.0), VT_BSTR, "BSTR 2012-03-04"}, {V::Error(E_FAIL), VT_BSTR, kMismatch},
        // Text to numbers: blanks around are allowed, nothing else.
        {V::String("  42  "), VT_I4, "I4 42"}, {V::String("-1.5E+2"), VT_R8, "R8 -150"}, {V::String("2.5"), VT_I2, "I2 2"},
        {V::String(""), VT_R8, kMismatch}, {V::String("1,000"), VT_R8, kMismatch}, {V::String("12abc"), VT_R8, kMismatch},
        {V::String("\xC3\xA9"), VT_I4, kMismatch}, {V::String("1e400"), VT_R8, kOverflow},
        {V::String("2147483648"), VT_I4, kOverflow},
        // Halves go to the even neighbour; what doesn't fit overflows.
        {V::R8(0.5), VT_I4, "I4 0"}, {V::R8(1.5), VT_I4, "I4 2"}, {V::R8(-2.5), VT_I4, "I4 -2"}, {V::R8(-2.6), VT_I4, "I4 -3"},
        {V::R8(2147483647.4), VT_I4, "I4 2147483647"}, {V::R8(2147483647.5), VT_I4, kOverflow},
        {V::R8(-2147483648.5), VT_I4, "I4 -2147483648"}, {V::R8(std::nan("")), VT_I4, kOverflow},
        {V::I4(32768), VT_I2, kOverflow}, {V::I4(-1), VT_UI1, kOverflow}, {V::R8(1e39), VT_R4, kOverflow},
        // Dates are serials of the years 100 to 9999.
        {V::Date(40972.75), VT_I4, "I4 40973"}, {V::R8(40972.2125810185), VT_DATE, "DATE 40972.2125810185"},
        {V::R8(2958466.0), VT_DATE, kOverflow}, {V::R8(-657435.0), VT_DATE, kOverflow},
        {V::String(" 2012/03/04 "), VT_DATE, "DATE 40972"}, {V::String("2012-04-31"), VT_DATE, kMismatch},
        {V::String("40972"), VT_DATE, kMismatch},
        // Types that have no conversion.
        {V::I4(1), VT_CY, HrText(DISP_E_BADVARTYPE)}, {V::I4(1), VT_UNKNOWN, kMismatch},
        {V::Array(VT_I4, SafeArrayCreateVector(VT_I4, 0, 1)), VT_I4, kMismatch},
    };
    for (const Case &c : cases)
        EXPECT_EQ(Converted(c.in, c.to, c.flags), c.expected) << Converted(c.in, VT_BSTR) << " to " << c.to;
}

}  // namespace
