// SPDX-License-Identifier: MIT
// The open dialog's window and pages, driven as a user would: clicks, typed
// texts, fields left, OK.
#include <gtest/gtest.h>

#include <QCheckBox>
#include <QDateEdit>
#include <QLabel>
#include <QRadioButton>
#include <QTabBar>
#include <QTest>
#include <QTimeEdit>

#include "dialog_driver.h"
#include "dialogs/open_dialog.h"
#include "hostseries/memory_series.h"
#include "module/string_table.h"
#include "specification/specification.h"
#include "support/temp_dir.h"

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

std::string DialogString(const CGUIOpenDlg &dialog)
{
    CSpecification specification;
    std::string spec;
    DialogToString(specification, dialog, spec);
    return spec;
}

TEST(OpenDialog, WindowTextsAndDefaults)
{
    CGUIOpenDlg dialog;
    EXPECT_EQ(dialog.windowTitle(), "GUIOpen Dialog");
    EXPECT_EQ(Find<QRadioButton>(dialog, "noTemplate")->text(), "No Template File");
    EXPECT_TRUE(Find<QRadioButton>(dialog, "noTemplate")->isChecked());
    EXPECT_EQ(Find<QRadioButton>(dialog, "useTemplate")->text(), "Use Template File");
    EXPECT_EQ(Find<QRadioButton>(dialog, "saveTemplate")->text(), "Save Template File");
    EXPECT_EQ(Find<QLabel>(dialog, "sheetsHint")->text(),
              "(empty for 1st sheet or comma separated list or range like start-end or all)");
    EXPECT_EQ(Edit(dialog, "excelSheets")->text(), "1");
    EXPECT_FALSE(Edit(dialog, "templatePath")->isEnabled());
    EXPECT_FALSE(Find<QPushButton>(dialog, "browseTemplate")->isEnabled());
    QTabBar *bar = dialog.TabSheet().Bar();
    ASSERT_EQ(bar->count(), 3);
    EXPECT_EQ(bar->tabText(0), "Time description");
    EXPECT_EQ(bar->tabText(1), "Data description");
    EXPECT_EQ(bar->tabText(2), "Preview");
    EXPECT_EQ(dialog.TabSheet().CurrentPage(), 0);
    // A seventeenth page is refused.
    CTabSheet sheet;
    QWidget pages[17];
    for (int i = 0; i < 16; ++i) EXPECT_TRUE(sheet.AddPage(QString::number(i), &pages[i]));
    EXPECT_FALSE(sheet.AddPage("17", &pages[16]));
    EXPECT_EQ(sheet.PageCount(), 16);

    // A new dialog, committed, gives the defaults of every page.
    dialog.TimePage().Commit();
    dialog.DataPage().Commit();
    dialog.Commit();
    EXPECT_EQ(DialogString(dialog),
              "DateTimeCol=1;StartRow=3;GlobalUnitType=Undefined;GlobalUnit=undefined;"
              "GlobalValueType=Instantaneous;ItemDescriptionRow=2;ExcelSheet=1;FilePath=;");
}

