// SPDX-License-Identifier: MIT
#include "decimal_number.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace workbook::format {

DecimalNumber DecimalNumber::FromDouble(double value) {
    DecimalNumber number;
    value = std::fabs(value);
    if (value == 0.0 || !std::isfinite(value)) return number;
    // d.dddddddddddddde+XX, correctly rounded as printf's %.14e but without
    // the locale and format-string work: this runs for every displayed number.
    char buffer[40];
    const auto end = std::to_chars(buffer, buffer + sizeof buffer, value, std::chars_format::scientific, 14).ptr;
    const char *e = buffer + 2;
    while (*e != 'e') ++e;
    number.digits_.reserve(15);
    number.digits_.push_back(buffer[0]);
    number.digits_.append(buffer + 2, static_cast<size_t>(e - (buffer + 2)));
    int exponent = 0;
    std::from_chars(e + (e[1] == '+' ? 2 : 1), end, exponent);
    number.exponent_ = exponent + 1;
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

void DecimalNumber::AppendPlain(std::string &out, int decimals) const {
    if (exponent_ <= 0) {
        out.push_back('0');
    } else {
        const size_t integer = std::min(digits_.size(), static_cast<size_t>(exponent_));
        out.append(digits_, 0, integer);
        out.append(static_cast<size_t>(exponent_) - integer, '0');
    }
    const size_t point = out.size();
    out.push_back('.');
    for (int i = 0; i < decimals; ++i) {
        const long index = static_cast<long>(exponent_) + i;
        out.push_back(index >= 0 && index < static_cast<long>(digits_.size()) ? digits_[static_cast<size_t>(index)]
                                                                               : '0');
    }
    while (out.size() > point + 1 && out.back() == '0') out.pop_back();
    if (out.size() == point + 1) out.pop_back();
}

}  // namespace workbook::format
