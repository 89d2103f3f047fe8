// SPDX-License-Identifier: MIT
#include "decimal_number.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>

namespace workbook::format {

DecimalNumber DecimalNumber::FromDouble(double value) {
    DecimalNumber number;
    value = std::fabs(value);
    if (value == 0.0 || !std::isfinite(value)) return number;
    char buffer[40];
    std::snprintf(buffer, sizeof buffer, "%.14e", value);  // d.dddddddddddddde+XX
    number.digits_.push_back(buffer[0]);
    const char *p = buffer + 2;
    while (*p != 'e') number.digits_.push_back(*p++);
    number.exponent_ = std::atoi(p + 1) + 1;
    number.StripTrailingZeros();
    return number;
}

DecimalNumber DecimalNumber::RoundedToDecimals(int decimals) const {
    return RoundedToLength(static_cast<long>(exponent_) + decimals);
}

DecimalNumber DecimalNumber::RoundedToSignificant(int count) const { return RoundedToLength(count); }

DecimalNumber DecimalNumber::TimesPowerOfTen(int power) const {
    DecimalNumber number = *this;
    if (!number.IsZero()) number.exponent_ += power;
    return number;
}

// Keeps the first `keep` digits, rounding half away from zero.
DecimalNumber DecimalNumber::RoundedToLength(long keep) const {
    if (keep >= static_cast<long>(digits_.size())) return *this;
    DecimalNumber number;
    if (keep < 0) return number;
    const bool roundUp = digits_[static_cast<size_t>(keep)] >= '5';
    number.digits_ = digits_.substr(0, static_cast<size_t>(keep));
    number.exponent_ = exponent_;
    if (roundUp) {
        long i = keep - 1;
        while (i >= 0 && number.digits_[static_cast<size_t>(i)] == '9') {
            number.digits_[static_cast<size_t>(i)] = '0';
            --i;
        }
        if (i >= 0) {
            ++number.digits_[static_cast<size_t>(i)];
        } else {
            number.digits_.insert(number.digits_.begin(), '1');
            ++number.exponent_;
        }
    }
    number.StripTrailingZeros();
    return number;
}

void DecimalNumber::StripTrailingZeros() {
    while (!digits_.empty() && digits_.back() == '0') digits_.pop_back();
    if (digits_.empty()) exponent_ = 0;
}

std::string DecimalNumber::IntegerDigits() const {
    if (exponent_ <= 0) return {};
    std::string out = digits_.substr(0, static_cast<size_t>(exponent_));
    out.resize(static_cast<size_t>(exponent_), '0');
    return out;
}

std::string DecimalNumber::FractionDigits(int count) const {
    std::string out;
    out.reserve(static_cast<size_t>(count));
    for (int i = 0; i < count; ++i) {
        const long index = static_cast<long>(exponent_) + i;
        out.push_back(index >= 0 && index < static_cast<long>(digits_.size())
                          ? digits_[static_cast<size_t>(index)]
                          : '0');
    }
    return out;
}

}  // namespace workbook::format
