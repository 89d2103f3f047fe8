// SPDX-License-Identifier: MIT
#include "date_section.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "serial_date.h"

namespace workbook::format {
namespace {

constexpr std::array<std::string_view, 12> kMonthNames{
    "January", "February", "March",     "April",   "May",      "June",
    "July",    "August",   "September", "October", "November", "December"};
constexpr std::array<std::string_view, 7> kDayNames{"Sunday",   "Monday", "Tuesday", "Wednesday",
                                                    "Thursday", "Friday", "Saturday"};

std::string Padded(long long number, int width) {
    std::string text = std::to_string(number);
    if (static_cast<int>(text.size()) < width) text.insert(0, static_cast<size_t>(width) - text.size(), '0');
    return text;
}

// The serial as a whole count of the smallest unit shown (a second, or a
// tenth, hundredth or thousandth of one), rounded half away from zero. The
// tolerance absorbs the binary error of a serial that was typed as an exact
// time such as 05:06:07.5.
long long RoundToUnits(double serial, long long unitsPerDay) {
    const long double exact = static_cast<long double>(serial) * unitsPerDay;
    const long double tolerance = std::max<long double>(1e-9L, exact * 1e-15L);
    return static_cast<long long>(std::floor(exact + 0.5L + tolerance));
}

}  // namespace

std::optional<std::string> FormatDateSection(double serial, const FormatSection &section,
                                             bool date1904) {
    const long lastSerial = date1904 ? kLastSerial1904 : kLastSerial1900;
    if (!std::isfinite(serial) || serial < 0 || serial >= static_cast<double>(lastSerial) + 1)
        return std::nullopt;

    int precision = 0;
    bool twelveHour = false;
    for (const auto &token : section.tokens) {
        if (token.kind == TokenKind::SecondFraction) precision = std::max(precision, token.count);
        if (token.kind == TokenKind::AmPm) twelveHour = true;
    }
    long long scale = 1;
    for (int i = 0; i < precision; ++i) scale *= 10;
    const long long unitsPerDay = 86400 * scale;

    const long long units = RoundToUnits(serial, unitsPerDay);
    const long dayCount = static_cast<long>(units / unitsPerDay);
    const auto date = DateFromSerial(dayCount, date1904);
    if (!date) return std::nullopt;

    const long long inDay = units % unitsPerDay;
    const long long hour = inDay / (3600 * scale);
    const long long minute = inDay / (60 * scale) % 60;
    const long long second = inDay / scale % 60;
    const std::string fraction = Padded(inDay % scale, precision);

    std::string out;
    for (const auto &token : section.tokens) {
        switch (token.kind) {
        case TokenKind::Year:
            out += token.count <= 2 ? Padded(date->year % 100, 2) : Padded(date->year, 4);
            break;
        case TokenKind::Month:
            if (token.count <= 2) out += Padded(date->month, token.count);
            else if (token.count == 3) out += kMonthNames[date->month - 1].substr(0, 3);
            else if (token.count == 5) out += kMonthNames[date->month - 1].substr(0, 1);
            else out += kMonthNames[date->month - 1];
            break;
        case TokenKind::Day:
            if (token.count <= 2) out += Padded(date->day, token.count);
            else if (token.count == 3) out += kDayNames[date->weekday].substr(0, 3);
            else out += kDayNames[date->weekday];
            break;
        case TokenKind::Hour: {
            long long shown = hour;
            if (twelveHour) shown = hour % 12 == 0 ? 12 : hour % 12;
            out += Padded(shown, std::min(token.count, 2));
            break;
        }
        case TokenKind::Minute:
            out += Padded(minute, std::min(token.count, 2));
            break;
        case TokenKind::Second:
            out += Padded(second, std::min(token.count, 2));
            break;
        case TokenKind::ElapsedHours:
            out += Padded(units / (3600 * scale), token.count);
            break;
        case TokenKind::ElapsedMinutes:
            out += Padded(units / (60 * scale), token.count);
            break;
        case TokenKind::ElapsedSeconds:
            out += Padded(units / scale, token.count);
            break;
        case TokenKind::SecondFraction:
            out += '.';
            out += fraction.substr(0, static_cast<size_t>(token.count));
            break;
        case TokenKind::AmPm:
            if (token.text == "AM/PM") out += hour < 12 ? "AM" : "PM";
            else out += hour < 12 ? token.text[0] : token.text[2];
            break;
        default:
            out += token.text;
            break;
        }
    }
    return out;
}

}  // namespace workbook::format
