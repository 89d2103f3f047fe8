// SPDX-License-Identifier: MIT
// The dialogs' templates: the bytes and paths written, and what survives
// writing in one dialog and loading (through the chooser) in another.
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>

#include <QDateEdit>
#include <QTimeEdit>

#include "dialog_driver.h"
#include "dialogs/template_text.h"
#include "save_host.h"

using namespace dialog_testing;

namespace {

// Mode 1, the chooser, the path: a load as a user makes it.
void LoadThroughChooser(QWidget &dialog, const std::string &path)
{
    Click(dialog, "useTemplate");
    ChooseInFileDialog(path);
    Click(dialog, "browseTemplate");
}

void CommitAll(CGUIOpenDlg &dialog)
{
    dialog.TimePage().Commit();
    dialog.DataPage().Commit();
    dialog.Commit();
}

std::string TemplateText(const CGUIOpenDlg &dialog)
{
    std::string text;
    dialog.BuildTemplateText(text);
    return text;
}

// A save dialog whose fields differ from the defaults everywhere.
void DescribeExport(CGUISaveDlg &dialog, const char *format)
{
    Click(dialog, {"multiColumns", "useDeleteRow"});
    Find<QComboBox>(dialog, "format")->setEditText(QString::fromUtf8(format));
    Type(dialog, {{"dateTimeColumnEdit", "2"}, {"unitTypeRowEdit", "1"}, {"unitRowEdit", "2"},
                  {"valueTypeRowEdit", "3"}, {"itemDescriptionRowEdit", "4"}, {"dataStartRowEdit", "6"},
                  {"deleteValueRowEdit", "5"}});
    dialog.Commit();
}

TEST(TemplatesSurvive, OpenDialogToOpenDialog)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("layout.xml");
    CGUIOpenDlg source;
    Click(source, {"dateTimeFormatBox", "timeRadio", "timeFormatBox"});
    Find<QComboBox>(source, "dateTimeFormat")->setEditText("\"YYYY-MM-DD hh:mm\"");
    // Text beyond plain ASCII, and characters that XML escapes.
    Find<QComboBox>(source, "timeFormat")->setEditText(QString::fromUtf8("HH-mm \xC2\xAB & <\"x\"> \xC2\xBB"));
    Find<QComboBox>(source, "dateFormat")->setEditText("DD.MM.YYYY");
    Find<QDateEdit>(source, "globalDate")->setDate(QDate(2023, 7, 14));
    Find<QTimeEdit>(source, "globalTime")->setTime(QTime(6, 30, 15));
    CDataPageDlg &page = source.DataPage();
    ASSERT_TRUE(page.SelectItemType("Water Level") && page.SelectUnit("feet") && page.SelectValueType("Accumulated"));
    Click(source, {"itemTypeInRow", "valueTypeInRow", "deleteValueBox", "saveTemplate"});
    Type(source, {{"excelSheets", "2,3"}, {"dateTimeColEdit", "4"}, {"timeColEdit", "5"}, {"dateColEdit", "6"},
                  {"itemTypeRowEdit", "4"}, {"unitRowEdit", "5"}, {"valueTypeRowEdit", "4"}, {"startRowEdit", "8"},
                  {"itemDescriptionRowEdit", "6"}, {"deleteValue", "-9999.125"}, {"deleteValueRowEdit", "7"},
                  {"templatePath", path}});
    CommitAll(source);
    ASSERT_TRUE(source.WriteTemplateFile(path));
    // A unit that matches the catalogue only by case comes in from its item type's list.
    std::string text = testing_host::ReadFile(path);
    testing_host::WriteFile(path, text.replace(text.find("\"feet\""), 6, "\"FEET\""));

    testing_host::MessageBoxes boxes;
    CGUIOpenDlg loaded;
    LoadThroughChooser(loaded, path);
    EXPECT_EQ(std::pair(boxes.texts, loaded.Fields().m_templatePath), std::pair(Texts{}, path));
    CommitAll(loaded);  // what the controls show
    EXPECT_EQ(Keys(loaded), Keys(source));
    // Every field, the other modes' included, as the writer puts them.
    EXPECT_EQ(TemplateText(loaded), TemplateText(source));
    EXPECT_TRUE(Find<QWidget>(loaded, "timeColEdit")->isEnabled());
    EXPECT_FALSE(Find<QWidget>(loaded, "dateColEdit")->isEnabled());
    EXPECT_EQ(Edit(loaded, "excelSheets")->text(), "2,3");
}

