// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <limits>

#include "workbook/format/display_text.h"

namespace workbook::format {
namespace {

// General as the application shows it in a column wide enough for 11
// characters: a sign, then at most 11 characters.
TEST(GeneralNumber, ShownValues) {
    const std::pair<double, const char *> cases[] = {
        {0, "0"},
        {-0.0, "0"},
        {1, "1"},
        {-1, "-1"},
        {0.1, "0.1"},
        {0.5, "0.5"},
        {1.0 / 3, "0.333333333"},
        {-1.0 / 3, "-0.333333333"},
        {2.0 / 3, "0.666666667"},
        {3.14159265358979, "3.141592654"},
        {1234.567, "1234.567"},
        {40972.2125810185, "40972.21258"},
        {123456.789012, "123456.789"},
        {1234567890.5, "1234567891"},
        {12345678901.0, "12345678901"},
        {-12345678901.0, "-12345678901"},
        {99999999999.0, "99999999999"},
        {99999999999.5, "1E+11"},
        {100000000000.0, "1E+11"},
        {123456789012.0, "1.23457E+11"},
        {-123456789012.0, "-1.23457E+11"},
        {999999400000.0, "9.99999E+11"},
        {999999500000.0, "1E+12"},
        {1e15, "1E+15"},
        {1.5e300, "1.5E+300"},
        {1.23456789e100, "1.2346E+100"},
        {0.0001, "0.0001"},
        {0.000123456789, "0.000123457"},
        {0.00001, "1E-05"},
        {0.0000123456789, "1.23457E-05"},
        {-0.00001, "-1E-05"},
        {1.23456789e-100, "1.2346E-100"},
        {0.1 + 0.2, "0.3"},
        {2.675, "2.675"},
        {0.9999999999, "1"},
        {0.12345678951, "0.12345679"},
    };
    for (const auto &[value, shown] : cases) {
        EXPECT_EQ(GeneralNumberText(value), shown) << value;
        EXPECT_EQ(DisplayNumber(value, "General"), shown) << value;
        EXPECT_EQ(DisplayNumber(value, ""), shown) << value;
    }
}

TEST(GeneralNumber, NotFiniteShowsNumberError) {
    EXPECT_EQ(GeneralNumberText(std::numeric_limits<double>::infinity()), "#NUM!");
    EXPECT_EQ(DisplayNumber(std::numeric_limits<double>::quiet_NaN(), "0.00"), "#NUM!");
}

}  // namespace
}  // namespace workbook::format
