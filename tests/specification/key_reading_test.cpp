// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include <algorithm>

#include "specification/specification.h"

namespace {

std::string Text(const std::string &spec, int key, bool *found = nullptr)
{
    CSpecification s;
    std::string value = "<untouched>";
    const bool ok = s.GetKeyValue(spec, key, value);
    if (found) *found = ok;
    return value;
}

int Number(const std::string &spec, int key, bool *found = nullptr)
{
    CSpecification s;
    int value = -12345;
    const bool ok = s.GetKeyValueInt(spec, key, value);
    if (found) *found = ok;
    return value;
}

TEST(KeyNames, EveryKeyHasItsTextAndOthersFail)
{
    const char *expected[] = {
        "DateCol", "TimeCol", "DateTimeCol", "DateFormat", "TimeFormat", "DateTimeFormat",
        "GlobalDate", "GlobalTime", "StartRow", "UnitTypeRow", "UnitRow", "GlobalUnitType",
        "GlobalUnit", "ValueTypeRow", "GlobalValueType", "ItemDescriptionRow", "DeleteValue",
        "DelValRow", "ExcelSheet", "TemplateFilePath", "SaveTemplateFilePath", "FilePath"};
    CSpecification s;
    std::string name;
    for (int key = 0; key < kParsingTypeCount; ++key) {
        ASSERT_TRUE(s.GetKeyName(key, name)) << key;
        EXPECT_EQ(name, expected[key]);
    }
    name = "x";
    EXPECT_FALSE(s.GetKeyName(-1, name));
    EXPECT_EQ(name, "");
    name = "x";
    EXPECT_FALSE(s.GetKeyName(kParsingTypeCount, name));
    EXPECT_EQ(name, "");
}

TEST(KeyValue, PiecesAndSeparators)
{
    bool found = true;
    // An empty string holds no key at all.
    for (int key = 0; key < kParsingTypeCount; ++key) {
        EXPECT_EQ(Text("", key, &found), "<untouched>");
        EXPECT_FALSE(found) << key;
    }
    // Runs of separators are one; leading separators are skipped; "=" alone has no key.
    EXPECT_EQ(Number(";;StartRow=5;;", StartRow), 5);
    EXPECT_EQ(Number("=;StartRow=5", StartRow), 5);
    EXPECT_EQ(Number("StartRow==5;", StartRow), 5);
    // The first pair with the key wins.
    EXPECT_EQ(Number("StartRow=1;StartRow=2;", StartRow), 1);
    // Keys compare exactly: case and blanks count.
    Number("startrow=5;", StartRow, &found);
    EXPECT_FALSE(found);
    Number("StartRow =5;", StartRow, &found);
    EXPECT_FALSE(found);
    // A key is found by its own name only, not as a prefix of another.
    EXPECT_EQ(Text("DateTimeCol=3;DateCol=7;", DateCol), "7");
    EXPECT_EQ(Text("DateTimeFormat=YYYY;DateFormat=DD;", DateFormat), "DD");
    // Only the second token is the value.
    EXPECT_EQ(Text("DateFormat=a=b;", DateFormat), "a");
    // A value with ';' is cut there and its tail matches no key.
    EXPECT_EQ(Text("GlobalDate=2012;03;StartRow=4;", GlobalDate), "2012");
    EXPECT_EQ(Number("GlobalDate=2012;03;StartRow=4;", StartRow), 4);
    // Values keep their blanks: nothing is trimmed.
    EXPECT_EQ(Text("ExcelSheet= 1, 2 ;", ExcelSheet), " 1, 2 ");
}

TEST(KeyValue, EmptyValues)
{
    bool found = false;
    EXPECT_EQ(Text("StartRow=;", StartRow, &found), "");
    EXPECT_TRUE(found);
    EXPECT_EQ(Text("StartRow;", StartRow, &found), "");
    EXPECT_TRUE(found);
    EXPECT_EQ(Number("StartRow=;", StartRow, &found), 0);
    EXPECT_TRUE(found);
    // A key that isn't there leaves the output as it was.
    EXPECT_EQ(Text("StartRow=3;", DelValRow, &found), "<untouched>");
    EXPECT_FALSE(found);
    EXPECT_EQ(Number("StartRow=3;", DelValRow, &found), -12345);
    EXPECT_FALSE(found);
}

TEST(KeyValueInt, LeadingIntegerByAtoiRules)
{
    EXPECT_EQ(Number("StartRow=12a;", StartRow), 12);
    EXPECT_EQ(Number("StartRow=  -7;", StartRow), -7);
    EXPECT_EQ(Number("StartRow=+8x;", StartRow), 8);
    EXPECT_EQ(Number("StartRow=abc;", StartRow), 0);
    EXPECT_EQ(Number("StartRow=- 3;", StartRow), 0);
    EXPECT_EQ(Number("StartRow=99999999999999;", StartRow), 2147483647);
    EXPECT_EQ(Number("StartRow=-99999999999999;", StartRow), -2147483647 - 1);
}

TEST(KeyValueInt, OnlyNumericKeysAreRead)
{
    const int numeric[] = {DateCol, TimeCol, DateTimeCol, StartRow, UnitTypeRow, UnitRow,
                           GlobalUnitType, GlobalUnit, ValueTypeRow, ItemDescriptionRow, DelValRow};
    bool found = false;
    CSpecification s;
    std::string name;
    for (int key = 0; key < kParsingTypeCount; ++key) {
        s.GetKeyName(key, name);
        const int value = Number(name + "=42;", key, &found);
        const bool isNumeric = std::find(std::begin(numeric), std::end(numeric), key) != std::end(numeric);
        EXPECT_EQ(found, isNumeric) << name;
        EXPECT_EQ(value, isNumeric ? 42 : -12345) << name;
    }
}

}  // namespace
