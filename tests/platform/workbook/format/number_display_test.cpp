// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "workbook/format/display_text.h"
#include "workbook/format/format_code.h"

namespace workbook::format {
namespace {

struct Case {
    const char *code;
    double value;
    const char *shown;
};

void ExpectShown(const Case &c) {
    EXPECT_EQ(DisplayNumber(c.value, c.code), c.shown) << "code " << c.code << " value " << c.value;
}

TEST(NumberDisplay, DigitPlaceholdersAndRounding) {
    const Case cases[] = {
        {"0", 0.4, "0"},
        {"0", 0.5, "1"},
        {"0", 2.5, "3"},
        {"0", -2.5, "-3"},
        {"0.00", 2.675, "2.68"},
        {"0.00", 1.005, "1.01"},
        {"0.00", 0.125, "0.13"},
        {"0.00", -0.001, "-0.00"},
        {"0.00", 12345678901234.5, "12345678901234.50"},
        {"00000", 42, "00042"},
        {"#", 0, ""},
        {"#", 0.4, ""},
        {"#.##", 5, "5."},
        {"#.##", 0, "."},
        {"#.##", 1.5, "1.5"},
        {"0.0#", 1.5, "1.5"},
        {"0.0#", 1.256, "1.26"},
        {"0.0#", 2, "2.0"},
        {".00", 12.5, "12.50"},
        {".00", 0.5, ".50"},
        {"???.??", 1.5, "  1.5 "},
        {"0.?", 2, "2. "},
        {"000-0000", 5551234, "555-1234"},
        {"000-0000", 12345678, "1234-5678"},
        {"(000) 000-0000", 2125551234, "(212) 555-1234"},
        {"0 kg", 3, "3 kg"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(NumberDisplay, GroupingScalingPercentScientific) {
    const Case cases[] = {
        {"#,##0", 0, "0"},
        {"#,##0", 999, "999"},
        {"#,##0", 1000, "1,000"},
        {"#,##0", 1234567.5, "1,234,568"},
        {"#,##0", -1234567, "-1,234,567"},
        {"#,###", 0, ""},
        {"#,##0.00", 1234567.891, "1,234,567.89"},
        {"0,000", 5, "0,005"},
        {"#,##0,", 1234567, "1,235"},
        {"0.0,,\"M\"", 1234567, "1.2M"},
        {"#,##0,,", 999999999, "1,000"},
        {"0%", 0.125, "13%"},
        {"0.0%", -0.001, "-0.1%"},
        {"0%%", 0.5, "5000%%"},
        {"0.00E+00", 0, "0.00E+00"},
        {"0.00E+00", 1234.567, "1.23E+03"},
        {"0.00E+00", 0.000123, "1.23E-04"},
        {"0.00E+00", 9.999, "1.00E+01"},
        {"0.00E+00", 1e100, "1.00E+100"},
        {"0.00E-00", 1234.567, "1.23E03"},
        {"0.00E-00", 0.01234, "1.23E-02"},
        {"0E+0", 5, "5E+0"},
        {"00.00E+00", 1234.567, "12.35E+02"},
        {"##0.0E+0", 1234.567, "1.2E+3"},
        {"##0.0E+0", 12345, "12.3E+3"},
        {"##0.0E+0", 0.001234, "1.2E-3"},
        {"##0.0E+0", 999999, "1.0E+6"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(NumberDisplay, Fractions) {
    const Case cases[] = {
        {"# ?/?", 0.5, " 1/2"},
        {"# ?/?", 1.5, "1 1/2"},
        {"# ?/?", -1.5, "-1 1/2"},
        {"# ?/?", 2, "2    "},
        {"# ?/?", 0, "0    "},
        {"# ?/?", 0.99, "1    "},
        {"# ?/?", 0.333, " 1/3"},
        {R"(# ??/??)", 0.5, "  1/2 "},
        {R"(# ??/??)", 3.14159, "3 14/99"},
        {R"(# ??/??)", 2.25, "2  1/4 "},
        {R"(# ??/??)", 0.1234, " 10/81"},
        {"?/?", 1.5, "3/2"},
        {"?/?", 0, "0/1"},
        {"# ?/8", 0.25, " 2/8"},
        {"# ?/8", 0.3, " 2/8"},
        {"# ?/8 \"in\"", 3.5, "3 4/8 in"},
        {"0 ?/4", 0.1, "0    "},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(NumberDisplay, SectionsLiteralsConditionsColours) {
    const Case cases[] = {
        {"0.00;(0.00)", 5, "5.00"},
        {"0.00;(0.00)", -5, "(5.00)"},
        {"0.00;(0.00)", 0, "0.00"},
        {"0;-0;\"zero\"", 0, "zero"},
        {"0;-0;\"zero\"", -3, "-3"},
        {"0;0;\"zero\"", -3, "3"},
        {"0;;", -3, ""},
        {"0;;", 0, ""},
        {";;;", 7, ""},
        {"\"Total: \"0", -5, "-Total: 5"},
        {"\"$\"#,##0.00", 1234.5, "$1,234.50"},
        {"$#,##0.00", -1234.5, "-$1,234.50"},
        {"\\£0.00", 2, "£2.00"},
        {"0\" units\"", 1, "1 units"},
        {"0_);(0)", 5, "5 "},
        {"**0", 5, "5"},
        {"0*-", 5, "5"},
        {"[$€-407] #,##0.00", 1234.5, "€ 1,234.50"},
        {"[Red]0.00", 1.5, "1.50"},
        {"[Blue]0;[Red]-0", -2, "-2"},
        {"[Color10]0", 2, "2"},
        {"[>100]\"big\";\"small\"", 150, "big"},
        {"[>100]\"big\";\"small\"", 100, "small"},
        {"[>=100]0.0;0", 100, "100.0"},
        {"[>=100]0.0;0", -5, "-5"},
        {"[Red][<=100]0;[Blue][>100]0", 50, "50"},
        {"[Red][<=100]0;[Blue][>100]0", 150, "150"},
        {"[<1]0.00\" s\";[<60]0\" s\";0\" min\"", 0.5, "0.50 s"},
        {"[<1]0.00\" s\";[<60]0\" s\";0\" min\"", 30, "30 s"},
        {"[<1]0.00\" s\";[<60]0\" s\";0\" min\"", 90, "90 min"},
        {"[>100]0;[<50]0", 75, "########"},
        {"General;-General", -2.5, "-2.5"},
        {"General;(General)", -2.5, "(2.5)"},
        {"\"x\"@", -5, "x-5"},
        {"@", 0.1, "0.1"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(NumberDisplay, CellContentOfEveryKind) {
    const struct {
        CellContent value;
        const char *code;
        const char *shown;
    } cases[] = {
        {std::monostate{}, "0.00", ""},
        {1.5, "0.00", "1.50"},
        {true, "0.00", "TRUE"},
        {false, "General", "FALSE"},
        {ErrorValue{"#N/A"}, "0.00", "#N/A"},
        {ErrorValue{"#DIV/0!"}, "General", "#DIV/0!"},
        {std::string("abc"), "General", "abc"},
        {std::string("abc"), "0.00", "abc"},
        {std::string("abc"), "0;-0;0", "abc"},
        {std::string("abc"), "@", "abc"},
        {std::string("abc"), "\"<\"@\">\"", "<abc>"},
        {std::string("abc"), "0;-0;0;\"text: \"@", "text: abc"},
        {std::string("abc"), "0;-0;0;\"hidden\"", "hidden"},
        {std::string("abc"), ";;;", ""},
        {std::string("abc"), "@ @", "abc abc"},
        {std::string("12"), "0.00", "12"},
    };
    for (const auto &c : cases) EXPECT_EQ(DisplayText(c.value, c.code), c.shown) << c.code;
}

TEST(NumberDisplay, UnreadableCodeIsAnError) {
    EXPECT_THROW(DisplayNumber(1, "\"open"), FormatCodeError);
    EXPECT_THROW(DisplayText(std::string("a"), "[Nope]@"), FormatCodeError);
    // Values that never look at the code don't fail on it.
    EXPECT_EQ(DisplayText(true, "\"open"), "TRUE");
}

}  // namespace
}  // namespace workbook::format
