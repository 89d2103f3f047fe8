// SPDX-License-Identifier: MIT
// The open dialog driven as a user would (clicks, typed texts, fields left,
// OK), its row check, and OpenDialog on the bridge.
#include <gtest/gtest.h>

#include <vector>

#include <QDateEdit>
#include <QTabBar>
#include <QTest>
#include <QWheelEvent>

#include "dialog_driver.h"
#include "dialogs/bridge_preview_access.h"
#include "hostseries/memory_series.h"

using namespace dialog_testing;
using vantrel::dialogs::DataPageFields;

namespace {

const char kRowsNotAbove[] =
    "The data start row needs to be greater than any heading rows. Please correct this to continue.";
const char kTitleRowShared[] =
    "The item description row should not equal any of the other header rows. Please correct this to continue.";

TEST(OpenDialog, OkChecksRowsThenWorkbookThenTemplate)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    CGUIOpenDlg dialog;
    dialog.SetHost(series.Get(), Object(bridge));
    testing_host::MessageBoxes boxes;
    QTest::mouseClick(Find<QPushButton>(dialog, "ok"), Qt::LeftButton);
    // Wrong rows and a wrong path: only the rows are told.
    Type(dialog, "itemDescriptionRowEdit", "3");
    dialog.OnOK();
    Click(dialog, "itemTypeInRow");
    Type(dialog, {{"itemDescriptionRowEdit", "2"}, {"itemTypeRowEdit", "2"}});
    dialog.OnOK();
    // The workbook exists; mode 1 wants an existing template, mode 2 a path.
    Click(dialog, "useTemplate");
    Type(dialog, {{"itemTypeRowEdit", "1"}, {"filePath", Fixture("five_columns.xlsx")}, {"templatePath", "/none.xml"}});
    dialog.OnOK();
    Click(dialog, "saveTemplate");
    Type(dialog, "templatePath", "");
    dialog.OnOK();
    EXPECT_EQ(boxes.texts, (Texts{"Please enter the correct file.", kRowsNotAbove, kTitleRowShared,
                                  "Please enter the correct template file.", "The template file path is required."}));
    EXPECT_EQ(boxes.captions, (Texts{"Warning!", "Excel Vantrel", "Excel Vantrel", "Warning!", "Excel Vantrel"}));
    EXPECT_EQ(testing_host::Specification(series.Get()), "");  // nothing stored before the checks pass
}

TEST(OpenDialog, EachClickMovesTheEnabledStates)
{
    CGUIOpenDlg dialog;
    const struct {
        const char *click;
        std::vector<const char *> on, off;
    } steps[] = {
        {"useTemplate", {"templatePath", "browseTemplate", "itemTypeList", "itemTypeRowSpin"}, {"itemTypeRowEdit"}},
        {"noTemplate", {}, {"templatePath", "browseTemplate", "deleteValue"}},
        {"dateTimeFormatBox", {"dateTimeFormat"}, {}},
        {"timeRadio", {"timeColEdit", "timeFormatBox", "globalDate"}, {"timeFormat", "dateTimeColEdit"}},
        {"dateRadio", {"dateColEdit", "globalTime"}, {"dateFormat", "timeColEdit", "globalDate"}},
        {"dateTimeRadio", {"dateTimeColEdit", "dateTimeFormat"}, {"dateColEdit", "globalTime"}},
        {"itemTypeInRow", {"itemTypeRowEdit"}, {"itemTypeList"}},
        {"unitInRow", {"unitRowEdit"}, {"unitList"}},
        {"sameItemType", {"itemTypeList"}, {"itemTypeRowEdit"}},
        {"deleteValueBox", {"useDeleteValue", "deleteValueInRow", "deleteValue"}, {"deleteValueRowEdit"}},
        {"deleteValueInRow", {"deleteValueRowEdit"}, {"deleteValue"}},
        {"deleteValueBox", {}, {"useDeleteValue", "deleteValueInRow", "deleteValueRowEdit"}},
    };
    for (const auto &step : steps) {
        Click(dialog, step.click);
        for (const char *name : step.on) EXPECT_TRUE(Find<QWidget>(dialog, name)->isEnabled()) << name;
        for (const char *name : step.off) EXPECT_FALSE(Find<QWidget>(dialog, name)->isEnabled()) << name;
    }
    // The time radios move the enabled states, not the mode; the data page's commit.
    EXPECT_EQ(dialog.TimePage().Fields().m_timeMode, 0);
    EXPECT_EQ(dialog.DataPage().Fields().m_unitInRow, 1);
}

