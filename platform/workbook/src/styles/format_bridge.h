// SPDX-License-Identifier: MIT
// The engine's calls into the number-format library: built-in formats, the
// displayed text of a value, typed-text reading and column widths.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "cells/cell_value.h"

namespace workbook::format_bridge {

// Days between the 1900 and the 1904 date systems' day zero.
inline constexpr double kDays1900To1904 = 1462.0;

// Code of a built-in number format, or none for an id without one.
std::optional<std::string> BuiltinFormatCode(uint32_t id);
// Id of the built-in format with this code, or none.
std::optional<uint32_t> BuiltinFormatId(std::string_view code);

// The text a cell shows for value under the number format code.
std::string DisplayText(const CellValue &value, std::string_view code, bool date1904);

// What a person typing text into a cell would get, and the number format that
// typing gives the cell (empty when it keeps its own). In the 1904 date system
// a date before 1904-01-01 has no serial and stays text.
struct TypedEntry {
    CellValue value;
    std::string numberFormat;
};
TypedEntry ReadTyped(std::string_view text, bool date1904);

// Width of a column, in characters of the default font, that shows every text.
double FittingWidth(const std::vector<std::string> &texts);
// The width that one text alone needs (FittingWidth is the largest of these
// and the standard width).
double TextFittingWidth(std::string_view text);
// TextFittingWidth of the text value shows under the code "General".
double GeneralNumberFittingWidth(double value);

}  // namespace workbook::format_bridge
