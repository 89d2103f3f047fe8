// SPDX-License-Identifier: MIT
// The save dialog driven as a user would: OK's checks, the file chooser, the
// preview from the host object alone; and SaveDialog on the bridge.
#include <gtest/gtest.h>

#include <array>
#include <cmath>

#include <QLabel>
#include <QTest>

#include "dialog_driver.h"
#include "dialogs/bridge_preview_access.h"
#include "workbook/excel_obj.h"
#include "dialogs/save_preview.h"
#include "save_host.h"
#include "support/engine_guard.h"
#include "workbook/engine.h"

using namespace dialog_testing;
using save_testing::ThreeGauges;
using Line = std::vector<std::string>;

namespace {

TEST(SaveDialog, OkChecksInTheirOrderThenStoresStringAndPath)
{
    auto series = save_testing::ThreeGauges();
    CGUISaveDlg dialog;
    ASSERT_TRUE(dialog.SetHost(series.Get(), nullptr));
    testing_host::MessageBoxes boxes;
    auto ok = [&] { QTest::mouseClick(Find<QPushButton>(dialog, "ok"), Qt::LeftButton); };
    const std::string noPath = "Please specify the path of the output file.";
    ok();  // everything in order but the path
    // Rows before the format before the path.
    Click(dialog, "multiColumns");
    Find<QComboBox>(dialog, "format")->setEditText("YYYY/MM/DD Hm:mm");
    Type(dialog, "itemDescriptionRowEdit", "3");
    ok();
    Type(dialog, "itemDescriptionRowEdit", "1");
    ok();
    Click(dialog, "useDeleteRow");
    Type(dialog, "itemDescriptionRowEdit", "2");
    ok();  // the delete value row 2 shares the title row
    Type(dialog, "deleteValueRowEdit", "3");
    ok();  // and now lies below the data start
    Type(dialog, "deleteValueRowEdit", "1");
    ok();
    Click(dialog, "multiColumns");  // the same format with the box unchecked isn't looked at
    ok();
    const std::string m115 = vantrel::LoadMessage(115), m116 = vantrel::LoadMessage(116);
    EXPECT_EQ(boxes.texts, (Texts{noPath, m115, m116, m116, m115,
                                  "Only the letters 'Y','y', 'M','m', 'D','d','H','h' are allowed when specifying the "
                                  "date/time format.", noPath}));
    EXPECT_EQ(boxes.captions[0], "Excel Vantrel");

    // The path is trimmed in the field; then the template record's checks.
    Type(dialog, {{"filePath", "  /data/out/gauges.xlsx \t"}, {"unitRowEdit", "5"}});
    ok();
    EXPECT_EQ(Edit(dialog, "filePath")->text(), "/data/out/gauges.xlsx");
    EXPECT_EQ(boxes.texts.back(), m115);  // unit row 5 falls only here
    Type(dialog, "unitRowEdit", "0");
    ok();
    EXPECT_EQ(boxes.texts.back(), "Row numbers cannot be negative");
    // Mode 1 wants a template that exists; mode 2 a path.
    Click(dialog, "useTemplate");
    Type(dialog, {{"unitRowEdit", "1"}, {"templatePath", "/no/such/layout.xml"}});
    ok();
    EXPECT_EQ(boxes.texts.back(), "Please enter the correct template file.");
    EXPECT_EQ(boxes.captions.back(), "Warning!");
    Click(dialog, "saveTemplate");
    Type(dialog, "templatePath", "   ");
    ok();
    EXPECT_EQ(boxes.texts.back(), "Please specify the path of the output template file.");
    EXPECT_EQ(Edit(dialog, "templatePath")->text(), "");
    EXPECT_EQ(testing_host::Specification(series.Get()), "");  // nothing stored before the checks pass
    EXPECT_EQ(dialog.result(), QDialog::Rejected);

    // Mode 2 with a path: the template is written as the path stands, then OK.
    testing_host::TempDir folder;
    Type(dialog, {{"templatePath", folder.File("gauges")}, {"deleteValueRowEdit", "0"}});  // no DelValRow key
    const size_t told = boxes.texts.size();
    ok();
    EXPECT_EQ(boxes.texts.size(), told);
    EXPECT_EQ(dialog.result(), QDialog::Accepted);
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;"
              "TemplateFilePath=" + folder.File("gauges") + ";FilePath=/data/out/gauges.xlsx;");
    EXPECT_EQ(WorkbookPath(series.Get()), "/data/out/gauges.xlsx");
    const std::string written = testing_host::ReadFile(folder.File("gauges"));
    EXPECT_NE(written.find(" DateTimeFormat=\"YYYY/MM/DD Hm:mm\" UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" "
                           "ItemDescriptionRow=\"2\" StartRow=\"3\" UseDelValNotEmpty=\"true\" "
                           "DeleteValueRow=\"0\" />"),
              std::string::npos) << written;
}

