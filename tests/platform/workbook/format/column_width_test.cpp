// SPDX-License-Identifier: MIT
#include "workbook/format/column_width.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace workbook::format {
namespace {

TEST(ColumnWidth, PixelsOfTexts) {
    const std::pair<const char *, int> cases[] = {
        {"", 0},
        {"0", 7},
        {"12345678", 56},
        {"1,234.57", 6 * 7 + 2 * 4},
        {"Mill", 11 + 4 + 4 + 4},
        {"a b", 7 + 4 + 7},
        {"\xC3\xA9t\xC3\xA9", 7 + 4 + 7},                // é t é: two bytes each count once
        {"e\xCC\x81", 7},                                // e + combining acute
        {"\xE6\x97\xA5\xE6\x9C\xAC", 28},                // two CJK ideographs
        {"\xEF\xBC\xA1", 14},                            // fullwidth A
        {"\xF0\x9F\x98\x80", 14},                        // an emoji
        {"\xFF\xFE", 14},                                // stray bytes count one each
        {"\xE6\x97", 14},                                // a cut sequence too
    };
    for (const auto &[text, pixels] : cases) EXPECT_EQ(TextPixels(text), pixels) << text;
}

TEST(ColumnWidth, FileWidthOfTexts) {
    const std::pair<const char *, double> cases[] = {
        {"", 182.0 / 256},
        {"0", 438.0 / 256},
        {"12345678", 2230.0 / 256},
        {"1234567890", 2742.0 / 256},
        {"2012-03-04 05:06:07", 4717.0 / 256},  // 14 digits, 2 hyphens, 2 colons, a blank: 124 px
    };
    for (const auto &[text, width] : cases) EXPECT_DOUBLE_EQ(TextWidth(text), width) << text;
    // Ten digits: (10 * 7 + 5) / 7 * 256 = 2742.86 cut to 2742.
    EXPECT_DOUBLE_EQ(TextWidth("1234567890"), 10.7109375);
}

TEST(ColumnWidth, AutoFitTakesTheWidestButNotLessThanStandard) {
    const std::vector<std::string> none;
    EXPECT_DOUBLE_EQ(AutoFitWidth(none), kDefaultColumnWidth);
    const std::vector<std::string> narrow{"1", "22", ""};
    EXPECT_DOUBLE_EQ(AutoFitWidth(narrow), kDefaultColumnWidth);
    const std::vector<std::string> mixed{"1", "2012-03-04 05:06:07", "1234567890"};
    EXPECT_DOUBLE_EQ(AutoFitWidth(mixed), TextWidth("2012-03-04 05:06:07"));
}

TEST(ColumnWidth, CharactersOfFileWidths) {
    const std::pair<double, double> cases[] = {
        {kDefaultColumnWidth, kDefaultColumnCharacters},
        {10.7109375, 10},
        {8.7109375, 8},
        {0.7109375, 0},
        {0, 0},
        {-3, 0},
    };
    for (const auto &[width, characters] : cases)
        EXPECT_DOUBLE_EQ(ColumnWidthCharacters(width), characters) << width;
}

}  // namespace
}  // namespace workbook::format
