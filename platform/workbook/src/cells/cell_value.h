// SPDX-License-Identifier: MIT
// A cell's value as a closed sum type, and the spreadsheet's error values.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

#include "automation/automation.h"

namespace workbook {

enum class CellError : uint8_t { Null, Div0, Value, Ref, Name, Num, NA, GettingData };

// Empty, number (dates too, as serials), text, boolean or error.
using CellValue = std::variant<std::monostate, double, std::string, bool, CellError>;

// "#DIV/0!" and so on.
std::string_view ErrorText(CellError e);
std::optional<CellError> ErrorFromText(std::string_view text);

// The VT_ERROR code of a cell error: 0x800A0000 | 2000, 2007, ...
SCODE ErrorScode(CellError e);
std::optional<CellError> ErrorFromScode(SCODE code);

}  // namespace workbook
