// SPDX-License-Identifier: MIT
// The cell half of CExcelObj: reads and writes on the current worksheet.
// Rectangles and columns are read from the engine's cell store directly, so
// their cost grows with the cells they return, not with the used range.
#include <algorithm>
#include <set>
#include <cmath>
#include <cstdint>
#include <cstdio>

#include "automation/com_error.h"
#include "datetime/date_time_util.h"
#include "workbook/format/typed_text.h"
#include "workbook/limits.h"
#include "module/string_table.h"
#include "workbook/excel_obj.h"
#include "workbook/live_reference.h"

using vantrel::Live;

namespace {

// What Value2 gives for a cell, as a variant.
automation::Variant ToVariant(const workbook::CellContent &cell)
{
    using Kind = workbook::CellContent::Kind;
    switch (cell.kind) {
    case Kind::Number: return automation::Variant::R8(cell.number);
    case Kind::Text: return automation::Variant::String(cell.text);
    case Kind::Boolean: return automation::Variant::Bool(cell.boolean);
    case Kind::Error: return automation::Variant::Error(SCODE(0x800A0000u | uint32_t(cell.error)));
    case Kind::Empty: break;
    }
    return automation::Variant();
}

SAFEARRAY *MakeMatrix(VARTYPE type, int rows, int cols)
{
    SAFEARRAYBOUND bounds[2] = {{ULONG(rows), 0}, {ULONG(cols), 0}};
    SAFEARRAY *array = SafeArrayCreate(type, 2, bounds);
    if (!array) throw std::bad_alloc();
    return array;
}

constexpr int64_t kLastRow = workbook::limits::kMaxRows, kLastColumn = workbook::limits::kMaxColumns;

// The direct reads build no address, so they refuse by themselves what an
// addressed range refuses: cells off the sheet grid. A count of 0 reads nothing.
void CheckAddressable(int row, int64_t rowCount, int col, int64_t colCount)
{
    const bool inside = row >= 1 && col >= 1 && rowCount >= 0 && colCount >= 0 &&
                        int64_t{row} + std::max<int64_t>(rowCount, 1) - 1 <= kLastRow &&
                        int64_t{col} + std::max<int64_t>(colCount, 1) - 1 <= kLastColumn;
    if (!inside)
        throw automation::ComError(E_INVALIDARG, "cells from row " + std::to_string(row) + ", column " +
                                                     std::to_string(col) + " (" + std::to_string(rowCount) + " by " +
                                                     std::to_string(colCount) + ") lie outside the sheet");
}

bool SameInSinglePrecision(double a, double b)
{
    return static_cast<float>(a) == static_cast<float>(b);  // false with a NaN
}

}  // namespace

std::string CExcelObj::BuildCellAddress(int row, int col)
{
    if (row < 1 || row > kLastRow || col < 1 || col > kLastColumn)
        throw automation::ComError(E_INVALIDARG, "row " + std::to_string(row) + ", column " + std::to_string(col) +
                                                     " lies outside the sheet (rows 1 to 1048576, columns 1 to 16384)");
    std::string letters;
    for (int rest = col; rest > 0; rest = (rest - 1) / 26) letters.insert(letters.begin(), char('A' + (rest - 1) % 26));
    return letters + std::to_string(row);
}

CExcelObj::TypedText CExcelObj::StoredText(std::string_view text)
{
    auto typed = workbook::format::ParseTypedText(text);
    TypedText stored;
    switch (typed.kind) {
    case workbook::format::TypedKind::Date: stored.date = true; [[fallthrough]];
    case workbook::format::TypedKind::Number: stored.value = automation::Variant::R8(typed.value); break;
    case workbook::format::TypedKind::Boolean: stored.value = automation::Variant::Bool(typed.value != 0.0); break;
    case workbook::format::TypedKind::Text: stored.value = automation::Variant::String(std::string(text)); break;
    }
    stored.numberFormat = std::move(typed.numberFormat);
    return stored;
}

bool CExcelObj::Date1904() { return Live(m_workbook).Date1904(); }

