// SPDX-License-Identifier: MIT
// What survives writing a template in one place and reading it in another:
// the two dialogs (loaded through their choosers, as a user does), and the
// bridge's ReadData, InspectWorkbook and WriteData.
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include <QCheckBox>
#include <QComboBox>
#include <QDateEdit>
#include <QRadioButton>
#include <QTimeEdit>

#include "dialog_driver.h"
#include "dialogs/open_dialog.h"
#include "dialogs/save_dialog.h"
#include "module/string_table.h"
#include "save_host.h"
#include "specification/specification.h"
#include "support/temp_dir.h"
#include "workbook/excel_obj.h"

using namespace dialog_testing;

namespace {

template <typename Widget>
Widget *Find(QWidget &parent, const char *name)
{
    auto *widget = parent.findChild<Widget *>(name);
    EXPECT_NE(widget, nullptr) << name;
    return widget;
}

void Type(QWidget &dialog, const char *field, const std::string &text)
{
    Find<QLineEdit>(dialog, field)->setText(QString::fromStdString(text));
}

void Click(QWidget &dialog, const char *button) { Find<QAbstractButton>(dialog, button)->click(); }

void WriteFile(const std::string &path, const std::string &text) { std::ofstream(path, std::ios::binary) << text; }

std::string Slurp(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

std::string Keys(const CDialogKeySource &dialog)
{
    CSpecification specification;
    std::string spec;
    DialogToString(specification, dialog, spec);
    return spec;
}

// Mode 1, the chooser, the path: a load as a user makes it.
template <typename Dialog>
void LoadThroughChooser(Dialog &dialog, const std::string &path)
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

// The layout of the sample workbook: titles in row 1, item type, unit and
// value type in rows 2 to 4, data from row 5.
void DescribeSample(CGUIOpenDlg &dialog, const std::string &titleRow = "1")
{
    for (const char *radio : {"itemTypeInRow", "unitInRow", "valueTypeInRow"}) Click(dialog, radio);
    Type(dialog, "itemTypeRowEdit", "2");
    Type(dialog, "unitRowEdit", "3");
    Type(dialog, "valueTypeRowEdit", "4");
    Type(dialog, "itemDescriptionRowEdit", titleRow);
    Type(dialog, "startRowEdit", "5");
    CommitAll(dialog);
}

TEST(TemplatesSurvive, OpenDialogToOpenDialog)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("layout.xml");
    CGUIOpenDlg source;
    Type(source, "excelSheets", "2,3");
    Type(source, "dateTimeColEdit", "4");
    Click(source, "dateTimeFormatBox");
    Find<QComboBox>(source, "dateTimeFormat")->setEditText("\"YYYY-MM-DD hh:mm\"");
    Click(source, "timeRadio");
    Type(source, "timeColEdit", "5");
    Click(source, "timeFormatBox");
    // Text beyond plain ASCII, and characters that XML escapes.
    Find<QComboBox>(source, "timeFormat")->setEditText(QString::fromUtf8("HH-mm \xC2\xAB & <\"x\"> \xC2\xBB"));
    Type(source, "dateColEdit", "6");
    Find<QComboBox>(source, "dateFormat")->setEditText("DD.MM.YYYY");
    Find<QDateEdit>(source, "globalDate")->setDate(QDate(2023, 7, 14));
    Find<QTimeEdit>(source, "globalTime")->setTime(QTime(6, 30, 15));
    ASSERT_TRUE(source.DataPage().SelectItemType("Water Level"));
    ASSERT_TRUE(source.DataPage().SelectUnit("feet"));
    ASSERT_TRUE(source.DataPage().SelectValueType("Accumulated"));
    Click(source, "itemTypeInRow");
    Click(source, "valueTypeInRow");
    Type(source, "itemTypeRowEdit", "4");
    Type(source, "unitRowEdit", "5");
    Type(source, "valueTypeRowEdit", "4");
    Type(source, "itemDescriptionRowEdit", "6");
    Type(source, "startRowEdit", "8");
    Click(source, "deleteValueBox");
    Type(source, "deleteValue", "-9999.123456789");
    Type(source, "deleteValueRowEdit", "7");
    Click(source, "saveTemplate");
    Type(source, "templatePath", path);
    CommitAll(source);
    ASSERT_TRUE(source.WriteTemplateFile(path));

    CapturedMessages boxes;
    CGUIOpenDlg loaded;
    LoadThroughChooser(loaded, path);
    EXPECT_TRUE(boxes.shown.empty());
    EXPECT_EQ(loaded.Fields().m_templatePath, path);
    CommitAll(loaded);  // what the controls show
    EXPECT_EQ(Keys(loaded), Keys(source));

    const auto &t = loaded.TimePage().Fields(), &s = source.TimePage().Fields();
    EXPECT_EQ(t.m_timeMode, 1);
    EXPECT_EQ(t.m_dateTimeCol, s.m_dateTimeCol);
    EXPECT_EQ(t.m_useDTFormat, 1);
    EXPECT_EQ(t.m_dateTimeFormat, "\"YYYY-MM-DD hh:mm\"");
    EXPECT_EQ(t.m_timeCol, 5);
    EXPECT_EQ(t.m_useTFormat, 1);
    EXPECT_EQ(t.m_timeFormat, s.m_timeFormat);
    EXPECT_EQ(t.m_dateCol, 6);
    EXPECT_EQ(t.m_useDFormat, 0);
    EXPECT_EQ(t.m_dateFormat, "DD.MM.YYYY");
    EXPECT_EQ(Find<QDateEdit>(loaded, "globalDate")->date(), QDate(2023, 7, 14));
    EXPECT_EQ(Find<QTimeEdit>(loaded, "globalTime")->time(), QTime(6, 30, 15));
    EXPECT_TRUE(Find<QWidget>(loaded, "timeColEdit")->isEnabled());
    EXPECT_FALSE(Find<QWidget>(loaded, "dateTimeColEdit")->isEnabled());

    const auto &d = loaded.DataPage().Fields(), &e = source.DataPage().Fields();
    EXPECT_EQ(d.m_itemType, "Water Level");
    EXPECT_EQ(d.m_unit, "feet");
    EXPECT_EQ(d.m_valueType, "Accumulated");
    EXPECT_EQ(std::make_tuple(d.m_itemTypeInRow, d.m_unitInRow, d.m_valueTypeInRow, d.m_deleteValueInRow),
              std::make_tuple(1, 0, 1, 0));
    EXPECT_EQ(std::make_tuple(d.m_itemTypeRow, d.m_unitRow, d.m_valueTypeRow, d.m_itemDescriptionRow, d.m_startRow,
                              d.m_deleteValueRow, d.m_useDelValNotEmpty),
              std::make_tuple(e.m_itemTypeRow, e.m_unitRow, e.m_valueTypeRow, e.m_itemDescriptionRow, e.m_startRow,
                              e.m_deleteValueRow, 1));
    // The delete value to six decimals, in single precision.
    EXPECT_EQ(d.m_deleteValue, double(-9999.123457f));
    EXPECT_NE(d.m_deleteValue, e.m_deleteValue);
    EXPECT_EQ(Find<QLineEdit>(loaded, "excelSheets")->text(), "2,3");
}

TEST(TemplatesSurvive, OpenDialogToTheBridgesRead)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("sample.xml");
    CGUIOpenDlg dialog;
    DescribeSample(dialog);
    ASSERT_TRUE(dialog.WriteTemplateFile(path));

