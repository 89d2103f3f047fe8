// SPDX-License-Identifier: MIT
// The save dialog's window driven as a user would: its texts and defaults,
// the checks of OK in their order, the file chooser by the engine's version.
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include <QCheckBox>
#include <QLabel>
#include <QRadioButton>
#include <QTest>

#include "dialog_driver.h"
#include "dialogs/save_dialog.h"
#include "module/string_table.h"
#include "save_host.h"
#include "specification/specification.h"
#include "support/temp_dir.h"
#include "workbook/engine.h"
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

QLineEdit *Edit(QWidget &parent, const char *name) { return Find<QLineEdit>(parent, name); }

std::string DialogString(const CGUISaveDlg &dialog)
{
    CSpecification specification;
    std::string spec;
    DialogToString(specification, dialog, spec);
    return spec;
}

std::string Slurp(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

bool HasLabel(QWidget &dialog, const char *text)
{
    for (const QLabel *label : dialog.findChildren<QLabel *>())
        if (label->text() == text) return true;
    return false;
}

TEST(SaveDialog, WindowTextsDefaultsAndEnabledStates)
{
    CGUISaveDlg dialog;
    EXPECT_EQ(dialog.windowTitle(), "GUI Save");
    for (const char *label : {"Data/time column:", "Date/time values shall be saved as:",
                              "Data description shall be saved as:", "Unit Type row:", "Value Type row:",
                              "Data start row:", "Unit row:", "Item Description row:", "Delete Value row:",
                              "Date/time format (Char | as column separation)"})
        EXPECT_TRUE(HasLabel(dialog, label)) << label;
    EXPECT_EQ(Find<QCheckBox>(dialog, "multiColumns")->text(), "Date/time in multiple columns");
    EXPECT_EQ(Find<QCheckBox>(dialog, "useDeleteRow")->text(), "Delete Value is not empty cell:");
    EXPECT_TRUE(Find<QRadioButton>(dialog, "noTemplate")->isChecked());
    const std::pair<const char *, const char *> fields[] = {
        {"dateTimeColumnEdit", "1"}, {"unitTypeRowEdit", "1"}, {"valueTypeRowEdit", "1"}, {"dataStartRowEdit", "3"},
        {"deleteValueRowEdit", "2"}, {"itemDescriptionRowEdit", "2"}, {"unitRowEdit", "1"}};
    for (const auto &[name, text] : fields) EXPECT_EQ(Edit(dialog, name)->text(), text) << name;
    auto *combo = Find<QComboBox>(dialog, "format");
    EXPECT_EQ(combo->count(), 10);
    EXPECT_EQ(combo->currentText(), "YYYY/MM/DD HH:mm:ss");

    auto enabled = [&](const char *name) { return Find<QWidget>(dialog, name)->isEnabled(); };
    for (const char *name : {"templatePath", "browseTemplate", "format", "deleteValueRowEdit", "deleteValueRowSpin"})
        EXPECT_FALSE(enabled(name)) << name;
    Find<QRadioButton>(dialog, "saveTemplate")->click();
    EXPECT_TRUE(enabled("templatePath") && enabled("browseTemplate"));
    Find<QRadioButton>(dialog, "noTemplate")->click();
    EXPECT_FALSE(enabled("templatePath") || enabled("browseTemplate"));
    EXPECT_EQ(dialog.Fields().m_templateMode, 0);
    Find<QCheckBox>(dialog, "useDeleteRow")->click();
    EXPECT_TRUE(enabled("deleteValueRowEdit"));
    EXPECT_EQ(dialog.Fields().m_useDeleteRow, 0);  // the box alone commits nothing
    {
        // The format box commits and refreshes the preview, whose check finds
        // the delete value row on the title row.
        CapturedMessages boxes;
        Find<QCheckBox>(dialog, "multiColumns")->click();
        EXPECT_TRUE(enabled("format"));
        EXPECT_EQ(dialog.Fields().m_multiColumns, 1);
        ASSERT_EQ(boxes.shown.size(), 1u);
        EXPECT_EQ(boxes.shown[0].text, vantrel::LoadMessage(116));
    }

    // The keys of a new dialog; the spins' arrows stay within 1 to 100.
    CGUISaveDlg fresh;
    EXPECT_EQ(DialogString(fresh), "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;"
                                   "ItemDescriptionRow=2;FilePath=;");
    auto *spin = Find<CSpinArrows>(fresh, "dataStartRowSpin");
    Edit(fresh, "dataStartRowEdit")->setText("100");
    spin->Step(1);
    EXPECT_EQ(Edit(fresh, "dataStartRowEdit")->text(), "100");
}

TEST(SaveDialog, OkChecksInTheirOrderThenStoresStringAndPath)
{
    auto series = save_testing::ThreeGauges();
    CGUISaveDlg dialog;
    ASSERT_TRUE(dialog.SetHost(series.Get(), nullptr));
    EXPECT_FALSE(dialog.SetHost(nullptr, nullptr));  // a null series changes nothing
    CapturedMessages boxes;
    auto ok = [&] { QTest::mouseClick(Find<QPushButton>(dialog, "ok"), Qt::LeftButton); };
    auto lastText = [&] { return boxes.shown.empty() ? std::string() : boxes.shown.back().text; };

    ok();  // everything in order but the path
    EXPECT_EQ(lastText(), "Please specify the path of the output file.");
    EXPECT_EQ(boxes.shown.back().caption, "Excel Vantrel");

    // Rows before the format before the path.
    Find<QCheckBox>(dialog, "multiColumns")->click();
    Find<QComboBox>(dialog, "format")->setEditText("YYYY/MM/DD Hm:mm");
    Edit(dialog, "itemDescriptionRowEdit")->setText("3");
    boxes.shown.clear();
    ok();
    Edit(dialog, "itemDescriptionRowEdit")->setText("1");
    ok();
    Find<QCheckBox>(dialog, "useDeleteRow")->click();
    Edit(dialog, "itemDescriptionRowEdit")->setText("2");
    ok();  // the delete value row 2 shares the title row
    Edit(dialog, "deleteValueRowEdit")->setText("3");
    ok();  // and now lies below the data start
    Edit(dialog, "deleteValueRowEdit")->setText("1");
    ok();
    ASSERT_EQ(boxes.shown.size(), 5u);
    EXPECT_EQ(boxes.shown[0].text, vantrel::LoadMessage(115));
    EXPECT_EQ(boxes.shown[1].text, vantrel::LoadMessage(116));
    EXPECT_EQ(boxes.shown[2].text, vantrel::LoadMessage(116));
    EXPECT_EQ(boxes.shown[3].text, vantrel::LoadMessage(115));
    EXPECT_EQ(boxes.shown[4].text,
              "Only the letters 'Y','y', 'M','m', 'D','d','H','h' are allowed when specifying the date/time format.");
    // The same format with the box unchecked isn't looked at.
    Find<QCheckBox>(dialog, "multiColumns")->click();
    ok();
    EXPECT_EQ(lastText(), "Please specify the path of the output file.");

    // The path is trimmed in the field; then the template record's checks.
    Edit(dialog, "filePath")->setText("  /data/out/gauges.xlsx \t");
    Edit(dialog, "unitRowEdit")->setText("5");
    ok();
    EXPECT_EQ(Edit(dialog, "filePath")->text(), "/data/out/gauges.xlsx");
    EXPECT_EQ(lastText(), vantrel::LoadMessage(115));  // unit row 5 falls only here
    Edit(dialog, "unitRowEdit")->setText("0");
    boxes.shown.clear();
    ok();
    ASSERT_EQ(boxes.shown.size(), 1u);
    EXPECT_EQ(lastText(), "Row numbers cannot be negative");
    Edit(dialog, "unitRowEdit")->setText("1");

    // Mode 1 wants a template that exists; mode 2 a path.
    Find<QRadioButton>(dialog, "useTemplate")->click();
    Edit(dialog, "templatePath")->setText("/no/such/layout.xml");
    ok();
    EXPECT_EQ(lastText(), "Please enter the correct template file.");
    EXPECT_EQ(boxes.shown.back().caption, "Warning!");
    Find<QRadioButton>(dialog, "saveTemplate")->click();
    Edit(dialog, "templatePath")->setText("   ");
    ok();
    EXPECT_EQ(lastText(), "Please specify the path of the output template file.");
    EXPECT_EQ(Edit(dialog, "templatePath")->text(), "");
    EXPECT_EQ(testing_host::Specification(series.Get()), "");  // nothing stored before the checks pass
    EXPECT_EQ(dialog.result(), QDialog::Rejected);

    // Mode 2 with a path: the template is written as the path stands, then OK.
    testing_host::TempDir folder;
    Edit(dialog, "templatePath")->setText(QString::fromStdString(folder.File("gauges")));
    Edit(dialog, "deleteValueRowEdit")->setText("0");  // no DelValRow key
    const size_t before = boxes.shown.size();
    ok();
    EXPECT_EQ(boxes.shown.size(), before);
    EXPECT_EQ(dialog.result(), QDialog::Accepted);
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;"
              "TemplateFilePath=" + folder.File("gauges") + ";FilePath=/data/out/gauges.xlsx;");
    EXPECT_EQ(dialog_testing::FilePath(series.Get()), "/data/out/gauges.xlsx");
    std::string text;
    dialog.BuildTemplateText(text);
    EXPECT_EQ(Slurp(folder.File("gauges")), text);
}

