// SPDX-License-Identifier: MIT
// OpenDialog on the bridge: the dialog runs modally in the host's widget
// application, then the read; Cancel aborts, and the session ends either way.
#include <gtest/gtest.h>

#include <QCheckBox>
#include <QPushButton>
#include <QRadioButton>

#include "dialog_driver.h"
#include "dialogs/open_dialog.h"
#include "dialogs/open_dialog_runner.h"
#include "dialogs/bridge_preview_access.h"
#include "hostseries/memory_series.h"

using namespace dialog_testing;

namespace {

// Runs f with the dialog once it is up, before its modal loop starts.
struct DialogHook {
    explicit DialogHook(std::function<void(CGUIOpenDlg &)> f) { vantrel::dialogs::SetOpenDialogHook(std::move(f)); }
    ~DialogHook() { vantrel::dialogs::SetOpenDialogHook({}); }
};

TEST(OpenDialogRun, CancelAfterBrowseKeepsStringAndPath)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    bool cancelled = false;
    DialogHook hook([&](CGUIOpenDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog, &cancelled] {
            ChooseInFileDialog(Fixture("five_columns.xlsx"));
            dialog.findChild<QPushButton *>("browseFile")->click();  // returns once the chooser closed
            dialog.findChild<QPushButton *>("cancel")->click();
            cancelled = true;
        });
    });
    EXPECT_HR(E_ABORT, bridge->OpenDialog());
    EXPECT_TRUE(cancelled);
    EXPECT_TRUE(boxes.shown.empty());
    EXPECT_EQ(FilePath(series.Get()), Fixture("five_columns.xlsx"));
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;StartRow=3;GlobalUnitType=Undefined;GlobalUnit=undefined;"
              "GlobalValueType=Instantaneous;ItemDescriptionRow=2;ExcelSheet=1;FilePath=" +
                  Fixture("five_columns.xlsx") + ";");
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
    EXPECT_EQ(testing_host::ItemCount(series.Get()), 0);
}

TEST(OpenDialogRun, FullImportThroughTheDialog)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    DialogHook hook([&](CGUIOpenDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog] {
            ChooseInFileDialog(Sample());
            dialog.findChild<QPushButton *>("browseFile")->click();
            for (const char *radio : {"itemTypeInRow", "unitInRow", "valueTypeInRow"})
                dialog.findChild<QRadioButton *>(radio)->click();
            const std::pair<const char *, const char *> rows[] = {
                {"itemTypeRowEdit", "2"}, {"unitRowEdit", "3"}, {"valueTypeRowEdit", "4"},
                {"itemDescriptionRowEdit", "1"}, {"startRowEdit", "5"}, {"excelSheets", "1,2"}};
            for (const auto &[name, text] : rows) dialog.findChild<QLineEdit *>(name)->setText(text);
            dialog.findChild<QPushButton *>("ok")->click();
            // A dialog still open here was refused: end it so the test can tell.
            if (dialog.isVisible()) dialog.reject();
        });
    });
    EXPECT_HR(S_OK, bridge->OpenDialog());
    for (const Message &box : boxes.shown) ADD_FAILURE() << "message: " << box.text;
    EXPECT_EQ(FilePath(series.Get()), Sample());
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;StartRow=5;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ItemDescriptionRow=1;"
              "ExcelSheet=1,2;FilePath=" + Sample() + ";");
    // Three gauges of the first sheet and two weather items of the second,
    // on the 48 hours of the first sheet.
    ASSERT_EQ(testing_host::ItemCount(series.Get()), 5);
    const std::vector<DATE> times = hostseries::ReadTimes(*series.Get());
    ASSERT_EQ(times.size(), 48u);
    EXPECT_NEAR(times.front(), 45352.0, 1e-9);
    const char *titles[] = {"Ardmore level", "Ardmore flow", "Bellow Bridge level", "Ardmore rain",
                            "Ardmore air temperature"};
    for (LONG i = 1; i <= 5; ++i) {
        auto item = hostseries::ItemAt(*series.Get(), i);
        automation::Bstr title;
        item->GetTitle(title.Out());
        EXPECT_EQ(title.Utf8(), titles[i - 1]);
        EXPECT_EQ(hostseries::ReadValues(*item.Get()).size(), 48u);
    }
    LONG type = 0;
    hostseries::ItemAt(*series.Get(), 2)->GetItemType(&type);
    EXPECT_EQ(type, 1001);  // Discharge
    EXPECT_FLOAT_EQ(float(hostseries::ReadValues(*hostseries::ItemAt(*series.Get(), 2).Get())[0]), 15.407f);
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
}

TEST(OpenDialogRun, RefusedInspectionKeepsTheDialogOpen)
{
    auto series = testing_host::MakeSeries("", "", false);  // the host lets the bridge speak
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    bool stayedOpen = false;
    DialogHook hook([&](CGUIOpenDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog, &stayedOpen] {
            dialog.findChild<QLineEdit *>("filePath")->setText(QString::fromStdString(Sample()));
            // Titles in row 1 but data from row 2: the attribute rows hold words.
            dialog.findChild<QLineEdit *>("itemDescriptionRowEdit")->setText("1");
            dialog.findChild<QLineEdit *>("startRowEdit")->setText("2");
            dialog.findChild<QPushButton *>("ok")->click();
            stayedOpen = dialog.isVisible();
            dialog.reject();
        });
    });
    EXPECT_HR(E_ABORT, bridge->OpenDialog());
    EXPECT_TRUE(stayedOpen);
    ASSERT_FALSE(boxes.shown.empty());  // the inspection told why, in a real box
    EXPECT_EQ(boxes.shown[0].caption, "Excel Vantrel");
    EXPECT_EQ(FilePath(series.Get()), Sample());
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
}

}  // namespace
