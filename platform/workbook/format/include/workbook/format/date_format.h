// SPDX-License-Identifier: MIT
// Tells whether a number format shows dates or times, which is how a reader
// tells a date cell from a number cell.
#pragma once

#include <string_view>

namespace workbook::format {

// True when a section for numbers holds a date or time token (y m d h s,
// AM/PM, A/P, or an elapsed [h] [m] [s]) outside quotes, escapes and
// brackets; so "[h]:mm:ss" is a time format, "0.00E+00", "\"d\"0" and
// "[Red]0" are not. A code that cannot be read is no date format.
bool IsDateFormat(std::string_view formatCode);

}  // namespace workbook::format
