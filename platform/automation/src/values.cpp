// SPDX-License-Identifier: MIT
// The out-of-line members of the RAII value owners.
#include "automation/values.h"

#include "automation/com_error.h"

namespace automation {

Variant Variant::I4(LONG v)
{
    Variant r;
    r.v_.vt = VT_I4;
    r.v_.lVal = v;
    return r;
}

Variant Variant::I2(SHORT v)
{
    Variant r;
    r.v_.vt = VT_I2;
    r.v_.iVal = v;
    return r;
}

Variant Variant::R4(FLOAT v)
{
    Variant r;
    r.v_.vt = VT_R4;
    r.v_.fltVal = v;
    return r;
}

Variant Variant::R8(DOUBLE v)
{
    Variant r;
    r.v_.vt = VT_R8;
    r.v_.dblVal = v;
    return r;
}

Variant Variant::Date(DATE v)
{
    Variant r;
    r.v_.vt = VT_DATE;
    r.v_.date = v;
    return r;
}

Variant Variant::Bool(bool v)
{
    Variant r;
    r.v_.vt = VT_BOOL;
    r.v_.boolVal = v ? VARIANT_TRUE : VARIANT_FALSE;
    return r;
}

Variant Variant::Error(SCODE v)
{
    Variant r;
    r.v_.vt = VT_ERROR;
    r.v_.scode = v;
    return r;
}

Variant Variant::String(std::string_view utf8)
{
    Variant r;
    r.v_.bstrVal = AllocBstr(utf8);
    r.v_.vt = VT_BSTR;
    return r;
}

Variant Variant::Array(VARTYPE elementType, SAFEARRAY *psa) noexcept
{
    Variant r;
    r.v_.vt = static_cast<VARTYPE>(VT_ARRAY | elementType);
    r.v_.parray = psa;
    return r;
}

void Variant::Check(HRESULT hr) { ThrowIfFailed(hr, "variant copy"); }

}  // namespace automation
