// SPDX-License-Identifier: MIT
// What the engine keeps of one worksheet part: its cells, its column entries,
// and where the elements it rewrites stand in the part's XML.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cells/cell_store.h"
#include "workbook/engine.h"
#include "xml/xml_splice.h"

namespace workbook {

// One <col> entry of the sheet's <cols>.
struct ColumnSpec {
    uint32_t min = 0, max = 0;
    double width = 0;
    uint32_t style = 0;
    bool customWidth = false;
    bool bestFit = false;
    bool hidden = false;
    std::string otherAttributes;  // the attributes the engine doesn't use, as XML
};

// Positions in the sheet XML: the three elements a save replaces, and where
// each would go in a part that lacks it.
struct SheetLayout {
    xml::RootShape root;
    xml::Span dimension, cols, sheetData;
    uint64_t dimensionAt = 0;  // after sheetPr, or after the root's start tag
    uint64_t colsAt = 0;       // after sheetFormatPr/sheetViews/dimension
};

// A formula the file holds without a result (libraries that write workbooks
// leave the computing to the program that opens them), or the master of a
// group of shared formulas, whose text the others of the group take.
struct FormulaSource {
    uint32_t row = 0, column = 0;
    std::string text;           // without the leading '='; empty for a shared one that isn't the master
    int64_t sharedIndex = -1;   // the group of a shared formula
    bool array = false;         // an array formula (or a data table): not computed
};

struct SheetModel {
    CellStore store;
    std::vector<FormulaSource> formulasWithoutResult;
    std::vector<FormulaSource> sharedMasters;
    std::vector<ColumnSpec> columns;
    std::vector<UnreadableNumber> unreadableNumbers;
    SheetLayout layout;
};

}  // namespace workbook
