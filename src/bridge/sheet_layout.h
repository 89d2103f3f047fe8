// SPDX-License-Identifier: MIT
// Where the date/time of a sheet stands and how a row of its cells becomes a
// point in time, worked out from the specification string each time a run
// needs it. The inspection, the import and the preview share these helpers so
// that all of them read a sheet the same way.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "automation/values.h"

struct UsedColumns;

namespace vantrel::bridge {

// DateTimeCol names the one date/time layout (DateCol and TimeCol beside it
// are not read). Without it, DateCol and TimeCol together give each row the
// date of the one and the time of day of the other; either alone takes the
// rest from GlobalTime or GlobalDate.
struct SheetLayout {
    int column = 1;       // first date/time column (DateCol when split); the first column when no key names one
    int columnCount = 1;  // its columns: the fields of the format, 1 for true dates
    int mode = 0;         // 0 date and time in the cells, 1 with GlobalTime, 2 with GlobalDate
    std::string format;   // empty: the cells hold true dates
    std::string globalText;  // GlobalTime in mode 1, GlobalDate in mode 2, else empty
    // DateCol and TimeCol together: the columns of the time of day.
    int timeColumn = 0;
    int timeColumnCount = 0;
    std::string timeFormat;
    // Why no row can be read ("" when the layout is sound): a global date or
    // time that is missing or doesn't parse, or columns that overlap.
    std::string problem;

    bool Split() const { return timeColumnCount > 0; }
    // Every date/time column of a row, the time columns of a split layout too.
    int AllColumnCount() const { return columnCount + timeColumnCount; }
    bool Holds(int sheetColumn) const;
    // True dates with their times, no format: the first cell of a row is its time.
    bool PlainDates() const;
};

SheetLayout TakeLayout(const std::string &spec);

// The first data row: StartRow, and never above row 1. False when the key is absent.
bool TakeStartRow(const std::string &spec, int &row);

// A stretch of data columns: the used columns that hold no date/time.
struct ColumnRun {
    int first = 0;
    int count = 0;
};

// The data columns of a sheet in column order: the first (used columns -
// date/time columns) columns from the first used one that the layout doesn't
// hold, as the stretches between the date/time columns.
std::vector<ColumnRun> DataRuns(const UsedColumns &used, const SheetLayout &layout);

// Copies row `row` of two-dimensional blocks of variants (counted from 0),
// one block after the other, into a one-dimensional array of variants, one
// element a column.
class RowCells {
public:
    explicit RowCells(int columnCount);
    // The array holding row `row` of the blocks.
    SAFEARRAY *Take(const std::vector<SAFEARRAY *> &blocks, int row);
    SAFEARRAY *Take(SAFEARRAY *block, int row) { return Take(std::vector<SAFEARRAY *>{block}, row); }
    // The array as it stands, to be filled by the caller.
    SAFEARRAY *Array() const { return cells_.Get(); }

private:
    automation::SafeArray cells_;
    int columnCount_;
};

// The row's cells (the date columns, then the time columns of a split
// layout) to a point in time by the layout; false when they give none.
bool ParseLayoutRow(SAFEARRAY *cells, const SheetLayout &layout, automation::Variant &time);

// Two rows' times in the order that the import demands: the later one at
// least a millisecond after the earlier.
bool RisesAtTheMillisecond(DATE previous, DATE current);

// Two times that the import keeps as the same millisecond.
bool SameMillisecond(DATE a, DATE b);

}  // namespace vantrel::bridge
