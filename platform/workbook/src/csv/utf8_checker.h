// SPDX-License-Identifier: MIT
// Checks UTF-8 a byte at a time, as text streams in: no overlong forms, no
// surrogates, nothing beyond U+10FFFF.
#pragma once

namespace workbook::csv {

class Utf8Checker {
public:
    // Whether byte may come next.
    bool Accept(unsigned char byte)
    {
        if (due_ != 0) {
            if (byte < low_ || byte > high_) return false;
            --due_;
            low_ = 0x80;
            high_ = 0xBF;
            return true;
        }
        if (byte < 0x80) return true;
        if (byte >= 0xC2 && byte <= 0xDF) {
            due_ = 1;
        } else if (byte >= 0xE0 && byte <= 0xEF) {
            due_ = 2;
            if (byte == 0xE0) low_ = 0xA0;   // overlong below it
            if (byte == 0xED) high_ = 0x9F;  // surrogates above it
        } else if (byte >= 0xF0 && byte <= 0xF4) {
            due_ = 3;
            if (byte == 0xF0) low_ = 0x90;
            if (byte == 0xF4) high_ = 0x8F;
        } else {
            return false;
        }
        return true;
    }
    // Whether a character has begun and not ended.
    bool InCharacter() const { return due_ != 0; }

private:
    int due_ = 0;
    unsigned char low_ = 0x80, high_ = 0xBF;
};

}  // namespace workbook::csv