    CapturedMessages boxes;
    auto series = testing_host::MakeSeries(Sample(), "TemplateFilePath=" + path + ";", false);
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    SHORT fits = 0;
    EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, SHORT(VARIANT_TRUE));
    EXPECT_EQ(testing_host::Specification(series.Get()).rfind("DateTimeCol=1;StartRow=5;UnitTypeRow=2;UnitRow=3;", 0),
              0u);
    auto reading = testing_host::MakeSeries(Sample(), "TemplateFilePath=" + path + ";", false);
    bridge->SetHostSeries(reading.Get());
    EXPECT_HR(S_OK, bridge->ReadData());
    EXPECT_EQ(testing_host::ItemCount(reading.Get()), 3);
    for (const Message &box : boxes.shown) ADD_FAILURE() << box.text;

    // Rows out of order: the bridge refuses the template.
    CGUIOpenDlg wrong;
    DescribeSample(wrong, "5");
    const std::string wrongPath = folder.File("wrong.xml");
    ASSERT_TRUE(wrong.WriteTemplateFile(wrongPath));
    auto refused = testing_host::MakeSeries(Sample(), "TemplateFilePath=" + wrongPath + ";", false);
    bridge->SetHostSeries(refused.Get());
    EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
    ASSERT_FALSE(boxes.shown.empty());
    EXPECT_EQ(boxes.shown[0].text, "The data in the xml File is not valid.");
}

