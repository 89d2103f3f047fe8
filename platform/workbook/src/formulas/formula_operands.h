// SPDX-License-Identifier: MIT
// What the parts of a formula hand each other while it is computed, the
// spreadsheet's conversions between value types, and the functions offered.
#pragma once

#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "formulas/formula_evaluator.h"

namespace workbook {

struct RangeRef {
    size_t sheet = 0;
    Rect rect;
};

// A value, or a reference that a function may read as a range.
using Operand = std::variant<CellValue, RangeRef>;

struct FormulaContext {
    FormulaCells &cells;
    bool date1904;
};

// The value an operand stands for where one value is wanted: a reference to
// one cell gives that cell, a larger one #VALUE!.
CellValue Scalar(const Operand &operand, FormulaContext &context);

// The conversions of operators and functions: an empty cell is 0, "" or
// FALSE; a text reads as a number when it is one; an error stays an error.
std::variant<double, CellError> NumberOf(const CellValue &value);
std::variant<std::string, CellError> TextOf(const CellValue &value);
std::variant<bool, CellError> BooleanOf(const CellValue &value);

// A number as a formula shows it in text: up to 15 significant digits.
std::string NumberText(double number);

using FormulaFunction = CellValue (*)(const std::vector<Operand> &args, FormulaContext &context);

// The function of that name (upper case), or null when it isn't offered.
FormulaFunction FindFunction(std::string_view name);

}  // namespace workbook
