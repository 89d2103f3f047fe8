// SPDX-License-Identifier: MIT
// The cells of a row's date/time columns to a point in time and back.
#include <cmath>
#include <optional>
#include <utility>
#include <string_view>
#include <vector>

#include "automation/text.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"

using namespace vantrel::datetime;

namespace {

// Elements and lower bound of a one-dimensional array of variants; nothing
// for any other array.
struct VariantVector {
    SAFEARRAY *array;
    LONG lowerBound;
    LONG count;
};

std::optional<VariantVector> AsVariantVector(SAFEARRAY *array)
{
    if (!array || SafeArrayGetDim(array) != 1) return std::nullopt;
    VARTYPE type = VT_EMPTY;
    if (FAILED(SafeArrayGetVartype(array, &type)) || type != VT_VARIANT) return std::nullopt;
    LONG lower = 0;
    LONG upper = -1;
    if (FAILED(SafeArrayGetLBound(array, 1, &lower)) || FAILED(SafeArrayGetUBound(array, 1, &upper)))
        return std::nullopt;
    return VariantVector{array, lower, upper - lower + 1};
}

// The first count elements, or nothing when the array is shorter or unreadable.
std::optional<std::vector<automation::Variant>> ReadElements(SAFEARRAY *array, int count)
{
    const auto vector = AsVariantVector(array);
    if (!vector || vector->count < count) return std::nullopt;
    std::vector<automation::Variant> elements(static_cast<size_t>(count));
    for (int i = 0; i < count; ++i) {
        LONG index = vector->lowerBound + i;
        if (FAILED(SafeArrayGetElement(array, &index, elements[static_cast<size_t>(i)].Out())))
            return std::nullopt;
    }
    return elements;
}

bool PutElement(const VariantVector &vector, LONG offset, automation::Variant &value)
{
    if (offset >= vector.count) return false;
    LONG index = vector.lowerBound + offset;
    return SUCCEEDED(SafeArrayPutElement(vector.array, &index, value.Ptr()));
}

std::optional<DATE> ToDate(const VARIANT &value)
{
    if (value.vt == VT_DATE) return value.date;
    automation::Variant converted;
    if (FAILED(VariantChangeType(converted.Out(), &value, 0, VT_DATE))) return std::nullopt;
    return converted.Raw().date;
}

std::optional<std::string> ToText(const VARIANT &value)
{
    if (value.vt == VT_BSTR) return automation::BstrToUtf8(value.bstrVal);
    automation::Variant converted;
    if (FAILED(VariantChangeType(converted.Out(), &value, 0, VT_BSTR))) return std::nullopt;
    return automation::BstrToUtf8(converted.Raw().bstrVal);
}

std::optional<SYSTEMTIME> FieldsOf(DATE serial)
{
    SYSTEMTIME fields{};
    if (!VariantTimeToSystemTime(serial, &fields)) return std::nullopt;
    return fields;
}

// The serial of a date at midnight; nothing for fields that make no date.
std::optional<DATE> DaySerial(int year, int month, int day)
{
    SYSTEMTIME fields{};
    fields.wYear = static_cast<WORD>(year);
    fields.wMonth = static_cast<WORD>(month);
    fields.wDay = static_cast<WORD>(day);
    DATE serial = 0.0;
    if (!CDateTimeUtil::MakeDateValue(fields, serial)) return std::nullopt;
    return serial;
}

double TimeOfDay(int hour, int minute, int second) { return ((hour * 60.0 + minute) * 60.0 + second) / 86400.0; }

// A serial as its day and its time of day, the time rounded to the second:
// 23:59:59.6 gives the day and a time of 1.0, which carries into the next day.
struct DayAndTime {
    DATE day;
    double timeOfDay;
};

DayAndTime SplitToTheSecond(DATE serial)
{
    const double day = std::trunc(serial);
    const double fraction = std::fabs(serial - day);  // below zero it runs the other way
    return {day, std::round(fraction * 86400.0) / 86400.0};
}

// A serial that stands for a date of the years 100 to 9999.
std::optional<DATE> Checked(DATE serial)
{
    if (!FieldsOf(serial)) return std::nullopt;
    return serial;
}

// Cells that hold true dates, with the date or the time of day from the text.
std::optional<DATE> ParseDateCell(const VARIANT &cell, int mode, const std::string &globalText)
{
    const auto cellSerial = ToDate(cell);
    if (!cellSerial || !FieldsOf(*cellSerial)) return std::nullopt;
    const DayAndTime fromCell = SplitToTheSecond(*cellSerial);
    if (mode == kModeDateWithGlobalTime) {
        const auto time = CDateTimeUtil::ParseGlobalTime(globalText);
        if (!time) return std::nullopt;
        const DATE day = CDateTimeUtil::AddTimeOfDay(fromCell.day, fromCell.timeOfDay);
        return Checked(CDateTimeUtil::AddTimeOfDay(std::trunc(day), *time));
    }
    const auto date = CDateTimeUtil::ParseGlobalDate(globalText);
    if (!date) return std::nullopt;
    return Checked(CDateTimeUtil::AddTimeOfDay(*date, fromCell.timeOfDay));
}

bool IsNumberCell(const VARIANT &cell) { return cell.vt == VT_R8 || cell.vt == VT_DATE || cell.vt == VT_R4; }

// The text that a column's cell stands for. A number under a column format of
// several fields whose plain text doesn't fit that format is a true date (a
// cell that the workbook typed into a date, or one a user filled with a
// date): its fields are spelled out by the column format, and the fraction
// of a second it holds goes to subSecond when the column has the seconds.
// Any other cell counts by its text, so a year column holding 2012 reads 2012.
std::optional<std::string> ColumnText(const VARIANT &cell, const std::string &columnFormat, double &subSecond)
{
    auto text = ToText(cell);
    if (!text || columnFormat.empty() || !CDateTimeUtil::HoldsTrueDate(cell, columnFormat)) return text;
    const auto serial = ToDate(cell);
    if (!serial) return text;
    // Whole seconds for the fields; the milliseconds apart, never rounded up
    // into the next second.
    const double millis = std::round(*serial * 86400000.0);
    const double rest = *serial >= 0 ? std::fmod(millis, 1000.0) : 0.0;
    DateValue date;
    date.serial = (millis - rest) / 86400000.0;
    bool hasSeconds = false;
    for (const FormatToken &token : Tokenize(columnFormat))
        hasSeconds |= token.text.front() == 'S' || token.text.front() == 's';
    if (hasSeconds) subSecond += rest / 86400000.0;
    return CDateTimeUtil::ExpandFormat(date, columnFormat);
}

// The glued text of a row taken apart by the format, by the mode.
std::optional<DATE> ParseGluedText(std::string glued, const std::string &format, int mode,
                                   const std::string &globalText)
{
    glued = std::string(TrimWhiteSpace(glued));
    const std::string fieldFormat =
        IsQuotedFormat(format) ? std::string(StripQuotes(TrimWhiteSpace(format))) : format;

    if (mode == kModeDateAndTime) {
        DateValue date;
        if (!CDateTimeUtil::ParseDateTimeFields(date, glued, fieldFormat)) return std::nullopt;
        if (date.status != kDateValid) return std::nullopt;
        return date.serial;
    }
    if (mode == kModeDateWithGlobalTime) {
        int year = 0, month = 0, day = 0;
        if (!CDateTimeUtil::ParseDateFields(year, month, day, glued, fieldFormat))
            return std::nullopt;
        const auto date = DaySerial(year, month, day);
        const auto time = CDateTimeUtil::ParseGlobalTime(globalText);
        if (!date || !time) return std::nullopt;
        return Checked(CDateTimeUtil::AddTimeOfDay(*date, *time));
    }
    if (mode == kModeTimeWithGlobalDate) {
        int hour = 0, minute = 0, second = 0;
        if (!CDateTimeUtil::ParseTimeFields(hour, minute, second, glued, fieldFormat))
            return std::nullopt;
        const auto date = CDateTimeUtil::ParseGlobalDate(globalText);
        if (!date) return std::nullopt;
        return Checked(CDateTimeUtil::AddTimeOfDay(*date, TimeOfDay(hour, minute, second)));
    }
    return std::nullopt;
}

// Cells of text taken apart by the format; their columns are glued with blanks.
std::optional<DATE> ParseTextCells(const std::vector<automation::Variant> &cells,
                                   const std::string &format, int mode,
                                   const std::string &globalText)
{
    std::string glued;
    double subSecond = 0.0;
    for (size_t i = 0; i < cells.size(); ++i) {
        std::string columnFormat;
        CDateTimeUtil::GetColumnFormat(int(i), format, columnFormat);
        const auto text = ColumnText(cells[i].Raw(), columnFormat, subSecond);
        if (!text) return std::nullopt;
        glued += *text;
        glued += ' ';
    }
    const auto serial = ParseGluedText(glued, format, mode, globalText);
    if (!serial || subSecond == 0.0) return serial;
    return *serial + subSecond;
}

}  // namespace

