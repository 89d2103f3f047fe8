// SPDX-License-Identifier: MIT
#include "float_text.h"

#include <bit>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>

namespace vantrel_cli {
namespace {

constexpr double kPowersOfTen[] = {1.0, 10.0, 100.0, 1000.0, 10000.0};
constexpr int kMaxDecimals = 4;

int DigitCount(uint64_t n)
{
    int digits = 1;
    while (n >= 10) {
        n /= 10;
        ++digits;
    }
    return digits;
}

// Writes the value n / 10^decimals in fixed notation at out; returns the end.
char *WriteFixed(char *out, bool negative, uint64_t n, int decimals)
{
    char text[32];
    char *end = text + sizeof text;
    char *p = end;
    for (int i = 0; i < decimals; ++i, n /= 10) *--p = char('0' + n % 10);
    if (decimals > 0) *--p = '.';
    do {
        *--p = char('0' + n % 10);
        n /= 10;
    } while (n > 0);
    if (negative) *--p = '-';
    const auto length = static_cast<size_t>(end - p);
    std::memcpy(out, p, length);
    return out + length;
}

// The fixed text with the fewest decimals that reads back as the value, when
// that is also the text std::to_chars gives, at out; null when it may not be.
char *WriteShortDecimal(char *out, float value)
{
    // Zero, powers of two (whose rounding interval is lopsided, so the nearest
    // decimal may fail where a farther one of as many digits reads back),
    // and what is not finite go the general way.
    const uint32_t bits = std::bit_cast<uint32_t>(value);
    if ((bits & 0x007FFFFFu) == 0 || !std::isfinite(value)) return nullptr;
    const double magnitude = std::fabs(double(value));
    if (magnitude >= 1e7 || magnitude < 1e-3) return nullptr;
    for (int k = 0; k <= kMaxDecimals; ++k) {
        // Exact: 24 bits of float times at most 14 bits of a power of ten.
        const double scaled = magnitude * kPowersOfTen[k];
        const double nearest = std::nearbyint(scaled);
        if (nearest == 0.0) continue;
        // The quotient rounds once to double and once to float; a decimal of
        // this size never lies close enough to a float's rounding boundary to
        // round differently than when read at once, so this is the float the
        // text reads back as.
        if (float(nearest / kPowersOfTen[k]) != float(magnitude)) continue;
        const auto n = static_cast<uint64_t>(nearest);
        // std::to_chars chooses scientific notation when it is shorter.
        uint64_t significant = n;
        while (significant % 10 == 0) significant /= 10;
        const int digits = DigitCount(significant);
        const int fixedLength = magnitude >= 1.0 ? DigitCount(n / uint64_t(kPowersOfTen[k])) + (k > 0 ? k + 1 : 0)
                                                 : 2 + k;
        const int scientificLength = digits + (digits > 1 ? 1 : 0) + 4;
        if (fixedLength > scientificLength) return nullptr;
        return WriteFixed(out, value < 0, n, k);
    }
    return nullptr;
}

}  // namespace

char *WriteShortestFloat(char *out, float value)
{
    if (char *end = WriteShortDecimal(out, value)) return end;
    return std::to_chars(out, out + kMaxFloatText, value).ptr;
}

void AppendShortestFloat(std::string &out, float value)
{
    char text[kMaxFloatText];
    out.append(text, WriteShortestFloat(text, value));
}

}  // namespace vantrel_cli
