// SPDX-License-Identifier: MIT
#include "workbook/format/builtin_formats.h"

#include <algorithm>
#include <array>
#include <cctype>

namespace workbook::format {
namespace {

struct BuiltinEntry {
    int id;
    std::string_view code;
};

// The codes the application shows for the en-US locale. Ids 27 to 36 are
// East Asian dates and times with no en-US code of their own: they show as
// the short date, or the time with the fields their code has. Their codes
// repeat those of 14, 20 and 21, which come first so that a lookup by code
// finds the lower id.
constexpr std::array<BuiltinEntry, 46> kBuiltins{{
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
    {13, "# ?\?/?\?"},  // escaped: "??/" would read as a trigraph
    {14, "m/d/yyyy"},
    {15, "d-mmm-yy"},
    {16, "d-mmm"},
    {17, "mmm-yy"},
    {18, "h:mm AM/PM"},
    {19, "h:mm:ss AM/PM"},
    {20, "h:mm"},
    {21, "h:mm:ss"},
    {22, "m/d/yyyy h:mm"},
    {27, "m/d/yyyy"},
    {28, "m/d/yyyy"},
    {29, "m/d/yyyy"},
    {30, "m/d/yyyy"},
    {31, "m/d/yyyy"},
    {32, "h:mm"},
    {33, "h:mm:ss"},
    {34, "m/d/yyyy"},
    {35, "m/d/yyyy"},
    {36, "m/d/yyyy"},
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
    {47, "mm:ss.0"},
    {48, "##0.0E+0"},
    {49, "@"},
}};

// Other spellings of the same formats, as other writers and the file
// format's documentation put them.
constexpr std::array<BuiltinEntry, 17> kAliases{{
    {5, R"("$"#,##0_);("$"#,##0))"},
    {5, R"("$"#,##0_);\("$"#,##0\))"},
    {6, R"("$"#,##0_);[Red]("$"#,##0))"},
    {6, R"("$"#,##0_);[Red]\("$"#,##0\))"},
    {7, R"("$"#,##0.00_);("$"#,##0.00))"},
    {7, R"("$"#,##0.00_);\("$"#,##0.00\))"},
    {8, R"("$"#,##0.00_);[Red]("$"#,##0.00))"},
    {8, R"("$"#,##0.00_);[Red]\("$"#,##0.00\))"},
    {14, "mm-dd-yy"},
    {22, "m/d/yy h:mm"},
    {37, "#,##0 ;(#,##0)"},
    {38, "#,##0 ;[Red](#,##0)"},
    {39, "#,##0.00;(#,##0.00)"},
    {40, "#,##0.00;[Red](#,##0.00)"},
    {37, R"(#,##0_);\(#,##0\))"},
    {39, R"(#,##0.00_);\(#,##0.00\))"},
    {44, R"(_("$"* #,##0.00_)_("$"* \(#,##0.00\)_("$"* "-"??_)_(@_))"},
}};

bool EqualsIgnoringCase(std::string_view a, std::string_view b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](char x, char y) {
        return std::tolower(static_cast<unsigned char>(x)) ==
               std::tolower(static_cast<unsigned char>(y));
    });
}

}  // namespace

std::string BuiltinFormatCode(int id) {
    for (const auto &entry : kBuiltins)
        if (entry.id == id) return std::string(entry.code);
    return {};
}

int BuiltinFormatId(std::string_view code) {
    if (EqualsIgnoringCase(code, "General")) return 0;
    for (const auto &entry : kBuiltins)
        if (entry.code == code) return entry.id;
    for (const auto &entry : kAliases)
        if (entry.code == code) return entry.id;
    return -1;
}

}  // namespace workbook::format
