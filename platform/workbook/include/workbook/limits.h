// SPDX-License-Identifier: MIT
// The bounds the engine holds a workbook to. A package that goes beyond one is
// refused with automation::ComError rather than read in part, so a hostile file
// can neither exhaust memory nor make a read run for ever.
#pragma once

#include <cstddef>
#include <cstdint>

namespace workbook::limits {

// The sheet grid of the xlsx format: rows 1..1,048,576, columns A..XFD.
inline constexpr uint32_t kMaxRows = 1048576;
inline constexpr uint32_t kMaxColumns = 16384;

// Largest inflated size of one package part. Counted on the bytes actually
// inflated, never on the size an entry's header claims.
inline constexpr uint64_t kMaxPartBytes = uint64_t{1} << 30;  // 1 GiB

// Largest text of one cell, a shared string or a formula, as it stands in the
// part. A spreadsheet holds at most 32,767 characters in a cell; with UTF-8
// and _xHHHH_ escapes that is well below this, so a longer one is no real
// workbook, and refusing it early keeps a hostile part from filling memory.
inline constexpr size_t kMaxCellTextBytes = size_t{1} << 20;  // 1 MiB

// Cells kept for one sheet, values and formatted empties together (16 bytes a
// cell in the sheet store, so at most about 800 MB).
inline constexpr uint64_t kMaxCellsPerSheet = 50'000'000;

// The same bound for the sheets of a workbook read so far, all together, so
// that many sheets can't add up to what one may not hold.
inline constexpr uint64_t kMaxCellsPerWorkbook = kMaxCellsPerSheet;

// Largest sum of the inflated sizes of a workbook's sheet parts, a part that
// several sheets name counted once for each. Told from the sizes the package
// states, which hold: a part that inflates beyond its stated size is refused.
inline constexpr uint64_t kMaxWorkbookBytes = uint64_t{4} << 30;  // 4 GiB

// Elements open inside one another in any XML part.
inline constexpr uint32_t kMaxXmlDepth = 256;

// Texts in a workbook's string pool (shared strings, inline and written texts).
inline constexpr uint64_t kMaxStrings = 50'000'000;

// Entries of the zip container, sheets of a workbook, cell formats (cellXfs).
inline constexpr uint32_t kMaxPackageEntries = 100'000;
inline constexpr uint32_t kMaxSheets = 10'000;
inline constexpr uint32_t kMaxCellFormats = 1'000'000;

// Elements a Value2 array may hold (a VARIANT is 24 bytes: 2.4 GB at most).
inline constexpr uint64_t kMaxArrayElements = 100'000'000;

}  // namespace workbook::limits
