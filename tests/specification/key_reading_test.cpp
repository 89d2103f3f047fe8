// SPDX-License-Identifier: MIT
// Values of keys read from specification strings, as text and as numbers.
#include <gtest/gtest.h>

#include <string>

#include "specification/specification.h"

namespace {

TEST(KeyValue, TextOfAKey)
{
    // value "<untouched>": the output stays as it was.
    const struct { const char *spec; int key; bool found; const char *value; } cases[] = {
        {"", StartRow, false, "<untouched>"}, {"StartRow=3;", DelValRow, false, "<untouched>"},
        {";;StartRow=5;;", StartRow, true, "5"},  // runs of separators are one
        {"=;StartRow=5", StartRow, true, "5"},    // "=" alone has no key
        {"StartRow==5;", StartRow, true, "5"}, {"StartRow=1;StartRow=2;", StartRow, true, "1"},  // the first pair wins
        {"startrow=5;", StartRow, false, "<untouched>"}, {"StartRow =5;", StartRow, false, "<untouched>"},  // exactly
        {"DateTimeCol=3;DateCol=7;", DateCol, true, "7"},  // not found as a prefix of another
        {"DateTimeFormat=YYYY;DateFormat=DD;", DateFormat, true, "DD"},
        {"DateFormat=a=b;", DateFormat, true, "a"},          // only the second token
        {"GlobalDate=2012;03;StartRow=4;", GlobalDate, true, "2012"},  // cut at ';'
        {"ExcelSheet= 1, 2 ;", ExcelSheet, true, " 1, 2 "},  // nothing is trimmed
        {"StartRow=;", StartRow, true, ""}, {"StartRow;", StartRow, true, ""},
    };
    for (const auto &c : cases) {
        std::string value = "<untouched>";
        EXPECT_EQ(CSpecification().GetKeyValue(c.spec, c.key, value), c.found) << c.spec;
        EXPECT_EQ(value, c.value) << c.spec;
    }
}

TEST(KeyValue, NumberOfAKey)
{
    const int untouched = -12345;
    const struct { const char *spec; int key; bool found; int value; } cases[] = {
        {"GlobalDate=2012;03;StartRow=4;", StartRow, true, 4},  // the value's tail matches no key
        {"StartRow=;", StartRow, true, 0}, {"StartRow=3;", DelValRow, false, untouched},
        // The leading integer, by atoi's rules.
        {"StartRow=12a;", StartRow, true, 12}, {"StartRow=  -7;", StartRow, true, -7}, {"StartRow=+8x;", StartRow, true, 8},
        {"StartRow=abc;", StartRow, true, 0}, {"StartRow=- 3;", StartRow, true, 0},
        {"StartRow=99999999999999;", StartRow, true, 2147483647},
        {"StartRow=-99999999999999;", StartRow, true, -2147483647 - 1},
        {"DelValRow=42;", DelValRow, true, 42}, {"GlobalUnit=42;", GlobalUnit, true, 42},
        // Keys with text values are no numbers.
        {"DateFormat=42;", DateFormat, false, untouched}, {"ExcelSheet=42;", ExcelSheet, false, untouched},
        {"GlobalValueType=42;", GlobalValueType, false, untouched},
    };
    for (const auto &c : cases) {
        int value = untouched;
        EXPECT_EQ(CSpecification().GetKeyValueInt(c.spec, c.key, value), c.found) << c.spec;
        EXPECT_EQ(value, c.value) << c.spec;
    }
}

}  // namespace
