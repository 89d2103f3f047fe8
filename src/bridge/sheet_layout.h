// SPDX-License-Identifier: MIT
// Where the date/time of a sheet stands and how a row of its cells becomes a
// point in time, worked out from the specification string each time a run
// needs it. The inspection and the import share these helpers so that both
// read a sheet the same way.
#pragma once

#include <optional>
#include <string>

#include "automation/values.h"

namespace vantrel::bridge {

struct SheetLayout {
    int column = 1;       // first date/time column; the first column when no key names one
    int columnCount = 1;  // date/time columns: the fields of the format, 1 for true dates
    int mode = 0;         // 0 date and time in the cells, 1 with GlobalTime, 2 with GlobalDate
    std::string format;   // empty: the cells hold true dates
    std::string globalText;  // GlobalTime in mode 1, GlobalDate in mode 2, else empty

    bool Holds(int sheetColumn) const { return sheetColumn >= column && sheetColumn < column + columnCount; }
    // True dates with their times, no format: the first cell of a row is its time.
    bool PlainDates() const;
};

SheetLayout TakeLayout(const std::string &spec);

// The first data row: StartRow, and never above row 1. False when the key is absent.
bool TakeStartRow(const std::string &spec, int &row);

// Copies row `row` of a two-dimensional block of variants (counted from 0)
// into a one-dimensional array of variants, one element a column.
class RowCells {
public:
    explicit RowCells(int columnCount);
    // The array holding row `row` of block.
    SAFEARRAY *Take(SAFEARRAY *block, int row);

private:
    automation::SafeArray cells_;
    int columnCount_;
};

// The row's cells to a point in time by the layout; false when they give none.
bool ParseLayoutRow(SAFEARRAY *cells, const SheetLayout &layout, automation::Variant &time);

// The times of the rows of a two-dimensional block of date/time cells (counted
// from 0), as ParseLayoutRow gives them, as dates.
class BlockTimes {
public:
    BlockTimes(SAFEARRAY *block, const SheetLayout &layout);
    // The time of row `row`; nothing when its cells give none.
    std::optional<DATE> At(int row);

private:
    SAFEARRAY *block_;
    const SheetLayout &layout_;
    RowCells row_;
    // True dates in one cell, with no format: each cell is read in place
    // rather than copied into a row first.
    bool inPlace_;
};

}  // namespace vantrel::bridge