TEST(OpenDialog, TimePageKeysPerModeAndCommitAtTabChange)
{
    CGUIOpenDlg dialog;
    dialog.show();
    dialog.TimePage().Commit();
    dialog.DataPage().Commit();
    dialog.Commit();
    EXPECT_EQ(Keys(dialog), "DateTimeCol=1;StartRow=3;GlobalUnitType=Undefined;GlobalUnit=undefined;"
                            "GlobalValueType=Instantaneous;ItemDescriptionRow=2;ExcelSheet=1;FilePath=;");
    Click(dialog, "timeRadio");
    Type(dialog, "timeColEdit", "2");
    Find<QDateEdit>(dialog, "globalDate")->setDate(QDate(2024, 3, 1));
    // Changing the tab hides the time page, which commits it.
    QTabBar *bar = dialog.TabSheet().Bar();
    QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(1).center());
    EXPECT_EQ(Keys(dialog).rfind("TimeCol=2;GlobalDate=2024", 0), 0u) << Keys(dialog);
    QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(0).center());
    Click(dialog, {"dateRadio", "dateFormatBox"});  // the box commits the page
    EXPECT_EQ(Keys(dialog).rfind("DateCol=1;DateFormat=YYYY/MM/DD;GlobalTime=", 0), 0u) << Keys(dialog);
    EXPECT_EQ(Keys(dialog).find("GlobalDate"), std::string::npos) << Keys(dialog);
}

TEST(OpenDialog, NumberFieldsTakeAnyWholeNumberAndRefuseOthers)
{
    CGUIOpenDlg dialog;
    QLineEdit *start = Edit(dialog, "startRowEdit");
    auto *arrows = Find<CSpinArrows>(dialog, "startRowSpin");
    start->setText(" +250 ");
    ASSERT_TRUE(dialog.DataPage().Commit());
    EXPECT_EQ(dialog.DataPage().Fields().m_startRow, 250);  // typing isn't bound by the arrows' range
    arrows->Step(1);
    start->setText("x");
    arrows->Step(-1);  // steps from the last position, 100
    EXPECT_EQ(start->text(), "99");

    testing_host::MessageBoxes boxes;
    for (const char *bad : {"", "abc", "3a", "1.5", "++1", "99999999999"}) {
        start->setText(bad);
        Type(dialog, "itemDescriptionRowEdit", "7");
        EXPECT_FALSE(dialog.DataPage().Commit()) << bad;
        EXPECT_EQ(boxes.texts.back(), "Please enter a whole number in \"Data start row\".") << bad;
        // Fields before the refused one took their texts; it kept its own.
        EXPECT_EQ(std::pair(dialog.DataPage().Fields().m_itemDescriptionRow, dialog.DataPage().Fields().m_startRow),
                  std::pair(7, 250)) << bad;
    }
    Click(dialog, "deleteValueBox");
    Type(dialog, {{"startRowEdit", "3"}, {"deleteValue", "-99x"}});
    EXPECT_FALSE(dialog.DataPage().Commit());
    EXPECT_EQ(boxes.texts.back(), "Please enter a number in \"Use Delete value\".");
    Type(dialog, "deleteValue", "-1e-30");
    EXPECT_TRUE(dialog.DataPage().Commit());
    EXPECT_NE(Keys(dialog).find(";DeleteValue=-1e-30;"), std::string::npos) << Keys(dialog);
}

// The data page as a new dialog commits it.
DataPageFields NewDataPage()
{
    DataPageFields data;
    data.m_itemTypeRow = data.m_unitRow = data.m_valueTypeRow = 1;
    data.m_itemDescriptionRow = data.m_deleteValueRow = 2;
    data.m_startRow = 3;
    return data;
}

