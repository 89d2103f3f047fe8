// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <vector>

#include "specification/specification.h"

namespace {

using Sheets = std::vector<int32_t>;

struct Parsed {
    bool ok;
    Sheets sheets;
};

Parsed ParseList(const std::string &text, int count = 4)
{
    CSpecification s;
    Parsed p{false, {}};
    p.ok = s.ParseSheetList(text, count, p.sheets);
    return p;
}

Parsed FromSpec(const std::string &spec, int count = 4)
{
    CSpecification s;
    Parsed p{false, {}};
    p.ok = s.GetSheetList(spec, count, p.sheets);
    return p;
}

TEST(SheetList, ItemsRangesAndAll)
{
    struct Case {
        const char *text;
        bool ok;
        Sheets sheets;
    };
    const Case cases[] = {
        {"", true, {1}},
        {"   ", true, {1}},
        {"1", true, {1}},
        {"2-3", true, {2, 3}},
        {"ALL", true, {1, 2, 3, 4}},
        {" all ", true, {1, 2, 3, 4}},
        {"aLl,2", true, {1, 2, 3, 4, 2}},
        {"1, 3", true, {1, 3}},
        {"1, all", false, {1}},  // the last piece keeps its blank: not the word
        {"2 - 3", true, {2, 3}},
        {"3-1", true, {}},
        {"1-5", false, {}},
        {"5-6", false, {}},
        {"5-3", true, {}},
        {"-5", false, {}},
        {"0", false, {}},
        {"5", false, {}},
        {"x", false, {}},
        {"2,5", false, {2}},
        {"2,2", true, {2, 2}},
        {"3,1", true, {3, 1}},
        {"1,2,", false, {1, 2}},
        {"1-2,4", true, {1, 2, 4}},
        {"1,5-6,2", false, {1}},
        {"3abc", true, {3}},
    };
    for (const auto &c : cases) {
        const auto p = ParseList(c.text);
        EXPECT_EQ(p.ok, c.ok) << '"' << c.text << '"';
        EXPECT_EQ(p.sheets, c.sheets) << '"' << c.text << '"';
    }
}

TEST(SheetList, NoSheetsToCountAgainst)
{
    EXPECT_TRUE(ParseList("all", 0).ok);
    EXPECT_TRUE(ParseList("all", 0).sheets.empty());
    EXPECT_FALSE(ParseList("1", 0).ok);
    // The list is appended to, never cleared.
    CSpecification s;
    Sheets sheets = {9};
    EXPECT_TRUE(s.ParseSheetList("2", 4, sheets));
    EXPECT_EQ(sheets, (Sheets{9, 2}));
}

TEST(SheetList, FromTheSpecificationString)
{
    EXPECT_EQ(FromSpec("StartRow=2;").sheets, Sheets{1});
    EXPECT_TRUE(FromSpec("StartRow=2;").ok);
    EXPECT_EQ(FromSpec("ExcelSheet=2-4;").sheets, (Sheets{2, 3, 4}));
    EXPECT_EQ(FromSpec("ExcelSheet= all ;").sheets, (Sheets{1, 2, 3, 4}));
    EXPECT_FALSE(FromSpec("ExcelSheet=1,;").ok);
    // Present but empty is an empty item here, while the same text in the list parser is sheet 1.
    EXPECT_FALSE(FromSpec("ExcelSheet=;").ok);
    EXPECT_FALSE(FromSpec("ExcelSheet= ;").ok);
    CSpecification s;
    std::string text;
    ASSERT_TRUE(s.GetKeyValue("ExcelSheet=;", ExcelSheet, text));
    EXPECT_EQ(ParseList(text).sheets, Sheets{1});
}

}  // namespace
