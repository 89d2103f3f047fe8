// SPDX-License-Identifier: MIT
// Text put into a cell is read as a person's typing would be: a number, a
// date, a boolean or text, with the format the typing brings along.
#include "workbook/format/typed_text.h"

#include <gtest/gtest.h>

#include "workbook/format/display_text.h"

namespace workbook::format {
namespace {

constexpr double kSecond = 1.0 / 86400;
constexpr double kMarch4th2012 = 40972;
constexpr double k050607 = (5 * 3600 + 6 * 60 + 7) * kSecond;

TEST(TypedText, ReadLikeACellEntry) {
    const struct {
        const char *typed;
        TypedKind kind;
        double value;
        const char *format;
    } cases[] = {
        {"+4", TypedKind::Number, 4, ""}, {".5", TypedKind::Number, 0.5, ""}, {" 7 ", TypedKind::Number, 7, ""},
        {"-2.5E-3", TypedKind::Number, -0.0025, "0.00E+00"}, {"12345678901234567890", TypedKind::Number, 12345678901234567890.0, ""},
        {"12.5%", TypedKind::Number, 0.125, "0.00%"}, {"-50%", TypedKind::Number, -0.5, "0%"},
        {"tRuE", TypedKind::Boolean, 1, ""}, {"false", TypedKind::Boolean, 0, ""},
        {"  2012-3-4 ", TypedKind::Date, kMarch4th2012, "yyyy-mm-dd"}, {"2012/03/04", TypedKind::Date, kMarch4th2012, "yyyy/mm/dd"},
        {"1900-02-28", TypedKind::Date, 59, "yyyy-mm-dd"}, {"1900-02-29", TypedKind::Date, 60, "yyyy-mm-dd"},
        {"1900-03-01", TypedKind::Date, 61, "yyyy-mm-dd"}, {"9999-12-31", TypedKind::Date, 2958465, "yyyy-mm-dd"},
        {"5:06", TypedKind::Date, (5 * 3600 + 6 * 60) * kSecond, "hh:mm"},
        {"05:06:07.5", TypedKind::Date, k050607 + 0.5 * kSecond, "hh:mm:ss.0"},
        {"2012-03-04 05:06", TypedKind::Date, kMarch4th2012 + (5 * 3600 + 6 * 60) * kSecond, "yyyy-mm-dd hh:mm"},
        {"2012-03-04 05:06:07.123", TypedKind::Date, kMarch4th2012 + k050607 + 0.123 * kSecond, "yyyy-mm-dd hh:mm:ss.000"},
    };
    for (const auto &c : cases) {
        const TypedValue read = ParseTypedText(c.typed);
        EXPECT_EQ(int(read.kind), int(c.kind)) << c.typed;
        EXPECT_NEAR(read.value, c.value, 1e-9 * std::max(1.0, std::abs(c.value))) << c.typed;
        EXPECT_EQ(read.numberFormat, c.format) << c.typed;
    }
}

TEST(TypedText, StaysText) {
    for (const char *typed : {"", "   ", "12abc", "1,000", "(5)", "$5", "1e", "--1", ".", "12%%", "1e3%", "1e400", "TRUEx",
                              "2012-04-31", "2011-02-29", "2012-00-10", "1899-12-31", "12-03-04", "2012-03-04T05:06:07",
                              "2012-03/04", "24:00:00", "12:60", "12:5", "05:06:07.1234", "05:06:07,5", "10000-01-01"}) {
        const TypedValue read = ParseTypedText(typed);
        EXPECT_EQ(int(read.kind), int(TypedKind::Text)) << '"' << typed << '"';
        EXPECT_EQ(read.numberFormat, "") << typed;
    }
}

// What a person types shows again as typed under the format it brings along.
TEST(TypedText, ShowsAsTypedUnderItsFormat) {
    for (const char *typed : {"2012-03-04", "2012/03/04", "05:06:07", "2012-03-04 05:06:07", "2012/03/04 05:06:07",
                              "2012-03-04 05:06:07.123", "23:59:59.9", "12%", "12.50%", "1.00E+03", "1900-02-29"}) {
        const TypedValue read = ParseTypedText(typed);
        ASSERT_FALSE(read.numberFormat.empty()) << typed;
        EXPECT_EQ(DisplayNumber(read.value, read.numberFormat), typed) << typed;
    }
}

}  // namespace
}  // namespace workbook::format