TEST(TemplatesSurvive, OpenDialogToSaveDialogAndNotToWriteData)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("open.xml");
    CGUIOpenDlg source;
    Type(source, "dateTimeColEdit", "2");
    Click(source, "dateTimeFormatBox");
    Find<QComboBox>(source, "dateTimeFormat")->setEditText("YYYY|MM|DD|HH|mm|ss");
    Click(source, "itemTypeInRow");
    Click(source, "valueTypeInRow");
    Type(source, "itemTypeRowEdit", "1");
    Type(source, "unitRowEdit", "7");  // the unit comes from the list: no row to take over
    Type(source, "valueTypeRowEdit", "2");
    Type(source, "itemDescriptionRowEdit", "3");
    Type(source, "startRowEdit", "4");
    Click(source, "deleteValueBox");  // a delete value, not a row
    Type(source, "deleteValueRowEdit", "1");
    CommitAll(source);
    ASSERT_TRUE(source.WriteTemplateFile(path));

    auto series = save_testing::ThreeGauges();
    CapturedMessages boxes;
    CGUISaveDlg save;
    save.SetHost(series.Get(), nullptr);
    LoadThroughChooser(save, path);
    EXPECT_TRUE(boxes.shown.empty());
    const auto &f = save.Fields();
    EXPECT_EQ(f.m_templatePath, path);
    EXPECT_EQ(std::make_tuple(f.m_dateTimeColumn, f.m_multiColumns, f.m_format),
              std::make_tuple(2, 1, std::string("YYYY|MM|DD|HH|mm|ss")));
    EXPECT_EQ(std::make_tuple(f.m_unitTypeRow, f.m_saveUnitRow, f.m_saveValueTypeRow, f.m_saveItemDescriptionRow,
                              f.m_dataStartRow, f.m_useDeleteRow, f.m_saveDeleteValueRow),
              std::make_tuple(1, 1, 2, 3, 4, 1, 2));
    EXPECT_TRUE(Find<QWidget>(save, "deleteValueRowEdit")->isEnabled());
    EXPECT_EQ(Find<QLineEdit>(save, "itemDescriptionRowEdit")->text(), "3");
    EXPECT_EQ(save.PreviewListControl()->columnCount(), 1 + 6 + 3);  // the preview followed the load

    // The export's loader knows only the save template.
    CapturedMessages captured;
    auto exported = testing_host::MakeSeries(folder.File("book.xlsx"), "TemplateFilePath=" + path + ";", false);
    auto bridge = MakeBridge();
    bridge->SetHostSeries(exported.Get());
    bridge->WriteData();
    ASSERT_FALSE(captured.shown.empty());
    EXPECT_EQ(captured.shown[0].text, "The xml File is not valid.");
    EXPECT_EQ(testing_host::Specification(exported.Get()), "TemplateFilePath=" + path + ";");
}

