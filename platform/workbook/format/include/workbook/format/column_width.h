// SPDX-License-Identifier: MIT
// Column widths for AutoFit, in the file format's width unit for the default
// font (maximum digit width 7 pixels):
//   width = Truncate((pixels + 5) / 7 * 256) / 256
// where pixels is the text's width and 5 the cell's padding. The object
// model's ColumnWidth is the number of digits that fit, without the padding.
#pragma once

#include <span>
#include <string>
#include <string_view>

namespace workbook::format {

// The standard column: 8.43 digits wide, 64 pixels, stored as 9.140625.
inline constexpr double kDefaultColumnWidth = 9.140625;
inline constexpr double kDefaultColumnCharacters = 8.43;

// The pixel width of a displayed text (UTF-8), approximated by classes of
// characters: digits and most letters 7 px, narrow ones (i l t . , : ; ' |
// space ...) 4 px, wide ones (m w M W @ % &) 11 px, East Asian wide and
// fullwidth characters 14 px, combining marks 0. Bytes that are not UTF-8
// count as one 7-pixel character each.
int TextPixels(std::string_view displayed);

// The file width of a column that shows `displayed` in full.
double TextWidth(std::string_view displayed);

// The file width of a column that shows value under the General format:
// TextWidth of its General text, most often worked out without making it.
double GeneralNumberWidth(double value);

// The file width that shows every text in full, never below the standard
// column (kDefaultColumnWidth).
double AutoFitWidth(std::span<const std::string> texts);

// The object model's ColumnWidth (digits that fit, two decimals) for a file
// width: 9.140625 gives 8.43.
double ColumnWidthCharacters(double fileWidth);

}  // namespace workbook::format
