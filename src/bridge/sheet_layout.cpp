// SPDX-License-Identifier: MIT
#include "bridge/sheet_layout.h"

#include <algorithm>
#include <cmath>
#include <new>

#include "automation/com_error.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"
#include "specification/specification.h"
#include "workbook/excel_obj.h"
#include "workbook/limits.h"

namespace vantrel::bridge {
namespace {

std::string Quoted(const std::string &text) { return "\"" + text + "\""; }

// The global text of a layout with one of the two split columns, or why it
// can't serve.
void TakeGlobalText(const std::string &spec, SheetLayout &layout)
{
    CSpecification specification;
    const bool dateInCells = layout.mode == kModeDateWithGlobalTime;
    const char *key = dateInCells ? "GlobalTime" : "GlobalDate";
    if (!specification.GetKeyValue(spec, dateInCells ? GlobalTime : GlobalDate, layout.globalText)) {
        layout.problem = dateInCells ? "GlobalTime is missing: the date column (DateCol) needs the time of day of its "
                                       "rows, such as GlobalTime=00:00:00."
                                     : "GlobalDate is missing: the time column (TimeCol) needs the date of its rows, "
                                       "such as GlobalDate=2024-03-01.";
        return;
    }
    if (dateInCells && !CDateTimeUtil::ParseGlobalTime(layout.globalText))
        layout.problem = std::string(key) + " " + Quoted(layout.globalText) + " is no time of day: write it as 05:06:07.";
    if (!dateInCells && !CDateTimeUtil::ParseGlobalDate(layout.globalText))
        layout.problem = std::string(key) + " " + Quoted(layout.globalText) + " is no date: write it as 2024-03-01.";
}

// DateCol and TimeCol together, without DateTimeCol.
void TakeSplitColumns(const std::string &spec, int dateColumn, int timeColumn, SheetLayout &layout)
{
    CSpecification specification;
    layout.column = dateColumn;
    layout.mode = kModeDateWithGlobalTime;
    layout.globalText = "00:00:00";  // the date alone; the time comes from the time columns
    if (!specification.GetKeyValue(spec, DateFormat, layout.format)) layout.format.clear();
    layout.columnCount = vantrel::datetime::CountFormatColumns(layout.format);
    layout.timeColumn = timeColumn;
    if (!specification.GetKeyValue(spec, TimeFormat, layout.timeFormat)) layout.timeFormat.clear();
    layout.timeColumnCount = vantrel::datetime::CountFormatColumns(layout.timeFormat);
    const bool apart = timeColumn >= dateColumn + layout.columnCount || dateColumn >= timeColumn + layout.timeColumnCount;
    if (!apart)
        layout.problem = "DateCol=" + std::to_string(dateColumn) + " and TimeCol=" + std::to_string(timeColumn) +
                         " share a column: give the dates and the times columns of their own.";
}

// A serial's moment in milliseconds from the base moment; below zero the
// serial's fraction runs the other way, and is turned round here.
long long TrueMilliseconds(DATE serial)
{
    const double day = std::trunc(serial);
    const double moment = serial >= 0.0 ? serial : day + (day - serial);
    return std::llround(moment * 86400000.0);
}

// A sheet ends at column XFD and row 1048576: a layout beyond them would
// read only empty cells there and blame the rows.
void CheckWithinSheet(const std::string &spec, SheetLayout &layout)
{
    const long lastColumn = std::max(long(layout.column) + layout.columnCount - 1,
                                     layout.Split() ? long(layout.timeColumn) + layout.timeColumnCount - 1 : 0L);
    if (lastColumn > long(workbook::limits::kMaxColumns)) {
        layout.problem = "The date/time columns reach column " + std::to_string(lastColumn) +
                         ", but a sheet ends at column 16384 (XFD): give the date/time column a number from 1 to "
                         "16384.";
        return;
    }
    int row = 0;
    if (CSpecification().GetKeyValueInt(spec, StartRow, row) && row > int(workbook::limits::kMaxRows))
        layout.problem = "StartRow=" + std::to_string(row) +
                         " lies below a sheet's last row, 1048576: give the first data row a number from 1 to 1048576.";
}

}  // namespace

SheetLayout TakeLayout(const std::string &spec)
{
    SheetLayout layout;
    CSpecification specification;
    specification.GetDateTimeLayout(spec, layout.column, layout.columnCount, layout.mode, layout.format);
    int dateColumn = 0, timeColumn = 0;
    const bool split = layout.mode != kModeDateAndTime && specification.GetKeyValueInt(spec, DateCol, dateColumn) &&
                       specification.GetKeyValueInt(spec, TimeCol, timeColumn);
    if (split)
        TakeSplitColumns(spec, dateColumn, timeColumn, layout);
    else if (layout.mode == kModeDateWithGlobalTime || layout.mode == kModeTimeWithGlobalDate)
        TakeGlobalText(spec, layout);
    if (layout.problem.empty()) CheckWithinSheet(spec, layout);
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

bool SheetLayout::Holds(int sheetColumn) const
{
    return (sheetColumn >= column && sheetColumn < column + columnCount) ||
           (Split() && sheetColumn >= timeColumn && sheetColumn < timeColumn + timeColumnCount);
}

bool SheetLayout::PlainDates() const { return format.empty() && mode == kModeDateAndTime && !Split(); }

std::vector<ColumnRun> DataRuns(const UsedColumns &used, const SheetLayout &layout)
{
    std::vector<ColumnRun> runs;
    int left = used.columnCount - layout.AllColumnCount();
    for (int c = used.firstColumn; left > 0; ++c) {
        if (layout.Holds(c)) continue;
        if (runs.empty() || runs.back().first + runs.back().count != c) runs.push_back({c, 0});
        ++runs.back().count;
        --left;
    }
    return runs;
}

RowCells::RowCells(int columnCount) : columnCount_(columnCount)
{
    cells_ = automation::SafeArray(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(columnCount < 1 ? 1 : columnCount)));
    if (!cells_.Get()) throw std::bad_alloc();
}

SAFEARRAY *RowCells::Take(const std::vector<SAFEARRAY *> &blocks, int row)
{
    LONG target = 0;
    for (SAFEARRAY *block : blocks) {
        LONG upper = -1;
        automation::ThrowIfFailed(SafeArrayGetUBound(block, 2, &upper), "row cells");
        for (LONG c = 0; c <= upper && target < columnCount_; ++c, ++target) {
            LONG from[2] = {row, c};
            automation::Variant cell;
            automation::ThrowIfFailed(SafeArrayGetElement(block, from, cell.Out()), "row cell");
            automation::ThrowIfFailed(SafeArrayPutElement(cells_.Get(), &target, cell.Ptr()), "row cell");
        }
    }
    return cells_.Get();
}

bool ParseLayoutRow(SAFEARRAY *cells, const SheetLayout &layout, automation::Variant &time)
{
    if (!layout.problem.empty()) return false;
    if (!layout.Split())
        return CDateTimeUtil::ParseTimeCells(cells, layout.format, layout.mode, time, layout.globalText);
    // The date of the date columns at midnight, and the time of day of the
    // time columns on the base day (1.0 when it rounded up to midnight).
    RowCells dateCells(layout.columnCount), timeCells(layout.timeColumnCount);
    for (LONG c = 0; c < layout.AllColumnCount(); ++c) {
        automation::Variant cell;
        automation::ThrowIfFailed(SafeArrayGetElement(cells, &c, cell.Out()), "row cell");
        SAFEARRAY *part = c < layout.columnCount ? dateCells.Array() : timeCells.Array();
        LONG at = c < layout.columnCount ? c : c - layout.columnCount;
        automation::ThrowIfFailed(SafeArrayPutElement(part, &at, cell.Ptr()), "row cell");
    }
    automation::Variant date, timeOfDay;
    if (!CDateTimeUtil::ParseTimeCells(dateCells.Array(), layout.format, kModeDateWithGlobalTime, date, "00:00") ||
        !CDateTimeUtil::ParseTimeCells(timeCells.Array(), layout.timeFormat, kModeTimeWithGlobalDate, timeOfDay,
                                       "1899-12-30"))
        return false;
    time = automation::Variant::Date(CDateTimeUtil::AddTimeOfDay(date.Raw().date, timeOfDay.Raw().date));
    return true;
}

bool RisesAtTheMillisecond(DATE previous, DATE current) { return TrueMilliseconds(previous) < TrueMilliseconds(current); }

bool SameMillisecond(DATE a, DATE b) { return TrueMilliseconds(a) == TrueMilliseconds(b); }

}  // namespace vantrel::bridge