// A save dialog whose fields differ from the defaults everywhere.
void DescribeExport(CGUISaveDlg &dialog, const char *format)
{
    Type(dialog, "dateTimeColumnEdit", "2");
    Click(dialog, "multiColumns");
    Find<QComboBox>(dialog, "format")->setEditText(QString::fromUtf8(format));
    Type(dialog, "unitTypeRowEdit", "1");
    Type(dialog, "unitRowEdit", "2");
    Type(dialog, "valueTypeRowEdit", "3");
    Type(dialog, "itemDescriptionRowEdit", "4");
    Type(dialog, "dataStartRowEdit", "6");
    Click(dialog, "useDeleteRow");
    Type(dialog, "deleteValueRowEdit", "5");
    dialog.Commit();
}

TEST(TemplatesSurvive, SaveDialogToSaveDialogAndWriteData)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("export.tpl");
    CGUISaveDlg source;
    // A double quote, escaped characters and text beyond ASCII come back too.
    DescribeExport(source, "YYYY-MM-DD \"\xC3\xA9t\xC3\xA9\" & <HH>");
    ASSERT_TRUE(source.WriteTemplateFile(path));

    CapturedMessages boxes;
    CGUISaveDlg loaded;
    LoadThroughChooser(loaded, path);
    EXPECT_TRUE(boxes.shown.empty());
    loaded.Commit();
    EXPECT_EQ(loaded.Fields().m_format, source.Fields().m_format);
    Click(source, "useTemplate");
    Type(source, "templatePath", path);
    source.Commit();
    EXPECT_EQ(Keys(loaded), Keys(source));
    EXPECT_EQ(loaded.Fields().m_useDeleteRow, 1);
    EXPECT_TRUE(Find<QWidget>(loaded, "format")->isEnabled());
    EXPECT_TRUE(Find<QWidget>(loaded, "deleteValueRowEdit")->isEnabled());

    // The export takes a save template whose rows are in order.
    CGUISaveDlg plain;
    DescribeExport(plain, "YYYY-MM-DD HH:mm:ss");
    const std::string plainPath = folder.File("plain.xml");
    ASSERT_TRUE(plain.WriteTemplateFile(plainPath));
    CapturedMessages captured;
    const std::string book = folder.File("book.xlsx");
    auto series = save_testing::ThreeGauges();
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    connection->SetSpecification(automation::Bstr("TemplateFilePath=" + plainPath + ";").Get());
    connection->SetFilePath(automation::Bstr(book).Get());
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    EXPECT_HR(S_OK, bridge->WriteData());
    EXPECT_TRUE(captured.shown.empty());
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=2;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=6;UnitTypeRow=1;UnitRow=2;ValueTypeRow=3;"
              "ItemDescriptionRow=4;DelValRow=5;");
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error) && excel.OpenWorkbook(book, error) && excel.SelectSheet(1, error)) << error;
    std::vector<std::string> texts;
    excel.ReadRowTexts(4, 2, 2, texts);
    excel.ReadRowTexts(6, 2, 2, texts);
    EXPECT_EQ(texts, (std::vector<std::string>{"Date/time", "Ardmore level", "2024-03-01 00:00:00", "1.25"}));
    excel.CloseWorkbook(0);
    excel.QuitExcel();

    // Rows out of order: the export's loader says why.
    Type(plain, "itemDescriptionRowEdit", "6");
    plain.Commit();
    ASSERT_TRUE(plain.WriteTemplateFile(plainPath));
    connection->SetSpecification(automation::Bstr("TemplateFilePath=" + plainPath + ";").Get());
    bridge->WriteData();
    ASSERT_FALSE(captured.shown.empty());
    EXPECT_EQ(captured.shown[0].text, vantrel::LoadMessage(115));
}