TEST(TemplatesSurvive, OpenDialogToSaveDialog)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("open.xml");
    CGUIOpenDlg source;
    Click(source, {"dateTimeFormatBox", "itemTypeInRow", "valueTypeInRow"});
    Find<QComboBox>(source, "dateTimeFormat")->setEditText("YYYY|MM|DD|HH|mm|ss");
    Type(source, {{"dateTimeColEdit", "2"}, {"itemTypeRowEdit", "1"}, {"unitRowEdit", "7"}, {"valueTypeRowEdit", "2"},
                  {"itemDescriptionRowEdit", "3"}, {"startRowEdit", "4"}, {"deleteValueRowEdit", "1"}});
    Click(source, "deleteValueBox");  // a delete value, not a row
    CommitAll(source);
    ASSERT_TRUE(source.WriteTemplateFile(path));

    auto series = save_testing::ThreeGauges();
    testing_host::MessageBoxes boxes;
    CGUISaveDlg save;
    save.SetHost(series.Get(), nullptr);
    LoadThroughChooser(save, path);
    EXPECT_EQ(boxes.texts, Texts{});
    // The unit came from the list: no row to take over.
    EXPECT_EQ(Keys(save), "DateTimeCol=2;DateTimeFormat=YYYY|MM|DD|HH|mm|ss;StartRow=4;UnitTypeRow=1;UnitRow=1;"
                          "ValueTypeRow=2;ItemDescriptionRow=3;DelValRow=2;TemplateFilePath=" + path + ";FilePath=;");
    EXPECT_EQ(save.PreviewListControl()->columnCount(), 1 + 6 + 3);  // the preview followed the load
    EXPECT_TRUE(Find<QWidget>(save, "format")->isEnabled());
}

TEST(TemplatesSurvive, SaveDialogToBothDialogs)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("export.tpl");
    CGUISaveDlg source;
    // A double quote, escaped characters and text beyond ASCII come back too.
    DescribeExport(source, "YYYY-MM-DD \"\xC3\xA9t\xC3\xA9\" & <HH>");
    ASSERT_TRUE(source.WriteTemplateFile(path));
    testing_host::MessageBoxes boxes;
    CGUISaveDlg save;
    LoadThroughChooser(save, path);
    save.Commit();
    Click(source, "useTemplate");
    Type(source, "templatePath", path);
    source.Commit();
    EXPECT_EQ(Keys(save), Keys(source));
    EXPECT_TRUE(Find<QWidget>(save, "format")->isEnabled() && Find<QWidget>(save, "deleteValueRowEdit")->isEnabled());

    CGUIOpenDlg open;
    Type(open, "excelSheets", "4");
    LoadThroughChooser(open, path);
    CommitAll(open);
    // The rows as they were, the first sheet, the date/time layout.
    EXPECT_EQ(Keys(open), "DateTimeCol=2;DateTimeFormat=YYYY-MM-DD \"\xC3\xA9t\xC3\xA9\" & <HH>;StartRow=6;"
                          "UnitTypeRow=1;UnitRow=2;ValueTypeRow=3;ItemDescriptionRow=4;DelValRow=5;ExcelSheet=1;"
                          "TemplateFilePath=" + path + ";FilePath=;");
    EXPECT_TRUE(Find<QWidget>(open, "deleteValueRowEdit")->isEnabled());
    EXPECT_EQ(boxes.texts, Texts{});
}

