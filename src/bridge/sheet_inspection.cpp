// SPDX-License-Identifier: MIT
// The inspection of a workbook against its specification string: each
// selected sheet by itself, then the sheets against each other. The first
// check that fails ends it, and tells the user why by message box (none while
// the silent flag is set). Nothing is written to the host object.
#include <algorithm>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "bridge/header_cells.h"
#include "bridge/sheet_layout.h"
#include "bridge/value_type_names.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"
#include "module/string_table.h"
#include "specification/specification.h"

using vantrel::bridge::RowCells;
using vantrel::bridge::SheetLayout;
using vantrel::bridge::TakeLayout;

namespace {

// The data columns beside the date/time columns: a run on each side.
struct ColumnRuns {
    int leftFirst = 0, leftCount = 0;
    int rightFirst = 0, rightCount = 0;
};

ColumnRuns SplitRuns(const UsedColumns &used, const SheetLayout &layout)
{
    ColumnRuns runs;
    const int first = used.firstColumn == layout.column ? layout.column + layout.columnCount : used.firstColumn;
    if (layout.column > first) {
        runs.leftFirst = first;
        runs.leftCount = layout.column - first;
        runs.rightCount = used.columnCount - runs.leftCount - layout.columnCount;
    } else {
        runs.rightCount = used.columnCount - layout.columnCount;
    }
    runs.rightFirst = layout.column + layout.columnCount;
    if (runs.rightCount < 0) runs.rightCount = 0;
    return runs;
}

std::string CellText(const VARIANT &cell)
{
    if (cell.vt == VT_BSTR) return automation::BstrToUtf8(cell.bstrVal);
    automation::Variant text;
    if (FAILED(VariantChangeType(text.Out(), &cell, 0, VT_BSTR))) return std::string();
    return automation::BstrToUtf8(text.Raw().bstrVal);
}

// A true date where the column's format spells out several fields: a number
// that the parsing takes as the date it holds.
bool IsDateCell(const VARIANT &cell, const std::string &columnFormat)
{
    automation::Variant date;
    return cell.vt == VT_R8 && vantrel::datetime::Tokenize(columnFormat).size() >= 2 &&
           SUCCEEDED(VariantChangeType(date.Out(), &cell, 0, VT_DATE));
}

}  // namespace

bool CExcelVantrel::CheckWorkbook(const std::string &spec, std::string &message)
{
    CSpecification specification;
    const int sheetCount = m_excel->GetSheetCount();
    std::string sheetText;
    specification.GetKeyValue(spec, ExcelSheet, sheetText);
    std::vector<int32_t> sheets;
    if (!specification.ParseSheetList(sheetText, sheetCount, sheets, &message)) {
        if (!message.empty()) ShowMessage(message);
        return false;
    }

    const std::string sheetSpec = specification.WithoutSheetList(spec);
    for (const int32_t sheet : sheets)
        if (!InspectSheet(sheet, sheetSpec)) return false;

    // Silent, a difference between the sheets doesn't count: the check is not run.
    if (sheets.size() >= 2 && m_silent == 0 && !CheckSheetsShareTime(sheets, sheetSpec)) {
        message = vantrel::LoadMessage(106);
        ShowMessage(message);
        return false;
    }
    return true;
}