TEST(SaveDialog, RefusedNumberStopsOkAndThePreview)
{
    CGUISaveDlg dialog;
    CapturedMessages boxes;
    Edit(dialog, "filePath")->setText("/data/out.xlsx");
    Edit(dialog, "dataStartRowEdit")->setText("three");
    dialog.OnOK();
    ASSERT_EQ(boxes.shown.size(), 1u);
    EXPECT_EQ(boxes.shown[0].text, "Please enter a whole number in \"Data start row\".");
    EXPECT_EQ(dialog.result(), QDialog::Rejected);
    EXPECT_EQ(dialog.Fields().m_dataStartRow, 3);
}

// An engine that only tells its version.
class VersionOnly : public workbook::Application {
public:
    explicit VersionOnly(std::string version) : m_version(std::move(version)) {}
    std::shared_ptr<workbook::Workbooks> GetWorkbooks() override { return nullptr; }
    std::string Version() override { return m_version; }
    void Quit() override { ++quits; }
    int quits = 0;

private:
    std::string m_version;
};

struct EngineFactory {
    explicit EngineFactory(CExcelObj::ApplicationFactory factory) { CExcelObj::SetApplicationFactory(std::move(factory)); }
    ~EngineFactory() { CExcelObj::ResetApplicationFactory(); }
};

