// SPDX-License-Identifier: MIT
// A non-negative number as decimal digits, so that displayed digits are
// rounded half away from zero on what the cell holds (15 significant digits)
// and not on the binary fraction behind it: 2.675 shows as 2.68.
#pragma once

#include <string>

namespace workbook::format {

class DecimalNumber {
public:
    // |value| to 15 significant digits; value must be finite.
    static DecimalNumber FromDouble(double value);

    bool IsZero() const { return digits_.empty(); }
    // The power of ten of the first digit: 1234.5 gives 3, 0.05 gives -2.
    int Magnitude() const { return exponent_ - 1; }

    DecimalNumber RoundedToDecimals(int decimals) const;
    DecimalNumber RoundedToSignificant(int count) const;
    DecimalNumber TimesPowerOfTen(int power) const;

    // The digits before the point, without leading zeros ("" below 1).
    std::string IntegerDigits() const;
    // Exactly `count` digits after the point, cut off (round first).
    std::string FractionDigits(int count) const;
    // Appends the integer digits ("0" below 1), then the point and the first
    // `decimals` fraction digits without trailing zeros, when any is left.
    void AppendPlain(std::string &out, int decimals) const;

private:
    DecimalNumber RoundedToLength(long keep) const;
    void StripTrailingZeros();

    std::string digits_;  // significant digits, no leading or trailing zeros
    int exponent_ = 0;    // value = 0.digits_ x 10^exponent_
};

}  // namespace workbook::format
