// SPDX-License-Identifier: MIT
#include "workbook/format/shortest_number.h"

#include <array>
#include <cmath>
#include <cstdint>

namespace workbook::format {
namespace {

constexpr std::array<double, 5> kPowersOfTen = {1, 10, 100, 1000, 10000};
constexpr std::array<uint64_t, 5> kWholePowersOfTen = {1, 10, 100, 1000, 10000};
// Below 2^31 a double's spacing is under 2^-22, far below 10^-4: at most one
// text of four decimals or fewer lies among those that read back as it.
constexpr double kFastBelow = 2147483648.0;

char *PutDigits(char *at, uint64_t value, int width)
{
    char *end = at + width;
    for (char *p = end; p != at; value /= 10) *--p = static_cast<char>('0' + value % 10);
    return end;
}

int DigitCount(uint64_t value)
{
    int count = 1;
    while (value >= 10) {
        value /= 10;
        ++count;
    }
    return count;
}

}  // namespace

char *ShortestNumberChars(char *first, char *last, double value)
{
    const double magnitude = std::fabs(value);
    if (!(magnitude >= 1 && magnitude < kFastBelow)) return std::to_chars(first, last, value).ptr;
    for (size_t decimals = 0; decimals < kPowersOfTen.size(); ++decimals) {
        const double scaled = std::nearbyint(magnitude * kPowersOfTen[decimals]);
        // The decimal scaled / 10^decimals reads back as the nearest double to
        // it, which the division gives exactly rounded.
        if (scaled / kPowersOfTen[decimals] != magnitude) continue;
        const auto digits = static_cast<uint64_t>(scaled);
        const uint64_t whole = digits / kWholePowersOfTen[decimals];
        const int wholeDigits = DigitCount(whole);
        if (decimals == 0) {
            // A whole number with trailing zeros can be shorter in the
            // scientific form ("1e+05"): that form is left to the library.
            int zeros = 0;
            for (uint64_t rest = whole; rest % 10 == 0; rest /= 10) ++zeros;
            const int significant = wholeDigits - zeros;
            const int scientific = significant + (significant > 1 ? 1 : 0) + 4;
            if (scientific < wholeDigits) return std::to_chars(first, last, value).ptr;
        }
        char *at = first;
        if (value < 0) *at++ = '-';
        at = PutDigits(at, whole, wholeDigits);
        if (decimals > 0) {
            *at++ = '.';
            at = PutDigits(at, digits % kWholePowersOfTen[decimals], static_cast<int>(decimals));
        }
        return at;
    }
    return std::to_chars(first, last, value).ptr;
}

}  // namespace workbook::format
