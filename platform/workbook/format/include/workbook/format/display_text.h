// SPDX-License-Identifier: MIT
// The displayed text of a cell (its `Text`) under the cell's number format.
//
// Numbers: the section is chosen by sign or condition; a one-section format
// shows a negative number with '-', a second section shows it without sign.
// Displayed digits are rounded half away from zero on the number's 15
// significant digits. General shows at most 11 characters besides the sign,
// as in a column wide enough for them.
//
// Dates: serials count days since 1899-12-30, or since 1904-01-01 with
// date1904. In the 1900 system the serials 1 to 59 are shown one day later
// than that count (serial 1 is 1900-01-01), serial 60 is shown as the day
// 1900-02-29 that never was, and serial 0 as 1900-01-00. Times are rounded to
// the precision the section shows (whole seconds, or the digits of ss.000)
// before any field is cut off, so the carry reaches minutes, hours and days.
// A negative serial, or one past 9999-12-31, shows as kOverflowText.
#pragma once

#include <string>
#include <string_view>
#include <variant>

namespace workbook::format {

// What a date section shows for a serial it cannot show, and what a format
// shows when no section takes the number: a run of '#' as in a cell of the
// standard width.
inline constexpr std::string_view kOverflowText = "########";

// An error value such as "#N/A" or "#DIV/0!": shown as it stands.
struct ErrorValue {
    std::string text;
};

// A cell's content; std::monostate is the empty cell.
using CellContent = std::variant<std::monostate, double, bool, std::string, ErrorValue>;

// The displayed text of `value` under `formatCode`. Booleans show "TRUE" or
// "FALSE" and errors their text whatever the format; a text goes through the
// text section (the fourth, or a lone section with '@'), else shows as it is.
// Throws FormatCodeError for a code that cannot be read.
std::string DisplayText(const CellContent &value, std::string_view formatCode,
                        bool date1904 = false);

// The displayed text of a number: DisplayText for a double.
std::string DisplayNumber(double value, std::string_view formatCode, bool date1904 = false);

// The General rendering of a number, e.g. "0.333333333", "1.23457E+11".
std::string GeneralNumberText(double value);

}  // namespace workbook::format
