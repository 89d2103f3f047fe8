// SPDX-License-Identifier: MIT
#include "cells/cell_store.h"

#include "errors.h"
#include "workbook/limits.h"

namespace workbook {

void CellStore::CountCell()
{
    if (++cellCount_ > cellLimit_) {
        if (cellLimit_ == limits::kMaxCellsPerSheet)
            Fail(kBadFile, "the sheet holds more than " + std::to_string(limits::kMaxCellsPerSheet) + " cells");
        Fail(kBadFile, "the workbook's sheets hold more than " + std::to_string(limits::kMaxCellsPerWorkbook) +
                           " cells together");
    }
}

Row &CellStore::AppendRow(uint32_t index)
{
    CellsChanged();
    size_t expected = 0;
    if (!rows_.empty()) {
        if (rows_.back().index == index) return rows_.back();
        if (rows_.back().index > index) unordered_ = true;
        expected = rows_.back().cells.size();
    }
    rows_.push_back(Row{index, {}, {}});
    // Rows of a sheet tend to be alike: room for as many cells as the last
    // one spares the growing steps and the trimming in FinishLoad.
    rows_.back().cells.reserve(expected);
    return rows_.back();
}

void CellStore::AppendCell(Row &row, const Cell &cell)
{
    CellsChanged();
    if (!row.cells.empty() && row.cells.back().column >= cell.column) unordered_ = true;
    row.cells.push_back(cell);
    CountCell();
}

void CellStore::FinishLoad()
{
    CellsChanged();
    if (unordered_) {
        // Rows or cells out of order (rare, but legal to read): sort, and let
        // the last of repeated rows and cells win.
        std::stable_sort(rows_.begin(), rows_.end(),
                         [](const Row &a, const Row &b) { return a.index < b.index; });
        std::vector<Row> merged;
        for (auto &row : rows_) {
            if (!merged.empty() && merged.back().index == row.index) {
                auto &into = merged.back();
                into.attributes = row.attributes;
                into.cells.insert(into.cells.end(), row.cells.begin(), row.cells.end());
            } else {
                merged.push_back(std::move(row));
            }
        }
        cellCount_ = 0;
        for (auto &row : merged) {
            std::stable_sort(row.cells.begin(), row.cells.end(),
                             [](const Cell &a, const Cell &b) { return a.column < b.column; });
            std::vector<Cell> unique;
            for (const auto &c : row.cells) {
                if (!unique.empty() && unique.back().column == c.column)
                    unique.back() = c;
                else
                    unique.push_back(c);
            }
            row.cells = std::move(unique);
            cellCount_ += row.cells.size();
        }
        rows_ = std::move(merged);
        unordered_ = false;
    }
    for (auto &row : rows_) row.cells.shrink_to_fit();
}

const Cell *CellStore::Find(uint32_t row, uint32_t column) const
{
    auto it = std::lower_bound(rows_.begin(), rows_.end(), row,
                               [](const Row &r, uint32_t i) { return r.index < i; });
    if (it == rows_.end() || it->index != row) return nullptr;
    auto c = std::lower_bound(it->cells.begin(), it->cells.end(), column,
                              [](const Cell &cell, uint32_t col) { return cell.column < col; });
    if (c == it->cells.end() || c->column != column) return nullptr;
    return &*c;
}

const Cell *CellStore::Find(uint32_t row, uint32_t column, FindHint &hint) const
{
    // The hint is only a guess, checked against the rows as they are now, so a
    // store changed since it was given is still read right.
    const Row *found = nullptr;
    if (hint.row < rows_.size() && rows_[hint.row].index == row) {
        found = &rows_[hint.row];
    } else if (hint.row + 1 < rows_.size() && rows_[hint.row + 1].index == row) {
        found = &rows_[++hint.row];
        hint.cell = 0;
    } else {
        auto it = std::lower_bound(rows_.begin(), rows_.end(), row,
                                   [](const Row &r, uint32_t i) { return r.index < i; });
        hint.row = static_cast<size_t>(it - rows_.begin());
        hint.cell = 0;
        if (it == rows_.end() || it->index != row) return nullptr;
        found = &*it;
    }
    const auto &cells = found->cells;
    for (size_t i = hint.cell; i < cells.size() && i < hint.cell + 2; ++i) {
        if (cells[i].column == column) {
            hint.cell = i;
            return &cells[i];
        }
        if (cells[i].column > column) break;
    }
    auto c = std::lower_bound(cells.begin(), cells.end(), column,
                              [](const Cell &cell, uint32_t col) { return cell.column < col; });
    if (c == cells.end() || c->column != column) return nullptr;
    hint.cell = static_cast<size_t>(c - cells.begin());
    return &*c;
}

Cell &CellStore::Ensure(uint32_t row, uint32_t column)
{
    CellsChanged();
    auto it = rows_.end();
    if (rows_.empty() || rows_.back().index < row) {
        // Rows are mostly written one after the other and alike: room for as
        // many cells as the last one spares the growing steps of each new row.
        const size_t expected = rows_.empty() ? 0 : rows_.back().cells.size();
        rows_.push_back(Row{row, {}, {}});
        rows_.back().cells.reserve(expected);
        it = rows_.end() - 1;
    } else {
        it = std::lower_bound(rows_.begin(), rows_.end(), row,
                              [](const Row &r, uint32_t i) { return r.index < i; });
        if (it == rows_.end() || it->index != row) it = rows_.insert(it, Row{row, {}, {}});
    }
    auto &cells = it->cells;
    if (cells.empty() || cells.back().column < column) {
        CountCell();
        Cell c;
        c.column = static_cast<uint16_t>(column);
        cells.push_back(c);
        return cells.back();
    }
    auto c = std::lower_bound(cells.begin(), cells.end(), column,
                              [](const Cell &cell, uint32_t col) { return cell.column < col; });
    if (c == cells.end() || c->column != column) {
        CountCell();
        Cell fresh;
        fresh.column = static_cast<uint16_t>(column);
        c = cells.insert(c, fresh);
    }
    return *c;
}

void CellStore::DropFormula(uint32_t row, Cell &cell)
{
    if (!(cell.flags & Cell::kHasFormula)) return;
    cell.flags &= static_cast<uint8_t>(~Cell::kHasFormula);
    auto it = formulas_.find(Key(row, cell.column));
    if (it == formulas_.end()) return;
    Formula gone = std::move(it->second);
    formulas_.erase(it);
    if (!gone.sharedMaster) return;
    // The cells sharing this formula lose their source: they keep their values.
    for (auto f = formulas_.begin(); f != formulas_.end();) {
        if (f->second.sharedIndex == gone.sharedIndex) {
            uint32_t r = static_cast<uint32_t>(f->first >> 16);
            uint32_t c = static_cast<uint32_t>(f->first & 0xFFFF);
            f = formulas_.erase(f);
            auto rowIt = std::lower_bound(rows_.begin(), rows_.end(), r,
                                          [](const Row &x, uint32_t i) { return x.index < i; });
            if (rowIt != rows_.end() && rowIt->index == r)
                for (auto &cc : rowIt->cells)
                    if (cc.column == c) cc.flags &= static_cast<uint8_t>(~Cell::kHasFormula);
        } else {
            ++f;
        }
    }
}

void CellStore::SetValue(uint32_t row, uint32_t column, CellKind kind, uint64_t payload)
{
    if (kind == CellKind::Empty) {
        // Clearing a value of a cell that isn't there is no work.
        if (!Find(row, column)) return;
    }
    Cell &c = Ensure(row, column);
    DropFormula(row, c);
    c.kind = kind;
    c.payload = kind == CellKind::Empty ? 0 : payload;
    if (c.Blank()) Clear(Rect{row, column, row, column}, true, true);
}

void CellStore::SetStyle(uint32_t row, uint32_t column, uint32_t style)
{
    if (style == 0) {
        if (!Find(row, column)) return;
        Ensure(row, column).style = 0;
        if (Find(row, column)->Blank()) Clear(Rect{row, column, row, column}, true, true);
        return;
    }
    Ensure(row, column).style = style;
}

uint32_t CellStore::StyleOf(uint32_t row, uint32_t column) const
{
    const Cell *c = Find(row, column);
    return c ? c->style : 0;
}

void CellStore::Clear(const Rect &r, bool values, bool styles)
{
    CellsChanged();
    auto it = std::lower_bound(rows_.begin(), rows_.end(), r.top,
                               [](const Row &row, uint32_t i) { return row.index < i; });
    auto firstTouched = it;
    for (; it != rows_.end() && it->index <= r.bottom; ++it) {
        auto &cells = it->cells;
        auto begin = std::lower_bound(cells.begin(), cells.end(), r.left,
                                      [](const Cell &cell, uint32_t col) { return cell.column < col; });
        auto end = begin;
        while (end != cells.end() && end->column <= r.right) {
            if (values) {
                DropFormula(it->index, *end);
                end->kind = CellKind::Empty;
                end->payload = 0;
            }
            if (styles) end->style = 0;
            ++end;
        }
        auto kept = std::remove_if(begin, end, [](const Cell &c) { return c.Blank(); });
        cellCount_ -= static_cast<uint64_t>(end - kept);
        cells.erase(kept, end);
    }
    // Rows left with neither cells nor attributes of their own go.
    rows_.erase(std::remove_if(firstTouched, it,
                               [](const Row &row) { return row.cells.empty() && row.attributes.Plain(); }),
                it);
}

std::optional<Rect> CellStore::Bounds() const
{
    if (bounds_) return *bounds_;
    std::optional<Rect> r;
    for (const auto &row : rows_) {
        if (row.cells.empty()) continue;
        uint32_t left = row.cells.front().column, right = row.cells.back().column;
        if (!r) {
            r = Rect{row.index, left, row.index, right};
            continue;
        }
        r->bottom = row.index;
        r->left = std::min(r->left, left);
        r->right = std::max(r->right, right);
    }
    bounds_ = r;
    return r;
}

void CellStore::SetFormula(uint32_t row, uint32_t column, Formula f)
{
    formulas_[Key(row, column)] = std::move(f);
}

void CellStore::SetFormulaResult(uint32_t row, uint32_t column, CellKind kind, uint64_t payload)
{
    Cell &c = Ensure(row, column);
    c.kind = kind;
    c.payload = payload;
    CellsChanged();
}

const Formula *CellStore::FormulaOf(uint32_t row, uint32_t column) const
{
    auto it = formulas_.find(Key(row, column));
    return it == formulas_.end() ? nullptr : &it->second;
}

}  // namespace workbook
