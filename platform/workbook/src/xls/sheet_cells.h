// SPDX-License-Identifier: MIT
// The cells of one worksheet's records, in the order a converted book takes
// them (rows rising, columns rising in a row).
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "cells/cell_value.h"
#include "xls/workbook_globals.h"

namespace workbook::xls {

// One cell, small: a sheet may hold millions of them before they are sorted.
struct SheetCell {
    enum class Kind : uint8_t { Number, SharedText, OwnText, Boolean, Error };
    uint32_t row = 0;     // 0-based
    uint16_t column = 0;  // 0-based
    uint16_t xf = 0;      // the cell format
    Kind kind = Kind::Number;
    uint32_t text = 0;    // SharedText: the shared string; OwnText: in SheetCells::texts
    double number = 0;    // Number; Boolean 0 or 1; Error the CellError
};

struct SheetCells {
    std::vector<SheetCell> cells;
    std::vector<std::string> texts;  // the texts written in the sheet's own records

    // The cell's value as the book takes it.
    CellValue ValueOf(const SheetCell &cell, const WorkbookGlobals &globals) const;
};

// The cells of the worksheet whose BOF record starts at offset, up to its
// EOF; those of charts embedded in it are passed over. Raises ComError
// (kBadFile) for a sheet of more cells than the engine holds.
SheetCells ReadSheetCells(std::string_view stream, size_t offset, const WorkbookGlobals &globals);

// The offsets of the BOF records of the sheets after the globals, in the
// order they stand in the stream.
std::vector<size_t> SubstreamOffsets(std::string_view stream, size_t from);

}  // namespace workbook::xls
