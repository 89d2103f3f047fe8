// SPDX-License-Identifier: MIT
#include "bridge/sheet_layout.h"

#include <new>

#include "automation/com_error.h"
#include "datetime/date_time_util.h"
#include "specification/specification.h"

namespace vantrel::bridge {

SheetLayout TakeLayout(const std::string &spec)
{
    SheetLayout layout;
    CSpecification specification;
    specification.GetDateTimeLayout(spec, layout.column, layout.columnCount, layout.mode, layout.format);
    if (layout.mode == kModeDateWithGlobalTime) specification.GetKeyValue(spec, GlobalTime, layout.globalText);
    if (layout.mode == kModeTimeWithGlobalDate) specification.GetKeyValue(spec, GlobalDate, layout.globalText);
    return layout;
}

bool TakeStartRow(const std::string &spec, int &row)
{
    row = 0;
    const bool present = CSpecification().GetKeyValueInt(spec, StartRow, row);
    // Row 0 and below name no sheet row; the count of the date/time cells
    // starts at the used range's first row for them, and so do the reads.
    if (row < 1) row = 1;
    return present;
}

RowCells::RowCells(int columnCount) : columnCount_(columnCount)
{
    cells_ = automation::SafeArray(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(columnCount < 1 ? 1 : columnCount)));
    if (!cells_.Get()) throw std::bad_alloc();
}

SAFEARRAY *RowCells::Take(SAFEARRAY *block, int row)
{
    for (LONG c = 0; c < columnCount_; ++c) {
        LONG from[2] = {row, c};
        automation::Variant cell;
        automation::ThrowIfFailed(SafeArrayGetElement(block, from, cell.Out()), "row cell");
        automation::ThrowIfFailed(SafeArrayPutElement(cells_.Get(), &c, cell.Ptr()), "row cell");
    }
    return cells_.Get();
}

bool SheetLayout::PlainDates() const { return format.empty() && mode == kModeDateAndTime; }

BlockTimes::BlockTimes(SAFEARRAY *block, const SheetLayout &layout)
    : block_(block), layout_(layout), row_(layout.columnCount),
      inPlace_(layout.PlainDates())
{
}

std::optional<DATE> BlockTimes::At(int row)
{
    if (inPlace_) {
        // What the general road below comes to for such a layout: the first
        // cell of the row as a date.
        LONG at[2] = {row, 0};
        void *element = nullptr;
        automation::ThrowIfFailed(SafeArrayPtrOfIndex(block_, at, &element), "row cell");
        const VARIANT &cell = *static_cast<const VARIANT *>(element);
        if (cell.vt == VT_DATE) return cell.date;
        automation::Variant date;
        if (FAILED(VariantChangeType(date.Out(), &cell, 0, VT_DATE))) return std::nullopt;
        return date.Raw().date;
    }
    automation::Variant time;
    automation::Variant date;
    if (!ParseLayoutRow(row_.Take(block_, row), layout_, time) ||
        FAILED(VariantChangeType(date.Out(), &time.Raw(), 0, VT_DATE)))
        return std::nullopt;
    return date.Raw().date;
}

bool ParseLayoutRow(SAFEARRAY *cells, const SheetLayout &layout, automation::Variant &time)
{
    return CDateTimeUtil::ParseTimeCells(cells, layout.format, layout.mode, time, layout.globalText);
}

}  // namespace vantrel::bridge
