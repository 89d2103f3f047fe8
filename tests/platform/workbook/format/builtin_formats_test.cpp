// SPDX-License-Identifier: MIT
#include "workbook/format/builtin_formats.h"

#include <gtest/gtest.h>

#include "workbook/format/display_text.h"

namespace workbook::format {
namespace {

TEST(BuiltinFormats, CodeOfEveryId) {
    const std::pair<int, const char *> expected[] = {
        {0, "General"},
        {1, "0"},
        {2, "0.00"},
        {3, "#,##0"},
        {4, "#,##0.00"},
        {5, "$#,##0_);($#,##0)"},
        {6, "$#,##0_);[Red]($#,##0)"},
        {7, "$#,##0.00_);($#,##0.00)"},
        {8, "$#,##0.00_);[Red]($#,##0.00)"},
        {9, "0%"},
        {10, "0.00%"},
        {11, "0.00E+00"},
        {12, "# ?/?"},
        {13, "# ?\?/?\?"},
        {14, "m/d/yyyy"},
        {15, "d-mmm-yy"},
        {16, "d-mmm"},
        {17, "mmm-yy"},
        {18, "h:mm AM/PM"},
        {19, "h:mm:ss AM/PM"},
        {20, "h:mm"},
        {21, "h:mm:ss"},
        {22, "m/d/yyyy h:mm"},
        {37, "#,##0_);(#,##0)"},
        {38, "#,##0_);[Red](#,##0)"},
        {39, "#,##0.00_);(#,##0.00)"},
        {40, "#,##0.00_);[Red](#,##0.00)"},
        {41, R"(_(* #,##0_);_(* \(#,##0\);_(* "-"_);_(@_))"},
        {42, R"(_("$"* #,##0_);_("$"* \(#,##0\);_("$"* "-"_);_(@_))"},
        {43, R"(_(* #,##0.00_);_(* \(#,##0.00\);_(* "-"??_);_(@_))"},
        {44, R"(_("$"* #,##0.00_);_("$"* \(#,##0.00\);_("$"* "-"??_);_(@_))"},
        {45, "mm:ss"},
        {46, "[h]:mm:ss"},
        {47, "mmss.0"},
        {48, "##0.0E+0"},
        {49, "@"},
    };
    for (const auto &[id, code] : expected) {
        EXPECT_EQ(BuiltinFormatCode(id), code) << "id " << id;
        EXPECT_EQ(BuiltinFormatId(code), id) << code;
    }
    for (int id : {-1, 23, 30, 36, 50, 164}) EXPECT_EQ(BuiltinFormatCode(id), "") << "id " << id;
}

TEST(BuiltinFormats, IdOfOtherSpellings) {
    const std::pair<const char *, int> cases[] = {
        {"general", 0},
        {"GENERAL", 0},
        {"mm-dd-yy", 14},
        {"m/d/yy h:mm", 22},
        {R"("$"#,##0_);("$"#,##0))", 5},
        {R"("$"#,##0.00_);[Red]\("$"#,##0.00\))", 8},
        {"#,##0 ;(#,##0)", 37},
        {"#,##0.00;[Red](#,##0.00)", 40},
        {"0.000", -1},
        {"yyyy-mm-dd", -1},
        {"", -1},
        {"0.00 ", -1},
    };
    for (const auto &[code, id] : cases) EXPECT_EQ(BuiltinFormatId(code), id) << code;
}

// Every built-in shows a value the way the application does.
TEST(BuiltinFormats, ShowKnownValues) {
    const struct {
        int id;
        double value;
        const char *shown;
    } cases[] = {
        {0, 1234.567, "1234.567"},
        {1, 1234.567, "1235"},
        {2, 1234.567, "1234.57"},
        {3, 1234.567, "1,235"},
        {4, 1234.567, "1,234.57"},
        {5, 1234.567, "$1,235 "},
        {5, -1234.567, "($1,235)"},
        {6, -1234.567, "($1,235)"},
        {7, 1234.567, "$1,234.57 "},
        {8, -1234.567, "($1,234.57)"},
        {9, 1234.567, "123457%"},
        {10, 1234.567, "123456.70%"},
        {11, 1234.567, "1.23E+03"},
        {12, 0.5, " 1/2"},
        {12, 1234.567, "1234 4/7"},
        {13, 0.5, "  1/2 "},
        {13, 1234.567, "1234 55/97"},
        {14, 1234.567, "5/18/1903"},
        {15, 1234.567, "18-May-03"},
        {16, 1234.567, "18-May"},
        {17, 1234.567, "May-03"},
        {18, 1234.567, "1:36 PM"},
        {19, 1234.567, "1:36:29 PM"},
        {20, 1234.567, "13:36"},
        {21, 1234.567, "13:36:29"},
        {22, 1234.567, "5/18/1903 13:36"},
        {37, 1234.567, "1,235 "},
        {37, -1234.567, "(1,235)"},
        {38, -1234.567, "(1,235)"},
        {39, 1234.567, "1,234.57 "},
        {40, -1234.567, "(1,234.57)"},
        {41, 1234.567, " 1,235 "},
        {41, -1234.567, " (1,235)"},
        {41, 0, " - "},
        {42, 1234.567, " $1,235 "},
        {43, 0, " -   "},
        {44, -1234.567, " $(1,234.57)"},
        {45, 1234.567, "36:29"},
        {46, 1234.567, "29629:36:29"},
        {47, 1234.567, "3628.8"},
        {48, 1234.567, "1.2E+3"},
        {49, 1234.567, "1234.567"},
    };
    for (const auto &c : cases)
        EXPECT_EQ(DisplayNumber(c.value, BuiltinFormatCode(c.id)), c.shown) << "id " << c.id << " value " << c.value;
}

TEST(BuiltinFormats, TextSectionOfAccountingFormats) {
    EXPECT_EQ(DisplayText(std::string("abc"), BuiltinFormatCode(41)), " abc ");
    EXPECT_EQ(DisplayText(std::string("abc"), BuiltinFormatCode(49)), "abc");
    EXPECT_EQ(DisplayText(std::string("abc"), BuiltinFormatCode(2)), "abc");
}

}  // namespace
}  // namespace workbook::format
