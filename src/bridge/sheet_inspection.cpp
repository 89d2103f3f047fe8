// SPDX-License-Identifier: MIT
// The inspection of a workbook against its specification string: each
// selected sheet by itself, then the sheets against each other. The first
// check that fails ends it, and tells the user why by message box (none while
// the silent flag is set). Nothing is written to the host object.
#include <algorithm>
#include <optional>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "bridge/header_cells.h"
#include "bridge/sheet_layout.h"
#include "bridge/sheet_times.h"
#include "bridge/value_type_names.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"
#include "module/string_table.h"
#include "specification/specification.h"

using vantrel::bridge::SheetLayout;
using vantrel::bridge::TakeLayout;

namespace {

std::string CellText(const VARIANT &cell)
{
    if (cell.vt == VT_BSTR) return automation::BstrToUtf8(cell.bstrVal);
    automation::Variant text;
    if (FAILED(VariantChangeType(text.Out(), &cell, 0, VT_BSTR))) return std::string();
    return automation::BstrToUtf8(text.Raw().bstrVal);
}

// What a cell of a date/time column says of itself when it doesn't fit:
// message 113 with the reason set apart, or "" when the cell fits.
std::string CellFault(const VARIANT &cell, const std::string &columnFormat, int row, int column)
{
    if (columnFormat.empty()) {
        // A true date: a number that converts to a date.
        automation::Variant date;
        if (cell.vt != VT_R8 && cell.vt != VT_DATE) return vantrel::FormatMessage(125, row, column);
        if (FAILED(VariantChangeType(date.Out(), &cell, 0, VT_DATE))) return vantrel::FormatMessage(126, row);
        return {};
    }
    std::string detail;
    if (CDateTimeUtil::CheckValueAgainstFormat(CellText(cell), columnFormat, detail) ||
        CDateTimeUtil::HoldsTrueDate(cell, columnFormat))
        return {};
    const std::string message = vantrel::FormatMessage(113, row, column);
    return detail.empty() ? message : message + " " + detail;
}

// The format of each date/time column of a row, date columns first.
std::vector<std::string> ColumnFormats(const SheetLayout &layout)
{
    std::vector<std::string> formats;
    for (int c = 0; c < layout.columnCount; ++c) CDateTimeUtil::GetColumnFormat(c, layout.format, formats.emplace_back());
    for (int c = 0; c < layout.timeColumnCount; ++c)
        CDateTimeUtil::GetColumnFormat(c, layout.timeFormat, formats.emplace_back());
    return formats;
}

int SheetColumnOf(const SheetLayout &layout, int index)
{
    return index < layout.columnCount ? layout.column + index : layout.timeColumn + index - layout.columnCount;
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
    std::string unreadable;  // the caller reports it as a workbook that doesn't open
    if (!m_excel->SelectSheet(sheet, unreadable)) return false;
    const SheetLayout layout = TakeLayout(spec);
    if (!layout.problem.empty()) {
        ShowMessage(layout.problem);
        return false;
    }

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

    // The data columns are checked as the runs beside the date/time
    // columns, so dates held as text never meet the numeric check.
    const std::vector<vantrel::bridge::ColumnRun> runs = vantrel::bridge::DataRuns(used, layout);
    for (const auto &run : runs)
        if (!CheckDataColumns(firstRow, rowCount, run.first, run.count)) return false;

    // A run left of the date/time columns checks the value types first, the
    // others the item types and units first, which decides the message when
    // both kinds of attribute are wrong.
    for (const auto &run : runs) {
        const bool left = run.first < layout.column;
        const bool valueTypesFit = CheckValueTypes(spec, run.first, run.count);
        if (left && !valueTypesFit) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(111));
            return false;
        }
        if (!CheckTypesAndUnits(spec, run.first, run.count)) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(112));
            return false;
        }
        if (!valueTypesFit) {
            m_report.Unresolved(sheet, m_unresolved);
            ShowMessage(vantrel::LoadMessage(111));
            return false;
        }
    }
    return true;
}

bool CExcelVantrel::CheckDateTimeColumns(int firstRow, int rowCount, const SheetLayout &layout)
{
    vantrel::bridge::SheetTimes times(*m_excel, layout, firstRow, rowCount);
    const std::vector<std::string> formats = ColumnFormats(layout);
    std::optional<DATE> previous;
    for (int r = 0; r < rowCount; ++r) {
        const int row = firstRow + r;
        SAFEARRAY *cells = times.Cells(r);
        for (LONG c = 0; c < LONG(formats.size()); ++c) {
            automation::Variant cell;
            SafeArrayGetElement(cells, &c, cell.Out());
            const std::string fault = CellFault(cell.Raw(), formats[size_t(c)], row, SheetColumnOf(layout, int(c)));
            if (!fault.empty()) {
                m_report.FailAt(CurrentSheet(), row);
                ShowMessage(fault);
                return false;
            }
        }
        // Cells that fit their formats and still give no time name a day
        // that the calendar doesn't have (2012-04-31) or a moment out of range.
        const std::optional<DATE> current = times.At(r);
        if (!current) {
            m_report.FailAt(CurrentSheet(), row);
            ShowMessage(times.NoTimeMessage(r));
            return false;
        }
        // At the millisecond, as the import keeps the times; the first row
        // has nothing before it.
        if (previous && !vantrel::bridge::RisesAtTheMillisecond(*previous, *current)) {
            m_report.FailAt(CurrentSheet(), row);
            if (!layout.PlainDates()) {
                ShowMessage(vantrel::LoadMessage(114));
            } else {
                const DateValue shown{*previous, kDateValid};
                ShowMessage(vantrel::FormatMessage(
                    124, CDateTimeUtil::FormatDateLocal(shown, 0, LOCALE_USER_DEFAULT).c_str()));
            }
            return false;
        }
        previous = current;
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
    // Cells whose stored number no cell holds pass as #NUM!, and are told,
    // as the read tells them.
    WarnAboutUnreadableNumbers();
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

    // Each sheet's times as the import reads them: no time is nothing.
    std::vector<std::vector<std::optional<DATE>>> times;
    for (const int32_t sheet : sheets) {
        std::string unreadable;  // the caller reports it as a workbook that doesn't open
        if (!m_excel->SelectSheet(sheet, unreadable)) return false;
        int rowCount = 0;
        if (layout.column >= 1) m_excel->CountColumnCells(firstRow, rowCount, layout.column);
        if (!times.empty() && size_t(rowCount) != times.front().size()) {
            m_report.FailAt(sheet, firstRow + int(std::min(size_t(rowCount), times.front().size())));
            return false;
        }

        vantrel::bridge::SheetTimes sheetTimes(*m_excel, layout, firstRow, rowCount, true);
        std::vector<std::optional<DATE>> rows(static_cast<size_t>(rowCount));
        for (int r = 0; r < rowCount; ++r) rows[size_t(r)] = sheetTimes.At(r);
        times.push_back(std::move(rows));
    }
    // The same millisecond in every sheet: what the import would keep.
    for (size_t s = 1; s < times.size(); ++s)
        for (size_t r = 0; r < times[s].size(); ++r) {
            const auto &mine = times[s][r], &first = times[0][r];
            if (mine.has_value() != first.has_value() ||
                (mine && !vantrel::bridge::SameMillisecond(*mine, *first))) {
                m_report.FailAt(sheets[s], firstRow + int(r));
                return false;
            }
        }
    return true;
}

bool CExcelVantrel::ParseRowTime(SAFEARRAY *cells, const std::string &spec, automation::Variant &time)
{
    return vantrel::bridge::ParseLayoutRow(cells, TakeLayout(spec), time);
}
