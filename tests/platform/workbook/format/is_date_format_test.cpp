// SPDX-License-Identifier: MIT
#include "workbook/format/date_format.h"

#include <gtest/gtest.h>

#include "workbook/format/builtin_formats.h"

namespace workbook::format {
namespace {

TEST(IsDateFormat, CodesReadersMeet) {
    const std::pair<const char *, bool> cases[] = {
        {"yyyy-mm-dd", true},
        {"yyyy/mm/dd hh:mm:ss", true},
        {"YYYY/MM/DD HH:mm:ss", true},
        {"hh:mm:ss.000", true},
        {"[h]:mm:ss", true},
        {"[mm]:ss", true},
        {"[ss]", true},
        {"h AM/PM", true},
        {"[$-409]d-mmm-yy;@", true},
        {"[Red]dd/mm", true},
        {"0.00;[Red]yyyy", true},
        {"General", false},
        {"", false},
        {"0.00", false},
        {"0.00E+00", false},
        {"#,##0 \"days\"", false},
        {"\"d\"0", false},
        {"\\d0", false},
        {"_d0", false},
        {"*d0", false},
        {"[Red]0", false},
        {"[Blue]#,##0;[Red]-#,##0", false},
        {"[$USD-409]0.00", false},
        {"0;0;0;yyyy", false},
        {"@", false},
        {"\"unterminated yyyy", false},
        {"[Bad]yyyy", false},
    };
    for (const auto &[code, isDate] : cases) EXPECT_EQ(IsDateFormat(code), isDate) << code;
}

TEST(IsDateFormat, BuiltinDateIdsAreDates) {
    for (int id = 0; id <= 49; ++id) {
        const bool expected = (id >= 14 && id <= 22) || (id >= 45 && id <= 47);
        EXPECT_EQ(IsDateFormat(BuiltinFormatCode(id)), expected) << "id " << id;
    }
}

}  // namespace
}  // namespace workbook::format