TEST(TemplatesSurvive, SaveDialogToOpenDialogAndNotToTheBridgesRead)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("export.xml");
    CGUISaveDlg source;
    DescribeExport(source, "YYYY-MM-DD HH:mm:ss");
    ASSERT_TRUE(source.WriteTemplateFile(path));

    CapturedMessages boxes;
    CGUIOpenDlg loaded;
    Type(loaded, "excelSheets", "4");
    LoadThroughChooser(loaded, path);
    EXPECT_TRUE(boxes.shown.empty());
    CommitAll(loaded);
    EXPECT_EQ(loaded.Fields().m_excelSheets, "1");
    const auto &t = loaded.TimePage().Fields();
    EXPECT_EQ(std::make_tuple(t.m_timeMode, t.m_dateTimeCol, t.m_useDTFormat, t.m_dateTimeFormat),
              std::make_tuple(0, 2, 1, std::string("YYYY-MM-DD HH:mm:ss")));
    EXPECT_EQ(std::make_tuple(t.m_dateCol, t.m_timeCol, t.m_dateFormat, t.m_timeFormat, t.m_useDFormat, t.m_useTFormat),
              std::make_tuple(1, 1, std::string("YYYY/MM/DD"), std::string("HH:mm:ss"), 0, 0));
    EXPECT_EQ(Find<QDateEdit>(loaded, "globalDate")->date(), QDate(1899, 12, 30));
    EXPECT_EQ(Find<QTimeEdit>(loaded, "globalTime")->time(), QTime(0, 0));
    EXPECT_TRUE(Find<QRadioButton>(loaded, "dateTimeRadio")->isChecked());
    const auto &d = loaded.DataPage().Fields();
    EXPECT_EQ(std::make_tuple(d.m_itemTypeInRow, d.m_unitInRow, d.m_valueTypeInRow), std::make_tuple(1, 1, 1));
    EXPECT_EQ(std::make_tuple(d.m_itemTypeRow, d.m_unitRow, d.m_valueTypeRow, d.m_itemDescriptionRow, d.m_startRow),
              std::make_tuple(1, 2, 3, 4, 6));
    EXPECT_EQ(std::make_tuple(d.m_useDelValNotEmpty, d.m_deleteValueInRow, d.m_deleteValueRow),
              std::make_tuple(1, 1, 5));
    EXPECT_TRUE(Find<QWidget>(loaded, "deleteValueRowEdit")->isEnabled());

    // The bridge's read wants an open template: no global date and time here.
    CapturedMessages captured;
    auto series = testing_host::MakeSeries(Sample(), "TemplateFilePath=" + path + ";", false);
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    SHORT fits = 0;
    EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
    ASSERT_FALSE(captured.shown.empty());
    EXPECT_EQ(captured.shown[0].text, "The data in the xml File is not valid.");
    captured.shown.clear();
    auto reading = testing_host::MakeSeries(Sample(), "TemplateFilePath=" + path + ";", false);
    bridge->SetHostSeries(reading.Get());
    EXPECT_HR(E_FAIL, bridge->ReadData());
    ASSERT_FALSE(captured.shown.empty());
    EXPECT_EQ(captured.shown[0].text, "The data in the xml File is not valid.");
}

TEST(TemplatesSurvive, AnyTemplateThroughTheOpenDialogLosesOptionsSelectionAndLists)
{
    testing_host::TempDir folder;
    const std::string path = folder.File("foreign.xml");
    WriteFile(path,
              "<?xml version=\"1.0\"?>\n"
              "<MSExcelVantrelSpecification GlobalDate=\"2024-01-02\" GlobalTime=\"03:04:05\" UseUnitTypeOption=\"2\" "
              "UseItemTitleOption=\"0\" SelItems=\"1,3\" ItemDescriptionRow=\"2\" StartRow=\"4\">\n"
              "  <MSExcelVantrelSpecificationExtension><ItemTitles><ItemTitle>Level</ItemTitle></ItemTitles>"
              "</MSExcelVantrelSpecificationExtension>\n"
              "</MSExcelVantrelSpecification>\n");
    CapturedMessages boxes;
    CGUIOpenDlg dialog;
    ASSERT_TRUE(dialog.LoadTemplateFile(path));
    EXPECT_TRUE(boxes.shown.empty());
    CommitAll(dialog);
    const std::string again = folder.File("again.xml");
    ASSERT_TRUE(dialog.WriteTemplateFile(again));
    const std::string text = Slurp(again);
    for (const char *gone : {"Option", "SelItems", "Extension", "ItemTitle", "Level"})
        EXPECT_EQ(text.find(gone), std::string::npos) << gone;
    EXPECT_NE(text.find(" GlobalDate=\"2024-01-02\" "), std::string::npos) << text;
    EXPECT_NE(text.find(" GlobalTime=\"03:04:05\" "), std::string::npos) << text;
    EXPECT_NE(text.find(" ItemDescriptionRow=\"2\" StartRow=\"4\" "), std::string::npos) << text;
}

