// SPDX-License-Identifier: MIT
#include "dialogs/field_parsing.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <system_error>

namespace vantrel::dialogs {
namespace {

std::string Trimmed(const std::string &text)
{
    const auto first = text.find_first_not_of(" \t");
    if (first == std::string::npos) return {};
    const auto last = text.find_last_not_of(" \t");
    return text.substr(first, last - first + 1);
}

// from_chars takes a minus but no plus: one leading plus is dropped here,
// and a sign after it refused.
bool DropPlus(std::string &text)
{
    if (text.empty() || text[0] != '+') return true;
    text.erase(0, 1);
    return text.empty() || (text[0] != '+' && text[0] != '-');
}

// to_chars, unlike printf, never looks at the locale.
template <typename... Precision>
std::string Printed(double value, Precision... precision)
{
    char buffer[64];
    const auto [end, error] = std::to_chars(buffer, buffer + sizeof buffer, value, precision...);
    return error == std::errc() ? std::string(buffer, end) : std::string();
}

}  // namespace

bool ParseWholeNumber(const std::string &text, int &value)
{
    std::string digits = Trimmed(text);
    if (!DropPlus(digits) || digits.empty()) return false;
    int parsed = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), parsed);
    if (error != std::errc() || end != digits.data() + digits.size()) return false;
    value = parsed;
    return true;
}

bool ParseNumber(const std::string &text, double &value)
{
    std::string number = Trimmed(text);
    if (!DropPlus(number) || number.empty()) return false;
    double parsed = 0;
    const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), parsed);
    if (error != std::errc() || end != number.data() + number.size() || !std::isfinite(parsed)) return false;
    value = parsed;
    return true;
}

std::string WholeNumberText(int value) { return std::to_string(value); }

std::string NumberText(double value) { return Printed(value); }

std::string ShortNumberText(double value) { return Printed(value, std::chars_format::general, 6); }

std::string KeyNumberText(int value) { return std::to_string(value); }

std::string KeyDoubleText(double value) { return NumberText(value); }

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
