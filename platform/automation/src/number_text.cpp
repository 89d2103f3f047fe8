// SPDX-License-Identifier: MIT
// Numbers in the fixed locale: decimal point, no grouping, "%.15G" output.
#include "number_text.h"

#include <charconv>
#include <cmath>
#include <string>

#include "automation/locale.h"

namespace automation {
namespace detail {
namespace {

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

size_t SkipDigits(std::string_view s, size_t pos)
{
    while (pos < s.size() && IsDigit(s[pos])) ++pos;
    return pos;
}

std::string_view TrimBlanks(std::string_view s)
{
    while (!s.empty() && IsBlank(static_cast<unsigned char>(s.front()))) s.remove_prefix(1);
    while (!s.empty() && IsBlank(static_cast<unsigned char>(s.back()))) s.remove_suffix(1);
    return s;
}

// True when s is exactly: sign? (digits (. digits?)? | . digits) (e sign? digits)?
bool IsNumberForm(std::string_view s)
{
    size_t pos = 0;
    if (pos < s.size() && (s[pos] == '+' || s[pos] == '-')) ++pos;
    const size_t intStart = pos;
    pos = SkipDigits(s, pos);
    bool haveDigits = pos > intStart;
    if (pos < s.size() && s[pos] == '.') {
        const size_t fracStart = ++pos;
        pos = SkipDigits(s, pos);
        haveDigits = haveDigits || pos > fracStart;
    }
    if (!haveDigits) return false;
    if (pos < s.size() && (s[pos] == 'e' || s[pos] == 'E')) {
        ++pos;
        if (pos < s.size() && (s[pos] == '+' || s[pos] == '-')) ++pos;
        const size_t expStart = pos;
        pos = SkipDigits(s, pos);
        if (pos == expStart) return false;
    }
    return pos == s.size();
}

}  // namespace

NumberParse ParseNumberText(std::string_view text, double &value)
{
    std::string_view s = TrimBlanks(text);
    if (!IsNumberForm(s)) return NumberParse::NotANumber;
    const bool negative = s.front() == '-';
    if (s.front() == '+' || s.front() == '-') s.remove_prefix(1);  // from_chars takes no sign
    double magnitude = 0;
    const auto [end, ec] = std::from_chars(s.data(), s.data() + s.size(), magnitude);
    if (ec == std::errc::result_out_of_range) {
        // A tiny number that underflows is zero; a huge one overflows.
        const auto e = s.find_first_of("eE");
        const bool tiny = e != std::string_view::npos && s[e + 1] == '-';
        if (!tiny) return NumberParse::OutOfRange;
        magnitude = 0;
    } else if (ec != std::errc() || end != s.data() + s.size()) {
        return NumberParse::NotANumber;
    }
    value = negative ? -magnitude : magnitude;
    return NumberParse::Ok;
}

}  // namespace detail

std::string FormatNumber(double value, int significantDigits)
{
    if (std::isnan(value)) return "NAN";
    if (std::isinf(value)) return value < 0 ? "-INF" : "INF";
    if (value == 0) return "0";  // also for negative zero
    if (significantDigits < 1) significantDigits = 1;
    if (significantDigits > 17) significantDigits = 17;
    char buffer[64];
    const auto result = std::to_chars(buffer, buffer + sizeof buffer, value,
                                      std::chars_format::general, significantDigits);
    std::string text(buffer, result.ptr);
    for (char &c : text)
        if (c == 'e') c = 'E';
    return text;
}

bool ParseNumber(std::string_view text, double &value)
{
    return detail::ParseNumberText(text, value) == detail::NumberParse::Ok;
}

bool ParseNumber(std::u16string_view text, double &value)
{
    // Number text is plain ASCII: anything wider is no number.
    std::string narrow;
    narrow.reserve(text.size());
    for (char16_t c : text) {
        if (c > 0x7F) return false;
        narrow += static_cast<char>(c);
    }
    return ParseNumber(narrow, value);
}

}  // namespace automation
