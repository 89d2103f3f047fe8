// SPDX-License-Identifier: MIT
#include "bridge/export_layout.h"

#include <cctype>
#include <new>

#include "automation/com_error.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"
#include "specification/specification.h"
#include "workbook/limits.h"

namespace vantrel::bridge {

namespace {

constexpr long kLastRow = workbook::limits::kMaxRows;
constexpr long kLastColumn = workbook::limits::kMaxColumns;

std::string Pair(const std::string &key, int value) { return key + "=" + std::to_string(value); }

bool TakeDateTimeKeys(const std::string &spec, ExportLayout &layout, std::string &message)
{
    CSpecification specification;
    layout.mode = kModeNone;
    specification.GetDateTimeLayout(spec, layout.column, layout.timeColumns, layout.mode, layout.format);
    const struct {
        int mode;
        PARSINGTYPE column, format;
    } keys[] = {{kModeDateAndTime, DateTimeCol, DateTimeFormat},
                {kModeTimeWithGlobalDate, TimeCol, TimeFormat},
                {kModeDateWithGlobalTime, DateCol, DateFormat}};
    layout.columnKey = "DateTimeCol";
    layout.formatKey = "DateTimeFormat";
    for (const auto &key : keys) {
        if (key.mode != layout.mode) continue;
        specification.GetKeyName(key.column, layout.columnKey);
        specification.GetKeyName(key.format, layout.formatKey);
    }
    if (layout.mode == kModeDateWithGlobalTime) specification.GetKeyValue(spec, GlobalTime, layout.globalText);
    if (layout.mode == kModeTimeWithGlobalDate) specification.GetKeyValue(spec, GlobalDate, layout.globalText);

    if (layout.mode == kModeNone) {
        message = "DateTimeCol is missing: give the column of the date and time (DateTimeCol=1, for one).";
        return false;
    }
    if (layout.column < 1) {
        message = Pair(layout.columnKey, layout.column) + " names no column: the date/time column is 1 or more.";
        return false;
    }
    const std::string format = layout.formatKey + "=" + layout.format;
    std::string error;
    if (layout.timeColumns < 1) {
        message = format + " has no field: give a format such as YYYY-MM-DD HH:mm:ss, or leave the key out.";
        return false;
    }
    if (!layout.format.empty() && !CDateTimeUtil::CheckFormatLetters(layout.format, error)) {
        message = format + " can't be written: each field is one letter repeated (YYYY, MM, DD, HH, mm, ss), "
                           "with one of the separators / T:-.| between two fields.";
        return false;
    }
    return true;
}

bool TakeRows(const std::string &spec, ExportLayout &layout, std::string &message)
{
    CSpecification specification;
    if (!specification.GetKeyValueInt(spec, StartRow, layout.startRow)) {
        message = "StartRow is missing: give the first data row of the export (StartRow=3, for one).";
        return false;
    }
    if (layout.startRow < 1) {
        message = Pair("StartRow", layout.startRow) + " names no row: the first data row is 1 or more.";
        return false;
    }
    specification.GetKeyValueInt(spec, ItemDescriptionRow, layout.titleRow);
    specification.GetKeyValueInt(spec, UnitTypeRow, layout.typeRow);
    specification.GetKeyValueInt(spec, UnitRow, layout.unitRow);
    specification.GetKeyValueInt(spec, ValueTypeRow, layout.valueTypeRow);
    layout.deleteValueKey = specification.GetKeyValueInt(spec, DelValRow, layout.deleteValueRow);

    // The title row, the header group (item type, unit and value type, whose
    // texts share a cell when their rows do) and the delete value row.
    const struct {
        const char *key;
        int row;
        int group;
    } rows[] = {{"ItemDescriptionRow", layout.titleRow, 0}, {"UnitTypeRow", layout.typeRow, 1},
                {"UnitRow", layout.unitRow, 1},          {"ValueTypeRow", layout.valueTypeRow, 1},
                {"DelValRow", layout.deleteValueRow, 2}};
    for (const auto &a : rows) {
        if (a.row < 1) continue;
        if (a.row >= layout.startRow) {
            message = Pair(a.key, a.row) + " is not above " + Pair("StartRow", layout.startRow) +
                      ": the header rows stand above the first data row.";
            return false;
        }
        for (const auto &b : rows)
            if (&b > &a && b.row == a.row && b.group != a.group) {
                message = Pair(a.key, a.row) + " and " + Pair(b.key, b.row) +
                          " name the same row: give each its own row (only the item type, unit and value "
                          "type rows may share one).";
                return false;
            }
    }
    return true;
}

}  // namespace

bool TakeExportLayout(const std::string &spec, long itemCount, long stepCount, ExportLayout &layout,
                      std::string &message)
{
    layout = ExportLayout();
    if (!TakeRows(spec, layout, message) || !TakeDateTimeKeys(spec, layout, message)) return false;
    const long lastColumn = long(layout.column) + layout.timeColumns - 1 + itemCount;
    if (lastColumn > kLastColumn) {
        message = "The export needs columns up to " + std::to_string(lastColumn) + " (" + std::to_string(itemCount) +
                  (itemCount == 1 ? " item beside " : " items beside ") + std::to_string(layout.timeColumns) +
                  (layout.timeColumns == 1 ? " date/time column from " : " date/time columns from ") +
                  Pair(layout.columnKey, layout.column) + "), but a sheet ends at column 16384 (XFD): export fewer "
                  "items or move the date/time column to the left.";
        return false;
    }
    const long lastRow = long(layout.startRow) + stepCount - 1;
    if (lastRow > kLastRow) {
        message = "The export needs rows up to " + std::to_string(lastRow) + " (" + std::to_string(stepCount) +
                  " time steps from " + Pair("StartRow", layout.startRow) +
                  "), but a sheet ends at row 1048576: export fewer time steps or start them higher.";
        return false;
    }
    return true;
}

bool CheckExportTarget(const std::string &path, bool exists, std::string &message)
{
    const size_t nameStart = path.find_last_of('/') + 1;  // 0 without a folder
    const size_t dot = path.find_last_of('.');
    const bool hasExtension = dot != std::string::npos && dot > nameStart;
    std::string extension = hasExtension ? path.substr(dot) : std::string();
    for (char &c : extension) c = char(std::tolower(static_cast<unsigned char>(c)));
    if (extension == ".xlsx" || extension == ".xlsm") return true;
    constexpr const char *kWritten = "workbooks are written as .xlsx or .xlsm";
    if (exists)
        message = path + " is not written: " + kWritten + ", and this file is left as it is. Export to a workbook "
                         "of one of those kinds.";
    else if (hasExtension)
        message = path + " would be an .xlsx workbook under the extension " + path.substr(dot) + ": " + kWritten +
                  ". Give the new workbook one of those extensions.";
    else
        message = path + " has no extension: " + kWritten + ". Give the new workbook one of those extensions.";
    return false;
}

automation::SafeArray ExportTimeCells(const ExportLayout &layout, const VARIANT &time)
{
    automation::SafeArray cells(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(layout.timeColumns)));
    if (!cells.Get()) throw std::bad_alloc();
    // True dates where the cell is to hold one: the empty format when the
    // steps have milliseconds, and a quoted format, whose look the column's
    // number format sets. Both keep the time exactly.
    const bool quoted = vantrel::datetime::IsQuotedFormat(layout.format);
    automation::Variant date;
    if ((quoted || (layout.subSecond && layout.format.empty())) &&
        SUCCEEDED(VariantChangeType(date.Out(), &time, 0, VT_DATE))) {
        LONG first = 0;
        automation::ThrowIfFailed(SafeArrayPutElement(cells.Get(), &first, date.Ptr()), "time cell");
    } else {
        CDateTimeUtil::FormatTimeCells(time, layout.format, cells.Get());
    }
    return cells;
}

}  // namespace vantrel::bridge