// Opens the chooser with the browse button, notes what it offers and picks
// path (or cancels for an empty one).
std::pair<QStringList, QString> BrowseFile(CGUISaveDlg &dialog, const std::string &path)
{
    std::pair<QStringList, QString> offered;
    WhenModal(
        [&offered, path](QWidget *modal) {
            auto *chooser = qobject_cast<QFileDialog *>(modal);
            if (!chooser) return false;
            offered = {chooser->nameFilters(), chooser->defaultSuffix()};
            EXPECT_EQ(chooser->acceptMode(), QFileDialog::AcceptSave);
            if (path.empty()) {
                chooser->reject();
                return true;
            }
            // Typed as a person would: selectFile leaves a focused name field alone.
            auto *name = chooser->findChild<QLineEdit *>("fileNameEdit");
            if (!name) return false;
            name->setText(QString::fromStdString(path));
            QMetaObject::invokeMethod(chooser, "accept");
            return !chooser->isVisible();
        },
        "file chooser");
    Find<QPushButton>(dialog, "browseFile")->click();
    return offered;
}

TEST(SaveDialog, FileChooserOffersWhatTheEngineWrites)
{
    auto series = save_testing::ThreeGauges();
    auto bridge = MakeBridge();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), Object(bridge));
    {
        auto engine = std::make_shared<VersionOnly>("11.0");
        EngineFactory factory([engine] { return engine; });
        const auto offered = BrowseFile(dialog, "");
        EXPECT_EQ(offered.first, (QStringList{"Excel Files (*.xls)", "All Files (*)"}));
        EXPECT_EQ(offered.second, "xls");
        EXPECT_EQ(engine->quits, 1);  // a session of its own ends with the choice
    }
    {
        auto engine = std::make_shared<VersionOnly>("12.0");
        EngineFactory factory([engine] { return engine; });
        testing_host::TempDir folder;
        const auto offered = BrowseFile(dialog, folder.File("new.xlsx"));
        EXPECT_EQ(offered.first, (QStringList{"Excel Files (*.xlsx)", "All Files (*)"}));
        EXPECT_EQ(offered.second, "xlsx");
        // A new name is taken, and the preview follows the choice.
        EXPECT_EQ(Edit(dialog, "filePath")->text().toStdString(), folder.File("new.xlsx"));
        EXPECT_EQ(dialog.Fields().m_filePath, folder.File("new.xlsx"));
        EXPECT_EQ(dialog.PreviewListControl()->rowCount(), 12);
    }
    {
        // No engine: the user is told and no chooser comes; the path can be typed.
        EngineFactory factory([] { return std::shared_ptr<workbook::Application>(); });
        CapturedMessages boxes;
        Find<QPushButton>(dialog, "browseFile")->click();
        ASSERT_EQ(boxes.shown.size(), 1u);
        EXPECT_EQ(boxes.shown[0].text,
                  "Could not locate Excel. Please verify that MS Excel has been installed correctly.");
        EXPECT_TRUE(Edit(dialog, "filePath")->isEnabled());
    }
}

}  // namespace