std::shared_ptr<workbook::Range> CExcelObj::CellRange(int row1, int col1, int row2, int col2)
{
    return Live(m_sheet).GetRange(BuildCellAddress(row1, col1), BuildCellAddress(row2, col2));
}

workbook::CellSource &CExcelObj::Cells()
{
    auto *cells = dynamic_cast<workbook::CellSource *>(&Live(m_sheet));
    if (!cells) throw automation::ComError(E_NOINTERFACE, "the worksheet offers no direct cell reads");
    return *cells;
}

bool CExcelObj::ReadCell(int row, int col, automation::Variant &value)
{
    value = CellRange(row, col, row, col)->GetValue2();
    return true;
}

bool CExcelObj::WriteCell(int row, int col, const VARIANT &value)
{
    CellRange(row, col, row, col)->SetValue2(value);
    return true;
}

bool CExcelObj::ReadRowTexts(int row, int col, int count, std::vector<std::string> &texts)
{
    for (int i = 0; i < count; ++i) {
        automation::Variant text = CellRange(row, col + i, row, col + i)->GetText();
        automation::Variant asText;
        if (text.Type() == VT_BSTR || SUCCEEDED(VariantChangeType(asText.Out(), &text.Raw(), 0, VT_BSTR)))
            texts.push_back(automation::BstrToUtf8(text.Type() == VT_BSTR ? text.Raw().bstrVal : asText.Raw().bstrVal));
        else
            texts.emplace_back();
    }
    return true;
}

bool CExcelObj::WriteRowTexts(int row, int col, const std::vector<std::string> &texts)
{
    const int n = int(texts.size());
    if (n == 0) return true;
    automation::SafeArray array(MakeMatrix(VT_VARIANT, 1, n));
    for (int i = 0; i < n; ++i) {
        LONG index[2] = {0, i};
        automation::Variant text = automation::Variant::String(texts[size_t(i)]);
        automation::ThrowIfFailed(SafeArrayPutElement(array.Get(), index, text.Ptr()), "array element");
    }
    const automation::Variant value = automation::Variant::Array(VT_VARIANT, array.Detach());
    // Header texts are texts: the Text format keeps "0012" or "TRUE" from
    // being typed into a number or a boolean.
    const auto cells = CellRange(row, col, row, col + n - 1);
    cells->SetNumberFormat("@");
    cells->SetValue(value.Raw());
    return true;
}

bool CExcelObj::ReadCellBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block,
                              bool asText)
{
    return ReadBlock(row, rowCount, col, colCount, block, colCount > 1 || asText);
}

bool CExcelObj::ReadStoredBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block)
{
    return ReadBlock(row, rowCount, col, colCount, block, false);
}

bool CExcelObj::ReadBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block,
                          bool changeToText)
{
    CheckAddressable(row, rowCount, col, colCount);
    block = automation::SafeArray(MakeMatrix(VT_VARIANT, rowCount, colCount));
    auto &cells = Cells();
    VARIANT *elements = nullptr;
    automation::ThrowIfFailed(SafeArrayAccessData(block.Get(), reinterpret_cast<void **>(&elements)), "block");
    try {
        for (int c = 0; c < colCount; ++c) {
            for (int r = 0; r < rowCount; ++r) {
                automation::Variant value = ToVariant(cells.GetCell(row + r, col + c));
                if (changeToText) {
                    automation::Variant text;
                    // An error cell doesn't change, and keeps its value.
                    if (SUCCEEDED(VariantChangeType(text.Out(), &value.Raw(), 0, VT_BSTR))) value = std::move(text);
                }
                elements[size_t(c) * size_t(rowCount) + size_t(r)] = value.Detach();
            }
        }
    } catch (...) {
        SafeArrayUnaccessData(block.Get());
        throw;
    }
    SafeArrayUnaccessData(block.Get());
    return true;
}

