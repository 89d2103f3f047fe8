// SPDX-License-Identifier: MIT
// The cells that a run passes over without a word of its own: the rows end at
// the first blank date/time cell, and the columns at the first empty column;
// whatever holds data beyond, and a stored number no cell holds, is told as a warning.
#include "bridge/excel_vantrel.h"

int CExcelVantrel::CurrentSheet() const { return m_excel ? m_excel->GetSelectedSheet() : 0; }

void CExcelVantrel::WarnAboutUnreadCells(int firstRow, int rowCount, const UsedColumns &used)
{
    const workbook::UsedBounds bounds = m_excel->GetUsedBounds();
    const int blankRow = firstRow + (rowCount > 0 ? rowCount : 0);
    // The used range says where to look; only a value counts, not a format.
    if (bounds.lastRow >= blankRow)
        if (const auto beyond = m_excel->ValuesFrom(blankRow, 1))
            m_report.RowsAfterBlank(CurrentSheet(), blankRow, beyond->row);
    const int lastRead = used.firstColumn + used.columnCount - 1;
    if (used.columnCount >= 1 && bounds.lastColumn > lastRead)
        if (const auto beyond = m_excel->ValuesFrom(1, lastRead + 1))
            m_report.ColumnsAfterEmpty(CurrentSheet(), lastRead, beyond->column);
}

void CExcelVantrel::WarnAboutUnreadableNumbers()
{
    if (const auto unreadable = m_excel->UnreadableNumbers(); !unreadable.empty()) {
        const workbook::UnreadableNumber &first = unreadable.front();
        m_report.UnreadableNumbers(CurrentSheet(), first.row, first.column, first.excerpt, first.underflow, unreadable.size());
    }
}
