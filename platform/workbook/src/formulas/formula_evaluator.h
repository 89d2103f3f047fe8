// SPDX-License-Identifier: MIT
// Computes one formula from the tokens the formula library parsed it into:
// operators, references within the workbook and the common functions, with
// the spreadsheet's rules for types and errors. A result that is an error
// value (#DIV/0!, #VALUE!, ...) is a result; what can't be computed at all (an
// unknown function or name, a function not offered here) is a FormulaFailure.
#pragma once

#include <cstdint>
#include <functional>
#include <stdexcept>

#include <ixion/address.hpp>
#include <ixion/formula_tokens.hpp>
#include <ixion/interface/formula_model_access.hpp>

#include "cells/cell_store.h"
#include "cells/cell_value.h"

namespace workbook {

// Why a formula can't be computed, in words for the user.
class FormulaFailure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// The cells a formula reads; sheets count from 0, rows and columns from 1.
class FormulaCells {
public:
    virtual ~FormulaCells() = default;
    virtual CellValue Value(size_t sheet, uint32_t row, uint32_t column) = 0;
    // Calls visit for every cell inside r that holds a value.
    virtual void ForEachValue(size_t sheet, const Rect &r, const std::function<void(const CellValue &)> &visit) = 0;
};

// The value of the formula whose tokens stand at pos (an empty result is 0).
CellValue EvaluateFormula(const ixion::formula_tokens_t &tokens, const ixion::abs_address_t &pos,
                          const ixion::iface::formula_model_access &model, FormulaCells &cells, bool date1904);

}  // namespace workbook