bool CExcelObj::ReadValueBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block,
                               double deleteValue, std::string &errors)
{
    CheckAddressable(row, rowCount, col, colCount);
    block = automation::SafeArray(MakeMatrix(VT_R8, rowCount, colCount));
    double *elements = nullptr;
    automation::ThrowIfFailed(SafeArrayAccessData(block.Get(), reinterpret_cast<void **>(&elements)), "block");
    SafeArrayUnaccessData(block.Get());  // the block stays alive; the pointer with it
    // A cell that is no number is met row by row, left to right, so that the
    // messages come in reading order.
    Cells().ReadNumbers(row, rowCount, col, colCount, elements, deleteValue,
                        [&](int32_t r, int32_t c, const workbook::CellContent &cell) {
                            automation::Variant number;
                            const automation::Variant original = ToVariant(cell);
                            if (SUCCEEDED(VariantChangeType(number.Out(), &original.Raw(), 0, VT_R8)))
                                return number.Raw().dblVal;
                            if (!errors.empty()) errors += "\r\n";
                            errors += vantrel::FormatMessage(127, r, c);
                            return deleteValue;
                        });
    return true;
}

bool CExcelObj::ReadDateColumn(int row, int rowCount, int col, DATE *dates)
{
    CheckAddressable(row, rowCount, col, 1);
    // A cell gives what it converts to as a date, and 0.0 when it gives none.
    const auto asDate = [](const automation::Variant &value) {
        automation::Variant date;
        return SUCCEEDED(VariantChangeType(date.Out(), &value.Raw(), 0, VT_DATE)) ? date.Raw().date : 0.0;
    };
    Cells().ReadNumbers(row, rowCount, col, 1, dates, 0.0,
                        [&](int32_t, int32_t, const workbook::CellContent &cell) { return asDate(ToVariant(cell)); });
    // Numbers from 1899-12-30 to 9999-12-31 are dates as they are; the rest
    // go through the conversion, which refuses what no date can be.
    constexpr double kLastDay = 2958465.0;
    for (int r = 0; r < rowCount; ++r)
        if (!(dates[r] >= 0.0 && dates[r] <= kLastDay)) dates[r] = asDate(automation::Variant::R8(dates[r]));
    return true;
}

bool CExcelObj::WriteDataRow(int row, int col, SAFEARRAY *timeCells, const std::vector<double> &values,
                             int writeDeleteValues, double deleteValue)
{
    LONG upper = -1;
    automation::ThrowIfFailed(SafeArrayGetUBound(timeCells, 1, &upper), "time cells");
    const int n = upper + 1;
    // The cells go straight into the store when the sheet takes direct writes
    // and every target has an address; that stores what Value2 (the time
    // cells) and Value (the numbers) would.
    const bool addressable = row >= 1 && row <= kLastRow && col >= 1 &&
                             int64_t{col} + n + int64_t(values.size()) - 1 <= kLastColumn;
    auto *sink = addressable ? dynamic_cast<workbook::CellSink *>(&Live(m_sheet)) : nullptr;
    if (n > 0 && sink) {
        for (LONG i = 0; i < n; ++i) {
            automation::Variant cell;
            automation::ThrowIfFailed(SafeArrayGetElement(timeCells, &i, cell.Out()), "time cell");
            sink->PutVariant(row, col + int(i), cell.Raw(), false);
        }
    } else if (n > 0) {
        // One row of cells in one call.
        automation::SafeArray row1(MakeMatrix(VT_VARIANT, 1, n));
        for (LONG i = 0; i < n; ++i) {
            automation::Variant cell;
            automation::ThrowIfFailed(SafeArrayGetElement(timeCells, &i, cell.Out()), "time cell");
            LONG index[2] = {0, i};
            automation::ThrowIfFailed(SafeArrayPutElement(row1.Get(), index, cell.Ptr()), "time cell");
        }
        const automation::Variant array = automation::Variant::Array(VT_VARIANT, row1.Detach());
        CellRange(row, col, row, col + n - 1)->SetValue2(array.Raw());
    }
    WriteRowValues(sink, row, col + n, values, writeDeleteValues, deleteValue);
    return true;
}