TEST(TemplateLoad, EachDialogTellsWhyAndChangesNothing)
{
    testing_host::TempDir folder;
    const std::pair<const char *, const char *> files[] = {
        {"text.xml", "no xml at all"},
        {"root.xml", "<Layout StartRow=\"3\"/>"},
        {"open.xml", "<MSExcelVantrelSpecification ExcelSheet=\"1\" StartRow=\"5\"/>"},
        {"rows.xml", "<MSExcelVantrelSpecification DateTimeCol=\"1\" UnitTypeRow=\"1\" UnitRow=\"1\" "
                     "ValueTypeRow=\"1\" ItemDescriptionRow=\"3\" StartRow=\"3\"/>"},
        // The title option frees the title row for the bridge, not for the dialogs.
        {"title.xml", "<MSExcelVantrelSpecification GlobalDate=\"2024-01-02\" GlobalTime=\"03:04:05\" "
                      "DateTimeCol=\"1\" UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"3\" "
                      "StartRow=\"3\" UseItemTitleOption=\"1\"/>"}};
    for (const auto &[name, text] : files) testing_host::WriteFile(folder.File(name), text);
    const std::string m115 = vantrel::LoadMessage(115);

    CGUIOpenDlg open;
    CommitAll(open);
    const std::string openBefore = Keys(open);
    testing_host::MessageBoxes boxes;
    for (const char *name : {"text.xml", "root.xml", "title.xml"}) {
        LoadThroughChooser(open, folder.File(name));
        EXPECT_EQ(Edit(open, "templatePath")->text(), "") << name;
    }
    // The save template's rows, then the verdict.
    EXPECT_EQ(boxes.texts, (Texts{"Can not Open the xml file!", "The xml File is not valid!", m115,
                                  "The data in the xml File is not valid!"}));
    EXPECT_EQ(boxes.captions[0], "Excel Vantrel");
    CommitAll(open);
    Click(open, "noTemplate");
    EXPECT_EQ(Keys(open), openBefore);

    CGUISaveDlg save;
    const std::string saveBefore = Keys(save);
    boxes.texts.clear();
    for (const char *name : {"text.xml", "root.xml", "open.xml", "rows.xml"})
        EXPECT_FALSE(save.LoadTemplateFile(folder.File(name))) << name;
    EXPECT_EQ(boxes.texts, (Texts{"Can not Open the xml file.", "The xml File is not valid.",
                                  "The data in the xml File is not valid!", m115}));  // and no verdict after the rows
    EXPECT_EQ(Keys(save), saveBefore);
}

const std::string kHead =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<MSExcelVantrelSpecification xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n";

// New dialogs, the open one with the global date 2024-03-01 and time 12:00:00.
const std::string kOpenDefaults =
    kHead +
    "ExcelSheet=\"1\" DataTimeType=\"0\" DateTimeCol=\"1\" UseDTFormat=\"false\" "
    "DateTimeFormat=\"YYYY/MM/DD HH:mm:ss\" GlobalDate=\"2024-03-01\" TimeCol=\"1\" UseTFormat=\"false\" "
    "GlobalTime=\"12:00:00\" TimeFormat=\"HH:mm:ss\" DateCol=\"1\" UseDFormat=\"false\" DateFormat=\"YYYY/MM/DD\" "
    "UseUnitTypeRow=\"false\" GlobalUnitType=\"Undefined\" UnitTypeRow=\"1\" UseUnitRow=\"false\" "
    "GlobalUnit=\"undefined\" UnitRow=\"1\" UseValueTypeRow=\"false\" "
    "GlobalValueType=\"Instantaneous\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" "
    "UseDelValNotEmpty=\"false\" UseDeleteValueRow=\"false\" DeleteValue=\"-1e-30\" DeleteValueRow=\"2\" />";
const std::string kSaveDefaults =
    kHead +
    "DateTimeCol=\"1\" UseDTFormat=\"false\" DateTimeFormat=\"YYYY/MM/DD HH:mm:ss\" UnitTypeRow=\"1\" UnitRow=\"1\" "
    "ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" UseDelValNotEmpty=\"false\" DeleteValueRow=\"2\" />";

// Commits the dialog as OK would, with the global date and time fixed.
void CommitWithFixedDateAndTime(CGUIOpenDlg &dialog)
{
    dialog.TimePage().SetGlobalDate({45352.0, kDateValid});
    dialog.TimePage().SetGlobalTime({0.5, kDateValid});
    CommitAll(dialog);
}

TEST(TemplateWriter, QuotedFormatGoesBetweenSingleQuotes)
{
    CGUIOpenDlg open;
    Click(open, "dateTimeFormatBox");
    Find<QComboBox>(open, "dateTimeFormat")->setEditText("\"YYYY/MM/DD\"\"");
    CommitAll(open);
    const std::string text = TemplateText(open);
    EXPECT_NE(text.find(" UseDTFormat=\"true\" DateTimeFormat=\"'YYYY/MM/DD'\" "), std::string::npos) << text;
    EXPECT_EQ(vantrel::dialogs::OpenTemplateFormat("hh:mm\""), "hh:mm\"");  // an unpaired quote stays
}

