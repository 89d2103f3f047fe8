// SPDX-License-Identifier: MIT
// The text a number shows under a format code, as the application shows it:
// General, digits and rounding, grouping, scaling, exponents, fractions,
// sections and conditions, dates and times in both date systems.
#include <gtest/gtest.h>

#include <bit>
#include <charconv>
#include <cmath>
#include <limits>
#include <random>
#include <string>
#include <vector>

#include "workbook/format/builtin_formats.h"
#include "workbook/format/column_width.h"
#include "workbook/format/display_text.h"
#include "workbook/format/format_code.h"
#include "workbook/format/shortest_number.h"

namespace workbook::format {
namespace {

constexpr double kSecond = 1.0 / 86400;
constexpr double kMarch4th2012 = 40972;  // a Sunday, in the 1900 system
constexpr double k050607 = (5 * 3600 + 6 * 60 + 7) * kSecond;

struct Case {
    const char *code;
    double value;
    const char *shown;
};

template <size_t N>
void ExpectShown(const Case (&cases)[N], bool date1904 = false)
{
    for (const Case &c : cases)
        EXPECT_EQ(DisplayNumber(c.value, c.code, date1904), c.shown) << "code " << c.code << " value " << c.value;
}

TEST(NumberDisplay, General)
{
    // A sign, then at most 11 characters.
    const Case cases[] = {
        {"General", -0.0, "0"}, {"General", 1.0 / 3, "0.333333333"}, {"General", -2.0 / 3, "-0.666666667"},
        {"General", 40972.2125810185, "40972.21258"}, {"General", 12345678901.0, "12345678901"},
        {"General", 99999999999.5, "1E+11"}, {"General", -123456789012.0, "-1.23457E+11"},
        {"General", 999999500000.0, "1E+12"}, {"General", 1.23456789e100, "1.2346E+100"},
        {"General", 0.000123456789, "0.000123457"}, {"General", 0.0000123456789, "1.23457E-05"},
        {"General", 1.23456789e-100, "1.2346E-100"}, {"General", 0.1 + 0.2, "0.3"}, {"", 0.9999999999, "1"},
        {"General", 0.12345678951, "0.12345679"}, {"0.00", std::numeric_limits<double>::quiet_NaN(), "#NUM!"},
        {"General", std::numeric_limits<double>::infinity(), "#NUM!"},
    };
    ExpectShown(cases);
}

TEST(NumberDisplay, DigitsGroupingScalingExponents)
{
    const Case cases[] = {
        {"0", 2.5, "3"}, {"0", -2.5, "-3"}, {"0.00", 2.675, "2.68"}, {"0.00", 1.005, "1.01"}, {"0.00", -0.001, "-0.00"},
        {"0.00", 12345678901234.5, "12345678901234.50"}, {"00000", 42, "00042"}, {"#", 0.4, ""}, {"#.##", 5, "5."},
        {"0.0#", 1.256, "1.26"}, {".00", 0.5, ".50"}, {"???.??", 1.5, "  1.5 "}, {"000-0000", 12345678, "1234-5678"},
        {"(000) 000-0000", 2125551234, "(212) 555-1234"}, {"#,##0", 1234567.5, "1,234,568"},
        {"#,##0", -1234567, "-1,234,567"}, {"#,###", 0, ""}, {"0,000", 5, "0,005"}, {"#,##0,", 1234567, "1,235"},
        {"0.0,,\"M\"", 1234567, "1.2M"}, {"0%", 0.125, "13%"}, {"0.0%", -0.001, "-0.1%"}, {"0%%", 0.5, "5000%%"},
        {"0.00E+00", 0.000123, "1.23E-04"}, {"0.00E+00", 9.999, "1.00E+01"}, {"0.00E+00", 1e100, "1.00E+100"},
        {"0.00E-00", 1234.567, "1.23E03"}, {"##0.0E+0", 12345, "12.3E+3"}, {"##0.0E+0", 0.001234, "1.2E-3"},
        {"##0.0E+0", 999999, "1.0E+6"},
    };
    ExpectShown(cases);
}

TEST(NumberDisplay, FractionsSectionsConditionsLiterals)
{
    const Case cases[] = {
        {"# ?/?", 0.5, " 1/2"}, {"# ?/?", -1.5, "-1 1/2"}, {"# ?/?", 0.99, "1    "}, {R"(# ??/??)", 3.14159, "3 14/99"},
        {R"(# ??/??)", 2.25, "2  1/4 "}, {"?/?", 0, "0/1"}, {"# ?/8", 0.3, " 2/8"}, {"# ?/8 \"in\"", 3.5, "3 4/8 in"},
        {"0 ?/4", 0.1, "0    "}, {"?/?", 1e20, "100000000000000000000/1"}, {"?/100", 0.57, "57/100"},
        {R"(# ??/100)", 3.14159, "3 14/100"}, {"# ?/10", 0.99, "1     "}, {"# ?/30 \"h\"", 2.5, "2 15/30 h"},
        {"0.00;(0.00)", -5, "(5.00)"},
        {"0;-0;\"zero\"", 0, "zero"}, {"0;0;\"zero\"", -3, "3"}, {"0;;", -3, ""}, {";;;", 7, ""},
        {"\"Total: \"0", -5, "-Total: 5"}, {"$#,##0.00", -1234.5, "-$1,234.50"}, {"\\£0.00", 2, "£2.00"},
        {"0_);(0)", 5, "5 "}, {"0*-", 5, "5"}, {"[$€-407] #,##0.00", 1234.5, "€ 1,234.50"}, {"[Blue]0;[Red]-0", -2, "-2"},
        {"[>100]\"big\";\"small\"", 100, "small"}, {"[>=100]0.0;0", -5, "-5"},
        {"[Red][<=100]0;[Blue][>100]0", 150, "150"}, {"[<1]0.00\" s\";[<60]0\" s\";0\" min\"", 90, "90 min"},
        {"[>100]0;[<50]0", 75, "########"}, {"General;(General)", -2.5, "(2.5)"}, {"\"x\"@", -5, "x-5"},
        // Accounting formats: padding, a dash for zero.
        {R"(_(* #,##0_);_(* \(#,##0\);_(* "-"_);_(@_))", -1234.567, " (1,235)"},
        {R"(_(* #,##0.00_);_(* \(#,##0.00\);_(* "-"??_);_(@_))", 0, " -   "},
        {R"(_("$"* #,##0.00_);_("$"* \(#,##0.00\);_("$"* "-"??_);_(@_))", -1234.567, " $(1,234.57)"},
    };
    ExpectShown(cases);
}

TEST(NumberDisplay, DatesAndTimes)
{
    const double when = kMarch4th2012 + k050607;
    const Case cases[] = {
        {"yyyy/mm/dd hh:mm:ss", when, "2012/03/04 05:06:07"}, {"YYYY-MM-DD HH:MM:SS", when, "2012-03-04 05:06:07"},
        {"y", when, "12"}, {"yyy", when, "2012"}, {"mmmmm", when, "M"}, {"mmm", when, "Mar"},
        {"dddd, mmmm d, yyyy", when, "Sunday, March 4, 2012"}, {"d \"de\" mmmm", when, "4 de March"},
        {"[$-409]m/d/yy", when, "3/4/12"}, {"h:m:s", when, "5:6:7"}, {"m:ss", when, "6:07"}, {"mm", when, "03"},
        {"m/d h:mm", when, "3/4 5:06"}, {"h:mm", kMarch4th2012 + 10.5 / 24 + 59.6 * kSecond, "10:31"},
        {"h:mm AM/PM", 0, "12:00 AM"}, {"h:mm AM/PM", 0.5, "12:00 PM"}, {"h a/p", 21.0 / 24, "9 p"},
        {"hh:mm:ss AM/PM", 0.5 - 0.4 * kSecond, "12:00:00 PM"}, {"[h]:mm:ss", 1.5, "36:00:00"},
        {"[mm]:ss", 2.75, "3960:00"}, {"[s].00", 1.234 * kSecond, "1.23"}, {"[h]:mm:ss", 1 - 0.5 * kSecond, "24:00:00"},
        {"[hhhhhh]", 1.5, "000036"},
        // Rounded to what the section shows, the carry going up to the day.
        {"yyyy-mm-dd hh:mm:ss", kMarch4th2012 + 1 - 0.4 * kSecond, "2012-03-05 00:00:00"},
        {"hh:mm:ss.00", when + 0.125 * kSecond, "05:06:07.13"}, {"mm:ss.0", 1.0 / 24 - 0.03 * kSecond, "00:00.0"},
        {"mmss.0", 62.34 * kSecond, "0102.3"},
        // The 1900 system's early serials, its 29 February included, and the ends.
        {"yyyy-mm-dd", 0, "1900-01-00"}, {"dddd", 0, "Saturday"}, {"m/d/yyyy", 60, "2/29/1900"}, {"dddd", 61, "Thursday"},
        {"m/d/yyyy", 2958465, "12/31/9999"}, {"m/d/yyyy", 2958466, "########"}, {"h:mm", -0.5, "########"},
        {"yyyy-mm-dd hh:mm:ss", 2958466 - 0.3 * kSecond, "########"}, {"yyyy-mm-dd;\"before 1900\"", -1, "before 1900"},
    };
    ExpectShown(cases);
    // Built-ins by id: 47 shows minutes; the East Asian date ids a short date or a time.
    const struct { int id; double value; const char *shown; } builtins[] = {
        {47, kMarch4th2012 + (14 * 3600 + 7 * 60 + 17.8) * kSecond, "07:17.8"}, {27, when, "3/4/2012"},
        {32, when, "5:06"}, {33, when, "5:06:07"}, {36, when, "3/4/2012"},
    };
    for (const auto &c : builtins) EXPECT_EQ(DisplayNumber(c.value, BuiltinFormatCode(c.id)), c.shown) << "id " << c.id;
    EXPECT_EQ(BuiltinFormatId("m/d/yyyy"), 14);  // a short date is saved under 14, not an East Asian id
    EXPECT_EQ(BuiltinFormatId("h:mm:ss"), 21);
    const Case mac[] = {
        {"yyyy-mm-dd", 0, "1904-01-01"}, {"dddd", 0, "Friday"}, {"yyyy-mm-dd hh:mm:ss", when - 1462, "2012-03-04 05:06:07"},
        {"yyyy-mm-dd", 2957003, "9999-12-31"}, {"yyyy-mm-dd", 2957004, "########"}, {"yyyy-mm-dd", -1, "########"},
    };
    ExpectShown(mac, true);
}

TEST(NumberDisplay, CellContentOfEveryKind)
{
    const struct {
        CellContent value;
        const char *code;
        const char *shown;
    } cases[] = {
        {std::monostate{}, "0.00", ""}, {true, "0.00", "TRUE"}, {ErrorValue{"#N/A"}, "0.00", "#N/A"},
        {std::string("abc"), "0;-0;0", "abc"}, {std::string("abc"), "\"<\"@\">\"", "<abc>"},
        {std::string("abc"), "0;-0;0;\"hidden\"", "hidden"}, {std::string("abc"), ";;;", ""},
        {std::string("abc"), "@ @", "abc abc"}, {std::string("12"), "0.00", "12"},
        {std::string("abc"), R"(_(* #,##0_);_(* \(#,##0\);_(* "-"_);_(@_))", " abc "},
    };
    for (const auto &c : cases) EXPECT_EQ(DisplayText(c.value, c.code), c.shown) << c.code;
    EXPECT_THROW(DisplayNumber(1, "\"open"), FormatCodeError);
    EXPECT_THROW(DisplayText(std::string("a"), "[Nope]@"), FormatCodeError);
    EXPECT_EQ(DisplayText(true, "\"open"), "TRUE");  // a value that never looks at the code
}

TEST(ColumnWidth, AutoFitTakesTheWidestButNotLessThanStandard)
{
    EXPECT_DOUBLE_EQ(AutoFitWidth(std::vector<std::string>{}), kDefaultColumnWidth);
    EXPECT_DOUBLE_EQ(AutoFitWidth(std::vector<std::string>{"1", "22", ""}), kDefaultColumnWidth);
    EXPECT_DOUBLE_EQ(AutoFitWidth(std::vector<std::string>{"1", "2012-03-04 05:06:07", "1234567890"}),
                     TextWidth("2012-03-04 05:06:07"));
}

// The width AutoFit takes for a General number without making its text is the
// width of that text, for every kind of value, with its sign or not.
TEST(ColumnWidth, GeneralNumberWidthIsTheWidthOfItsText)
{
    std::vector<double> values = {0.0, -0.0, 1e-5, 9.99999e-6, 0.0001, 0.00001234, 1e15, 1e11, 99999999999.0,
                                  99999999999.5, 9999999999.5, 0.99999999995, 0.999999999949, 12345.678949999,
                                  1234567890.12, 0.1 + 0.2, 1.0 / 3, 2.0 / 3, 123456.7890123,
                                  std::numeric_limits<double>::max(), std::numeric_limits<double>::denorm_min(),
                                  std::numeric_limits<double>::infinity(), std::numeric_limits<double>::quiet_NaN()};
    std::mt19937_64 random(20261124);
    std::uniform_real_distribution<double> unit(0.0, 1.0);
    for (int i = 0; i < 20000; ++i) {
        const double bits = std::bit_cast<double>(random());  // any magnitude at all
        if (std::isfinite(bits)) values.push_back(bits);
        values.push_back(static_cast<double>(random() % 1000000000000000ULL));         // integers up to 1e15
        values.push_back(unit(random) * std::pow(10.0, static_cast<int>(random() % 23) - 7));  // 1e-7 .. 1e15
        values.push_back(std::round(unit(random) * 1e6) / 100.0);                       // two decimals
        values.push_back(std::round(unit(random) * 1e11) / 1e11 + 0.5e-11 * unit(random));  // 11th digit
    }
    const size_t positives = values.size();
    for (size_t i = 0; i < positives; ++i) values.push_back(-values[i]);
    for (double v : values)
        ASSERT_EQ(GeneralNumberWidth(v), TextWidth(DisplayText(v, "General"))) << DisplayText(v, "General");
}

// The shortest text of a number is the library's to the byte: few decimals,
// whole numbers with and without trailing zeros, the edges of the fast range.
TEST(ShortestNumber, WritesWhatToCharsWrites)
{
    std::vector<double> values = {1.0, 10.0, 100000.0, 120000.0, 1e9, 2147483647.0, 2147483648.0, 2147483647.5,
                                  0.99999999999999989, 1.15, 1.0000000000000002, 1e-300, 5e-324, 9.995, 123456.7891};
    std::mt19937_64 random(20261124);
    for (int i = 0; i < 100000; ++i) {
        const double bits = std::bit_cast<double>(random());
        if (std::isfinite(bits)) values.push_back(bits);
        const int decimals = static_cast<int>(random() % 7);
        const double whole = static_cast<double>(random() % (uint64_t{1} << (random() % 34)));
        values.push_back(whole + static_cast<double>(random() % 100000) / std::pow(10.0, decimals) / 10.0);
        values.push_back(std::round((whole + 0.37) * std::pow(10.0, decimals)) / std::pow(10.0, decimals));
        values.push_back(whole * std::pow(10.0, static_cast<int>(random() % 8)));
    }
    const size_t positives = values.size();
    for (size_t i = 0; i < positives; ++i) values.push_back(-values[i]);
    for (double v : values) {
        char ours[32], library[32];
        const std::string_view shown(ours, size_t(ShortestNumberChars(ours, ours + sizeof ours, v) - ours));
        const std::string_view expected(library, size_t(std::to_chars(library, library + sizeof library, v).ptr - library));
        ASSERT_EQ(shown, expected);
    }
}

}  // namespace
}  // namespace workbook::format
