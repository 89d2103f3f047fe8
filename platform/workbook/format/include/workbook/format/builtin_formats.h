// SPDX-License-Identifier: MIT
// The built-in number formats: a workbook names them by id (numFmtId) without
// writing their code, so reader and writer share this one table (en-US).
#pragma once

#include <string>
#include <string_view>

namespace workbook::format {

// The code of built-in format `id` (0 to 49), or the empty string for an id
// that has none (23 to 26, and anything outside 0 to 49).
// Id 14 is "m/d/yyyy" and id 22 "m/d/yyyy h:mm", as the application shows
// them; the file format's documentation writes them "mm-dd-yy" and
// "m/d/yy h:mm". The East Asian date ids 27 to 36 show as an English locale
// shows them: "h:mm" for 32, "h:mm:ss" for 33, the short date "m/d/yyyy"
// for the others.
std::string BuiltinFormatCode(int id);

// The id of a built-in format code, or -1. Besides the codes above it knows
// the spellings other writers use for the same formats ("mm-dd-yy",
// "\"$\"#,##0_);(\"$\"#,##0)", "#,##0 ;(#,##0)" ...); "General" in any case.
// A code that ids 27 to 36 share with a lower id gives the lower one.
int BuiltinFormatId(std::string_view code);

}  // namespace workbook::format
