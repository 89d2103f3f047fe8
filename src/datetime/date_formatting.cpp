// SPDX-License-Identifier: MIT
// Points in time to text: by a strftime pattern, in a locale's words, and by a
// date/time format.
#include <ctime>

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

const char *PatternOf(Field field)
{
    switch (field) {
    case Field::Year:
        return "%Y";
    case Field::Month:
        return "%m";
    case Field::Day:
        return "%d";
    case Field::Hour:
        return "%H";
    case Field::Minute:
        return "%M";
    case Field::Second:
        return "%S";
    }
    return "";
}

}  // namespace

std::string CDateTimeUtil::ExpandFormat(const DateValue &date, const std::string &format)
{
    std::string text;
    // A run of separators comes out as its first character, as only the one
    // right behind a field is kept.
    for (const FormatToken &token : Tokenize(format)) {
        const auto rule = FieldOfLetter(token.text.front());
        if (!rule) continue;
        text += FormatDate(date, PatternOf(rule->field));
        if (token.separatorBehind != '\0') text += token.separatorBehind;
    }
    return text;
}