void CExcelObj::WriteRowValues(workbook::CellSink *sink, int row, int col, const std::vector<double> &values,
                               int writeDeleteValues, double deleteValue)
{
    for (size_t i = 0; i < values.size(); ++i) {
        if (!writeDeleteValues && SameInSinglePrecision(values[i], deleteValue)) continue;
        const int target = col + int(i);
        if (sink)
            sink->PutNumber(row, target, values[i]);
        else
            CellRange(row, target, row, target)->SetValue(automation::Variant::R8(values[i]).Raw());
    }
}

std::optional<double> CExcelObj::SerialInWorkbook(KnownNumber number)
{
    // As the engine stores a date: the same serial in the 1900 date system
    // and for a time of day alone, 1462 days less in the 1904 system, where
    // a day before 1904-01-01 has none.
    constexpr double kDays1900To1904 = 1462.0;
    if (!number.date || number.value < 1.0 || !Date1904()) return number.value;
    if (number.value >= kDays1900To1904) return number.value - kDays1900To1904;
    return std::nullopt;
}

bool CExcelObj::WriteKnownRow(int row, int col, std::span<const KnownNumber> timeCells,
                              const std::vector<double> &values, int writeDeleteValues, double deleteValue)
{
    const int n = int(timeCells.size());
    const bool addressable = row >= 1 && row <= kLastRow && col >= 1 &&
                             int64_t{col} + n + int64_t(values.size()) - 1 <= kLastColumn;
    auto *sink = addressable ? dynamic_cast<workbook::CellSink *>(&Live(m_sheet)) : nullptr;
    if (!sink) return false;
    double serials[16];
    if (size_t(n) > std::size(serials)) return false;
    for (int i = 0; i < n; ++i) {
        const auto serial = SerialInWorkbook(timeCells[size_t(i)]);
        if (!serial || !std::isfinite(*serial)) return false;
        serials[i] = *serial;
    }
    for (int i = 0; i < n; ++i) sink->PutNumber(row, col + i, serials[i]);
    WriteRowValues(sink, row, col + n, values, writeDeleteValues, deleteValue);
    return true;
}

std::vector<workbook::UnreadableNumber> CExcelObj::UnreadableNumbers() { return Live(m_sheet).UnreadableNumbers(); }

std::optional<bool> CExcelObj::HoldsKnownNumber(int row, int col, KnownNumber number)
{
    CheckAddressable(row, 1, col, 1);
    const auto serial = SerialInWorkbook(number);
    if (!serial) return std::nullopt;
    const workbook::CellContent cell = Cells().GetCell(row, col);
    return cell.kind == workbook::CellContent::Kind::Number && cell.number == *serial;
}

bool CExcelObj::ValidateColumn(int firstRow, int rowCount, int col, int expectedType, std::string &error)
{
    using Kind = workbook::CellContent::Kind;
    CheckAddressable(firstRow, rowCount, col, 1);
    auto &cells = Cells();
    double previous = 0.0;
    // A stored number no cell holds reads as #NUM! and imports, with a
    // warning, as a missing value: an item column may hold it.
    std::set<int> unreadableRows;
    if (expectedType == 5)
        for (const workbook::UnreadableNumber &number : UnreadableNumbers())
            if (number.column == col && !number.underflow) unreadableRows.insert(number.row);
    const auto isUnreadable = [&](int row) { return unreadableRows.count(row) > 0; };
    for (int i = 0; i < rowCount; ++i) {
        const int row = firstRow + i;
        const workbook::CellContent cell = cells.GetCell(row, col);
        if (expectedType == 5) {
            if (cell.kind != Kind::Empty && cell.kind != Kind::Number && !(cell.kind == Kind::Error && isUnreadable(row))) {
                error = vantrel::FormatMessage(144, row);
                return false;
            }
            continue;
        }
        if (cell.kind != Kind::Number) {
            error = vantrel::FormatMessage(125, row, col);
            return false;
        }
        automation::Variant date;
        const automation::Variant number = automation::Variant::R8(cell.number);
        if (FAILED(VariantChangeType(date.Out(), &number.Raw(), 0, VT_DATE))) {
            error = vantrel::FormatMessage(126, row);
            return false;
        }
        if (!CDateTimeUtil::IsStrictlyLater(previous, date.Raw().date)) {
            DateValue previousDate;
            previousDate.serial = previous;
            previousDate.status = kDateValid;
            error = vantrel::FormatMessage(
                124, CDateTimeUtil::FormatDateLocal(previousDate, 0, LOCALE_USER_DEFAULT).c_str());
            return false;
        }
        previous = date.Raw().date;
    }
    return true;
}

