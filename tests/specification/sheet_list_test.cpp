// SPDX-License-Identifier: MIT
// The sheets a specification string names, checked against a workbook's count.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "specification/specification.h"

namespace {

using Sheets = std::vector<int32_t>;

TEST(SheetList, ItemsRangesAndAll)
{
    const struct { const char *text; int count; bool ok; Sheets sheets; } cases[] = {
        {"", 4, true, {1}}, {"   ", 4, true, {1}}, {"1", 4, true, {1}}, {"2-3", 4, true, {2, 3}},
        {"ALL", 4, true, {1, 2, 3, 4}}, {" all ", 4, true, {1, 2, 3, 4}}, {"aLl,2", 4, true, {1, 2, 3, 4, 2}},
        {"1, 3", 4, true, {1, 3}},
        {"1, all", 4, false, {1}},  // the last piece keeps its blank: not the word
        {"2 - 3", 4, true, {2, 3}}, {"3-1", 4, true, {}}, {"5-3", 4, true, {}}, {"1-5", 4, false, {}},
        {"5-6", 4, false, {}}, {"-5", 4, false, {}}, {"0", 4, false, {}}, {"5", 4, false, {}}, {"x", 4, false, {}},
        {"2,5", 4, false, {2}}, {"2,2", 4, true, {2, 2}}, {"3,1", 4, true, {3, 1}}, {"1,2,", 4, false, {1, 2}},
        {"1-2,4", 4, true, {1, 2, 4}}, {"1,5-6,2", 4, false, {1}}, {"3abc", 4, true, {3}},
        {"all", 0, true, {}}, {"1", 0, false, {}},  // no sheets to count against
    };
    for (const auto &c : cases) {
        Sheets sheets = {9};  // appended to, never cleared
        EXPECT_EQ(CSpecification().ParseSheetList(c.text, c.count, sheets), c.ok) << '"' << c.text << '"';
        Sheets expected = {9};
        expected.insert(expected.end(), c.sheets.begin(), c.sheets.end());
        EXPECT_EQ(sheets, expected) << '"' << c.text << '"';
    }
}

TEST(SheetList, FromTheSpecificationString)
{
    const struct { const char *spec; bool ok; Sheets sheets; } cases[] = {
        {"StartRow=2;", true, {1}}, {"ExcelSheet=2-4;", true, {2, 3, 4}}, {"ExcelSheet= all ;", true, {1, 2, 3, 4}},
        {"ExcelSheet=1,;", false, {1}},
        // Present but empty is the first sheet, as in the list parser.
        {"ExcelSheet=;", true, {1}}, {"ExcelSheet= ;", true, {1}},
    };
    for (const auto &c : cases) {
        Sheets sheets;
        EXPECT_EQ(CSpecification().GetSheetList(c.spec, 4, sheets), c.ok) << c.spec;
        EXPECT_EQ(sheets, c.sheets) << c.spec;
    }
    // Long lists read in one pass; past the bound they are refused with a reason.
    for (const size_t count : {size_t{100000}, size_t{200000}}) {
        std::string spec = "ExcelSheet=1";
        for (size_t i = 1; i < count; ++i) spec += ",1";
        Sheets sheets;
        std::string refusal;
        EXPECT_EQ(CSpecification().GetSheetList(spec, 4, sheets, &refusal), count <= 100000) << count;
        EXPECT_EQ(refusal.empty(), count <= 100000) << refusal;
    }
}

}  // namespace
