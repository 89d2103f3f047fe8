// SPDX-License-Identifier: MIT
// Format codes that cannot be read, with the message that says where, and
// which codes are date formats.
#include "workbook/format/format_code.h"

#include "workbook/format/date_format.h"

#include <gtest/gtest.h>

namespace workbook::format {
namespace {

TEST(FormatCode, CodesThatCannotBeRead) {
    const std::pair<const char *, const char *> cases[] = {
        {"0;0;0;@;0", "format code: more than four sections at position 7"},
        {"\"abc", "format code: unterminated quoted text at position 0"},
        {"0\\", "format code: '\\' without a character after it at position 1"},
        {"0_", "format code: '_' without a character after it at position 1"},
        {"0*", "format code: '*' without a character after it at position 1"},
        {"[Red0", "format code: unterminated '[' at position 0"},
        {"[]0", "format code: empty brackets at position 0"},
        {"[Purple]0", "format code: unknown bracket [Purple] at position 0"},
        {"[Color57]0", "format code: unknown bracket [Color57] at position 0"},
        {"0;[>abc]0", "format code: bad condition [>abc] at position 2"},
        {"[<]0", "format code: bad condition [<] at position 0"},
    };
    for (const auto &[code, message] : cases) {
        try {
            ParseFormatCode(code);
            ADD_FAILURE() << "no error for " << code;
        } catch (const FormatCodeError &error) {
            EXPECT_STREQ(error.what(), message) << code;
        }
    }
}

TEST(FormatCode, DateFormatsAreTheCodesWithDateOrTimeFields) {
    const std::pair<const char *, bool> cases[] = {
        {"YYYY/MM/DD HH:mm:ss", true}, {"hh:mm:ss.000", true}, {"[mm]:ss", true}, {"[ss]", true}, {"h AM/PM", true},
        {"[$-409]d-mmm-yy;@", true}, {"[Red]dd/mm", true}, {"0.00;[Red]yyyy", true}, {"General", false}, {"", false},
        {"0.00E+00", false}, {"#,##0 \"days\"", false}, {"\\d0", false}, {"_d0", false}, {"*d0", false},
        {"[Blue]#,##0;[Red]-#,##0", false}, {"[$USD-409]0.00", false}, {"0;0;0;yyyy", false}, {"@", false},
        {"\"unterminated yyyy", false}, {"[Bad]yyyy", false},
    };
    for (const auto &[code, isDate] : cases) EXPECT_EQ(IsDateFormat(code), isDate) << code;
}

}  // namespace
}  // namespace workbook::format
