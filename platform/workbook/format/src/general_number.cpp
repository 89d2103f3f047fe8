// SPDX-License-Identifier: MIT
// General shows a number in at most 11 characters besides the sign: plainly
// while that keeps the integer part whole and the value not below 1E-05
// (10 significant digits at most, fewer as the integer part grows), else in
// scientific form with up to 6 significant digits.
#include "general_number.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdlib>

#include "decimal_number.h"
#include "workbook/format/display_text.h"
#include "workbook/format/shortest_number.h"

namespace workbook::format {
namespace {

constexpr int kGeneralWidth = 11;

std::string PlainText(const DecimalNumber &number, int decimals) {
    std::string text;
    number.AppendPlain(text, decimals);
    return text;
}

std::string ScientificText(const DecimalNumber &number) {
    DecimalNumber rounded = number.RoundedToSignificant(6);
    if (std::abs(rounded.Magnitude()) >= 100) rounded = number.RoundedToSignificant(5);
    const int exponent = rounded.Magnitude();
    const DecimalNumber mantissa = rounded.TimesPowerOfTen(-exponent);
    std::string text = PlainText(mantissa, 5);
    const int digits = std::abs(exponent);
    text += exponent < 0 ? "E-" : "E+";
    if (digits < 10) text += '0';
    text += std::to_string(digits);
    return text;
}

}  // namespace

std::optional<std::string_view> ShortestGeneralText(double magnitude, ShortestBuffer &buffer) {
    if (!(magnitude > 0) || !std::isfinite(magnitude)) return std::nullopt;
    const char *end = ShortestNumberChars(buffer.data(), buffer.data() + buffer.size(), magnitude);
    const std::string_view shortest(buffer.data(), size_t(end - buffer.data()));
    if (shortest.find('e') != std::string_view::npos) return std::nullopt;
    const size_t point = shortest.find('.');
    const size_t integerDigits = point == std::string_view::npos ? shortest.size() : point;
    const size_t decimals = point == std::string_view::npos ? 0 : shortest.size() - point - 1;
    if (shortest[0] != '0') {
        // The integer part's magnitude is integerDigits - 1.
        if (integerDigits > size_t(kGeneralWidth)) return std::nullopt;
        if (decimals > size_t(std::max(0, kGeneralWidth - 1 - int(integerDigits)))) return std::nullopt;
    } else {
        // Below 1: the first significant digit within four places (from
        // 1E-05 down General turns scientific), nine decimals at most.
        if (decimals > size_t(kGeneralWidth - 2) || shortest.compare(0, 6, "0.0000") == 0) return std::nullopt;
    }
    return shortest;
}

std::string GeneralMagnitudeText(double value) {
    ShortestBuffer buffer;
    if (auto shortest = ShortestGeneralText(std::fabs(value), buffer)) return std::string(*shortest);
    const DecimalNumber number = DecimalNumber::FromDouble(value);
    if (number.IsZero()) return "0";
    const int magnitude = number.Magnitude();
    if (magnitude >= 0) {
        // The integer part takes magnitude + 1 characters and the point one more.
        const int decimals = std::max(0, kGeneralWidth - 2 - magnitude);
        const DecimalNumber rounded = number.RoundedToDecimals(decimals);
        if (rounded.Magnitude() >= kGeneralWidth) return ScientificText(number);
        return PlainText(rounded, decimals);
    }
    // Below 1: "0." leaves nine digits, but from 1E-05 down the scientific
    // form is used even where the plain one would fit.
    if (number.RoundedToSignificant(6).Magnitude() <= -5) return ScientificText(number);
    const int decimals = kGeneralWidth - 2;
    return PlainText(number.RoundedToDecimals(decimals), decimals);
}

std::string GeneralNumberText(double value) {
    if (!std::isfinite(value)) return "#NUM!";
    std::string text = GeneralMagnitudeText(value);
    if (value < 0 && text != "0") text.insert(text.begin(), '-');
    return text;
}

}  // namespace workbook::format
