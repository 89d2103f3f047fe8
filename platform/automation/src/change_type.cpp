// SPDX-License-Identifier: MIT
// VariantChangeType between the scalar types: empty, null, 16- and 32-bit
// integers, bytes, floats, doubles, dates, text, booleans and error codes.
#include <cfloat>
#include <cmath>
#include <string>

#include "automation/com_error.h"
#include "automation/locale.h"
#include "automation/text.h"
#include "calendar.h"
#include "number_text.h"
#include "vartypes.h"

namespace {

using automation::detail::NumberParse;

bool IsConvertible(VARTYPE vt)
{
    switch (vt) {
    case VT_EMPTY: case VT_NULL: case VT_I2: case VT_I4: case VT_R4: case VT_R8:
    case VT_DATE: case VT_BSTR: case VT_BOOL: case VT_ERROR: case VT_UI1:
        return true;
    default:
        return false;
    }
}

bool IsObjectOrArray(VARTYPE vt)
{
    return (vt & VT_ARRAY) || vt == VT_UNKNOWN || vt == VT_DISPATCH;
}

bool IsNumeric(VARTYPE vt)
{
    switch (vt) {
    case VT_EMPTY: case VT_I2: case VT_I4: case VT_R4: case VT_R8: case VT_DATE:
    case VT_BOOL: case VT_UI1:
        return true;
    default:
        return false;
    }
}

// Every numeric source is held exactly by a double.
double NumberOf(const VARIANT &v)
{
    switch (v.vt) {
    case VT_I2: return v.iVal;
    case VT_I4: return v.lVal;
    case VT_R4: return v.fltVal;
    case VT_R8: return v.dblVal;
    case VT_DATE: return v.date;
    case VT_BOOL: return v.boolVal;
    case VT_UI1: return v.bVal;
    default: return 0;  // VT_EMPTY
    }
}

std::u16string_view TextOf(const VARIANT &v)
{
    return v.bstrVal ? std::u16string_view(v.bstrVal, SysStringLen(v.bstrVal)) : u"";
}

// Halves go to the even neighbour: 2.5 -> 2, 3.5 -> 4, -2.5 -> -2.
double RoundHalfEven(double x)
{
    const double below = std::floor(x);
    const double fraction = x - below;
    if (fraction > 0.5) return below + 1;
    if (fraction < 0.5) return below;
    return std::fmod(below, 2.0) == 0 ? below : below + 1;
}

HRESULT ParseText(const VARIANT &v, double &number)
{
    std::string narrow;
    for (char16_t c : TextOf(v)) {
        if (c > 0x7F) return DISP_E_TYPEMISMATCH;  // number text is plain ASCII
        narrow += static_cast<char>(c);
    }
    switch (automation::detail::ParseNumberText(narrow, number)) {
    case NumberParse::Ok: return S_OK;
    case NumberParse::OutOfRange: return DISP_E_OVERFLOW;
    default: return DISP_E_TYPEMISMATCH;
    }
}

// The source as a number for a numeric target; text is read in the locale.
HRESULT SourceNumber(const VARIANT &src, double &number)
{
    if (src.vt == VT_BSTR) return ParseText(src, number);
    if (!IsNumeric(src.vt)) return DISP_E_TYPEMISMATCH;
    number = NumberOf(src);
    return S_OK;
}

HRESULT ToInteger(double number, double lowest, double highest, double &out)
{
    if (std::isnan(number)) return DISP_E_OVERFLOW;
    out = RoundHalfEven(number);
    return out < lowest || out > highest ? DISP_E_OVERFLOW : S_OK;
}

bool EqualsIgnoringCase(std::u16string_view text, std::u16string_view word)
{
    if (text.size() != word.size()) return false;
    for (size_t i = 0; i < text.size(); ++i) {
        char16_t c = text[i];
        if (c >= u'A' && c <= u'Z') c = static_cast<char16_t>(c - u'A' + u'a');
        if (c != word[i]) return false;
    }
    return true;
}

std::u16string_view TrimBlanks(std::u16string_view s)
{
    while (!s.empty() && automation::detail::IsBlank(s.front())) s.remove_prefix(1);
    while (!s.empty() && automation::detail::IsBlank(s.back())) s.remove_suffix(1);
    return s;
}

HRESULT ToBool(const VARIANT &src, VARIANT &out)
{
    out.vt = VT_BOOL;
    if (src.vt == VT_BSTR) {
        const auto word = TrimBlanks(TextOf(src));
        const bool isTrue = EqualsIgnoringCase(word, u"true");
        if (isTrue || EqualsIgnoringCase(word, u"false")) {
            out.boolVal = isTrue ? VARIANT_TRUE : VARIANT_FALSE;
            return S_OK;
        }
    }
    double number = 0;
    const HRESULT hr = SourceNumber(src, number);
    out.boolVal = number != 0 ? VARIANT_TRUE : VARIANT_FALSE;
    return hr;
}

std::string TextOfNumber(const VARIANT &src, LCID lcid, USHORT flags)
{
    switch (src.vt) {
    case VT_I2: return std::to_string(src.iVal);
    case VT_I4: return std::to_string(src.lVal);
    case VT_UI1: return std::to_string(src.bVal);
    case VT_R4: return automation::FormatNumber(src.fltVal, automation::kFloatDigits);
    case VT_R8: return automation::FormatNumber(src.dblVal);
    case VT_BOOL:
        if (flags & VARIANT_ALPHABOOL) return src.boolVal ? "True" : "False";
        return src.boolVal ? "-1" : "0";
    case VT_DATE: {
        BSTR text = nullptr;
        automation::ThrowIfFailed(VarBstrFromDate(src.date, lcid, 0, &text), "date as text");
        std::string utf8 = automation::BstrToUtf8(text);
        SysFreeString(text);
        return utf8;
    }
    default: return {};  // VT_EMPTY
    }
}

HRESULT Convert(const VARIANT &src, LCID lcid, USHORT flags, VARTYPE vt, VARIANT &out)
{
    if (src.vt == vt) return VariantCopy(&out, &src);
    if (src.vt == VT_NULL || src.vt == VT_ERROR || vt == VT_ERROR || vt == VT_EMPTY)
        return DISP_E_TYPEMISMATCH;
    double number = 0, whole = 0;
    HRESULT hr = S_OK;
    switch (vt) {
    case VT_NULL:
        if (src.vt != VT_EMPTY) return DISP_E_TYPEMISMATCH;
        out.vt = VT_NULL;
        return S_OK;
    case VT_BSTR:
        out.bstrVal = automation::AllocBstr(TextOfNumber(src, lcid, flags));
        out.vt = VT_BSTR;
        return S_OK;
    case VT_BOOL:
        return ToBool(src, out);
    case VT_DATE:
        if (src.vt == VT_BSTR) {
            const auto text = std::u16string(TextOf(src));
            hr = VarDateFromStr(text.c_str(), lcid, 0, &out.date);
        } else if (SUCCEEDED(hr = SourceNumber(src, out.date))) {
            automation::detail::DateTimeFields fields;
            if (!automation::detail::SerialToFields(out.date, fields)) hr = DISP_E_OVERFLOW;
        }
        if (SUCCEEDED(hr)) out.vt = VT_DATE;
        return hr;
    default:
        break;
    }
    if (FAILED(hr = SourceNumber(src, number))) return hr;
    switch (vt) {
    case VT_R8:
        out.dblVal = number;
        break;
    case VT_R4:
        if (std::isfinite(number) && std::fabs(number) > FLT_MAX) return DISP_E_OVERFLOW;
        out.fltVal = static_cast<FLOAT>(number);
        break;
    case VT_I4:
        if (FAILED(hr = ToInteger(number, -2147483648.0, 2147483647.0, whole))) return hr;
        out.lVal = static_cast<LONG>(whole);
        break;
    case VT_I2:
        if (FAILED(hr = ToInteger(number, -32768.0, 32767.0, whole))) return hr;
        out.iVal = static_cast<SHORT>(whole);
        break;
    case VT_UI1:
        if (FAILED(hr = ToInteger(number, 0.0, 255.0, whole))) return hr;
        out.bVal = static_cast<BYTE>(whole);
        break;
    default:
        return DISP_E_BADVARTYPE;
    }
    out.vt = vt;
    return S_OK;
}

// The value that a reference (VT_BYREF) points at, as a plain variant that
// borrows any text; false when the reference is to something else.
bool Dereference(const VARIANT &ref, VARIANT &plain)
{
    VariantInit(&plain);
    if (!ref.byref) return false;
    const VARTYPE base = ref.vt & VT_TYPEMASK;
    if (ref.vt & VT_ARRAY) return false;
    if (base == VT_VARIANT) {
        plain = *static_cast<const VARIANT *>(ref.byref);
        return !(plain.vt & VT_BYREF);
    }
    switch (base) {
    case VT_I2: plain.iVal = *static_cast<const SHORT *>(ref.byref); break;
    case VT_I4: plain.lVal = *static_cast<const LONG *>(ref.byref); break;
    case VT_R4: plain.fltVal = *static_cast<const FLOAT *>(ref.byref); break;
    case VT_R8: plain.dblVal = *static_cast<const DOUBLE *>(ref.byref); break;
    case VT_DATE: plain.date = *static_cast<const DATE *>(ref.byref); break;
    case VT_BSTR: plain.bstrVal = *static_cast<const BSTR *>(ref.byref); break;
    case VT_BOOL: plain.boolVal = *static_cast<const VARIANT_BOOL *>(ref.byref); break;
    case VT_ERROR: plain.scode = *static_cast<const SCODE *>(ref.byref); break;
    case VT_UI1: plain.bVal = *static_cast<const BYTE *>(ref.byref); break;
    default: return false;
    }
    plain.vt = base;
    return true;
}

}  // namespace

