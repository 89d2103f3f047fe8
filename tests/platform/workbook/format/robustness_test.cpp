// SPDX-License-Identifier: MIT
// Codes and texts made of every awkward character: each either reads or
// fails with FormatCodeError, and nothing crashes or runs away.
#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "workbook/format/date_format.h"
#include "workbook/format/display_text.h"
#include "workbook/format/format_code.h"
#include "workbook/format/typed_text.h"

namespace workbook::format {
namespace {

constexpr std::string_view kAlphabet = "0#?.,%E+-/@\"\\_*[]<>=;:hmsdyAP$ 9e\xC3";

TEST(Robustness, EveryShortCodeReadsOrFailsCleanly) {
    const double values[] = {0,    -0.0, 1.5,   -1234.567, 1e-300, 1e300, 2958466,
                             0.99, 60,   -1e20, std::numeric_limits<double>::infinity()};
    const size_t n = kAlphabet.size();
    size_t readable = 0, unreadable = 0;
    for (size_t a = 0; a < n; ++a)
        for (size_t b = 0; b < n; ++b)
            for (size_t c = 0; c < n; ++c) {
                const std::string code{kAlphabet[a], kAlphabet[b], kAlphabet[c]};
                try {
                    ParseFormatCode(code);
                    ++readable;
                } catch (const FormatCodeError &) {
                    ++unreadable;
                    EXPECT_FALSE(IsDateFormat(code)) << code;
                    continue;
                }
                for (double value : values) DisplayNumber(value, code);
                DisplayText(std::string("x"), code);
                ParseTypedText(code);
            }
    // Both outcomes occur, so the loop really reached the displays.
    EXPECT_GT(readable, 10000u);
    EXPECT_GT(unreadable, 1000u);
}

TEST(Robustness, LongAndHugeCodes) {
    EXPECT_EQ(DisplayNumber(1, std::string(2000, '0')), std::string(1999, '0') + "1");
    EXPECT_EQ(DisplayNumber(1e300, "0").size(), 301u);
    // 0.5 x 100^300 has 600 digits, and every % stays.
    EXPECT_EQ(DisplayNumber(0.5, "0" + std::string(300, '%')).size(), 900u);
    EXPECT_EQ(DisplayNumber(1.5, R"(# ?????/?????)"), "1     1/2    ");
    EXPECT_EQ(DisplayNumber(1e20, "?/?"), "100000000000000000000/1");
    EXPECT_EQ(DisplayNumber(1.5, "[hhhhhh]"), "000036");
}

}  // namespace
}  // namespace workbook::format
