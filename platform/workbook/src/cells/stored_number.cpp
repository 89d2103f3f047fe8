// SPDX-License-Identifier: MIT
#include "cells/stored_number.h"

#include <charconv>
#include <cmath>

namespace workbook {
namespace {

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

// Whether a decimal number whose double is out of range lies below 1 (its
// first significant digit after the point) and so is an underflow: the
// place of that digit plus the exponent.
bool IsBelowOne(std::string_view text)
{
    size_t pos = text.empty() || (text[0] != '-' && text[0] != '+') ? 0 : 1;
    long long place = 0;
    bool significant = false;
    for (; pos < text.size() && IsDigit(text[pos]); ++pos) {
        significant = significant || text[pos] != '0';
        if (significant) ++place;
    }
    if (pos < text.size() && text[pos] == '.') {
        for (++pos; pos < text.size() && IsDigit(text[pos]); ++pos) {
            if (significant) continue;
            if (text[pos] != '0') significant = true;
            else --place;
        }
    }
    if (pos < text.size() && (text[pos] == 'e' || text[pos] == 'E')) {
        ++pos;
        const bool negative = pos < text.size() && text[pos] == '-';
        if (pos < text.size() && (text[pos] == '-' || text[pos] == '+')) ++pos;
        long long exponent = 0;
        const auto [end, error] = std::from_chars(text.data() + pos, text.data() + text.size(), exponent);
        // An exponent beyond long long decides alone.
        if (error == std::errc::result_out_of_range || end != text.data() + text.size()) return negative;
        place += negative ? -exponent : exponent;
    }
    return place <= 0;
}

}  // namespace

StoredNumber ReadStoredNumber(std::string_view text)
{
    if (text.starts_with('+')) text.remove_prefix(1);  // as some producers write a positive number
    double value = 0;
    const char *end = text.data() + text.size();
    const auto [ptr, error] = std::from_chars(text.data(), end, value);
    if (ptr != end || text.empty()) return {};
    if (error == std::errc() && std::isfinite(value)) return {StoredNumber::Kind::Finite, value};
    if (error == std::errc::result_out_of_range && IsBelowOne(text)) return {StoredNumber::Kind::Underflow, 0.0};
    return {};
}

}  // namespace workbook