TEST(FieldRules, RowCheckCountsOnlyTheRowsInUse)
{
    const struct {
        const char *what;
        void (*change)(DataPageFields &);
        int message;
    } cases[] = {
        {"defaults", [](DataPageFields &) {}, 0},
        {"an unused item type row", [](DataPageFields &d) { d.m_itemTypeRow = 5; }, 0},
        {"title row on the data", [](DataPageFields &d) { d.m_itemDescriptionRow = 3; }, 115},
        {"item type row on the title row", [](DataPageFields &d) { d.m_itemTypeInRow = 1, d.m_itemTypeRow = 2; }, 116},
        {"115 before 116",
         [](DataPageFields &d) { d.m_itemTypeInRow = d.m_unitInRow = 1, d.m_itemTypeRow = 2, d.m_unitRow = 3; }, 115},
        {"attribute rows share a row",
         [](DataPageFields &d) { d.m_itemTypeInRow = d.m_unitInRow = d.m_valueTypeInRow = 1; }, 0},
        {"delete row, box unchecked", [](DataPageFields &d) { d.m_deleteValueRow = 3; }, 0},
        {"delete row, value chosen", [](DataPageFields &d) { d.m_deleteValueRow = 3, d.m_useDelValNotEmpty = 1; }, 0},
        {"delete row on the data",
         [](DataPageFields &d) { d.m_deleteValueRow = 3, d.m_useDelValNotEmpty = d.m_deleteValueInRow = 1; }, 115},
        {"delete row on the title row", [](DataPageFields &d) { d.m_useDelValNotEmpty = d.m_deleteValueInRow = 1; }, 0},
    };
    for (const auto &c : cases) {
        DataPageFields data = NewDataPage();
        c.change(data);
        EXPECT_EQ(data.CheckDataRows(), c.message) << c.what;
    }
}

TEST(OpenDialogRun, CancelAfterBrowseKeepsStringAndPath)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    bool cancelled = false;
    QStringList offered;
    OpenDialogHook hook([&](CGUIOpenDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog, &cancelled, &offered] {
            ChooseInFileDialog(Fixture("five_columns.xlsx"),
                               [&offered](QFileDialog &chooser) { offered = chooser.nameFilters(); });
            Click(dialog, "browseFile");  // returns once the chooser closed
            Click(dialog, "cancel");
            cancelled = true;
        });
    });
    EXPECT_HR(E_ABORT, bridge->OpenDialog());
    EXPECT_TRUE(cancelled && boxes.texts.empty());
    // Every kind the engine reads, all of them first.
    EXPECT_EQ(offered, QStringList({"All Workbooks (*.xlsx *.xlsm *.xls *.ods *.csv *.tsv *.txt)",
                                    "Workbook (*.xlsx)", "Macro-Enabled Workbook (*.xlsm)",
                                    "Binary Workbook (*.xls)", "OpenDocument Spreadsheet (*.ods)",
                                    "Delimited Text (*.csv *.tsv *.txt)", "All Files (*)"}));
    EXPECT_EQ(WorkbookPath(series.Get()), Fixture("five_columns.xlsx"));
    EXPECT_NE(testing_host::Specification(series.Get()).find(";FilePath=" + Fixture("five_columns.xlsx") + ";"),
              std::string::npos);
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
    EXPECT_EQ(testing_host::ItemCount(series.Get()), 0);
}