TEST(TemplateLoad, OpenDialogTellsWhyAndChangesNothing)
{
    testing_host::TempDir folder;
    WriteFile(folder.File("text.xml"), "no xml at all");
    WriteFile(folder.File("root.xml"), "<Layout StartRow=\"3\"/>");
    // The title option frees the title row for the bridge, not for the dialog.
    WriteFile(folder.File("title.xml"),
              "<MSExcelVantrelSpecification GlobalDate=\"2024-01-02\" GlobalTime=\"03:04:05\" DateTimeCol=\"1\" "
              "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"3\" StartRow=\"3\" "
              "UseItemTitleOption=\"1\"/>");
    OpenSpecification record;
    std::string error;
    EXPECT_TRUE(CSpecification().LoadOpenTemplate(folder.File("title.xml"), record, error)) << error;

    CGUIOpenDlg dialog;
    CommitAll(dialog);
    const std::string before = Keys(dialog);
    CapturedMessages boxes;
    for (const char *name : {"text.xml", "root.xml", "title.xml"}) {
        LoadThroughChooser(dialog, folder.File(name));
        EXPECT_EQ(Find<QLineEdit>(dialog, "templatePath")->text(), "") << name;
    }
    ASSERT_EQ(boxes.shown.size(), 4u);
    EXPECT_EQ(boxes.shown[0].text, "Can not Open the xml file!");
    EXPECT_EQ(boxes.shown[0].caption, "Excel Vantrel");
    EXPECT_EQ(boxes.shown[1].text, "The xml File is not valid!");
    EXPECT_EQ(boxes.shown[2].text, vantrel::LoadMessage(115));  // the save template's rows, then the verdict
    EXPECT_EQ(boxes.shown[3].text, "The data in the xml File is not valid!");
    CommitAll(dialog);
    Click(dialog, "noTemplate");
    EXPECT_EQ(Keys(dialog), before);
}

TEST(TemplateLoad, SaveDialogTellsWhyAndChangesNothing)
{
    testing_host::TempDir folder;
    WriteFile(folder.File("text.xml"), "<unclosed");
    WriteFile(folder.File("root.xml"), "<Layout StartRow=\"3\"/>");
    WriteFile(folder.File("open.xml"), "<MSExcelVantrelSpecification ExcelSheet=\"1\" StartRow=\"5\"/>");
    WriteFile(folder.File("rows.xml"),
              "<MSExcelVantrelSpecification DateTimeCol=\"1\" UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" "
              "ItemDescriptionRow=\"3\" StartRow=\"3\"/>");
    CGUISaveDlg dialog;
    const std::string before = Keys(dialog);
    CapturedMessages boxes;
    for (const char *name : {"text.xml", "root.xml", "open.xml", "rows.xml"})
        EXPECT_FALSE(dialog.LoadTemplateFile(folder.File(name))) << name;
    ASSERT_EQ(boxes.shown.size(), 4u);
    EXPECT_EQ(boxes.shown[0].text, "Can not Open the xml file.");
    EXPECT_EQ(boxes.shown[1].text, "The xml File is not valid.");
    EXPECT_EQ(boxes.shown[2].text, "The data in the xml File is not valid!");
    EXPECT_EQ(boxes.shown[3].text, vantrel::LoadMessage(115));  // and no verdict behind it
    EXPECT_EQ(Keys(dialog), before);
}

}  // namespace
