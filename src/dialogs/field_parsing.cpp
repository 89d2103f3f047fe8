// SPDX-License-Identifier: MIT
#include "dialogs/field_parsing.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstdlib>

namespace vantrel::dialogs {
namespace {

std::string Trimmed(const std::string &text)
{
    const auto first = text.find_first_not_of(" \t");
    if (first == std::string::npos) return {};
    const auto last = text.find_last_not_of(" \t");
    return text.substr(first, last - first + 1);
}

std::string Printed(const char *format, double value)
{
    char buffer[64];
    std::snprintf(buffer, sizeof buffer, format, value);
    return buffer;
}

}  // namespace

bool ParseWholeNumber(const std::string &text, int &value)
{
    std::string digits = Trimmed(text);
    // from_chars takes a minus but no plus.
    if (!digits.empty() && digits[0] == '+') digits.erase(0, 1);
    if (digits.empty() || digits[0] == '+') return false;
    int parsed = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), parsed);
    if (error != std::errc() || end != digits.data() + digits.size()) return false;
    value = parsed;
    return true;
}

bool ParseNumber(const std::string &text, double &value)
{
    const std::string number = Trimmed(text);
    if (number.empty()) return false;
    char *end = nullptr;
    const double parsed = std::strtod(number.c_str(), &end);
    if (end != number.c_str() + number.size() || !std::isfinite(parsed)) return false;
    value = parsed;
    return true;
}

std::string WholeNumberText(int value) { return std::to_string(value); }

std::string NumberText(double value) { return Printed("%.15g", value); }

std::string KeyNumberText(int value) { return std::to_string(value); }

std::string KeyDoubleText(double value) { return Printed("%g", value); }

}  // namespace vantrel::dialogs

namespace vantrel::dialogs {

int SpinStep(const std::string &text, int position, int step, int low, int high)
{
    int current = position;
    ParseWholeNumber(text, current);
    const long long next = static_cast<long long>(current) + step;
    return int(std::clamp<long long>(next, low, high));
}

}  // namespace vantrel::dialogs
