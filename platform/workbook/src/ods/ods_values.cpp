// SPDX-License-Identifier: MIT
#include "ods/ods_values.h"

#include <charconv>
#include <cmath>

#include "cells/date_serial.h"

namespace workbook::ods {

std::optional<double> ParseNumber(std::string_view text)
{
    if (!text.empty() && text.front() == '+') text.remove_prefix(1);
    double value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (text.empty() || error != std::errc() || end != text.data() + text.size()) return std::nullopt;
    return value;
}

std::optional<uint64_t> ParseCount(std::string_view text)
{
    uint64_t value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (text.empty() || error != std::errc() || end != text.data() + text.size() || value == 0) return std::nullopt;
    return value;
}

std::optional<double> ParseDateValue(std::string_view text)
{
    // Only dates with a four-digit year of the common era; no time zone.
    if (text.size() < 10 || text[4] != '-' || text[7] != '-') return std::nullopt;
    return IsoTextToSerial(text, false);
}

std::optional<double> ParseDuration(std::string_view text)
{
    bool negative = false;
    if (!text.empty() && text.front() == '-') {
        negative = true;
        text.remove_prefix(1);
    }
    if (text.empty() || text.front() != 'P') return std::nullopt;
    text.remove_prefix(1);
    double seconds = 0;
    bool inTime = false, any = false;
    while (!text.empty()) {
        if (text.front() == 'T' && !inTime) {
            inTime = true;
            text.remove_prefix(1);
            continue;
        }
        double amount = 0;
        const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), amount);
        if (error != std::errc() || end == text.data() + text.size() || amount < 0) return std::nullopt;
        const char unit = *end;
        text.remove_prefix(size_t(end - text.data()) + 1);
        if (!inTime && unit == 'D') seconds += amount * 86400;
        else if (inTime && unit == 'H') seconds += amount * 3600;
        else if (inTime && unit == 'M') seconds += amount * 60;
        else if (inTime && unit == 'S') seconds += amount;
        else return std::nullopt;  // years and months have no fixed length
        any = true;
    }
    if (!any || !std::isfinite(seconds)) return std::nullopt;
    return (negative ? -seconds : seconds) / 86400.0;
}

}  // namespace workbook::ods