TEST(OpenDialogRun, SampleByKeyboardAndMouseThenAgainFromItsTemplate)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    testing_host::TempDir folder;
    MessageBoxWatcher boxes;
    Texts walked, headings;
    OpenDialogHook hook([&](CGUIOpenDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&] {
            KeyIn(dialog, "filePath", Sample());
            // Tab goes from top to bottom, past what is disabled or on another page.
            walked = WalkWithTab();
            Press(dialog, "dateTimeFormatBox");
            KeyIn(dialog, "dateTimeFormat", "YYYY-MM-DD HH:mm");  // no preset completes it
            KeyIn(dialog, "excelSheets", "");                      // the first sheet
            ShowTab(dialog, 1);
            // The wheel over the tabs leaves the bar on the page shown.
            QWheelEvent wheel(QPointF(5, 5), QPointF(5, 5), {}, QPoint(0, -120), Qt::NoButton, {}, Qt::NoScrollPhase, false);
            QApplication::sendEvent(dialog.TabSheet().Bar(), &wheel);
            EXPECT_EQ(dialog.TabSheet().Bar()->currentIndex(), 1);
            for (const char *radio : {"itemTypeInRow", "unitInRow", "valueTypeInRow"}) Press(dialog, radio);
            for (const auto &[field, row] : {std::pair{"itemTypeRowEdit", "2"}, {"unitRowEdit", "3"},
                                             {"valueTypeRowEdit", "4"}, {"itemDescriptionRowEdit", "1"}, {"startRowEdit", "5"}})
                KeyIn(dialog, field, row);
            ShowTab(dialog, 2);
            for (const auto &column : dialog.PreviewPage().Preview().ResultList().columns) headings.push_back(column.heading);
            Press(dialog, "saveTemplate");
            KeyIn(dialog, "templatePath", folder.File("sample"));
            Press(dialog, "ok");
            if (dialog.isVisible()) dialog.reject();  // refused: the test tells by the missing import
        });
    });
    EXPECT_HR(S_OK, bridge->OpenDialog());
    EXPECT_EQ(walked, (Texts{"browseFile", "noTemplate", "excelSheets", "dateTimeRadio", "dateTimeColEdit",
                             "dateTimeFormatBox", "ok", "cancel"}));
    EXPECT_EQ(headings, (Texts{"DateTime", "Ardmore level", "Ardmore flow", "Bellow Bridge level"}));
    const std::string spec = "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm;StartRow=5;UnitTypeRow=2;UnitRow=3;"
                             "ValueTypeRow=4;ItemDescriptionRow=1;ExcelSheet=1;TemplateFilePath=" +
                             folder.File("sample.xml") + ";FilePath=" + Sample() + ";";
    EXPECT_EQ(testing_host::Specification(series.Get()), spec);
    ASSERT_EQ(testing_host::ItemCount(series.Get()), 3);
    EXPECT_EQ(hostseries::ReadTimes(*series.Get()).size(), 48u);
    EXPECT_FLOAT_EQ(float(hostseries::ReadValues(*hostseries::ItemAt(*series.Get(), 2).Get())[0]), 15.407f);

    // The template brings every control back.
    OpenDialogHook again([&](CGUIOpenDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&] {
            KeyIn(dialog, "filePath", Sample());
            Press(dialog, "useTemplate");
            ChooseInFileDialog(folder.File("sample.xml"));
            Press(dialog, "browseTemplate");
            Press(dialog, "ok");
            if (dialog.isVisible()) dialog.reject();
        });
    });
    EXPECT_HR(S_OK, bridge->OpenDialog());
    EXPECT_EQ(testing_host::Specification(series.Get()), spec);
    EXPECT_EQ(testing_host::ItemCount(series.Get()), 3);
    EXPECT_EQ(boxes.texts, Texts{});
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
}

TEST(OpenDialogRun, WhatOkRefusesKeepsTheDialogOpenAndTellsWhy)
{
    const struct {
        const char *what;
        std::function<void(CGUIOpenDlg &)> fill;
        std::string told;
        QMessageBox::Icon icon = QMessageBox::NoIcon;
    } cases[] = {
        {"titles in row 1, data from row 2: row 2 holds no time",
         [](CGUIOpenDlg &d) { KeyIn(d, "itemDescriptionRowEdit", "1"), KeyIn(d, "startRowEdit", "2"); },
         "There is no date/time in the"},
        {"a start row that is no number", [](CGUIOpenDlg &d) { KeyIn(d, "startRowEdit", "abc"); },
         "Please enter a whole number in \"Data start row\".", QMessageBox::Warning},
    };
    for (const auto &c : cases) {
        auto series = testing_host::MakeSeries("", "", false);  // the host lets the bridge speak
        auto bridge = testing_host::MakeBridge();
        bridge->SetHostSeries(series.Get());
        MessageBoxWatcher boxes;
        bool stayedOpen = false;
        OpenDialogHook hook([&](CGUIOpenDlg &dialog) {
            QTimer::singleShot(0, &dialog, [&] {
                KeyIn(dialog, "filePath", Sample());
                KeyIn(dialog, "itemDescriptionRowEdit", "1");
                KeyIn(dialog, "startRowEdit", "5");
                c.fill(dialog);
                Press(dialog, "ok");
                stayedOpen = dialog.isVisible();
                dialog.reject();
            });
        });
        EXPECT_HR(E_ABORT, bridge->OpenDialog()) << c.what;
        EXPECT_TRUE(stayedOpen) << c.what;
        ASSERT_EQ(boxes.texts.size(), 1u) << c.what;
        EXPECT_EQ(std::pair(boxes.texts[0].substr(0, c.told.size()), boxes.icons[0]), std::pair(c.told, c.icon)) << c.what;
        EXPECT_EQ(testing_host::ItemCount(series.Get()), 0) << c.what;
        EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
    }
}

}  // namespace
