// SPDX-License-Identifier: MIT
// Moving cell values between the sheet store and automation VARIANTs.
#pragma once

#include <cstdint>

#include "automation/values.h"
#include "cells/cell_store.h"
#include "cells/cell_value.h"
#include "cells/string_pool.h"

namespace workbook {

// The value of a stored cell (null: an empty cell).
CellValue ValueOf(const Cell *cell, const StringPool &strings);

// A cell as Value2 gives it: VT_EMPTY, VT_R8, VT_BSTR, VT_BOOL or VT_ERROR.
// out must be empty (VT_EMPTY) on entry.
void FillVariant(VARIANT &out, const Cell &cell, const StringPool &strings);

// What a put of one VARIANT stores. Numbers of any width, dates (as serials),
// booleans, texts and error codes; a VT_BYREF is followed. Raises ComError
// (DISP_E_TYPEMISMATCH) for objects and nested arrays.
struct PutValue {
    CellValue value;
    bool typedText = false;  // a text to be read as a person typing it
    bool wasDate = false;    // a VT_DATE
};
PutValue FromVariant(const VARIANT &v);

}  // namespace workbook