bool CDateTimeUtil::HoldsTrueDate(const VARIANT &cell, const std::string &columnFormat)
{
    if (!IsNumberCell(cell)) return false;
    if (columnFormat.empty()) return true;
    if (Tokenize(columnFormat).size() < 2) return false;
    const auto text = ToText(cell);
    std::string ignored;
    return text && !CheckValueAgainstFormat(*text, columnFormat, ignored);
}

bool CDateTimeUtil::ParseTimeCells(SAFEARRAY *cells, const std::string &format, int mode,
                                   automation::Variant &result, const std::string &globalText)
{
    const int columnCount = GetFormatColumnCount(format);
    // A format of bars or blanks alone spans no column, but the first cell is
    // still read when the format is empty.
    const auto elements = ReadElements(cells, format.empty() ? 1 : columnCount);
    if (!elements) return false;

    if (format.empty() && mode == kModeDateAndTime) {
        automation::Variant date;
        if (FAILED(VariantChangeType(date.Out(), &(*elements)[0].Raw(), 0, VT_DATE))) return false;
        result = std::move(date);
        return true;
    }
    const auto serial = format.empty() ? ParseDateCell((*elements)[0].Raw(), mode, globalText)
                                       : ParseTextCells(*elements, format, mode, globalText);
    if (!serial) return false;
    result = automation::Variant::Date(*serial);
    return true;
}

