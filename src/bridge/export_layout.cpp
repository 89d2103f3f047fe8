// SPDX-License-Identifier: MIT
#include "bridge/export_layout.h"

#include <cctype>
#include <cmath>
#include <cstdio>
#include <new>
#include <optional>

#include "automation/com_error.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"
#include "specification/specification.h"
#include "workbook/excel_obj.h"
#include "workbook/limits.h"

namespace vantrel::bridge {

namespace {

constexpr long kLastRow = workbook::limits::kMaxRows;
constexpr long kLastColumn = workbook::limits::kMaxColumns;

std::string Pair(const std::string &key, int value) { return key + "=" + std::to_string(value); }

// A time as the messages show it, with milliseconds when it has them.
std::string TimeText(DATE serial)
{
    DateValue date;
    const double millis = std::round(serial * 86400000.0);
    const long rest = serial >= 0 ? long(std::fmod(millis, 1000.0)) : 0;
    date.serial = (millis - double(rest)) / 86400000.0;
    std::string text = CDateTimeUtil::FormatDate(date, "%Y-%m-%d %H:%M:%S");
    if (rest != 0) {
        char fraction[8];
        std::snprintf(fraction, sizeof fraction, ".%03ld", rest);
        text += fraction;
    }
    return text;
}

bool HasSubSecond(DATE serial) { return std::fmod(std::round(serial * 86400000.0), 1000.0) != 0.0; }

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
                  " items beside " + std::to_string(layout.timeColumns) + " date/time columns from " +
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

namespace {

// The time cells of the steps as they are stored, made into export.cells and,
// one step at a time, into an array of what the import reads back.
class StoredTimeCells {
public:
    StoredTimeCells(const ExportLayout &layout, ExportTimes &exportTimes)
        : m_layout(layout), m_export(exportTimes),
          m_trueDates(vantrel::datetime::IsQuotedFormat(layout.format) || (layout.subSecond && layout.format.empty())),
          m_stored(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(layout.timeColumns)))
    {
        if (!m_stored.Get()) throw std::bad_alloc();
        m_export.columns = layout.timeColumns;
        m_export.cells.assign(m_export.times.size() * size_t(layout.timeColumns), TimeCell());
    }

    // The cells of step t, as ExportTimeCells makes them and the workbook
    // stores them.
    SAFEARRAY *Make(size_t t)
    {
        const DATE time = m_export.times[t];
        TimeCell *cells = m_export.cells.data() + t * size_t(m_layout.timeColumns);
        if (m_trueDates) {
            // A date cell holds the date itself.
            Put(0, automation::Variant::Date(time));
            cells[0] = TimeCell{true, 0, {time, true}};
            return m_stored.Get();
        }
        DateValue date;
        date.serial = time;
        const std::vector<std::string> texts = CDateTimeUtil::TimeCellTexts(date, m_layout.format);
        for (int c = 0; c < m_layout.timeColumns; ++c) {
            if (size_t(c) >= texts.size()) {
                Put(c, automation::Variant());
                continue;
            }
            CExcelObj::TypedText typed = CExcelObj::StoredText(texts[size_t(c)]);
            if (typed.value.Type() == VT_R8) {
                const auto format = FormatIndex(typed.numberFormat);
                if (format) cells[c] = TimeCell{true, *format, {typed.value.Raw().dblVal, typed.date}};
            }
            Put(c, std::move(typed.value));
        }
        return m_stored.Get();
    }

private:
    void Put(LONG column, automation::Variant value)
    {
        automation::ThrowIfFailed(SafeArrayPutElement(m_stored.Get(), &column, value.Ptr()), "time cell");
    }

    std::optional<uint16_t> FormatIndex(const std::string &format)
    {
        auto &formats = m_export.formats;
        for (size_t i = 0; i < formats.size(); ++i)
            if (formats[i] == format) return uint16_t(i);
        if (formats.size() > UINT16_MAX) return std::nullopt;
        formats.push_back(format);
        return uint16_t(formats.size() - 1);
    }

    const ExportLayout &m_layout;
    ExportTimes &m_export;
    const bool m_trueDates;
    automation::SafeArray m_stored;
};

}  // namespace

bool CheckTimesReadBack(ExportLayout &layout, ExportTimes &exportTimes, std::string &message)
{
    const std::vector<DATE> &times = exportTimes.times;
    layout.subSecond = false;
    for (const DATE time : times) layout.subSecond |= HasSubSecond(time);
    const std::string format = layout.format.empty() ? "the default date/time (no " + layout.formatKey + ")"
                                                     : layout.formatKey + "=" + layout.format;
    StoredTimeCells cells(layout, exportTimes);
    for (size_t t = 0; t < times.size(); ++t) {
        // What the cells hold once written, as the import with the same string reads them.
        SAFEARRAY *stored = cells.Make(t);
        automation::Variant read;
        automation::Variant date;
        const bool parsed = CDateTimeUtil::ParseTimeCells(stored, layout.format, layout.mode, read,
                                                          layout.globalText) &&
                            SUCCEEDED(VariantChangeType(date.Out(), &read.Raw(), 0, VT_DATE));
        if (parsed && std::round(date.Raw().date * 86400000.0) == std::round(times[t] * 86400000.0)) continue;
        message = "Time step " + std::to_string(t + 1) + " (" + TimeText(times[t]) + ") would not read back " +
                  (parsed ? "as itself but as " + TimeText(date.Raw().date) : std::string("at all")) + " under " +
                  format + ": " +
                  (HasSubSecond(times[t]) && !layout.format.empty()
                       ? "leave " + layout.formatKey + " out, so that the cells are true dates that keep the milliseconds."
                       : "give a format with every field of the time steps (YYYY-MM-DD HH:mm:ss, for one).");
        return false;
    }
    return true;
}

}  // namespace vantrel::bridge