// Every LCID is served by the one fixed locale (automation/locale.h). On
// failure pvargDest is left as it was, also when it is the source.
AUTOMATION_API HRESULT VariantChangeTypeEx(VARIANT *pvargDest, const VARIANT *pvarSrc, LCID lcid,
                                           USHORT wFlags, VARTYPE vt)
{
    using automation::detail::IsValidVariantType;
    if (!pvargDest || !pvarSrc) return E_INVALIDARG;
    if (!IsValidVariantType(pvarSrc->vt) || !IsValidVariantType(vt) || (vt & VT_BYREF))
        return DISP_E_BADVARTYPE;
    return automation::ComBoundary([&]() -> HRESULT {
        VARIANT src = *pvarSrc;
        if ((src.vt & VT_BYREF) && !Dereference(*pvarSrc, src)) return DISP_E_TYPEMISMATCH;
        VARIANT result;
        VariantInit(&result);
        HRESULT hr;
        if (src.vt == vt || (IsConvertible(src.vt) && IsConvertible(vt)))
            hr = Convert(src, lcid, wFlags, vt, result);
        else if (IsObjectOrArray(src.vt) || IsObjectOrArray(vt))
            hr = DISP_E_TYPEMISMATCH;  // no default values of objects are fetched here
        else
            hr = DISP_E_BADVARTYPE;  // a type that this runtime does not convert
        if (SUCCEEDED(hr)) hr = VariantClear(pvargDest);
        if (FAILED(hr)) {
            VariantClear(&result);
            return hr;
        }
        *pvargDest = result;
        return S_OK;
    });
}

AUTOMATION_API HRESULT VariantChangeType(VARIANT *pvargDest, const VARIANT *pvarSrc,
                                         USHORT wFlags, VARTYPE vt)
{
    return VariantChangeTypeEx(pvargDest, pvarSrc, automation::kFixedLocale, wFlags, vt);
}
