// SPDX-License-Identifier: MIT
// SaveDialog on the bridge: the dialog runs modally in the host's widget
// application, then the export; Cancel aborts and leaves the host object
// alone, and the session ends either way.
#include <gtest/gtest.h>

#include <QCheckBox>
#include <QComboBox>
#include <QPushButton>

#include "dialog_driver.h"
#include "dialogs/bridge_preview_access.h"
#include "dialogs/save_dialog.h"
#include "dialogs/save_dialog_runner.h"
#include "save_host.h"
#include "support/temp_dir.h"
#include "workbook/excel_obj.h"

using namespace dialog_testing;

namespace {

struct DialogHook {
    explicit DialogHook(std::function<void(CGUISaveDlg &)> f) { vantrel::dialogs::SetSaveDialogHook(std::move(f)); }
    ~DialogHook() { vantrel::dialogs::SetSaveDialogHook({}); }
};

void SetHostString(IHostSeries *series, const std::string &spec, const std::string &path)
{
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    connection->SetSpecification(automation::Bstr(spec).Get());
    connection->SetFilePath(automation::Bstr(path).Get());
}

TEST(SaveDialogRun, CancelLeavesTheHostObjectAlone)
{
    auto series = save_testing::ThreeGauges();
    SetHostString(series.Get(), "StartRow=9;", "/kept/book.xlsx");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    bool shown = false;
    DialogHook hook([&](CGUISaveDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog, &shown] {
            shown = dialog.isVisible();
            // What was typed and refreshed doesn't reach the host object.
            dialog.findChild<QLineEdit *>("filePath")->setText("/elsewhere.xlsx");
            dialog.FillSavePreview();
            dialog.findChild<QPushButton *>("cancel")->click();
        });
    });
    EXPECT_HR(E_ABORT, bridge->SaveDialog());
    EXPECT_TRUE(shown);
    EXPECT_TRUE(boxes.shown.empty());
    EXPECT_EQ(testing_host::Specification(series.Get()), "StartRow=9;");
    EXPECT_EQ(dialog_testing::FilePath(series.Get()), "/kept/book.xlsx");
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
}

TEST(SaveDialogRun, FullExportThroughTheDialog)
{
    testing_host::TempDir folder;
    const std::string book = folder.File("gauges.xlsx");
    auto series = save_testing::ThreeGauges();
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    DialogHook hook([&](CGUISaveDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog, book] {
            dialog.findChild<QLineEdit *>("filePath")->setText(QString::fromStdString(book));
            dialog.findChild<QCheckBox *>("multiColumns")->click();
            dialog.findChild<QComboBox *>("format")->setEditText("YYYY-MM-DD HH:mm:ss");
            dialog.findChild<QCheckBox *>("useDeleteRow")->click();
            const std::pair<const char *, const char *> rows[] = {{"unitTypeRowEdit", "1"},
                                                                  {"unitRowEdit", "2"},
                                                                  {"valueTypeRowEdit", "1"},
                                                                  {"deleteValueRowEdit", "3"},
                                                                  {"itemDescriptionRowEdit", "4"},
                                                                  {"dataStartRowEdit", "5"}};
            for (const auto &[name, text] : rows) dialog.findChild<QLineEdit *>(name)->setText(text);
            dialog.findChild<QPushButton *>("ok")->click();
            // A dialog still open here was refused: end it so the test can tell.
            if (dialog.isVisible()) dialog.reject();
        });
    });
    EXPECT_HR(S_OK, bridge->SaveDialog());
    for (const Message &box : boxes.shown) ADD_FAILURE() << "message: " << box.text;
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=5;UnitTypeRow=1;UnitRow=2;ValueTypeRow=1;"
              "ItemDescriptionRow=4;DelValRow=3;FilePath=" + book + ";");
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);

    // The workbook as the export laid it out.
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error)) << error;
    ASSERT_TRUE(excel.OpenWorkbook(book, error)) << error;
    ASSERT_TRUE(excel.SelectSheet(1, error)) << error;
    std::vector<std::string> texts;
    excel.ReadRowTexts(1, 2, 3, texts);
    excel.ReadRowTexts(2, 2, 3, texts);
    excel.ReadRowTexts(4, 1, 4, texts);
    excel.ReadRowTexts(5, 1, 4, texts);
    excel.ReadRowTexts(7, 1, 4, texts);
    const std::vector<std::string> expected = {
        "Water Level:Instantaneous", "Discharge:Accumulated", "Rainfall:Step_Accumulated",
        "meter", "liter/sec", "millimeter",
        "Date/time", "Ardmore level", "Ardmore flow", "Ardmore rain",
        "2024-03-01 00:00:00", "1.25", "15.5", "0",
        "2024-03-01 02:00:00", "2.25", "16", "-999"};
    EXPECT_EQ(texts, expected);
    automation::Variant deleteValue;
    excel.ReadCell(3, 1, deleteValue);
    ASSERT_EQ(deleteValue.Type(), VT_R8);
    EXPECT_EQ(deleteValue.Raw().dblVal, -999.0);
    automation::Variant last;
    excel.ReadCell(5 + 24, 2, last);
    EXPECT_EQ(last.Raw().dblVal, 1.25 + 0.5 * 24);
    excel.CloseWorkbook(0);
    excel.QuitExcel();
}

}  // namespace
