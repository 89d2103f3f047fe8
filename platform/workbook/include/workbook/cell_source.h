// SPDX-License-Identifier: MIT
// Direct reads of a worksheet's cell store, for callers that walk big sheets:
// what Value2 would give for a cell, without building variants. A worksheet
// of the engine offers it beside the object model (dynamic_cast from
// Worksheet); the cost of a call doesn't grow with the size of the sheet.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "automation/values.h"

namespace workbook {

struct CellContent {
    enum class Kind : uint8_t { Empty, Number, Text, Boolean, Error };
    Kind kind = Kind::Empty;
    double number = 0.0;   // Number (dates as serials)
    std::string text;      // Text
    bool boolean = false;  // Boolean
    int32_t error = 0;     // Error: the spreadsheet's code, 2000 (#NULL!) to 2043
};

// The used range's corners, 1-based and inclusive, as UsedRange reports them.
struct UsedBounds {
    int32_t firstRow = 1;
    int32_t firstColumn = 1;
    int32_t lastRow = 1;
    int32_t lastColumn = 1;
};

class CellSource {
public:
    virtual ~CellSource() = default;
    virtual CellContent GetCell(int32_t row, int32_t column) = 0;
    // Whether the cell holds a value; cheaper than GetCell for a text cell.
    virtual bool IsEmpty(int32_t row, int32_t column) = 0;
    virtual UsedBounds GetUsedBounds() = 0;
    // Calls visit for every cell that holds a value, row by row and left to
    // right; the cost grows with the cells stored, not with the used range.
    virtual void ForEachValue(const std::function<void(int32_t row, int32_t column, const CellContent &cell)> &visit) = 0;

    // The numbers of a rectangle of rowCount × columnCount cells from
    // (firstRow, firstColumn), into out column after column. A number gives
    // itself, an empty cell gives `empty`, and any other cell what `other`
    // returns for it, called row by row and left to right. The cost grows with
    // the cells stored in the rectangle. Raises ComError for a rectangle that
    // doesn't start on the sheet grid; what lies beyond it is empty.
    virtual void ReadNumbers(int32_t firstRow, int32_t rowCount, int32_t firstColumn, int32_t columnCount, double *out,
                             double empty,
                             const std::function<double(int32_t row, int32_t column, const CellContent &cell)> &other) = 0;
    // How many cells hold a value going down from (row, column) to lastRow at
    // most: the run that the first empty cell ends.
    virtual int32_t CountFilledDown(int32_t row, int32_t column, int32_t lastRow) = 0;
};

// Direct writes to a worksheet's cell store, for callers that fill big sheets:
// what Value puts into one cell, without building a Range for it. A worksheet
// of the engine offers it beside the object model (dynamic_cast from
// Worksheet), as it offers CellSource.
class CellSink {
public:
    virtual ~CellSink() = default;
    // The same as Value on the one cell at (row, column) with a VT_R8: the
    // number replaces the value and formula, the cell keeps its style, and a
    // NaN or an infinity becomes the #NUM! error. Raises ComError for a cell
    // off the sheet grid.
    virtual void PutNumber(int32_t row, int32_t column, double value) = 0;
    // The same as Value (asValue) or Value2 on the one cell with any value
    // a cell takes: a date may give the cell a date format (Value only), a
    // text is read as typed. Raises ComError as Value does for a value no
    // cell takes, and for a cell off the sheet grid.
    virtual void PutVariant(int32_t row, int32_t column, const VARIANT &value, bool asValue) = 0;
};

}  // namespace workbook