TEST(OpenDialog, OkChecksRowsThenWorkbookThenTemplate)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    CGUIOpenDlg dialog;
    dialog.SetHost(series.Get(), Object(bridge));
    {
        CapturedMessages boxes;
        QTest::mouseClick(Find<QPushButton>(dialog, "ok"), Qt::LeftButton);
        ASSERT_EQ(boxes.shown.size(), 1u);
        EXPECT_EQ(boxes.shown[0].text, "Please enter the correct file.");
        EXPECT_EQ(boxes.shown[0].caption, "Warning!");
        EXPECT_EQ(dialog.result(), QDialog::Rejected);
        EXPECT_EQ(testing_host::Specification(series.Get()), "");  // nothing stored before the checks pass
    }
    {
        // Wrong rows and a wrong path: only the rows are told.
        CapturedMessages boxes;
        Edit(dialog, "itemDescriptionRowEdit")->setText("3");
        dialog.OnOK();
        ASSERT_EQ(boxes.shown.size(), 1u);
        EXPECT_EQ(boxes.shown[0].text, vantrel::LoadMessage(115));
        EXPECT_EQ(boxes.shown[0].caption, "Excel Vantrel");
        Edit(dialog, "itemDescriptionRowEdit")->setText("2");
        Find<QRadioButton>(dialog, "itemTypeInRow")->click();
        Edit(dialog, "itemTypeRowEdit")->setText("2");
        dialog.OnOK();
        ASSERT_EQ(boxes.shown.size(), 2u);
        EXPECT_EQ(boxes.shown[1].text, vantrel::LoadMessage(116));
    }
    {
        // The workbook exists; mode 1 wants an existing template, mode 2 a path.
        CapturedMessages boxes;
        Edit(dialog, "itemTypeRowEdit")->setText("1");
        Edit(dialog, "filePath")->setText(QString::fromStdString(Fixture("five_columns.xlsx")));
        Find<QRadioButton>(dialog, "useTemplate")->click();
        Edit(dialog, "templatePath")->setText("/no/such/template.xml");
        dialog.OnOK();
        Find<QRadioButton>(dialog, "saveTemplate")->click();
        Edit(dialog, "templatePath")->setText("");
        dialog.OnOK();
        ASSERT_EQ(boxes.shown.size(), 2u);
        EXPECT_EQ(boxes.shown[0].text, "Please enter the correct template file.");
        EXPECT_EQ(boxes.shown[0].caption, "Warning!");
        EXPECT_EQ(boxes.shown[1].text, "The template file path is required.");
        EXPECT_EQ(boxes.shown[1].caption, "Excel Vantrel");
    }
}

TEST(OpenDialog, SaveModeGivesAPathWithoutExtensionXml)
{
    testing_host::TempDir folder;
    CGUIOpenDlg dialog;
    QLineEdit *path = Edit(dialog, "templatePath");
    Find<QRadioButton>(dialog, "saveTemplate")->click();
    path->setText(QString::fromStdString(folder.File("layout")));
    LeaveField(path);
    EXPECT_EQ(path->text().toStdString(), folder.File("layout.xml"));
    EXPECT_EQ(dialog.Fields().m_templatePath, folder.File("layout.xml"));
    path->setText(QString::fromStdString(folder.File("layout.tpl")));
    LeaveField(path);
    EXPECT_EQ(path->text().toStdString(), folder.File("layout.tpl"));
    // In mode 1 leaving the field commits and adds nothing.
    Find<QRadioButton>(dialog, "useTemplate")->click();
    path->setText(QString::fromStdString(folder.File("other")));
    LeaveField(path);
    EXPECT_EQ(path->text().toStdString(), folder.File("other"));
    EXPECT_EQ(dialog.Fields().m_templatePath, folder.File("other"));
    EXPECT_EQ(dialog.Fields().m_templateMode, 1);
}

