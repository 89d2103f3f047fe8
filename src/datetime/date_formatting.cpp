// SPDX-License-Identifier: MIT
// Points in time to text: by a strftime pattern, in a locale's words, and by a
// date/time format.
#include <charconv>
#include <ctime>
#include <optional>

#include "automation/values.h"
#include "datetime/date_fields.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"

using namespace vantrel::datetime;

std::string CDateTimeUtil::FormatDate(const DateValue &date, const std::string &pattern)
{
    if (date.status != kDateValid) return kInvalidDateTimeText;
    UDATE ud{};
    if (FAILED(VarUdateFromDate(date.serial, 0, &ud))) return kInvalidDateTimeText;
    std::tm fields{};
    fields.tm_year = ud.st.wYear - 1900;
    fields.tm_mon = ud.st.wMonth - 1;
    fields.tm_mday = ud.st.wDay;
    fields.tm_hour = ud.st.wHour;
    fields.tm_min = ud.st.wMinute;
    fields.tm_sec = ud.st.wSecond;
    fields.tm_wday = ud.st.wDayOfWeek;
    fields.tm_yday = ud.wDayOfYear - 1;
    fields.tm_isdst = 0;
    char buffer[256];
    // A text longer than the buffer comes out empty rather than cut.
    const size_t length = std::strftime(buffer, sizeof buffer, pattern.c_str(), &fields);
    return std::string(buffer, length);
}

std::string CDateTimeUtil::FormatDateLocal(const DateValue &date, ULONG flags, LCID locale)
{
    if (date.status != kDateValid) return kInvalidDateTimeText;
    automation::Bstr text;
    if (FAILED(VarBstrFromDate(date.serial, locale, flags, text.Out()))) return kInvalidDateTimeText;
    return text.Utf8();
}

namespace {

// The fields of a date that FormatDate shows; nothing where it shows the
// invalid text.
std::optional<SYSTEMTIME> ShownFields(const DateValue &date)
{
    UDATE ud{};
    if (date.status != kDateValid || FAILED(VarUdateFromDate(date.serial, 0, &ud))) return std::nullopt;
    return ud.st;
}

// A field as FormatDate's %Y (the year's digits), %m, %d, %H, %M and %S (two
// digits) show it.
void AppendField(std::string &text, const SYSTEMTIME &fields, Field field)
{
    int value = 0;
    switch (field) {
    case Field::Year: value = fields.wYear; break;
    case Field::Month: value = fields.wMonth; break;
    case Field::Day: value = fields.wDay; break;
    case Field::Hour: value = fields.wHour; break;
    case Field::Minute: value = fields.wMinute; break;
    case Field::Second: value = fields.wSecond; break;
    }
    char digits[12];
    const char *end = std::to_chars(digits, digits + sizeof digits, value).ptr;
    if (field != Field::Year && end - digits < 2) text += '0';
    text.append(digits, size_t(end - digits));
}

}  // namespace

std::string CDateTimeUtil::ExpandFormat(const DateValue &date, const std::string &format)
{
    std::string text;
    // The date is taken apart once for all its fields.
    const auto fields = ShownFields(date);
    // A run of separators comes out as its first character, as only the one
    // right behind a field is kept.
    for (const FormatToken &token : Tokenize(format)) {
        const auto rule = FieldOfLetter(token.text.front());
        if (!rule) continue;
        if (fields)
            AppendField(text, *fields, rule->field);
        else
            text += kInvalidDateTimeText;
        if (token.separatorBehind != '\0') text += token.separatorBehind;
    }
    return text;
}
