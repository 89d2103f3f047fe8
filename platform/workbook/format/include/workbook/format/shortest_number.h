// SPDX-License-Identifier: MIT
// The shortest text of a double that reads back as it, exactly as
// std::to_chars(first, last, value) writes it, made without its general
// algorithm for the numbers most sheets hold: a whole part under 2^31 and up
// to four decimals. Sheets and column widths write and measure millions.
#pragma once

#include <charconv>

namespace workbook::format {

// Writes value into [first, last) and returns the end of what it wrote;
// last - first must be at least 32.
char *ShortestNumberChars(char *first, char *last, double value);

}  // namespace workbook::format