int CExcelObj::CountRowCells(int row, int col, int count)
{
    auto &cells = Cells();
    const int m = count < 2 ? 2 : count;
    CheckAddressable(row, 1, col, m);
    int filled = 0;
    while (filled < m && !cells.IsEmpty(row, col + filled)) ++filled;
    return filled;
}

bool CExcelObj::CountColumnCells(int row, int &cellCount, int col)
{
    auto &cells = Cells();
    const workbook::UsedBounds used = cells.GetUsedBounds();
    if (used.firstRow == used.lastRow && used.firstColumn == used.lastColumn) return false;
    if (col > used.lastColumn || row > used.lastRow) return false;
    const int startRow = row > used.firstRow ? row : used.firstRow;
    const int column = col > used.firstColumn ? col : used.firstColumn;
    cellCount = cells.CountFilledDown(startRow, column, used.lastRow);
    return true;
}

UsedColumns CExcelObj::GetUsedColumns()
{
    auto &cells = Cells();
    const workbook::UsedBounds used = cells.GetUsedBounds();
    UsedColumns result;
    if (used.firstRow == used.lastRow && used.firstColumn == used.lastColumn) return result;
    result.firstColumn = used.firstColumn;
    // The row cursor is not reset between columns: a column searched to the
    // bottom without a hit ends the count for every later column.
    int cursor = used.firstRow;
    for (int column = used.firstColumn; column <= used.lastColumn; ++column) {
        while (cursor <= used.lastRow && cells.IsEmpty(cursor, column)) ++cursor;
        if (cursor <= used.lastRow) ++result.columnCount;
    }
    return result;
}

int CExcelObj::GetUsedRowCount()
{
    const workbook::UsedBounds used = Cells().GetUsedBounds();
    if (used.firstRow == used.lastRow && used.firstColumn == used.lastColumn) return 1;
    return used.lastRow - used.firstRow + 1;
}

bool CExcelObj::SetColumnNumberFormat(int firstRow, int rowCount, int col, const std::string &format)
{
    auto range = CellRange(firstRow, col, firstRow + rowCount - 1, col);
    range->ClearFormats();
    // "0" stands for the general format: no number format is set.
    if (format != "0") range->SetNumberFormat(format);
    return true;
}

bool CExcelObj::ApplyNumberFormat(int firstRow, int rowCount, int col, const std::string &format)
{
    CellRange(firstRow, col, firstRow + rowCount - 1, col)->SetNumberFormat(format);
    return true;
}

bool CExcelObj::ClearColumnFormats(int firstRow, int rowCount, int firstCol, int colCount)
{
    // Side by side columns clear as one rectangle, in one walk of the rows;
    // the result is that of clearing them one by one.
    if (colCount > 1 && firstCol >= 1 && int64_t{firstCol} + colCount - 1 <= kLastColumn) {
        CellRange(firstRow, firstCol, firstRow + rowCount - 1, firstCol + colCount - 1)->ClearFormats();
        return true;
    }
    for (int c = 0; c < colCount; ++c) CellRange(firstRow, firstCol + c, firstRow + rowCount - 1, firstCol + c)->ClearFormats();
    return true;
}

bool CExcelObj::SetDateTimeColumnFormat(int firstRow, int rowCount, int col, const std::string &format)
{
    if (CDateTimeUtil::GetFormatColumnCount(format) != 1 || CDateTimeUtil::ClassifyFormat(format) != kFormatDateAndTime)
        return true;
    std::string columnFormat;
    CDateTimeUtil::GetColumnFormat(0, format, columnFormat);
    return SetColumnNumberFormat(firstRow, rowCount, col, columnFormat);
}
