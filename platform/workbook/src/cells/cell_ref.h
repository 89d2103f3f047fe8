// SPDX-License-Identifier: MIT
// A1-style cell addresses.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "cells/cell_store.h"

namespace workbook {

struct CellPos {
    uint32_t row = 0;     // 1-based; 0 when the reference has no row part
    uint32_t column = 0;  // 1-based; 0 when the reference has no column part
};

// "B3", "$B$3", "b3". The letters and digits may be absent (as in a cell's r
// attribute giving only a column); values beyond the sheet are returned as
// read for the caller to refuse. None when the text isn't a reference.
std::optional<CellPos> ParseCellRef(std::string_view text);

// A full cell reference within the sheet grid, or none.
std::optional<CellPos> ParseCellAddress(std::string_view text);

// "B3:D10" or "B3" (a single cell).
std::optional<Rect> ParseRangeAddress(std::string_view text);

std::string ColumnName(uint32_t column);
std::string CellAddress(uint32_t row, uint32_t column);
std::string RangeAddress(const Rect &r);

}  // namespace workbook
