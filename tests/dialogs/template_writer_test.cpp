// SPDX-License-Identifier: MIT
// The template files that the dialogs write: their exact bytes, the escaping
// of what plain ASCII can't carry, and the paths they are written to.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include <QCheckBox>
#include <QComboBox>

#include "dialog_driver.h"
#include "dialogs/open_dialog.h"
#include "dialogs/save_dialog.h"
#include "dialogs/template_text.h"
#include "support/temp_dir.h"

using namespace dialog_testing;
using vantrel::dialogs::EscapeAttributeValue;

namespace {

std::string Slurp(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

constexpr const char kHead[] =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<MSExcelVantrelSpecification xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n";

// An open dialog as OK leaves it, with a fixed global date and time.
void PrepareOpenDialog(CGUIOpenDlg &dialog)
{
    dialog.TimePage().SetGlobalDate({45352.0, kDateValid});  // 2024-03-01
    dialog.TimePage().SetGlobalTime({0.5, kDateValid});      // 12:00:00
    dialog.TimePage().Commit();
    dialog.DataPage().Commit();
    dialog.Commit();
}

TEST(TemplateWriter, ExactBytesOfBothKinds)
{
    CGUIOpenDlg open;
    PrepareOpenDialog(open);
    std::string text;
    ASSERT_TRUE(open.BuildTemplateText(text));
    EXPECT_EQ(text, std::string(kHead) +
                        "ExcelSheet=\"1\" DataTimeType=\"0\" DateTimeCol=\"1\" UseDTFormat=\"false\" "
                        "DateTimeFormat=\"YYYY/MM/DD HH:mm:ss\" GlobalDate=\"2024-03-01\" TimeCol=\"1\" "
                        "UseTFormat=\"false\" GlobalTime=\"12:00:00\" TimeFormat=\"HH:mm:ss\" DateCol=\"1\" "
                        "UseDFormat=\"false\" DateFormat=\"YYYY/MM/DD\" UseUnitTypeRow=\"false\" "
                        "GlobalUnitType=\"Undefined\" UnitTypeRow=\"1\" UseUnitRow=\"false\" GlobalUnit=\"undefined\" "
                        "UnitRow=\"1\" UseValueTypeRow=\"false\" GlobalValueType=\"Instantaneous\" ValueTypeRow=\"1\" "
                        "ItemDescriptionRow=\"2\" StartRow=\"3\" UseDelValNotEmpty=\"false\" "
                        "UseDeleteValueRow=\"false\" DeleteValue=\"-0.000000\" DeleteValueRow=\"2\" />");

    // A quoted format goes between single quotes; the flags say "true".
    open.findChild<QCheckBox *>("dateTimeFormatBox")->click();
    open.findChild<QComboBox *>("dateTimeFormat")->setEditText("\"YYYY/MM/DD\"\"");
    open.findChild<QCheckBox *>("deleteValueBox")->click();
    open.findChild<QLineEdit *>("deleteValue")->setText("-99.5");
    open.TimePage().Commit();
    open.DataPage().Commit();
    open.BuildTemplateText(text);
    EXPECT_NE(text.find(" UseDTFormat=\"true\" DateTimeFormat=\"'YYYY/MM/DD'\" "), std::string::npos) << text;
    EXPECT_NE(text.find(" UseDelValNotEmpty=\"true\" "), std::string::npos);
    EXPECT_NE(text.find(" DeleteValue=\"-99.500000\" "), std::string::npos);

    CGUISaveDlg save;
    ASSERT_TRUE(save.BuildTemplateText(text));
    EXPECT_EQ(text, std::string(kHead) +
                        "DateTimeCol=\"1\" UseDTFormat=\"false\" DateTimeFormat=\"YYYY/MM/DD HH:mm:ss\" "
                        "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" "
                        "UseDelValNotEmpty=\"false\" DeleteValueRow=\"2\" />");
}

TEST(TemplateWriter, EscapesWhatAnAttributeCantHold)
{
    EXPECT_EQ(EscapeAttributeValue("YYYY/MM/DD HH:mm:ss"), "YYYY/MM/DD HH:mm:ss");
    EXPECT_EQ(EscapeAttributeValue("a&b<c>d\"e'f"), "a&amp;b&lt;c&gt;d&quot;e'f");
    EXPECT_EQ(EscapeAttributeValue("x\ty\nz\r"), "x&#9;y&#10;z&#13;");
    // UTF-8 stands as it is; what isn't UTF-8 or XML becomes U+FFFD.
    EXPECT_EQ(EscapeAttributeValue("D\xC3\xA9" "bit \xE2\x82\xAC \xF0\x9F\x8C\x8A"), "D\xC3\xA9" "bit \xE2\x82\xAC \xF0\x9F\x8C\x8A");
    EXPECT_EQ(EscapeAttributeValue("a\xFF" "b"), "a\xEF\xBF\xBD" "b");
    EXPECT_EQ(EscapeAttributeValue("\xC0\xAF"), "\xEF\xBF\xBD\xEF\xBF\xBD");            // an overlong slash
    EXPECT_EQ(EscapeAttributeValue("\xED\xA0\x80"), "\xEF\xBF\xBD\xEF\xBF\xBD\xEF\xBF\xBD");  // a surrogate
    EXPECT_EQ(EscapeAttributeValue("\xE2\x82"), "\xEF\xBF\xBD\xEF\xBF\xBD");            // cut short
    EXPECT_EQ(EscapeAttributeValue(std::string("a\x01" "b\0c", 5)), "a\xEF\xBF\xBD" "b\xEF\xBF\xBD" "c");
    EXPECT_EQ(vantrel::dialogs::OpenTemplateFormat("\"\"hh:mm\""), "'hh:mm'");
    EXPECT_EQ(vantrel::dialogs::OpenTemplateFormat("hh:mm\""), "hh:mm\"");
}

TEST(TemplateWriter, PathsOfTheTwoDialogs)
{
    testing_host::TempDir folder;
    CapturedMessages boxes;
    CGUIOpenDlg open;
    CGUISaveDlg save;
    // The open dialog gives a path without extension ".xml"; the save dialog
    // writes the very path; a path with an extension stays in both.
    EXPECT_TRUE(open.WriteTemplateFile(folder.File("open")));
    EXPECT_TRUE(std::filesystem::exists(folder.File("open.xml")));
    EXPECT_FALSE(std::filesystem::exists(folder.File("open")));
    EXPECT_TRUE(save.WriteTemplateFile(folder.File("save")));
    EXPECT_TRUE(std::filesystem::exists(folder.File("save")));
    EXPECT_FALSE(std::filesystem::exists(folder.File("save.xml")));
    EXPECT_TRUE(open.WriteTemplateFile(folder.File("open.tpl")));
    EXPECT_TRUE(save.WriteTemplateFile(folder.File("save.tpl")));
    EXPECT_TRUE(std::filesystem::exists(folder.File("open.tpl")));
    EXPECT_TRUE(std::filesystem::exists(folder.File("save.tpl")));

    // A file is replaced whole.
    { std::ofstream(folder.File("save.tpl")) << std::string(4000, 'x'); }
    EXPECT_TRUE(save.WriteTemplateFile(folder.File("save.tpl")));
    std::string text;
    save.BuildTemplateText(text);
    EXPECT_EQ(Slurp(folder.File("save.tpl")), text);

    // A file that can't be written is false and nothing is shown.
    EXPECT_FALSE(open.WriteTemplateFile(folder.File("no/such/folder/open")));
    EXPECT_FALSE(save.WriteTemplateFile(folder.Path().string()));
    EXPECT_TRUE(boxes.shown.empty());
}

TEST(TemplateWriter, OkOfEachDialogWritesInMode2)
{
    testing_host::TempDir folder;
    CapturedMessages boxes;
    CGUIOpenDlg open;
    open.findChild<QLineEdit *>("filePath")->setText(QString::fromStdString(Sample()));
    open.findChild<QAbstractButton *>("saveTemplate")->click();
    open.findChild<QLineEdit *>("templatePath")->setText(QString::fromStdString(folder.File("import")));
    open.OnOK();  // written before the inspection, which has no host here
    std::string text;
    open.BuildTemplateText(text);
    EXPECT_EQ(Slurp(folder.File("import.xml")), text);

    CGUISaveDlg save;
    save.findChild<QLineEdit *>("filePath")->setText("book.xlsx");
    save.findChild<QAbstractButton *>("saveTemplate")->click();
    save.findChild<QLineEdit *>("templatePath")->setText(QString::fromStdString(folder.File("export")));
    save.OnOK();
    save.BuildTemplateText(text);
    EXPECT_EQ(Slurp(folder.File("export")), text);
    EXPECT_TRUE(boxes.shown.empty());
}

}  // namespace
