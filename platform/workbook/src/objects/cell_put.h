// SPDX-License-Identifier: MIT
// What a put through Value or Value2 does to one cell: the value goes in, and
// a date or a typed text may give the cell a number format. Shared by Range
// and the worksheet's direct writes, so that both store the same.
#pragma once

#include <cstdint>

#include "cells/cell_store.h"
#include "cells/cell_values.h"
#include "ooxml/document.h"

namespace workbook {

void PutCell(Document &doc, CellStore &store, uint32_t row, uint32_t column, const PutValue &in, bool asValue);

}  // namespace workbook
