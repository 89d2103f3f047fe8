// SPDX-License-Identifier: MIT
// The rules of the open dialog that need no window: number fields, spins,
// the keys of the pages, the row check, sorted lists and the string.
#include <gtest/gtest.h>

#include "dialogs/catalogue_lists.h"
#include "dialogs/field_parsing.h"
#include "dialogs/open_dialog_fields.h"
#include "dialogs/sorted_entries.h"
#include "module/string_table.h"
#include "specification/parsing_type.h"
#include "specification/specification.h"

using namespace vantrel::dialogs;

namespace {

std::string Build(const OpenDialogFields &dialog, const TimePageFields &time, const DataPageFields &data)
{
    CSpecification specification;
    std::string spec;
    DialogToString(specification, COpenDialogKeys(dialog, time, data), spec);
    return spec;
}

// The data page as OnInitDialog leaves it, after a first commit.
DataPageFields NewDataPage()
{
    DataPageFields data;
    data.m_itemTypeRow = data.m_unitRow = data.m_valueTypeRow = 1;
    data.m_itemDescriptionRow = 2;
    data.m_startRow = 3;
    data.m_deleteValueRow = 2;
    data.m_itemType = "Undefined";
    data.m_unit = "undefined";
    data.m_valueType = "Instantaneous";
    return data;
}

TEST(FieldRules, WholeNumbersAndNumbersOfAField)
{
    int value = 7;
    EXPECT_TRUE(ParseWholeNumber(" 12 ", value));
    EXPECT_EQ(value, 12);
    EXPECT_TRUE(ParseWholeNumber("+150", value));
    EXPECT_EQ(value, 150);  // typing isn't bound by the spin's range
    EXPECT_TRUE(ParseWholeNumber("-3", value));
    EXPECT_EQ(value, -3);
    for (const char *bad : {"", " ", "abc", "3a", "1.5", "++1", "99999999999"}) {
        value = 7;
        EXPECT_FALSE(ParseWholeNumber(bad, value)) << bad;
        EXPECT_EQ(value, 7) << bad;
    }
    double number = 1.0;
    EXPECT_TRUE(ParseNumber("-1e-30", number));
    EXPECT_EQ(number, -1e-30);
    EXPECT_FALSE(ParseNumber("-1e-30x", number));
    EXPECT_FALSE(ParseNumber("inf", number));
    EXPECT_EQ(number, -1e-30);
    EXPECT_EQ(NumberText(-1e-30), "-1e-30");
    EXPECT_EQ(KeyDoubleText(-999.5), "-999.5");
}

TEST(FieldRules, SpinArrowsStayWithinOneToHundred)
{
    EXPECT_EQ(SpinStep("5", 1, 1, 1, 100), 6);
    EXPECT_EQ(SpinStep("100", 1, 1, 1, 100), 100);
    EXPECT_EQ(SpinStep("1", 1, -1, 1, 100), 1);
    // A typed number out of range comes back into it with the first press.
    EXPECT_EQ(SpinStep("250", 1, 1, 1, 100), 100);
    EXPECT_EQ(SpinStep("-4", 1, 1, 1, 100), 1);
    // A field without a number steps from the last position.
    EXPECT_EQ(SpinStep("x", 41, 1, 1, 100), 42);
}

TEST(FieldRules, TimeKeysFollowTheMode)
{
    OpenDialogFields dialog;
    DataPageFields data = NewDataPage();
    TimePageFields time;
    time.m_timeCol = time.m_dateCol = 1;
    time.m_globalDate = {45352.25, kDateValid};
    time.m_globalTime = {45352.25, kDateValid};
    const std::string dataKeys =
        "StartRow=3;GlobalUnitType=Undefined;GlobalUnit=undefined;GlobalValueType=Instantaneous;"
        "ItemDescriptionRow=2;ExcelSheet=1;FilePath=;";
    EXPECT_EQ(Build(dialog, time, data), "DateTimeCol=1;" + dataKeys);
    time.m_useDTFormat = 1;
    EXPECT_EQ(Build(dialog, time, data), "DateTimeCol=1;DateTimeFormat=YYYY/MM/DD HH:mm:ss;" + dataKeys);

    // Mode 1: the time column and the date of the sheet; the other layouts say nothing.
    time.m_timeMode = 1;
    time.m_timeCol = 4;
    std::string date;
    EXPECT_TRUE(time.GetKeyValue(GlobalDate, date));
    EXPECT_NE(date.find("2024"), std::string::npos) << date;
    EXPECT_EQ(date.find(':'), std::string::npos) << date;
    EXPECT_EQ(Build(dialog, time, data), "TimeCol=4;GlobalDate=" + date + ";" + dataKeys);
    time.m_useTFormat = 1;
    EXPECT_EQ(Build(dialog, time, data), "TimeCol=4;TimeFormat=HH:mm:ss;GlobalDate=" + date + ";" + dataKeys);

    // Mode 2: the date column and the time of the sheet.
    time.m_timeMode = 2;
    time.m_dateCol = 2;
    time.m_useDFormat = 1;
    std::string clock;
    EXPECT_TRUE(time.GetKeyValue(GlobalTime, clock));
    EXPECT_NE(clock.find("6"), std::string::npos) << clock;
    EXPECT_EQ(clock.find("2024"), std::string::npos) << clock;
    EXPECT_EQ(Build(dialog, time, data), "DateCol=2;DateFormat=YYYY/MM/DD;GlobalTime=" + clock + ";" + dataKeys);

    // An accessor hands out its value whatever the mode.
    std::string column;
    EXPECT_FALSE(time.GetKeyValue(DateTimeCol, column));
    EXPECT_EQ(column, "1");
    // A date that couldn't be taken reads "Invalid DateTime".
    time.m_timeMode = 1;
    time.m_globalDate = {0.0, kDateInvalid};
    EXPECT_TRUE(time.GetKeyValue(GlobalDate, date));
    EXPECT_EQ(date, "Invalid DateTime");
}

TEST(FieldRules, DataKeysAndTheDialogsOwn)
{
    OpenDialogFields dialog;
    dialog.m_filePath = "/data/book.xlsx";
    dialog.m_excelSheets = "1,2";
    dialog.m_templatePath = "/data/layout.xml";
    TimePageFields time;
    DataPageFields data = NewDataPage();
    data.m_itemTypeInRow = data.m_unitInRow = data.m_valueTypeInRow = 1;
    data.m_itemTypeRow = 2;
    data.m_unitRow = 3;
    data.m_valueTypeRow = 4;
    data.m_itemDescriptionRow = 1;
    data.m_startRow = 5;
    data.m_useDelValNotEmpty = 1;
    const std::string rows = "DateTimeCol=1;StartRow=5;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ItemDescriptionRow=1;";
    EXPECT_EQ(Build(dialog, time, data), rows + "DeleteValue=-1e-30;ExcelSheet=1,2;FilePath=/data/book.xlsx;");
    data.m_deleteValueInRow = 1;
    dialog.m_templateMode = 1;
    EXPECT_EQ(Build(dialog, time, data),
              rows + "DelValRow=2;ExcelSheet=1,2;TemplateFilePath=/data/layout.xml;FilePath=/data/book.xlsx;");
    // Mode 0 keeps the path in its field, but not in the string.
    dialog.m_templateMode = 0;
    EXPECT_EQ(Build(dialog, time, data), rows + "DelValRow=2;ExcelSheet=1,2;FilePath=/data/book.xlsx;");

    const COpenDialogKeys keys(dialog, time, data);
    std::string value = "stale";
    EXPECT_FALSE(keys.GetDialogKeyValue(SaveTemplateFilePath, value));
    EXPECT_EQ(value, "");
    EXPECT_FALSE(keys.GetDialogKeyValue(22, value));
    EXPECT_FALSE(keys.GetDialogKeyValue(-1, value));
}

TEST(FieldRules, RowCheckCasesInOrder)
{
    DataPageFields data = NewDataPage();
    EXPECT_EQ(data.CheckDataRows(), 0);  // the defaults pass
    data.m_itemTypeRow = 5;              // a row whose list is in use doesn't count
    EXPECT_EQ(data.CheckDataRows(), 0);

    data = NewDataPage();
    data.m_itemDescriptionRow = 3;
    EXPECT_EQ(data.CheckDataRows(), 115);
    data = NewDataPage();
    data.m_itemTypeInRow = 1;
    data.m_itemTypeRow = 2;  // equal to the title row
    EXPECT_EQ(data.CheckDataRows(), 116);
    data.m_unitInRow = 1;
    data.m_unitRow = 3;  // not above the data: 115 comes before 116
    EXPECT_EQ(data.CheckDataRows(), 115);
    data = NewDataPage();
    data.m_valueTypeInRow = 1;
    data.m_valueTypeRow = 2;
    EXPECT_EQ(data.CheckDataRows(), 116);
    data.m_valueTypeRow = 1;
    data.m_itemTypeInRow = data.m_unitInRow = 1;  // the attribute rows may share a row
    EXPECT_EQ(data.CheckDataRows(), 0);

    // The delete value row counts only with the box checked and its radio chosen.
    data = NewDataPage();
    data.m_deleteValueRow = 3;
    EXPECT_EQ(data.CheckDataRows(), 0);
    data.m_useDelValNotEmpty = 1;
    EXPECT_EQ(data.CheckDataRows(), 0);
    data.m_deleteValueInRow = 1;
    EXPECT_EQ(data.CheckDataRows(), 115);
    data.m_deleteValueRow = 2;  // may equal the title row
    EXPECT_EQ(data.CheckDataRows(), 0);

    EXPECT_EQ(vantrel::LoadMessage(115),
              "The data start row needs to be greater than any heading rows. Please correct this to continue.");
    EXPECT_EQ(vantrel::LoadMessage(116), "The item description row should not equal any of the other header "
                                         "rows. Please correct this to continue.");
}

TEST(FieldRules, EnabledStatesOfTheDataPage)
{
    DataPageEnables on = DataEnables(0, 0, 0, false, 0);
    EXPECT_TRUE(on.itemTypeList && on.unitList && on.valueTypeList);
    EXPECT_FALSE(on.itemTypeRow || on.unitRow || on.valueTypeRow);
    EXPECT_FALSE(on.deleteRadios || on.deleteValue || on.deleteValueRow);
    on = DataEnables(1, 0, 1, true, 0);
    EXPECT_FALSE(on.itemTypeList);
    EXPECT_TRUE(on.itemTypeRow && on.unitList && on.valueTypeRow && on.deleteRadios && on.deleteValue);
    EXPECT_FALSE(on.unitRow || on.valueTypeList || on.deleteValueRow);
    on = DataEnables(0, 1, 0, true, 1);
    EXPECT_TRUE(on.unitRow && on.deleteValueRow);
    EXPECT_FALSE(on.unitList || on.deleteValue);
    on = DataEnables(0, 0, 0, false, 1);
    EXPECT_FALSE(on.deleteRadios || on.deleteValue || on.deleteValueRow);
}

TEST(FieldRules, SortedListsAndTheCatalogue)
{
    std::vector<std::string> entries;
    for (const char *entry : {"b", "A", "c", "a"}) entries.insert(entries.begin() + std::ptrdiff_t(SortedInsertPlace(entries, entry)), entry);
    EXPECT_EQ(entries, (std::vector<std::string>{"A", "a", "b", "c"}));
    EXPECT_EQ(FindExactEntry(entries, "B"), 2);
    EXPECT_EQ(FindExactEntry(entries, "bb"), -1);
    EXPECT_EQ(FindPrefixEntry({"Discharge", "Undefined", "Water Level"}, "undef"), 1);
    EXPECT_EQ(FindPrefixEntry({"Discharge"}, "Undefined"), -1);

    const std::vector<std::string> types = CatalogueItemTypes();
    ASSERT_FALSE(types.empty());
    EXPECT_EQ(types.front(), "Undefined");
    EXPECT_EQ(GetUnitsOfItemType("water level"),
              (std::vector<std::string>{"meter", "centimeter", "millimeter", "feet", "inch"}));
    EXPECT_EQ(GetUnitsOfItemType("Undefined"), (std::vector<std::string>{"undefined"}));
}

}  // namespace
