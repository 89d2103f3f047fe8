// SPDX-License-Identifier: MIT
#include "cells/cell_values.h"

#include <cmath>

#include "errors.h"

namespace workbook {

CellValue ValueOf(const Cell *cell, const StringPool &strings)
{
    if (!cell) return std::monostate{};
    switch (cell->kind) {
    case CellKind::Number: return cell->Number();
    case CellKind::String: return std::string(strings.Get(cell->StringIndex()));
    case CellKind::Boolean: return cell->Boolean();
    case CellKind::Error: return cell->Error();
    case CellKind::Empty: break;
    }
    return std::monostate{};
}

void FillVariant(VARIANT &out, const Cell &cell, const StringPool &strings)
{
    switch (cell.kind) {
    case CellKind::Number:
        out.vt = VT_R8;
        out.dblVal = cell.Number();
        break;
    case CellKind::String:
        out.bstrVal = automation::AllocBstr(strings.Get(cell.StringIndex()));
        out.vt = VT_BSTR;
        break;
    case CellKind::Boolean:
        out.vt = VT_BOOL;
        out.boolVal = cell.Boolean() ? VARIANT_TRUE : VARIANT_FALSE;
        break;
    case CellKind::Error:
        out.vt = VT_ERROR;
        out.scode = ErrorScode(cell.Error());
        break;
    case CellKind::Empty: break;
    }
}

namespace {

CellValue Number(double d)
{
    // A sheet holds no NaN or infinity: such a number is the #NUM! error.
    if (!std::isfinite(d)) return CellError::Num;
    return d;
}

}  // namespace

PutValue FromVariant(const VARIANT &in)
{
    const VARIANT *v = &in;
    if (v->vt == (VT_BYREF | VT_VARIANT)) v = v->pvarVal;
    if (!v) Fail(DISP_E_TYPEMISMATCH, "a null reference is no cell value");
    VARTYPE t = v->vt;
    bool byRef = (t & VT_BYREF) != 0;
    t = static_cast<VARTYPE>(t & ~VT_BYREF);
    auto get = [&](auto member) { return byRef ? *static_cast<decltype(&(v->*member))>(v->byref) : v->*member; };
    PutValue out;
    switch (t) {
    case VT_EMPTY:
    case VT_NULL: return out;
    case VT_R8: out.value = Number(get(&VARIANT::dblVal)); return out;
    case VT_R4: out.value = Number(get(&VARIANT::fltVal)); return out;
    case VT_I2: out.value = static_cast<double>(get(&VARIANT::iVal)); return out;
    case VT_I4: out.value = static_cast<double>(get(&VARIANT::lVal)); return out;
    case VT_INT: out.value = static_cast<double>(get(&VARIANT::intVal)); return out;
    case VT_I1: out.value = static_cast<double>(get(&VARIANT::cVal)); return out;
    case VT_UI1: out.value = static_cast<double>(get(&VARIANT::bVal)); return out;
    case VT_UI2: out.value = static_cast<double>(get(&VARIANT::uiVal)); return out;
    case VT_UI4: out.value = static_cast<double>(get(&VARIANT::ulVal)); return out;
    case VT_UINT: out.value = static_cast<double>(get(&VARIANT::uintVal)); return out;
    case VT_CY: out.value = static_cast<double>(get(&VARIANT::cyVal)) / 10000.0; return out;
    case VT_DATE:
        out.value = Number(get(&VARIANT::date));
        out.wasDate = true;
        return out;
    case VT_BOOL: out.value = get(&VARIANT::boolVal) != VARIANT_FALSE; return out;
    case VT_BSTR:
        out.value = automation::BstrToUtf8(get(&VARIANT::bstrVal));
        out.typedText = true;
        return out;
    case VT_ERROR: {
        SCODE code = get(&VARIANT::scode);
        if (code == DISP_E_PARAMNOTFOUND) return out;  // the missing marker clears
        auto e = ErrorFromScode(code);
        out.value = e ? *e : CellError::Value;
        return out;
    }
    default: break;
    }
    Fail(DISP_E_TYPEMISMATCH, "a value of variant type " + std::to_string(v->vt) + " can't go into a cell");
}

}  // namespace workbook
