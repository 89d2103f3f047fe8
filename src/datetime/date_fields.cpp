// SPDX-License-Identifier: MIT
#include "datetime/date_fields.h"

#include <cctype>
#include <climits>
#include <cstdint>

#include "datetime/format_text.h"

namespace vantrel::datetime {

std::optional<FieldRule> FieldOfLetter(char letter)
{
    switch (letter) {
    case 'Y':
    case 'y':
        return FieldRule{Field::Year, 100, 9999};
    case 'M':
        return FieldRule{Field::Month, 1, 12};
    case 'D':
    case 'd':
        return FieldRule{Field::Day, 1, 31};
    case 'H':
    case 'h':
        return FieldRule{Field::Hour, 0, 23};
    case 'm':
        return FieldRule{Field::Minute, 0, 59};
    case 'S':
    case 's':
        return FieldRule{Field::Second, 0, 59};
    default:
        return std::nullopt;
    }
}

bool AllLettersSame(std::string_view token)
{
    return token.find_first_not_of(token.substr(0, 1)) == std::string_view::npos;
}

std::optional<int> ReadDecimal(std::string_view token)
{
    size_t i = 0;
    while (i < token.size() && std::isspace(static_cast<unsigned char>(token[i]))) ++i;
    bool negative = false;
    if (i < token.size() && (token[i] == '+' || token[i] == '-')) negative = token[i++] == '-';
    if (i >= token.size() || token[i] < '0' || token[i] > '9') return std::nullopt;
    constexpr int64_t kLimit = int64_t{INT_MAX} + 1;
    int64_t value = 0;
    for (; i < token.size() && token[i] >= '0' && token[i] <= '9'; ++i) {
        value = value * 10 + (token[i] - '0');
        if (value > kLimit) value = kLimit;  // saturate and keep reading
    }
    if (negative) value = -value;
    if (value > INT_MAX) return INT_MAX;
    return static_cast<int>(value);
}

namespace {

bool InSet(Field field, FieldSet set)
{
    const bool isDate = field == Field::Year || field == Field::Month || field == Field::Day;
    switch (set) {
    case FieldSet::DateOnly:
        return isDate;
    case FieldSet::TimeOnly:
        return !isDate;
    case FieldSet::All:
        break;
    }
    return true;
}

}  // namespace

bool ReadFields(std::string_view text, std::string_view format, FieldSet set, FieldValues &fields)
{
    const auto textTokens = Tokenize(text);
    const auto formatTokens = Tokenize(format);
    for (size_t i = 0; i < formatTokens.size(); ++i) {
        // A text that has run out leaves the remaining fields at their values.
        if (i >= textTokens.size()) break;
        const auto rule = FieldOfLetter(formatTokens[i].text.front());
        if (!rule || !InSet(rule->field, set)) continue;
        const auto number = ReadDecimal(textTokens[i].text);
        if (!number || *number < rule->minimum || *number > rule->maximum) return false;
        At(fields, rule->field) = *number;
    }
    return true;
}

}  // namespace vantrel::datetime