TEST(OpenDialog, EnabledStatesAfterEachRadio)
{
    CGUIOpenDlg dialog;
    QLineEdit *templatePath = Edit(dialog, "templatePath");
    auto *browseTemplate = Find<QPushButton>(dialog, "browseTemplate");
    for (const char *radio : {"useTemplate", "noTemplate", "saveTemplate", "noTemplate"}) {
        Find<QRadioButton>(dialog, radio)->click();
        const bool on = std::string(radio) != "noTemplate";
        EXPECT_EQ(templatePath->isEnabled(), on) << radio;
        EXPECT_EQ(browseTemplate->isEnabled(), on) << radio;
    }

    // The time page: a radio moves the enabled states, not the mode.
    struct Layout {
        const char *radio, *column, *box, *combo, *picker;
    };
    const Layout layouts[3] = {{"dateTimeRadio", "dateTimeColEdit", "dateTimeFormatBox", "dateTimeFormat", nullptr},
                               {"timeRadio", "timeColEdit", "timeFormatBox", "timeFormat", "globalDate"},
                               {"dateRadio", "dateColEdit", "dateFormatBox", "dateFormat", "globalTime"}};
    Find<QCheckBox>(dialog, "dateTimeFormatBox")->click();
    for (int chosen : {1, 2, 0}) {
        Find<QRadioButton>(dialog, layouts[chosen].radio)->click();
        for (int i = 0; i < 3; ++i) {
            const Layout &layout = layouts[i];
            EXPECT_EQ(Edit(dialog, layout.column)->isEnabled(), i == chosen) << layout.column << " " << chosen;
            EXPECT_EQ(Find<QCheckBox>(dialog, layout.box)->isEnabled(), i == chosen) << layout.box;
            // Only the date/time box is checked.
            EXPECT_EQ(Find<QComboBox>(dialog, layout.combo)->isEnabled(), i == chosen && i == 0) << layout.combo;
            if (layout.picker) {
                EXPECT_EQ(Find<QWidget>(dialog, layout.picker)->isEnabled(), i == chosen);
            }
        }
        if (chosen != 0) {
            EXPECT_EQ(dialog.TimePage().Fields().m_timeMode, 0);
        }
    }
    // The box of mode 0 and its combo's text survived the trip.
    EXPECT_TRUE(Find<QCheckBox>(dialog, "dateTimeFormatBox")->isChecked());
    EXPECT_EQ(Find<QComboBox>(dialog, "dateTimeFormat")->currentText(), "YYYY/MM/DD HH:mm:ss");

    // The data page: each radio commits and moves the enabled states.
    auto enabled = [&](const char *name) { return Find<QWidget>(dialog, name)->isEnabled(); };
    EXPECT_TRUE(enabled("itemTypeList"));
    EXPECT_FALSE(enabled("itemTypeRowEdit"));
    EXPECT_TRUE(enabled("itemTypeRowSpin"));  // the arrows stay enabled
    Find<QRadioButton>(dialog, "itemTypeInRow")->click();
    EXPECT_FALSE(enabled("itemTypeList"));
    EXPECT_TRUE(enabled("itemTypeRowEdit"));
    EXPECT_EQ(dialog.DataPage().Fields().m_itemTypeInRow, 1);
    Find<QRadioButton>(dialog, "unitInRow")->click();
    EXPECT_FALSE(enabled("unitList"));
    EXPECT_TRUE(enabled("unitRowEdit"));
    Find<QRadioButton>(dialog, "valueTypeInRow")->click();
    EXPECT_FALSE(enabled("valueTypeList"));
    EXPECT_TRUE(enabled("valueTypeRowEdit"));
    Find<QRadioButton>(dialog, "sameItemType")->click();
    EXPECT_TRUE(enabled("itemTypeList"));
    EXPECT_FALSE(enabled("itemTypeRowEdit"));

    for (const char *name : {"useDeleteValue", "deleteValueInRow", "deleteValue", "deleteValueRowEdit"})
        EXPECT_FALSE(enabled(name)) << name;
    Find<QCheckBox>(dialog, "deleteValueBox")->click();
    EXPECT_TRUE(enabled("useDeleteValue") && enabled("deleteValueInRow") && enabled("deleteValue"));
    EXPECT_FALSE(enabled("deleteValueRowEdit"));
    Find<QRadioButton>(dialog, "deleteValueInRow")->click();
    EXPECT_TRUE(enabled("deleteValueRowEdit"));
    EXPECT_FALSE(enabled("deleteValue"));
    Find<QRadioButton>(dialog, "useDeleteValue")->click();
    EXPECT_TRUE(enabled("deleteValue"));
    EXPECT_FALSE(enabled("deleteValueRowEdit"));
    Find<QCheckBox>(dialog, "deleteValueBox")->click();
    for (const char *name : {"useDeleteValue", "deleteValueInRow", "deleteValue", "deleteValueRowEdit"})
        EXPECT_FALSE(enabled(name)) << name;
}

