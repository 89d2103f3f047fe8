// SPDX-License-Identifier: MIT
// Digit placeholders: '0' shows a digit or 0, '#' a digit or nothing, '?' a
// digit or a blank.
#pragma once

#include <string>
#include <vector>

#include "workbook/format/format_code.h"

namespace workbook::format {

inline bool IsPlaceholder(TokenKind kind) {
    return kind == TokenKind::DigitZero || kind == TokenKind::DigitHash ||
           kind == TokenKind::DigitQuestion;
}

// What a placeholder shows where the number has no digit for it.
inline std::string Filler(TokenKind kind) {
    return kind == TokenKind::DigitZero ? "0" : kind == TokenKind::DigitQuestion ? " " : "";
}

// Right-aligned digits over placeholders, one text for each; extra digits go
// into the first. An empty `digits` stands for a zero integer part.
inline std::vector<std::string> AlignRight(const std::string &digits, const std::vector<TokenKind> &slots) {
    std::vector<std::string> out(slots.size());
    const size_t n = slots.size();
    for (size_t i = 0; i < n; ++i) {
        const size_t fromRight = n - 1 - i;
        out[i] = fromRight < digits.size() ? std::string(1, digits[digits.size() - 1 - fromRight])
                                           : Filler(slots[i]);
    }
    if (n > 0 && digits.size() > n) out[0] = digits.substr(0, digits.size() - n) + out[0];
    return out;
}

// Left-aligned digits over placeholders (a fraction's denominator).
inline std::vector<std::string> AlignLeft(const std::string &digits, const std::vector<TokenKind> &slots) {
    std::vector<std::string> out(slots.size());
    for (size_t i = 0; i < slots.size(); ++i)
        out[i] = i < digits.size() ? std::string(1, digits[i]) : Filler(slots[i]);
    if (!slots.empty() && digits.size() > slots.size()) out.back() += digits.substr(slots.size());
    return out;
}

}  // namespace workbook::format
