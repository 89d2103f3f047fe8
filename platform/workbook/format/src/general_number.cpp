// SPDX-License-Identifier: MIT
// General shows a number in at most 11 characters besides the sign: plainly
// while that keeps the integer part whole and the value not below 1E-05
// (10 significant digits at most, fewer as the integer part grows), else in
// scientific form with up to 6 significant digits.
#include "general_number.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

#include "decimal_number.h"
#include "workbook/format/display_text.h"

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

std::string GeneralMagnitudeText(double value) {
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