TEST(TemplateWriter, EscapesWhatAnAttributeCantHold)
{
    const std::string fffd = "\xEF\xBF\xBD";
    const std::pair<std::string, std::string> cases[] = {
        {"a&b<c>d\"e'f", "a&amp;b&lt;c&gt;d&quot;e'f"},
        {"x\ty\nz\r", "x&#9;y&#10;z&#13;"},
        {"D\xC3\xA9" "bit \xE2\x82\xAC \xF0\x9F\x8C\x8A", "D\xC3\xA9" "bit \xE2\x82\xAC \xF0\x9F\x8C\x8A"},  // UTF-8
        {"a\xFF" "b", "a" + fffd + "b"},
        {"\xC0\xAF", fffd + fffd},            // an overlong slash
        {"\xED\xA0\x80", fffd + fffd + fffd},  // a surrogate
        {"\xE2\x82", fffd + fffd},            // cut short
        {std::string("a\x01" "b\0c", 5), "a" + fffd + "b" + fffd + "c"},
    };
    using vantrel::dialogs::EscapeAttributeValue;
    for (const auto &[given, escaped] : cases) EXPECT_EQ(EscapeAttributeValue(given), escaped) << given;
}

TEST(TemplateWriter, PathsOfTheTwoDialogs)
{
    testing_host::TempDir folder;
    testing_host::MessageBoxes boxes;
    CGUIOpenDlg open;
    CGUISaveDlg save;
    // The open dialog adds ".xml" to a path without extension; the save
    // dialog writes the very path; a path with an extension stays in both.
    for (const char *given : {"open", "open.tpl"}) EXPECT_TRUE(open.WriteTemplateFile(folder.File(given)));
    for (const char *given : {"save", "save.tpl"}) EXPECT_TRUE(save.WriteTemplateFile(folder.File(given)));
    std::vector<std::string> written;
    for (const auto &entry : std::filesystem::directory_iterator(folder.Path()))
        written.push_back(entry.path().filename().string());
    std::sort(written.begin(), written.end());
    EXPECT_EQ(written, (std::vector<std::string>{"open.tpl", "open.xml", "save", "save.tpl"}));
    // A file is replaced whole.
    testing_host::WriteFile(folder.File("save.tpl"), std::string(4000, 'x'));
    EXPECT_TRUE(save.WriteTemplateFile(folder.File("save.tpl")));
    EXPECT_EQ(testing_host::ReadFile(folder.File("save.tpl")), kSaveDefaults);
    // A file that can't be written is false and nothing is shown.
    EXPECT_FALSE(open.WriteTemplateFile(folder.File("no/such/folder/open")));
    EXPECT_FALSE(save.WriteTemplateFile(folder.Path().string()));
    EXPECT_TRUE(boxes.texts.empty());
}

TEST(TemplateWriter, OkOfTheOpenDialogWritesInMode2)
{
    testing_host::TempDir folder;
    testing_host::MessageBoxes boxes;
    CGUIOpenDlg open;
    CommitWithFixedDateAndTime(open);
    Click(open, "saveTemplate");
    Type(open, {{"filePath", Sample()}, {"templatePath", folder.File("import")}});
    open.OnOK();  // written before the inspection, which has no host here
    EXPECT_EQ(testing_host::ReadFile(folder.File("import.xml")), kOpenDefaults);
    EXPECT_TRUE(boxes.texts.empty());
}

TEST(TemplatesSurvive, DecimalCommaLocaleKeepsTheDecimalPointAndEveryDigit)
{
    GermanLocale german;
    testing_host::TempDir folder;
    const std::string path = folder.File("comma.xml");
    const struct {
        std::string typed;
        double value;
    } cases[] = {{"-9999.5", -9999.5}, {"-1e-30", -1e-30}, {"0.30000000000000004", 0.30000000000000004}};
    for (const auto &c : cases) {
        CGUIOpenDlg source;
        Click(source, "deleteValueBox");
        Type(source, "deleteValue", c.typed);
        CommitAll(source);
        EXPECT_NE(Keys(source).find(";DeleteValue=" + c.typed + ";"), std::string::npos) << Keys(source);
        ASSERT_TRUE(source.WriteTemplateFile(path));
        const std::string text = testing_host::ReadFile(path);
        EXPECT_NE(text.find(" DeleteValue=\"" + c.typed + "\" "), std::string::npos) << text;
        CGUIOpenDlg loaded;
        LoadThroughChooser(loaded, path);
        CommitAll(loaded);
        EXPECT_EQ(loaded.DataPage().Fields().m_deleteValue, c.value) << c.typed;
    }
    // The six decimals that older versions wrote load as before.
    std::string older = kOpenDefaults;
    older.replace(older.find("\"-1e-30\""), 8, "\"-9999.000000\"");
    testing_host::WriteFile(path, older);
    CGUIOpenDlg loaded;
    LoadThroughChooser(loaded, path);
    CommitAll(loaded);
    EXPECT_EQ(loaded.DataPage().Fields().m_deleteValue, -9999.0);
}

}  // namespace
