// SPDX-License-Identifier: MIT
#include "workbook/format/typed_text.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>
#include <optional>

#include "serial_date.h"

namespace workbook::format {
namespace {

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

std::string_view TrimBlanks(std::string_view text) {
    while (!text.empty() && text.front() == ' ') text.remove_prefix(1);
    while (!text.empty() && text.back() == ' ') text.remove_suffix(1);
    return text;
}

bool EqualsIgnoringCase(std::string_view a, std::string_view b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](char x, char y) {
        return std::tolower(static_cast<unsigned char>(x)) == std::tolower(static_cast<unsigned char>(y));
    });
}

// Consumes 1 to maxDigits digits from the front of `text`.
std::optional<int> TakeNumber(std::string_view &text, size_t minDigits, size_t maxDigits) {
    size_t n = 0;
    while (n < text.size() && n < maxDigits && IsDigit(text[n])) ++n;
    if (n < minDigits || (n < text.size() && IsDigit(text[n]))) return std::nullopt;
    int value = 0;
    std::from_chars(text.data(), text.data() + n, value);
    text.remove_prefix(n);
    return value;
}

bool TakeChar(std::string_view &text, char c) {
    if (text.empty() || text.front() != c) return false;
    text.remove_prefix(1);
    return true;
}

// [+-] digits [. digits] [e [+-] digits], with digits on at least one side
// of the point.
struct PlainNumber {
    double value;
    bool hasFraction;
    bool hasExponent;
};

std::optional<PlainNumber> ReadPlainNumber(std::string_view text) {
    size_t i = 0;
    if (i < text.size() && (text[i] == '+' || text[i] == '-')) ++i;
    size_t digits = 0;
    while (i < text.size() && IsDigit(text[i])) ++i, ++digits;
    bool hasFraction = false;
    if (i < text.size() && text[i] == '.') {
        ++i;
        while (i < text.size() && IsDigit(text[i])) ++i, ++digits, hasFraction = true;
    }
    if (digits == 0) return std::nullopt;
    bool hasExponent = false;
    if (i < text.size() && (text[i] == 'e' || text[i] == 'E')) {
        ++i;
        if (i < text.size() && (text[i] == '+' || text[i] == '-')) ++i;
        size_t exponentDigits = 0;
        while (i < text.size() && IsDigit(text[i])) ++i, ++exponentDigits;
        if (exponentDigits == 0) return std::nullopt;
        hasExponent = true;
    }
    if (i != text.size()) return std::nullopt;
    // from_chars takes no '+'.
    std::string_view body = text;
    if (body.front() == '+') body.remove_prefix(1);
    double value = 0;
    auto [ptr, ec] = std::from_chars(body.data(), body.data() + body.size(), value);
    if (ec != std::errc() || ptr != body.data() + body.size() || !std::isfinite(value)) return std::nullopt;
    if (value == 0) value = 0;  // "-0" is 0
    return PlainNumber{value, hasFraction, hasExponent};
}

struct DatePart {
    long serial;
    char separator;
};

// yyyy-m-d or yyyy/m/d, the same separator twice.
std::optional<DatePart> ReadDate(std::string_view &text) {
    std::string_view rest = text;
    const auto year = TakeNumber(rest, 4, 4);
    if (!year || rest.empty() || (rest.front() != '-' && rest.front() != '/')) return std::nullopt;
    const char separator = rest.front();
    rest.remove_prefix(1);
    const auto month = TakeNumber(rest, 1, 2);
    if (!month || !TakeChar(rest, separator)) return std::nullopt;
    const auto day = TakeNumber(rest, 1, 2);
    if (!day) return std::nullopt;
    const auto serial = SerialFromDate(*year, *month, *day);
    if (!serial) return std::nullopt;
    text = rest;
    return DatePart{*serial, separator};
}

struct TimePart {
    double fraction;
    std::string format;
};

// h:mm, h:mm:ss or h:mm:ss.f (1 to 3 digits), 24-hour clock.
std::optional<TimePart> ReadTime(std::string_view &text) {
    std::string_view rest = text;
    const auto hour = TakeNumber(rest, 1, 2);
    if (!hour || !TakeChar(rest, ':')) return std::nullopt;
    const auto minute = TakeNumber(rest, 2, 2);
    if (!minute) return std::nullopt;
    std::string format = "hh:mm";
    int second = 0, millis = 0;
    if (TakeChar(rest, ':')) {
        const auto s = TakeNumber(rest, 2, 2);
        if (!s) return std::nullopt;
        second = *s;
        format += ":ss";
        if (TakeChar(rest, '.')) {
            size_t n = 0;
            while (n < rest.size() && IsDigit(rest[n])) ++n;
            if (n == 0 || n > 3) return std::nullopt;
            std::string digits(rest.substr(0, n));
            format += "." + std::string(n, '0');
            digits.resize(3, '0');
            millis = std::stoi(digits);
            rest.remove_prefix(n);
        }
    }
    if (*hour > 23 || *minute > 59 || second > 59) return std::nullopt;
    text = rest;
    const double seconds = *hour * 3600.0 + *minute * 60.0 + second + millis / 1000.0;
    return TimePart{seconds / 86400.0, format};
}

std::optional<TypedValue> ReadDateTime(std::string_view text) {
    std::string_view rest = text;
    if (auto date = ReadDate(rest)) {
        const std::string dateFormat = date->separator == '-' ? "yyyy-mm-dd" : "yyyy/mm/dd";
        if (rest.empty()) return TypedValue{TypedKind::Date, static_cast<double>(date->serial), dateFormat};
        if (!TakeChar(rest, ' ')) return std::nullopt;
        auto time = ReadTime(rest);
        if (!time || !rest.empty()) return std::nullopt;
        return TypedValue{TypedKind::Date, static_cast<double>(date->serial) + time->fraction,
                          dateFormat + " " + time->format};
    }
    rest = text;
    auto time = ReadTime(rest);
    if (!time || !rest.empty()) return std::nullopt;
    return TypedValue{TypedKind::Date, time->fraction, time->format};
}

}  // namespace

TypedValue ParseTypedText(std::string_view text) {
    const std::string_view body = TrimBlanks(text);
    if (body.empty()) return {};
    if (EqualsIgnoringCase(body, "TRUE")) return {TypedKind::Boolean, 1.0, ""};
    if (EqualsIgnoringCase(body, "FALSE")) return {TypedKind::Boolean, 0.0, ""};
    if (body.back() == '%') {
        if (auto number = ReadPlainNumber(body.substr(0, body.size() - 1)); number && !number->hasExponent)
            return {TypedKind::Number, number->value / 100.0, number->hasFraction ? "0.00%" : "0%"};
        return {};
    }
    if (auto number = ReadPlainNumber(body))
        return {TypedKind::Number, number->value, number->hasExponent ? "0.00E+00" : ""};
    if (auto dateTime = ReadDateTime(body)) return *dateTime;
    return {};
}

}  // namespace workbook::format