bool CDateTimeUtil::FormatTimeCells(const VARIANT &time, const std::string &format, SAFEARRAY *cells)
{
    const auto vector = AsVariantVector(cells);
    if (!vector) return false;

    DateValue date;
    if (const auto serial = ToDate(time)) {
        date.serial = *serial;
    } else {
        date.status = kDateInvalid;
    }

    if (!IsQuotedFormat(format)) {
        LONG offset = 0;
        for (const std::string &part : TimeCellTexts(date, format)) {
            automation::Variant text = automation::Variant::String(part);
            if (!PutElement(*vector, offset++, text)) break;
        }
        return true;
    }
    // A quoted format asks for a date cell, whose look the column's number
    // format sets; a text that is no date goes in as it is.
    const std::string expanded = ExpandFormat(date, std::string(StripQuotes(TrimWhiteSpace(format))));
    automation::Variant text = automation::Variant::String(expanded);
    automation::Variant asDate;
    if (SUCCEEDED(VariantChangeType(asDate.Out(), &text.Raw(), 0, VT_DATE)))
        PutElement(*vector, 0, asDate);
    else
        PutElement(*vector, 0, text);
    return true;
}

std::vector<std::string> CDateTimeUtil::TimeCellTexts(const DateValue &date, const std::string &format)
{
    // The one fixed output format: a true date column goes out as text, as
    // FormatDate's "%Y/%m/%d %H:%M:%S" shows it (one invalid text for an
    // invalid date, where the fields would give one each).
    if (format.empty()) {
        std::string text = ExpandFormat(date, "YYYY/MM/DD HH:mm:ss");
        if (text.starts_with(kInvalidDateTimeText)) text = kInvalidDateTimeText;
        return {text};
    }
    std::vector<std::string> texts;
    const std::string expanded = ExpandFormat(date, format);
    for (const FormatToken &part : Tokenize(expanded, kColumnSeparator)) texts.emplace_back(part.text);
    return texts;
}