bool CExcelVantrel::InspectSheet(int sheet, const std::string &spec)
{
    std::string ignored;
    m_excel->SelectSheet(sheet, ignored);
    const SheetLayout layout = TakeLayout(spec);

    const UsedColumns used = m_excel->GetUsedColumns();
    if (used.columnCount < 2) {
        ShowMessage(vantrel::FormatMessage(109, sheet));
        return false;
    }
    int firstRow = 1;
    vantrel::bridge::TakeStartRow(spec, firstRow);
    int rowCount = 0;
    if (layout.column < 1 || !m_excel->CountColumnCells(firstRow, rowCount, layout.column) || rowCount < 1) {
        m_report.FailAt(sheet, firstRow);
        ShowMessage(vantrel::FormatMessage(110, firstRow));
        return false;
    }
    WarnAboutUnreadCells(firstRow, rowCount, used);
    std::string deleteValue;
    if (!CSpecification().GetKeyValue(spec, DeleteValue, deleteValue)) ReadDeleteValueCell(layout.column, spec);
    if (!CheckDateTimeColumns(firstRow, rowCount, layout)) return false;

    // The data columns are checked as the two runs beside the date/time
    // columns, so dates held as text never meet the numeric check.
    const ColumnRuns runs = SplitRuns(used, layout);
    if (!CheckDataColumns(firstRow, rowCount, runs.leftFirst, runs.leftCount)) return false;
    if (!CheckDataColumns(firstRow, rowCount, runs.rightFirst, runs.rightCount)) return false;

    // The two runs check in opposite order, which decides the message when
    // both kinds of attribute are wrong.
    if (runs.leftCount > 0) {
        if (!CheckValueTypes(spec, runs.leftFirst, runs.leftCount)) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(111));
            return false;
        }
        if (!CheckTypesAndUnits(spec, runs.leftFirst, runs.leftCount)) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(112));
            return false;
        }
    }
    if (runs.rightCount > 0) {
        if (!CheckTypesAndUnits(spec, runs.rightFirst, runs.rightCount)) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(112));
            return false;
        }
        if (!CheckValueTypes(spec, runs.rightFirst, runs.rightCount)) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(111));
            return false;
        }
    }
    return true;
}

bool CExcelVantrel::CheckDateTimeColumns(int firstRow, int rowCount, const SheetLayout &layout)
{
    const int column = layout.column;
    const int columnCount = layout.columnCount;
    const std::string &format = layout.format;
    std::string error;
    if (format.empty()) {
        // True dates: one column, checked for type and rise by the cell access.
        if (m_excel->ValidateColumn(firstRow, rowCount, column, 7, error)) return true;
        if (!error.empty()) ShowMessage(error);
        return false;
    }

    automation::SafeArray block;
    m_excel->ReadStoredBlock(firstRow, rowCount, column, columnCount, block);
    RowCells row(columnCount);
    std::vector<std::string> columnFormats(static_cast<size_t>(columnCount));
    for (int c = 0; c < columnCount; ++c) CDateTimeUtil::GetColumnFormat(c, format, columnFormats[size_t(c)]);

    double previous = 0.0;
    bool previousValid = true;
    for (int r = 0; r < rowCount; ++r) {
        SAFEARRAY *cells = row.Take(block.Get(), r);
        for (LONG c = 0; c < columnCount; ++c) {
            automation::Variant cell;
            SafeArrayGetElement(cells, &c, cell.Out());
            std::string detail;
            if (!CDateTimeUtil::CheckValueAgainstFormat(CellText(cell.Raw()), columnFormats[size_t(c)], detail) &&
                !IsDateCell(cell.Raw(), columnFormats[size_t(c)])) {
                m_report.FailAt(CurrentSheet(), firstRow + r);
                ShowMessage(vantrel::FormatMessage(113, firstRow + r, column + int(c)) + detail);
                return false;
            }
        }
        automation::Variant time;
        if (!vantrel::bridge::ParseLayoutRow(cells, layout, time)) continue;  // no time: passed over
        automation::Variant date;
        if (FAILED(VariantChangeType(date.Out(), &time.Raw(), 0, VT_DATE))) {
            previousValid = false;
            continue;
        }
        const double current = date.Raw().date;
        if (previousValid && !CDateTimeUtil::IsStrictlyLater(previous, current)) {
            m_report.FailAt(CurrentSheet(), firstRow + r);
            ShowMessage(vantrel::LoadMessage(114));
            return false;
        }
        previous = current;
        previousValid = true;
    }
    return true;
}

