// SPDX-License-Identifier: MIT
// CDateTimeUtil: date/time format strings, the turning of a row's cells into a
// point in time, and of a point in time back into the cells of an export row.
//
// A format is fields (Y/y year, M month, D/d day, H/h hour, m minute, S/s
// second) and separators from "/ T:-.|"; the bar also separates worksheet
// columns. A format in double quotes is one column. The empty format stands
// for a cell that holds a true date value.
//
// The class holds nothing; every operation stands alone.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "automation/automation.h"
#include "automation/values.h"
#include "datetime/date_value.h"

class CDateTimeUtil {
public:
    // ---- Formats --------------------------------------------------------

    // Worksheet columns that the format spans: 1 for the empty and for a quoted
    // format, otherwise the non-empty parts between bars.
    static int GetFormatColumnCount(const std::string &format);

    // The format of column index (from 0), trimmed of white space. For a quoted
    // format only index 0 exists (its text without the quotes); a false there
    // leaves columnFormat alone. Otherwise columnFormat becomes the part, or
    // empty, and the result says whether it is non-empty.
    static bool GetColumnFormat(int index, const std::string &format, std::string &columnFormat);

    // kFormatDateAndTime, kFormatDateOnly, kFormatTimeOnly or kFormatIncomplete
    // by the letters anywhere in the format; below 8 characters always the last.
    static int ClassifyFormat(const std::string &format);

    // "Date/time", "Date", "Time", or one built from the fields ("Hour:Minute").
    static bool GetColumnTitle(const std::string &columnFormat, std::string &title);

    // Appends one title for each column of the format.
    static bool GetColumnTitles(const std::string &format, std::vector<std::string> &titles);

    // Does a cell's text fit a column format? error gets message 117 for a
    // different count of tokens and 118 for a field of mixed letters, and is
    // empty for any other failure.
    static bool CheckValueAgainstFormat(const std::string &value, const std::string &columnFormat,
                                        std::string &error);

    // Are all fields of a format well formed? error gets message 140 if not.
    static bool CheckFormatLetters(const std::string &format, std::string &error);

    // ---- Parsing --------------------------------------------------------

    // The cells of one row (a one-dimensional array of variants, one element a
    // column of format; text when the format is not empty) to a VT_DATE result.
    // mode is kModeDateAndTime, kModeDateWithGlobalTime (the time of day comes
    // from globalText) or kModeTimeWithGlobalDate (the date comes from it).
    // False, with result untouched, when the row gives no point in time: a
    // field out of range, an unknown mode with a format, cells that cannot be
    // read, or fields that make no date (31 April).
    static bool ParseTimeCells(SAFEARRAY *cells, const std::string &format, int mode,
                               automation::Variant &result, const std::string &globalText);

    // Text to all six fields, by the format; missing trailing fields keep
    // 1900-01-01 00:00:00. False for a present field that is no number or out
    // of range. True otherwise, with status invalid if the fields make no date.
    static bool ParseDateTimeFields(DateValue &date, const std::string &text,
                                    const std::string &format);

    // The year, month and day alone (start values 1900, 1, 1). The outputs are
    // set only on success.
    static bool ParseDateFields(int &year, int &month, int &day, const std::string &text,
                                const std::string &format);

    // The hour, minute and second alone; the values passed in (the caller sets
    // them to 0) stand for fields that the text lacks. Set only on success.
    static bool ParseTimeFields(int &hour, int &minute, int &second, const std::string &text,
                                const std::string &format);

    // Six fields to a serial, true only if the serial gives the same fields
    // back; so a day that the month lacks is refused. serial is set only on
    // success.
    static bool MakeDateValue(const SYSTEMTIME &fields, DATE &serial);

    // Text in the words of a locale to a DateValue (VarDateFromStr). On failure
    // the status is invalid and the serial 0 for a text that is no date
    // (DISP_E_TYPEMISMATCH), -1.0 for any other failure.
    static bool ParseDateTimeText(DateValue &date, std::string_view text, ULONG flags, LCID locale);

    // The one date of a layout's rows (GlobalDate) as a serial at midnight:
    // 2024-03-01, 2024/03/01, or 01.03.2024 (day first, with points). Nothing
    // for any other text or for a day that the month doesn't have.
    static std::optional<DATE> ParseGlobalDate(std::string_view text);

    // The one time of day (GlobalTime) as a fraction of a day: 05:06,
    // 05:06:07 or 05:06:07.250. Nothing for any other text.
    static std::optional<double> ParseGlobalTime(std::string_view text);

    // A day's serial at midnight with a time of day added; a time of 1.0 or
    // more (one that rounded up to midnight) carries into the next day.
    static DATE AddTimeOfDay(DATE day, double timeOfDay);

    // Does a cell hold a true date for a column of this format (one column's
    // part of a format)? A number does under the empty format, and under a
    // format of several fields when its plain text doesn't fit the format.
    static bool HoldsTrueDate(const VARIANT &cell, const std::string &columnFormat);

    // The order rule of a date/time column: current lies at least HalfSecond
    // after previous. Negative serials are compared in true time order.
    static bool IsStrictlyLater(double previous, double current);

    // ---- Formatting -----------------------------------------------------

    // The text "Invalid DateTime" wherever an invalid date would be formatted.
    static constexpr const char *kInvalidDateTimeText = "Invalid DateTime";

    // A date by a strftime pattern.
    static std::string FormatDate(const DateValue &date, const std::string &pattern);

    // A date in the words of a locale (VarBstrFromDate); flags VAR_TIMEVALUEONLY
    // or VAR_DATEVALUEONLY show a part alone.
    static std::string FormatDateLocal(const DateValue &date, ULONG flags, LCID locale);

    // A date by a date/time format: each field as digits, each followed by the
    // one separator behind it in the format. "YYYY|MM|DD" gives 2012|03|04.
    static std::string ExpandFormat(const DateValue &date, const std::string &format);

    // A point in time to the cells of an export row: cells is a one-dimensional
    // array of variants with GetFormatColumnCount(format) elements, made by the
    // caller. The empty format gives a text like 2012/03/04 05:06:07 in element
    // 0, a quoted format a date value, any other format one text a column.
    // False only for an array that is not a one-dimensional array of variants.
    static bool FormatTimeCells(const VARIANT &time, const std::string &format, SAFEARRAY *cells);

    // The texts that FormatTimeCells puts in the cells for a format that is
    // not quoted, one a column (fewer when the date fills fewer fields).
    static std::vector<std::string> TimeCellTexts(const DateValue &date, const std::string &format);
};
