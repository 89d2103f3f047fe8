// SPDX-License-Identifier: MIT
// Where the cells of a sheet reach: the used range, and the values that lie
// beyond what a run reads, so that the run can tell what it passes over.
#include <algorithm>

#include "workbook/excel_obj.h"

workbook::UsedBounds CExcelObj::GetUsedBounds() { return Cells().GetUsedBounds(); }

std::optional<CExcelObj::ValueCorner> CExcelObj::ValuesFrom(int firstRow, int firstColumn)
{
    std::optional<ValueCorner> corner;
    Cells().ForEachValue([&](int32_t row, int32_t column, const workbook::CellContent &) {
        if (row < firstRow || column < firstColumn) return;
        if (!corner) corner = ValueCorner{row, column};
        corner->row = std::min<int>(corner->row, row);
        corner->column = std::min<int>(corner->column, column);
    });
    return corner;
}
