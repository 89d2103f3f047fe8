// SPDX-License-Identifier: MIT
// The compact store of one sheet: rows sorted by number, each holding its
// cells sorted by column. A cell is 16 bytes: kind, style, column and a payload
// that is a double or an index into the workbook's string pool. Reading a
// rectangle touches only the rows and cells inside it.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "cells/cell_value.h"
#include "workbook/limits.h"

namespace workbook {

enum class CellKind : uint8_t { Empty, Number, String, Boolean, Error };

struct Cell {
    uint64_t payload = 0;  // double bits, string index, 0/1, or CellError
    uint32_t style = 0;    // index into the cell formats (cellXfs)
    uint16_t column = 0;   // 1-based
    CellKind kind = CellKind::Empty;
    uint8_t flags = 0;

    static constexpr uint8_t kHasFormula = 1;

    double Number() const { return std::bit_cast<double>(payload); }
    uint32_t StringIndex() const { return static_cast<uint32_t>(payload); }
    bool Boolean() const { return payload != 0; }
    CellError Error() const { return static_cast<CellError>(payload); }
    bool Blank() const { return kind == CellKind::Empty && style == 0; }
};
static_assert(sizeof(Cell) == 16, "a cell stays compact");

struct RowAttributes {
    uint32_t style = 0;
    float height = 0;
    uint8_t outlineLevel = 0;
    bool customFormat = false;
    bool customHeight = false;
    bool hidden = false;
    bool collapsed = false;

    bool Plain() const
    {
        return style == 0 && height == 0 && outlineLevel == 0 && !customFormat && !customHeight &&
               !hidden && !collapsed;
    }
};

struct Row {
    uint32_t index = 0;  // 1-based
    RowAttributes attributes;
    std::vector<Cell> cells;
};

// A rectangle of cells, 1-based and inclusive.
struct Rect {
    uint32_t top = 1, left = 1, bottom = 1, right = 1;
    uint64_t Rows() const { return uint64_t{bottom} - top + 1; }
    uint64_t Columns() const { return uint64_t{right} - left + 1; }
};

// A formula kept as its <f> element, so an unchanged cell is written back as read.
struct Formula {
    std::string xml;
    int64_t sharedIndex = -1;
    bool sharedMaster = false;
};

class CellStore {
public:
    // Loading: rows and cells are appended in file order; FinishLoad sorts
    // what came out of order and merges repeats.
    Row &AppendRow(uint32_t index);
    void AppendCell(Row &row, const Cell &cell);
    void FinishLoad();

    const std::vector<Row> &Rows() const { return rows_; }
    const Cell *Find(uint32_t row, uint32_t column) const;
    // Where the last lookup through it found its row and cell. Reads that walk
    // a rectangle row by row, left to right, then find each next cell without
    // a search; any other order still works, with the search.
    struct FindHint {
        size_t row = 0;
        size_t cell = 0;
    };
    const Cell *Find(uint32_t row, uint32_t column, FindHint &hint) const;
    uint64_t CellCount() const { return cellCount_; }
    // The most cells this store may hold: what the workbook's other sheets
    // leave of its whole bound.
    void LimitCells(uint64_t limit) { cellLimit_ = limit; }

    // Calls f(rowIndex, cell) for each stored cell inside r, row by row.
    template <typename F>
    void ForEach(const Rect &r, F &&f) const
    {
        auto it = std::lower_bound(rows_.begin(), rows_.end(), r.top,
                                   [](const Row &row, uint32_t i) { return row.index < i; });
        for (; it != rows_.end() && it->index <= r.bottom; ++it) {
            auto c = std::lower_bound(it->cells.begin(), it->cells.end(), r.left,
                                      [](const Cell &cell, uint32_t col) { return cell.column < col; });
            for (; c != it->cells.end() && c->column <= r.right; ++c) f(it->index, *c);
        }
    }

    // Writing. A value replaces the cell's value and formula; its style stays.
    void SetValue(uint32_t row, uint32_t column, CellKind kind, uint64_t payload);
    void SetStyle(uint32_t row, uint32_t column, uint32_t style);
    uint32_t StyleOf(uint32_t row, uint32_t column) const;
    // Removes values (and formulas) and/or styles inside r.
    void Clear(const Rect &r, bool values, bool styles);

    // The smallest rectangle holding every stored cell, if any. Kept from one
    // call to the next until the cells change, so that asking is cheap.
    std::optional<Rect> Bounds() const;

    void SetFormula(uint32_t row, uint32_t column, Formula f);
    // Gives a formula cell the result computed for it; the formula stays.
    void SetFormulaResult(uint32_t row, uint32_t column, CellKind kind, uint64_t payload);
    const Formula *FormulaOf(uint32_t row, uint32_t column) const;

private:
    static uint64_t Key(uint32_t row, uint32_t column) { return (uint64_t{row} << 16) | column; }
    Cell &Ensure(uint32_t row, uint32_t column);
    void DropFormula(uint32_t row, Cell &cell);
    void CountCell();
    void CellsChanged() { bounds_.reset(); }

    std::vector<Row> rows_;
    uint64_t cellCount_ = 0;
    uint64_t cellLimit_ = limits::kMaxCellsPerSheet;
    bool unordered_ = false;
    std::unordered_map<uint64_t, Formula> formulas_;
    mutable std::optional<std::optional<Rect>> bounds_;  // empty: to be worked out
};

}  // namespace workbook
