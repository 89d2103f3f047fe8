// SPDX-License-Identifier: MIT
// Numeric one-dimensional arrays in and out of variants. Values are kept as
// doubles inside the library: every element type of an item's data (float,
// double and integers of at most 32 bits) fits a double exactly.
#pragma once

#include <span>
#include <vector>

#include "automation/automation.h"

namespace hostseries::detail {

// The element type that an item of this data type hands out; 3 and unknown
// data types give 8-bit signed integers.
VARTYPE ElementTypeOfDataType(LONG dataType) noexcept;

// Reads a one-dimensional array of numbers (VT_ARRAY with R4, R8, DATE, I1,
// UI1, I2, UI2, I4, UI4, INT or UINT elements), from its lower bound on.
// DISP_E_TYPEMISMATCH when v is no such array, E_INVALIDARG for another
// number of dimensions.
HRESULT ReadNumberArray(const VARIANT &v, std::vector<double> &values);

// A new zero-based array of elementType holding values. Integers are rounded
// to the nearest and held at the type's limits; NaN becomes 0.
HRESULT MakeNumberArray(VARTYPE elementType, std::span<const double> values, VARIANT &out);

// Clears a variant that was passed in by value when the callee is done: the
// callee owns what it holds.
class TakeOwnership {
public:
    explicit TakeOwnership(VARIANT &v) noexcept : v_(v) {}
    ~TakeOwnership() { VariantClear(&v_); }
    TakeOwnership(const TakeOwnership &) = delete;
    TakeOwnership &operator=(const TakeOwnership &) = delete;

private:
    VARIANT &v_;
};

}  // namespace hostseries::detail
