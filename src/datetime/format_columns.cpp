// SPDX-License-Identifier: MIT
// How a format is laid out: its columns, what it covers and the titles of its
// columns.
#include <string_view>
#include <utility>

#include "datetime/date_fields.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"

using namespace vantrel::datetime;

int CDateTimeUtil::GetFormatColumnCount(const std::string &format)
{
    return CountFormatColumns(format);
}

bool CDateTimeUtil::GetColumnFormat(int index, const std::string &format, std::string &columnFormat)
{
    const std::string_view trimmed = TrimWhiteSpace(format);
    if (IsQuotedFormat(trimmed)) {
        if (index != 0) return false;
        columnFormat = std::string(TrimWhiteSpace(StripQuotes(trimmed)));
        return true;
    }
    const auto columns = Tokenize(trimmed, kColumnSeparator);
    if (index >= 0 && static_cast<size_t>(index) < columns.size())
        columnFormat = std::string(TrimWhiteSpace(columns[static_cast<size_t>(index)].text));
    else
        columnFormat.clear();
    return !columnFormat.empty();
}

int CDateTimeUtil::ClassifyFormat(const std::string &format)
{
    // Shorter formats cannot name a full date or time and are not searched.
    constexpr size_t kShortestClassified = 8;
    if (format.size() < kShortestClassified) return kFormatIncomplete;
    const auto has = [&format](std::string_view letters) {
        return format.find_first_of(letters) != std::string::npos;
    };
    const bool hasDate = has("Yy") && has("M") && has("Dd");
    const bool hasTime = has("Hh") && has("m") && has("Ss");
    if (hasDate && hasTime) return kFormatDateAndTime;
    if (hasDate) return kFormatDateOnly;
    if (hasTime) return kFormatTimeOnly;
    return kFormatIncomplete;
}

namespace {

const char *FieldName(Field field)
{
    switch (field) {
    case Field::Year:
        return "Year";
    case Field::Month:
        return "Month";
    case Field::Day:
        return "Day";
    case Field::Hour:
        return "Hour";
    case Field::Minute:
        return "Minute";
    case Field::Second:
        return "Second";
    }
    return "";
}

}  // namespace

bool CDateTimeUtil::GetColumnTitle(const std::string &columnFormat, std::string &title)
{
    switch (ClassifyFormat(columnFormat)) {
    case kFormatDateAndTime:
        title = "Date/time";
        return true;
    case kFormatDateOnly:
        title = "Date";
        return true;
    case kFormatTimeOnly:
        title = "Time";
        return true;
    default:
        break;
    }
    title.clear();
    for (const FormatToken &token : Tokenize(columnFormat)) {
        const auto rule = FieldOfLetter(token.text.front());
        if (!rule) continue;
        title += FieldName(rule->field);
        if (token.separatorBehind != '\0') title += token.separatorBehind;
    }
    return true;
}

bool CDateTimeUtil::GetColumnTitles(const std::string &format, std::vector<std::string> &titles)
{
    const int count = GetFormatColumnCount(format);
    for (int index = 0; index < count; ++index) {
        // A column without a format of its own gets an empty title, never the
        // format of the column before it.
        std::string columnFormat;
        GetColumnFormat(index, format, columnFormat);
        std::string title;
        GetColumnTitle(columnFormat, title);
        titles.push_back(std::move(title));
    }
    return true;
}
