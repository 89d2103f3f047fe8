// SPDX-License-Identifier: MIT
#include "bridge/sheet_times.h"

#include "automation/com_error.h"
#include "automation/text.h"
#include "datetime/date_time_util.h"
#include "module/string_table.h"
#include "workbook/excel_obj.h"

namespace vantrel::bridge {
namespace {

// Days from 1899-12-30 to 1904-01-01, the first day of the 1904 date system.
constexpr double kDays1900To1904 = 1462.0;

std::optional<DATE> AsDate(const VARIANT &cell)
{
    if (cell.vt == VT_DATE) return cell.date;
    automation::Variant date;
    if (FAILED(VariantChangeType(date.Out(), &cell, 0, VT_DATE))) return std::nullopt;
    return date.Raw().date;
}

std::string CellText(const VARIANT &cell)
{
    if (cell.vt == VT_BSTR) return automation::BstrToUtf8(cell.bstrVal);
    automation::Variant text;
    if (FAILED(VariantChangeType(text.Out(), &cell, 0, VT_BSTR))) return std::string();
    return automation::BstrToUtf8(text.Raw().bstrVal);
}

}  // namespace

SheetTimes::SheetTimes(CExcelObj &excel, const SheetLayout &layout, int firstRow, int rowCount, bool timesOnly)
    : excel_(excel), layout_(layout), firstRow_(firstRow), row_(layout.AllColumnCount())
{
    if (rowCount < 1) return;
    const bool date1904 = excel.Date1904();
    if (timesOnly && layout.PlainDates() && !date1904) {
        // A cell that gives no date reads 0.0 here; At looks at it once more.
        dates_.resize(size_t(rowCount));
        excel.ReadDateColumn(firstRow, rowCount, layout.column, dates_.data());
        return;
    }
    blocks_.emplace_back();
    excel.ReadStoredBlock(firstRow, rowCount, layout.column, layout.columnCount, blocks_.back());
    if (date1904) MoveTo1900Base(blocks_.back().Get(), layout.format, layout.columnCount);
    if (!layout.Split()) return;
    blocks_.emplace_back();
    excel.ReadStoredBlock(firstRow, rowCount, layout.timeColumn, layout.timeColumnCount, blocks_.back());
    if (date1904) MoveTo1900Base(blocks_.back().Get(), layout.timeFormat, layout.timeColumnCount);
}

void SheetTimes::MoveTo1900Base(SAFEARRAY *block, const std::string &format, int columnCount)
{
    LONG rows = -1;
    automation::ThrowIfFailed(SafeArrayGetUBound(block, 1, &rows), "date block");
    for (LONG c = 0; c < columnCount; ++c) {
        std::string columnFormat;
        CDateTimeUtil::GetColumnFormat(int(c), format, columnFormat);
        for (LONG r = 0; r <= rows; ++r) {
            LONG at[2] = {r, c};
            void *element = nullptr;
            automation::ThrowIfFailed(SafeArrayPtrOfIndex(block, at, &element), "date cell");
            auto &cell = *static_cast<VARIANT *>(element);
            // Only a number that is read as a date: a year column's 2012 stays 2012.
            if (cell.vt == VT_R8 && CDateTimeUtil::HoldsTrueDate(cell, columnFormat)) cell.dblVal += kDays1900To1904;
        }
    }
}

SAFEARRAY *SheetTimes::Cells(int row)
{
    std::vector<SAFEARRAY *> blocks;
    for (const auto &block : blocks_) blocks.push_back(block.Get());
    return row_.Take(blocks, row);
}

std::optional<DATE> SheetTimes::At(int row)
{
    if (!dates_.empty()) {
        if (dates_[size_t(row)] != 0.0) return dates_[size_t(row)];
        automation::Variant cell;
        excel_.ReadCell(firstRow_ + row, layout_.column, cell);
        return AsDate(cell.Raw());
    }
    if (layout_.PlainDates()) {
        LONG at[2] = {row, 0};
        void *element = nullptr;
        automation::ThrowIfFailed(SafeArrayPtrOfIndex(blocks_.front().Get(), at, &element), "row cell");
        return AsDate(*static_cast<const VARIANT *>(element));
    }
    automation::Variant time;
    if (!ParseLayoutRow(Cells(row), layout_, time)) return std::nullopt;
    return AsDate(time.Raw());
}

std::string SheetTimes::RowText(int row)
{
    SAFEARRAY *cells = Cells(row);
    std::string text;
    for (LONG c = 0; c < layout_.AllColumnCount(); ++c) {
        automation::Variant cell;
        automation::ThrowIfFailed(SafeArrayGetElement(cells, &c, cell.Out()), "row cell");
        if (c > 0) text += '|';
        text += CellText(cell.Raw());
    }
    return text;
}

std::string SheetTimes::NoTimeMessage(int row)
{
    return vantrel::FormatMessage(113, firstRow_ + row, layout_.column) + " " + automation::MessageExcerpt(RowText(row)) +
           " gives no date and time: check each field against the format, and the day against its month and year.";
}

}  // namespace vantrel::bridge