TEST(SaveDialog, RefusedNumberStopsOk)
{
    CGUISaveDlg dialog;
    testing_host::MessageBoxes boxes;
    Type(dialog, {{"filePath", "/data/out.xlsx"}, {"dataStartRowEdit", "three"}});
    dialog.OnOK();
    EXPECT_EQ(boxes.texts, Texts{"Please enter a whole number in \"Data start row\"."});
    EXPECT_EQ(dialog.result(), QDialog::Rejected);
    EXPECT_EQ(dialog.Fields().m_dataStartRow, 3);
}

// An engine that only tells its version.
struct VersionOnly : workbook::Application {
    explicit VersionOnly(std::string v) : version(std::move(v)) {}
    std::shared_ptr<workbook::Workbooks> GetWorkbooks() override { return nullptr; }
    std::string Version() override { return version; }
    void Quit() override { ++quits; }
    std::string version;
    int quits = 0;
};

TEST(SaveDialog, FileChooserOffersWhatTheEngineWrites)
{
    auto series = save_testing::ThreeGauges();
    auto bridge = testing_host::MakeBridge();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), Object(bridge));
    testing_host::TempDir folder;
    const struct {
        const char *version, *chosen;
        QStringList filters;
        QString suffix;
    } cases[] = {{"11.0", "", {"Excel Files (*.xls)", "All Files (*)"}, "xls"},
                 {"12.0", "new.xlsx", {"Workbook (*.xlsx)", "Macro-Enabled Workbook (*.xlsm)"}, "xlsx"}};
    for (const auto &c : cases) {
        auto engine = std::make_shared<VersionOnly>(c.version);
        testing_host::EngineGuard guard([engine] { return engine; });
        QStringList offered;
        ChooseInFileDialog(*c.chosen ? folder.File(c.chosen) : "", [&](QFileDialog &chooser) {
            EXPECT_EQ(chooser.acceptMode(), QFileDialog::AcceptSave);
            offered = chooser.nameFilters() << chooser.defaultSuffix();
        });
        Click(dialog, "browseFile");
        EXPECT_EQ(offered, QStringList(c.filters) << c.suffix) << c.version;
        EXPECT_EQ(engine->quits, 1) << c.version;  // a session of its own ends with the choice
    }
    EXPECT_EQ(dialog.Fields().m_filePath, folder.File("new.xlsx"));
    EXPECT_EQ(dialog.PreviewListControl()->rowCount(), 12);

    // No engine: the user is told and no chooser comes.
    testing_host::EngineGuard missing(testing_host::EngineGuard::Missing);
    testing_host::MessageBoxes boxes;
    Click(dialog, "browseFile");
    EXPECT_EQ(boxes.texts, Texts{"Could not locate Excel. Please verify that MS Excel has been installed correctly."});
}

// The list control as the user sees it: every line, every column.
std::vector<Line> Shown(const CGUISaveDlg &dialog)
{
    const QTableWidget *list = dialog.PreviewListControl();
    std::vector<Line> lines(size_t(list->rowCount()));
    for (int row = 0; row < list->rowCount(); ++row)
        for (int column = 0; column < list->columnCount(); ++column)
            lines[size_t(row)].push_back(list->item(row, column) ? list->item(row, column)->text().toStdString() : "");
    return lines;
}

// Types the rows and leaves the last field, which refreshes the preview.
void TypeRows(CGUISaveDlg &dialog, const std::vector<std::pair<const char *, const char *>> &rows)
{
    for (const auto &[field, text] : rows) Type(dialog, field, text);
    LeaveField(Edit(dialog, rows.back().first));
}

const std::string kLevel = "Water Level[meter]:Instantaneous", kFlow = "Discharge[liter/sec]:Accumulated",
                  kRain = "Rainfall[millimeter]:Step_Accumulated";
const Line kTitles = {"Date/time", "Ardmore level", "Ardmore flow", "Ardmore rain"};

