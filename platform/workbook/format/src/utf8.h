// SPDX-License-Identifier: MIT
// Just enough UTF-8 to step over whole characters and read code points.
#pragma once

#include <cstddef>
#include <string_view>

namespace workbook::format {

// The number of bytes of the character at `pos`: 1 for ASCII and for any
// byte that does not start a well-formed sequence, so that bad input is
// stepped over one byte at a time.
inline size_t Utf8SequenceLength(std::string_view text, size_t pos) {
    const auto lead = static_cast<unsigned char>(text[pos]);
    size_t length = lead < 0x80 ? 1 : (lead >> 5) == 0x6 ? 2 : (lead >> 4) == 0xE ? 3
                                  : (lead >> 3) == 0x1E  ? 4 : 1;
    if (pos + length > text.size()) return 1;
    for (size_t i = 1; i < length; ++i)
        if ((static_cast<unsigned char>(text[pos + i]) & 0xC0) != 0x80) return 1;
    return length;
}

// The code point of the character at `pos` whose length is `length`;
// a lone byte that is not ASCII gives 0xFFFD.
inline char32_t Utf8CodePoint(std::string_view text, size_t pos, size_t length) {
    const auto lead = static_cast<unsigned char>(text[pos]);
    if (length == 1) return lead < 0x80 ? lead : 0xFFFD;
    char32_t cp = lead & (0x7F >> length);
    for (size_t i = 1; i < length; ++i) cp = (cp << 6) | (static_cast<unsigned char>(text[pos + i]) & 0x3F);
    return cp;
}

}  // namespace workbook::format
