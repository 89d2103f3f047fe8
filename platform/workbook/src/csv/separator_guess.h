// SPDX-License-Identifier: MIT
// Which of comma, semicolon and tab separates the fields of a text, found from
// its first lines as a person would see it: the separator that splits every
// line into the same number of fields, quotes respected.
#pragma once

#include <string_view>

namespace workbook::csv {

// How much of the text the guess looks at, at most.
inline constexpr size_t kSeparatorSampleBytes = 64 * 1024;

// sample is the start of the text (the whole text when whole is true). Of the
// separators that split each of its lines alike into two fields or more, tab
// wins over semicolon and semicolon over comma (a comma may be a decimal
// separator inside fields; the others seldom are). Without such a separator,
// the one that splits the most lines; comma when none splits any.
char GuessSeparator(std::string_view sample, bool whole);

}  // namespace workbook::csv