TEST(OpenDialog, TimePageKeysPerModeAndCommitAtTabChange)
{
    CGUIOpenDlg dialog;
    dialog.show();
    Edit(dialog, "dateTimeColEdit")->setText("4");
    Find<QRadioButton>(dialog, "timeRadio")->click();
    Edit(dialog, "timeColEdit")->setText("2");
    Find<QTimeEdit>(dialog, "globalTime");
    Find<QDateEdit>(dialog, "globalDate")->setDate(QDate(2024, 3, 1));
    // Typed but not committed: the string doesn't know it yet.
    EXPECT_EQ(dialog.TimePage().Fields().m_timeMode, 0);
    std::string value;
    EXPECT_TRUE(dialog.GetDialogKeyValue(DateTimeCol, value));
    EXPECT_EQ(value, "1");

    // Changing the tab hides the time page, which commits it.
    QTabBar *bar = dialog.TabSheet().Bar();
    QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(1).center());
    EXPECT_EQ(dialog.TabSheet().CurrentPage(), 1);
    EXPECT_FALSE(dialog.GetDialogKeyValue(DateTimeCol, value));
    EXPECT_EQ(value, "4");
    EXPECT_TRUE(dialog.GetDialogKeyValue(TimeCol, value));
    EXPECT_EQ(value, "2");
    EXPECT_TRUE(dialog.GetDialogKeyValue(GlobalDate, value));
    EXPECT_NE(value.find("2024"), std::string::npos) << value;
    EXPECT_FALSE(dialog.GetDialogKeyValue(TimeFormat, value));
    EXPECT_FALSE(dialog.GetDialogKeyValue(GlobalTime, value));

    QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(0).center());
    Find<QRadioButton>(dialog, "dateRadio")->click();
    Find<QCheckBox>(dialog, "dateFormatBox")->click();  // the box commits the page
    EXPECT_TRUE(dialog.GetDialogKeyValue(DateCol, value));
    EXPECT_EQ(value, "1");
    EXPECT_TRUE(dialog.GetDialogKeyValue(DateFormat, value));
    EXPECT_EQ(value, "YYYY/MM/DD");
    EXPECT_TRUE(dialog.GetDialogKeyValue(GlobalTime, value));
    EXPECT_FALSE(dialog.GetDialogKeyValue(TimeCol, value));
    EXPECT_FALSE(dialog.GetDialogKeyValue(GlobalDate, value));
    dialog.reject();
}

TEST(OpenDialog, FormatCombosOfferThePresetsAndKeepTypedFormats)
{
    CGUIOpenDlg dialog;
    auto *dateTime = Find<CDTFormatCMB>(dialog, "dateTimeFormat");
    auto *date = Find<CDTFormatCMB>(dialog, "dateFormat");
    auto *time = Find<CDTFormatCMB>(dialog, "timeFormat");
    EXPECT_EQ(dateTime->count(), 10);
    EXPECT_EQ(date->count(), 5);
    EXPECT_EQ(time->count(), 4);
    EXPECT_EQ(date->itemText(0), "DD-MM-YYYY");  // sorted, not in the order of adding
    EXPECT_EQ(time->itemText(3), "HH|mm|ss");
    // The presets came after the display: the fields' texts stand.
    EXPECT_EQ(dateTime->currentText(), "YYYY/MM/DD HH:mm:ss");
    EXPECT_EQ(date->currentText(), "YYYY/MM/DD");
    EXPECT_EQ(time->currentText(), "HH:mm:ss");

    Find<QCheckBox>(dialog, "dateTimeFormatBox")->click();
    dateTime->setEditText("yyyy/mm/dd hh:MM:ss");  // an entry in other case
    LeaveField(dateTime);
    EXPECT_EQ(dateTime->count(), 10);
    dateTime->setEditText("DD.MM.YYYY HH:mm");
    LeaveField(dateTime);
    EXPECT_EQ(dateTime->count(), 11);
    EXPECT_NE(dateTime->findText("DD.MM.YYYY HH:mm"), -1);
    LeaveField(dateTime);
    EXPECT_EQ(dateTime->count(), 11);
    std::string value;
    EXPECT_TRUE(dialog.GetDialogKeyValue(DateTimeFormat, value));
    EXPECT_EQ(value, "DD.MM.YYYY HH:mm");
}

