// SPDX-License-Identifier: MIT
// The text side of date/time format strings: the tokenizer over the seven
// separators, trimming, quoted formats and the column count. Header-only and
// free of automation types, so that the specification library can count the
// columns of a layout without linking the date/time library.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace vantrel::datetime {

// Split both formats and cell texts; the bar also separates columns.
inline constexpr std::string_view kSeparators = "/ T:-.|";
inline constexpr std::string_view kColumnSeparator = "|";
inline constexpr char kQuote = '"';

// One token and the separator right behind it ('\0' at the end of the text).
struct FormatToken {
    std::string_view text;
    char separatorBehind = '\0';
};

// Runs of separators count as one, separators at either end yield nothing, and
// no token is ever empty.
inline std::vector<FormatToken> Tokenize(std::string_view text,
                                         std::string_view separators = kSeparators)
{
    std::vector<FormatToken> tokens;
    size_t pos = 0;
    while (true) {
        pos = text.find_first_not_of(separators, pos);
        if (pos == std::string_view::npos) break;
        size_t end = text.find_first_of(separators, pos);
        if (end == std::string_view::npos) end = text.size();
        tokens.push_back({text.substr(pos, end - pos), end < text.size() ? text[end] : '\0'});
        pos = end;
    }
    return tokens;
}

inline bool IsWhiteSpace(char c)
{
    return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r';
}

inline std::string_view TrimWhiteSpace(std::string_view text)
{
    while (!text.empty() && IsWhiteSpace(text.front())) text.remove_prefix(1);
    while (!text.empty() && IsWhiteSpace(text.back())) text.remove_suffix(1);
    return text;
}

// A quoted format stands for one column whatever it holds, bars included.
inline bool IsQuotedFormat(std::string_view format)
{
    const std::string_view trimmed = TrimWhiteSpace(format);
    return !trimmed.empty() && trimmed.front() == kQuote;
}

// The text of a quoted format: double quotes removed from both ends.
inline std::string_view StripQuotes(std::string_view format)
{
    while (!format.empty() && format.front() == kQuote) format.remove_prefix(1);
    while (!format.empty() && format.back() == kQuote) format.remove_suffix(1);
    return format;
}

// Columns that a format spans: 1 for the empty and for a quoted format,
// otherwise the non-empty parts between bars (0 for bars or blanks alone).
inline int CountFormatColumns(std::string_view format)
{
    if (format.empty()) return 1;
    const std::string_view trimmed = TrimWhiteSpace(format);
    if (!trimmed.empty() && trimmed.front() == kQuote) return 1;
    return static_cast<int>(Tokenize(trimmed, kColumnSeparator).size());
}

}  // namespace vantrel::datetime