TEST(SavePreview, ThreeItemsOf25StepsUnderTheDefaults)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), nullptr);
    EXPECT_EQ(dialog.PreviewListControl()->columnCount(), 0);  // empty until the first refresh
    testing_host::MessageBoxes boxes;
    LeaveField(Edit(dialog, "dataStartRowEdit"));
    const std::vector<Line> lines = Shown(dialog);
    ASSERT_EQ(lines.size(), 12u);
    // Ten hours, the time in the locale's words; the delete value an empty cell.
    EXPECT_EQ((std::vector<Line>{lines[0], lines[1], Line(lines[4].begin() + 1, lines[4].end()),
                                 Line(lines[11].begin() + 1, lines[11].end())}),
              (std::vector<Line>{{"", kLevel, kFlow, kRain}, kTitles, {"2.25", "16", ""}, {"5.75", "17.75", "9"}}));
    EXPECT_EQ(lines[2][0].rfind("2024-03-01", 0), 0u) << lines[2][0];
    EXPECT_NE(lines[11][0].find("9:00:00"), std::string::npos) << lines[11][0];

    // The box alone refreshes nothing; leaving a field does: -999 in its row and the values.
    Click(dialog, "useDeleteRow");
    EXPECT_EQ(Shown(dialog)[4][3], "");
    TypeRows(dialog, {{"deleteValueRowEdit", "1"}});
    EXPECT_EQ((Line{Shown(dialog)[0][0], Shown(dialog)[4][3]}), (Line{"-999", "-999"}));
    EXPECT_EQ(boxes.texts, Line{});
}

TEST(SavePreview, FormatColumnsDateTimeColumnAndNoSteps)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), nullptr);
    testing_host::MessageBoxes boxes;
    auto *combo = Find<QComboBox>(dialog, "format");
    Click(dialog, "multiColumns");  // commits and refreshes
    EXPECT_EQ(Shown(dialog)[2][0], "2024/03/01 00:00:00");  // the user's format gives the export's text
    combo->setEditText("YYYY|MM|DD|HH|mm|ss");
    LeaveField(combo);
    const std::vector<Line> lines = Shown(dialog);
    ASSERT_EQ(dialog.PreviewListControl()->columnCount(), 5 + 1 + 3);
    EXPECT_EQ(lines[3], (Line{"2024", "03", "01", "01", "00", "00", "1.75", "15.75", "1"}));
    EXPECT_EQ((Line{lines[0][6], lines[1][6]}), (Line{kLevel, "Ardmore level"}));
    EXPECT_EQ(boxes.texts, Line{});

    // A host object without time steps: titles and headers only.
    auto empty = ThreeGauges(0);
    CGUISaveDlg bare;
    bare.SetHost(empty.Get(), nullptr);
    LeaveField(Edit(bare, "unitRowEdit"));
    EXPECT_EQ(Shown(bare), (std::vector<Line>{{"", kLevel, kFlow, kRain}, kTitles}));
}

TEST(SavePreview, WrongRowsAreToldAndTheListStays)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), nullptr);
    LeaveField(Edit(dialog, "unitRowEdit"));
    const std::vector<Line> before = Shown(dialog);
    ASSERT_EQ(before.size(), 12u);

    // Told above the preview while the rows are typed, never in a box per field.
    testing_host::MessageBoxes boxes;
    auto *problem = Find<QLabel>(dialog, "previewProblem");
    Line told;
    TypeRows(dialog, {{"itemDescriptionRowEdit", "3"}});
    told.push_back(problem->text().toStdString());
    TypeRows(dialog, {{"itemDescriptionRowEdit", "1"}});
    told.push_back(problem->text().toStdString());
    TypeRows(dialog, {{"unitTypeRowEdit", "-1"}, {"valueTypeRowEdit", "-3"}, {"unitRowEdit", "-4"},
                      {"itemDescriptionRowEdit", "-2"}, {"dataStartRowEdit", "0"}});
    told.push_back(problem->text().toStdString());
    EXPECT_EQ(told, (Line{vantrel::LoadMessage(115), vantrel::LoadMessage(116), "Wrong number of the Data start row."}));
    EXPECT_EQ(boxes.texts, Line{});
    EXPECT_EQ(Shown(dialog), before);

    // Unit row 5 below data start row 3 passes here; on that row, as on the sheet, the values win.
    TypeRows(dialog, {{"unitTypeRowEdit", "1"}, {"valueTypeRowEdit", "1"}, {"itemDescriptionRowEdit", "2"},
                      {"dataStartRowEdit", "3"}, {"unitRowEdit", "5"}});
    EXPECT_TRUE(problem->isHidden());
    EXPECT_EQ((Line{Shown(dialog)[0][1], Shown(dialog)[4][1]}), (Line{"Water Level:Instantaneous", "2.25"}));
}

TEST(SavePreview, FloatsMeetTheDeleteValueNarrowed)
{
    using vantrel::dialogs::PreviewValueText;
    GermanLocale german;  // the texts keep their decimal point
    std::string text;
    EXPECT_TRUE(PreviewValueText(ItemDataTypeFloat, double(0.1f), 0.1, false, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeDouble, double(0.1f), 0.1, false, text));
    EXPECT_EQ(text, "0.1");
}