TEST(OpenDialog, NumberFieldsTakeAnyWholeNumberAndRefuseOthers)
{
    CGUIOpenDlg dialog;
    QLineEdit *start = Edit(dialog, "startRowEdit");
    auto *up = Find<CSpinArrows>(dialog, "startRowSpin");
    start->setText("250");
    EXPECT_TRUE(dialog.DataPage().Commit());
    EXPECT_EQ(dialog.DataPage().Fields().m_startRow, 250);
    up->Step(1);  // the arrows bring it back into 1 to 100
    EXPECT_EQ(start->text(), "100");
    up->Step(-1);
    EXPECT_EQ(start->text(), "99");

    CapturedMessages boxes;
    start->setText("abc");
    Edit(dialog, "itemDescriptionRowEdit")->setText("7");
    EXPECT_FALSE(dialog.DataPage().Commit());
    ASSERT_EQ(boxes.shown.size(), 1u);
    EXPECT_EQ(boxes.shown[0].text, "Please enter a whole number in \"Data start row\".");
    // Fields before the refused one took their texts; it and those after kept theirs.
    EXPECT_EQ(dialog.DataPage().Fields().m_itemDescriptionRow, 7);
    EXPECT_EQ(dialog.DataPage().Fields().m_startRow, 250);

    Find<QCheckBox>(dialog, "deleteValueBox")->click();  // commits, and is refused again
    start->setText("3");
    Edit(dialog, "deleteValue")->setText("-99x");
    EXPECT_FALSE(dialog.DataPage().Commit());
    EXPECT_EQ(boxes.shown.back().text, "Please enter a number in \"Use Delete value\".");
    Edit(dialog, "deleteValue")->setText("-999");
    EXPECT_TRUE(dialog.DataPage().Commit());
    std::string value;
    EXPECT_TRUE(dialog.GetDialogKeyValue(DeleteValue, value));
    EXPECT_EQ(value, "-999");
}

TEST(OpenDialog, ItemTypeChangeRefillsTheUnits)
{
    CGUIOpenDlg dialog;
    auto *types = Find<QComboBox>(dialog, "itemTypeList");
    auto *units = Find<QComboBox>(dialog, "unitList");
    EXPECT_EQ(types->currentText(), "Undefined");
    EXPECT_EQ(units->currentText(), "undefined");
    const int waterLevel = types->findText("Water Level");
    ASSERT_GE(waterLevel, 0);
    types->setCurrentIndex(waterLevel);
    emit types->activated(waterLevel);
    ASSERT_EQ(units->count(), 5);
    EXPECT_EQ(units->currentText(), "centimeter");  // the first in sorted order
    EXPECT_EQ(dialog.DataPage().Fields().m_itemType, "Water Level");

    EXPECT_TRUE(dialog.DataPage().SelectItemType("discharge"));
    EXPECT_EQ(types->currentText(), "Discharge");
    EXPECT_FALSE(dialog.DataPage().SelectUnit("LITER/SEC"));  // units match in their own case only
    EXPECT_TRUE(dialog.DataPage().SelectUnit("liter/sec"));
    EXPECT_EQ(units->currentText(), "liter/sec");
    EXPECT_TRUE(dialog.DataPage().SelectValueType("accumulated"));
    EXPECT_EQ(Find<QComboBox>(dialog, "valueTypeList")->currentText(), "Accumulated");
    EXPECT_FALSE(dialog.DataPage().SelectItemType("Flux"));
}

}  // namespace
