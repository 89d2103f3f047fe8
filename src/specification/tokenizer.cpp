// SPDX-License-Identifier: MIT
#include "specification/tokenizer.h"

#include <cctype>
#include <climits>
#include <cstdint>

namespace vantrel {

std::vector<std::string_view> SplitPieces(std::string_view text, std::string_view separators)
{
    std::vector<std::string_view> pieces;
    size_t pos = 0;
    while (true) {
        pos = text.find_first_not_of(separators, pos);
        if (pos == std::string_view::npos) break;
        // One separator is found by a plain search, not one set look-up a character.
        size_t end = separators.size() == 1 ? text.find(separators[0], pos) : text.find_first_of(separators, pos);
        if (end == std::string_view::npos) end = text.size();
        pieces.push_back(text.substr(pos, end - pos));
        pos = end;
    }
    return pieces;
}

int LeadingInt(std::string_view text)
{
    size_t i = 0;
    while (i < text.size() && std::isspace(static_cast<unsigned char>(text[i]))) ++i;
    bool negative = false;
    if (i < text.size() && (text[i] == '+' || text[i] == '-')) negative = text[i++] == '-';
    int64_t value = 0;
    for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
        value = value * 10 + (text[i] - '0');
        if (value > int64_t{INT_MAX} + 1) value = int64_t{INT_MAX} + 1;  // saturate, keep reading
    }
    if (negative) value = -value;
    if (value > INT_MAX) return INT_MAX;
    if (value < INT_MIN) return INT_MIN;
    return static_cast<int>(value);
}

}  // namespace vantrel
