// SPDX-License-Identifier: MIT
#include "cells/cell_ref.h"

#include "workbook/limits.h"

namespace workbook {

std::optional<CellPos> ParseCellRef(std::string_view s)
{
    size_t i = 0;
    if (i < s.size() && s[i] == '$') ++i;
    uint64_t col = 0;
    size_t letters = 0;
    while (i < s.size()) {
        char c = s[i];
        if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
        if (c < 'A' || c > 'Z') break;
        if (++letters > 4) return std::nullopt;
        col = col * 26 + static_cast<uint64_t>(c - 'A' + 1);
        ++i;
    }
    if (i < s.size() && s[i] == '$') ++i;
    uint64_t row = 0;
    size_t digits = 0;
    while (i < s.size() && s[i] >= '0' && s[i] <= '9') {
        if (++digits > 10) return std::nullopt;
        row = row * 10 + static_cast<uint64_t>(s[i] - '0');
        ++i;
    }
    if (i != s.size() || (letters == 0 && digits == 0)) return std::nullopt;
    if (row > UINT32_MAX || col > UINT32_MAX) return std::nullopt;
    return CellPos{static_cast<uint32_t>(row), static_cast<uint32_t>(col)};
}

std::optional<CellPos> ParseCellAddress(std::string_view text)
{
    auto p = ParseCellRef(text);
    if (!p || p->row < 1 || p->column < 1 || p->row > limits::kMaxRows || p->column > limits::kMaxColumns)
        return std::nullopt;
    return p;
}

std::optional<Rect> ParseRangeAddress(std::string_view text)
{
    size_t colon = text.find(':');
    auto a = ParseCellAddress(text.substr(0, colon));
    if (!a) return std::nullopt;
    CellPos b = *a;
    if (colon != std::string_view::npos) {
        auto other = ParseCellAddress(text.substr(colon + 1));
        if (!other) return std::nullopt;
        b = *other;
    }
    return Rect{std::min(a->row, b.row), std::min(a->column, b.column), std::max(a->row, b.row),
                std::max(a->column, b.column)};
}

std::string ColumnName(uint32_t column)
{
    std::string name;
    while (column > 0) {
        uint32_t rem = (column - 1) % 26;
        name.insert(name.begin(), static_cast<char>('A' + rem));
        column = (column - 1) / 26;
    }
    return name;
}

std::string CellAddress(uint32_t row, uint32_t column) { return ColumnName(column) + std::to_string(row); }

std::string RangeAddress(const Rect &r)
{
    std::string a = CellAddress(r.top, r.left);
    if (r.top == r.bottom && r.left == r.right) return a;
    return a + ":" + CellAddress(r.bottom, r.right);
}

}  // namespace workbook