bool CExcelVantrel::CheckDataColumns(int firstRow, int rowCount, int firstColumn, int columnCount)
{
    for (int c = 0; c < columnCount; ++c) {
        std::string error;
        if (m_excel->ValidateColumn(firstRow, rowCount, firstColumn + c, 5, error)) continue;
        if (!error.empty()) ShowMessage(error);
        return false;
    }
    return true;
}

bool CExcelVantrel::CheckTypesAndUnits(const std::string &spec, int firstColumn, int columnCount)
{
    m_unresolved = {};
    // A string that names no item type at all asks for none: the read leaves
    // them unset, as it was told, and there is nothing to refuse.
    const CSpecification specification;
    std::string ignored;
    if (!specification.GetKeyValue(spec, GlobalUnitType, ignored) && !specification.GetKeyValue(spec, UnitTypeRow, ignored) &&
        m_itemTypes.empty())
        return true;
    std::vector<int> types;
    std::vector<int> units;
    return ResolveItemTypes(spec, firstColumn, columnCount, types) &&
           ResolveUnits(spec, firstColumn, columnCount, types, units);
}

bool CExcelVantrel::CheckValueTypes(const std::string &spec, int firstColumn, int columnCount)
{
    int row = 0;
    m_unresolved = {};
    if (!CSpecification().GetKeyValueInt(spec, ValueTypeRow, row)) return true;
    if (columnCount == 0) return true;
    if (row < 1) return false;
    const int filled = m_excel->CountRowCells(row, firstColumn, columnCount);
    if (filled != 1 && filled != columnCount) {
        NoteWrongCount("value type", row, firstColumn, filled, columnCount);
        return false;
    }
    for (int i = 0; i < filled; ++i) {
        automation::Variant cell;
        m_excel->ReadCell(row, firstColumn + i, cell);
        // A whole number counts as the value type of that number.
        const automation::Variant valueType = vantrel::bridge::NormalizeValueTypeCell(cell);
        if (LookupValueType(valueType.Raw()) == -1) {
            NoteUnresolved("value type", "", row, firstColumn + i, valueType.Raw());
            return false;
        }
    }
    return true;
}

bool CExcelVantrel::CheckSheetsShareTime(const std::vector<int32_t> &sheets, const std::string &spec)
{
    const SheetLayout layout = TakeLayout(spec);
    int firstRow = 1;
    vantrel::bridge::TakeStartRow(spec, firstRow);

    std::vector<std::vector<double>> times;
    int firstRowCount = 0;
    for (size_t s = 0; s < sheets.size(); ++s) {
        std::string ignored;
        m_excel->SelectSheet(sheets[s], ignored);
        int rowCount = 0;
        if (layout.column >= 1) m_excel->CountColumnCells(firstRow, rowCount, layout.column);
        if (s == 0) firstRowCount = rowCount;
        else if (rowCount != firstRowCount) {
            m_report.FailAt(sheets[s], firstRow + std::min(rowCount, firstRowCount));
            return false;
        }

        std::vector<double> sheetTimes(size_t(rowCount), 0.0);
        if (rowCount > 0) {
            automation::SafeArray block;
            m_excel->ReadStoredBlock(firstRow, rowCount, layout.column, layout.columnCount, block);
            vantrel::bridge::BlockTimes blockTimes(block.Get(), layout);
            for (int r = 0; r < rowCount; ++r) sheetTimes[size_t(r)] = blockTimes.At(r).value_or(0.0);
        }
        times.push_back(std::move(sheetTimes));
    }
    // By value and exactly: no tolerance between the sheets.
    for (size_t s = 1; s < times.size(); ++s)
        for (size_t r = 0; r < times[s].size(); ++r)
            if (times[s][r] != times[0][r]) {
                m_report.FailAt(sheets[s], firstRow + int(r));
                return false;
            }
    return true;
}

bool CExcelVantrel::ParseRowTime(SAFEARRAY *cells, const std::string &spec, automation::Variant &time)
{
    return vantrel::bridge::ParseLayoutRow(cells, TakeLayout(spec), time);
}