TEST(SaveDialogRun, CancelLeavesTheHostObjectAlone)
{
    auto series = save_testing::ThreeGauges(25, "StartRow=9;", "/kept/book.xlsx");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    MessageBoxWatcher boxes;
    bool shown = false;
    SaveDialogHook hook([&](CGUISaveDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&dialog, &shown] {
            shown = dialog.isVisible();
            // What was typed and refreshed doesn't reach the host object.
            Type(dialog, "filePath", "/elsewhere.xlsx");
            dialog.FillSavePreview();
            Click(dialog, "cancel");
        });
    });
    EXPECT_HR(E_ABORT, bridge->SaveDialog());
    EXPECT_TRUE(shown);
    EXPECT_EQ(boxes.texts, std::vector<std::string>());
    EXPECT_EQ(testing_host::Specification(series.Get()), "StartRow=9;");
    EXPECT_EQ(WorkbookPath(series.Get()), "/kept/book.xlsx");
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
}

TEST(SaveDialogRun, SampleSeriesByKeyboardAndMouseThenAgainFromItsTemplate)
{
    testing_host::TempDir folder;
    const std::string book = folder.File("gauges.xlsx"), layout = folder.File("layout.xml");
    auto series = testing_host::MakeSeries(Sample(), "DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;"
                                                     "UnitRow=3;ValueTypeRow=4;ExcelSheet=1,2;");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    ASSERT_HR(S_OK, bridge->ReadData());
    const auto seconds = [&series] {  // a time in a cell is the moment to the second
        std::vector<long long> whole;
        for (const DATE time : hostseries::ReadTimes(*series.Get())) whole.push_back(std::llround(time * 86400));
        return whole;
    };
    const auto times = seconds();
    const auto flow = hostseries::ReadValues(*hostseries::ItemAt(*series.Get(), 2).Get());
    MessageBoxWatcher boxes;
    Texts walked;
    bool wholeCells = true;
    SaveDialogHook hook([&](CGUISaveDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&] {
            KeyIn(dialog, "filePath", book);
            walked = WalkWithTab();
            Press(dialog, "multiColumns");
            // The sample's rows in reading order, each field left with Tab.
            for (const auto &[field, text] : {std::pair{"format", "YYYY-MM-DD HH:mm"}, {"unitTypeRowEdit", "2"},
                                              {"unitRowEdit", "3"}, {"valueTypeRowEdit", "4"},
                                              {"itemDescriptionRowEdit", "1"}, {"dataStartRowEdit", "5"}}) {
                KeyIn(dialog, field, text);
                PressTab();
            }
            QTableWidget *list = dialog.PreviewListControl();
            for (int row = 0; row < list->rowCount(); ++row)
                for (int column = 0; column < list->columnCount(); ++column)
                    if (const QTableWidgetItem *cell = list->item(row, column))
                        wholeCells &= list->fontMetrics().horizontalAdvance(cell->text()) < list->columnWidth(column);
            Press(dialog, "saveTemplate");
            KeyIn(dialog, "templatePath", layout);
            Press(dialog, "ok");
            if (dialog.isVisible()) dialog.reject();  // refused: the test tells by the missing workbook
        });
    });
    EXPECT_HR(S_OK, bridge->SaveDialog());
    EXPECT_EQ(walked, (Texts{"browseFile", "noTemplate", "dateTimeColumnEdit", "multiColumns", "unitTypeRowEdit",
                             "unitRowEdit", "valueTypeRowEdit", "itemDescriptionRowEdit", "dataStartRowEdit",
                             "useDeleteRow", "previewList", "ok", "cancel"}));
    EXPECT_TRUE(wholeCells);
    EXPECT_EQ(boxes.texts, Texts{});
    const std::string spec = "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm;StartRow=5;UnitTypeRow=2;UnitRow=3;"
                             "ValueTypeRow=4;ItemDescriptionRow=1;TemplateFilePath=" + layout + ";FilePath=";
    EXPECT_EQ(testing_host::Specification(series.Get()), spec + book + ";");

    // The template fills a new dialog alike; what it exports imports as the sample did.
    SaveDialogHook again([&](CGUISaveDlg &dialog) {
        QTimer::singleShot(0, &dialog, [&] {
            Press(dialog, "useTemplate");
            ChooseInFileDialog(layout);
            Press(dialog, "browseTemplate");
            KeyIn(dialog, "filePath", folder.File("again.xlsx"));
            Press(dialog, "ok");
            if (dialog.isVisible()) dialog.reject();
        });
    });
    EXPECT_HR(S_OK, bridge->SaveDialog());
    EXPECT_EQ(testing_host::Specification(series.Get()), spec + folder.File("again.xlsx") + ";");
    EXPECT_HR(S_OK, bridge->ReadData());
    EXPECT_EQ(seconds(), times);
    EXPECT_EQ(hostseries::ReadValues(*hostseries::ItemAt(*series.Get(), 2).Get()), flow);
    EXPECT_EQ(CBridgePreviewAccess::Session(*Object(bridge)), nullptr);
}

}  // namespace
