// SPDX-License-Identifier: MIT
// Building specification strings from the two records.
#include <gtest/gtest.h>

#include "specification/specification.h"

namespace {

std::string OpenString(const OpenSpecification &record)
{
    CSpecification spec;
    std::string text = "left over";
    spec.OpenSpecificationToString(record, text);
    return text;
}

std::string SaveString(const SaveSpecification &record)
{
    CSpecification spec;
    std::string text = "left over";
    spec.SaveSpecificationToString(record, text);
    return text;
}

TEST(Records, DefaultsGiveTheDefaultLayouts)
{
    EXPECT_EQ(OpenString(OpenSpecification{}),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;"
              "ItemDescriptionRow=2;ExcelSheet=1;");
    EXPECT_EQ(SaveString(SaveSpecification{}),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;");
}

TEST(Records, OpenRecordChoosesKeysByTimeLayoutFlagsAndOptions)
{
    OpenSpecification timeOnly;
    timeOnly.DataTimeType = 1;
    timeOnly.TimeCol = 4;
    timeOnly.GlobalDate = "2020-01-02";
    timeOnly.TimeFormat = "HH:mm";
    EXPECT_EQ(OpenString(timeOnly),
              "TimeCol=4;GlobalDate=2020-01-02;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;"
              "ItemDescriptionRow=2;ExcelSheet=1;");
    timeOnly.UseTFormat = 1;
    EXPECT_EQ(OpenString(timeOnly),
              "TimeCol=4;TimeFormat=HH:mm;GlobalDate=2020-01-02;StartRow=3;UnitTypeRow=1;UnitRow=1;"
              "ValueTypeRow=1;ItemDescriptionRow=2;ExcelSheet=1;");

    OpenSpecification dateOnly;
    dateOnly.DataTimeType = 2;
    dateOnly.DateCol = 2;
    dateOnly.UseDFormat = 1;
    dateOnly.DateFormat = "DD.MM.YYYY";
    dateOnly.GlobalTime = "12:00:00";
    dateOnly.UseDTFormat = 1;  // no effect outside layout 0
    EXPECT_EQ(OpenString(dateOnly),
              "DateCol=2;DateFormat=DD.MM.YYYY;GlobalTime=12:00:00;StartRow=3;UnitTypeRow=1;"
              "UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;ExcelSheet=1;");

    OpenSpecification globals;
    globals.UseDTFormat = 1;
    globals.DateTimeFormat = "YYYY-MM-DD|HH:mm";
    globals.UseUnitTypeRow = 0;
    globals.GlobalUnitType = "Rainfall";
    globals.UseUnitRow = 0;
    globals.GlobalUnit = "mm";
    globals.UseValueTypeRow = 0;
    globals.GlobalValueType = "Accumulated";
    globals.UseDelValNotEmpty = 1;
    globals.UseDeleteValueRow = 0;
    globals.DeleteValue = "-99";
    globals.ExcelSheet = "1-3";
    EXPECT_EQ(OpenString(globals),
              "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD|HH:mm;StartRow=3;GlobalUnitType=Rainfall;"
              "GlobalUnit=mm;GlobalValueType=Accumulated;ItemDescriptionRow=2;DeleteValue=-99;"
              "ExcelSheet=1-3;");

    // Option 2 drops both the row and the global key; option 1 drops the title row.
    OpenSpecification options;
    options.UseUnitTypeOption = 2;
    options.UseUnitRow = 0;
    options.UseUnitOption = 2;
    options.UseValueTypeOption = 2;
    options.UseItemTitleOption = 1;
    options.UseDelValNotEmpty = 1;
    options.DeleteValueRow = 7;
    options.StartRow = 0;
    EXPECT_EQ(OpenString(options), "DateTimeCol=1;StartRow=0;DelValRow=7;ExcelSheet=1;");
}

TEST(Records, SaveRecordLeavesOutZerosAndTakesFormatOnlyWhenFlagged)
{
    SaveSpecification record;
    record.DateTimeCol = 0;
    record.ItemDescriptionRow = 0;
    record.DateTimeFormat = "YYYY|MM|DD";
    EXPECT_EQ(SaveString(record), "StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;");

    record.UseDTFormat = 1;
    record.UseDelValNotEmpty = 1;
    record.DeleteValueRow = 4;
    record.StartRow = 6;
    EXPECT_EQ(SaveString(record), "DateTimeFormat=YYYY|MM|DD;StartRow=6;UnitTypeRow=1;UnitRow=1;"
                                  "ValueTypeRow=1;DelValRow=4;");

    record.DateTimeFormat.clear();
    record.DeleteValueRow = 0;
    EXPECT_EQ(SaveString(record), "StartRow=6;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;");
}

TEST(Records, KeyValuesAreEmptiedAndBoundedByTheKeyTable)
{
    CSpecification spec;
    std::string value = "stale";
    EXPECT_FALSE(spec.GetSaveKeyValue(SaveSpecification{}, ExcelSheet, value));
    EXPECT_EQ(value, "");
    value = "stale";
    EXPECT_FALSE(spec.GetOpenKeyValue(OpenSpecification{}, TemplateFilePath, value));
    EXPECT_EQ(value, "");
    EXPECT_FALSE(spec.GetOpenKeyValue(OpenSpecification{}, -1, value));
    EXPECT_FALSE(spec.GetOpenKeyValue(OpenSpecification{}, kParsingTypeCount, value));
    EXPECT_TRUE(spec.GetOpenKeyValue(OpenSpecification{}, ExcelSheet, value));
    EXPECT_EQ(value, "1");

    // An empty map joins to nothing; a text value is copied as it stands.
    std::string joined = "stale";
    EXPECT_FALSE(spec.JoinKeyValues(joined));
    EXPECT_EQ(joined, "");
    spec.KeyValues[FilePath] = "/tmp/a b.xlsx";
    spec.KeyValues[DateCol] = "";
    EXPECT_TRUE(spec.JoinKeyValues(joined));
    EXPECT_EQ(joined, "DateCol=;FilePath=/tmp/a b.xlsx;");
}

TEST(Records, TemplateReferenceIsTheFirstPieceOnly)
{
    CSpecification spec;
    std::string path = "untouched";
    EXPECT_TRUE(spec.GetTemplateReference("TemplateFilePath=/t/a.xml;StartRow=3;", path));
    EXPECT_EQ(path, "/t/a.xml");
    EXPECT_TRUE(spec.GetTemplateReference(";;SaveTemplateFilePath=x;", path));
    EXPECT_EQ(path, "x");
    EXPECT_TRUE(spec.GetTemplateReference("TemplateFilePath;", path));
    EXPECT_EQ(path, "");
    path = "untouched";
    EXPECT_FALSE(spec.GetTemplateReference("StartRow=3;TemplateFilePath=/t/a.xml;", path));
    EXPECT_FALSE(spec.GetTemplateReference("", path));
    EXPECT_EQ(path, "untouched");
}

}  // namespace
