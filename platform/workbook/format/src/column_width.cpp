// SPDX-License-Identifier: MIT
#include "workbook/format/column_width.h"

#include <algorithm>
#include <cmath>
#include <string_view>

#include "general_number.h"
#include "utf8.h"
#include "workbook/format/display_text.h"

namespace workbook::format {
namespace {

constexpr int kDigitPixels = 7;
constexpr int kNarrowPixels = 4;
constexpr int kWidePixels = 11;
constexpr int kFullWidthPixels = 14;
constexpr int kPaddingPixels = 5;

constexpr std::string_view kNarrow = " !'(),.:;I[]fijlrt|`";
constexpr std::string_view kWide = "%&@MWmw";

bool IsCombining(char32_t cp) {
    return (cp >= 0x0300 && cp <= 0x036F) || (cp >= 0x1AB0 && cp <= 0x1AFF) ||
           (cp >= 0x20D0 && cp <= 0x20FF) || (cp >= 0xFE20 && cp <= 0xFE2F) || cp == 0x200B ||
           cp == 0x200D || (cp >= 0xFE00 && cp <= 0xFE0F);
}

// East Asian wide and fullwidth ranges, and the emoji planes.
bool IsFullWidth(char32_t cp) {
    return (cp >= 0x1100 && cp <= 0x115F) || (cp >= 0x2E80 && cp <= 0x303E) ||
           (cp >= 0x3041 && cp <= 0x33FF) || (cp >= 0x3400 && cp <= 0x4DBF) ||
           (cp >= 0x4E00 && cp <= 0x9FFF) || (cp >= 0xA000 && cp <= 0xA4CF) ||
           (cp >= 0xAC00 && cp <= 0xD7A3) || (cp >= 0xF900 && cp <= 0xFAFF) ||
           (cp >= 0xFE30 && cp <= 0xFE4F) || (cp >= 0xFF00 && cp <= 0xFF60) ||
           (cp >= 0xFFE0 && cp <= 0xFFE6) || (cp >= 0x1F300 && cp <= 0x1FAFF) ||
           (cp >= 0x20000 && cp <= 0x3FFFD);
}

int CharacterPixels(char32_t cp) {
    if (cp < 0x80) {
        const char c = static_cast<char>(cp);
        if (kNarrow.find(c) != std::string_view::npos) return kNarrowPixels;
        if (kWide.find(c) != std::string_view::npos) return kWidePixels;
        return kDigitPixels;
    }
    if (IsCombining(cp)) return 0;
    if (IsFullWidth(cp)) return kFullWidthPixels;
    return kDigitPixels;
}

double FileWidthForPixels(int pixels) {
    const double units = static_cast<double>(pixels + kPaddingPixels) / kDigitPixels * 256.0;
    return std::trunc(units) / 256.0;
}

}  // namespace

int TextPixels(std::string_view displayed) {
    int pixels = 0;
    for (size_t pos = 0; pos < displayed.size();) {
        const size_t length = Utf8SequenceLength(displayed, pos);
        pixels += CharacterPixels(Utf8CodePoint(displayed, pos, length));
        pos += length;
    }
    return pixels;
}

double TextWidth(std::string_view displayed) { return FileWidthForPixels(TextPixels(displayed)); }

double GeneralNumberWidth(double value) {
    if (value == 0) return FileWidthForPixels(kDigitPixels);  // "0", -0 too
    ShortestBuffer buffer;
    if (const auto shortest = ShortestGeneralText(std::fabs(value), buffer)) {
        // Digits and at most one point: a sign or a digit is 7 pixels, the point 4.
        const int characters = static_cast<int>(shortest->size()) + (value < 0 ? 1 : 0);
        const bool point = shortest->find('.') != std::string_view::npos;
        return FileWidthForPixels(characters * kDigitPixels - (point ? kDigitPixels - kNarrowPixels : 0));
    }
    return TextWidth(GeneralNumberText(value));
}

double AutoFitWidth(std::span<const std::string> texts) {
    double width = kDefaultColumnWidth;
    for (const auto &text : texts) width = std::max(width, TextWidth(text));
    return width;
}

double ColumnWidthCharacters(double fileWidth) {
    if (!(fileWidth > 0)) return 0;
    const double pixels = std::trunc((256.0 * fileWidth + std::trunc(128.0 / kDigitPixels)) / 256.0 * kDigitPixels);
    const double characters = std::trunc((pixels - kPaddingPixels) / kDigitPixels * 100.0 + 0.5) / 100.0;
    return std::max(characters, 0.0);
}

}  // namespace workbook::format
