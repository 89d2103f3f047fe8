// SPDX-License-Identifier: MIT
// The preview page on real workbooks: the raw cells above, the import's
// reading below, refreshed when the tab is shown.
#include <gtest/gtest.h>

#include <QCheckBox>
#include <QRadioButton>
#include <QTabBar>
#include <QTest>

#include "dialog_driver.h"
#include "dialogs/open_dialog.h"

using namespace dialog_testing;
using vantrel::dialogs::PreviewList;

namespace {

std::vector<std::string> Headings(const PreviewList &list)
{
    std::vector<std::string> headings;
    for (const auto &column : list.columns) headings.push_back(column.heading);
    return headings;
}

using Lines = std::vector<std::vector<std::string>>;

// The dialog with the five-column workbook typed in and committed as a user
// would leave it: date/time in column 3, the attributes in rows 2 to 4.
struct FiveColumns {
    automation::ComPtr<IHostSeries> series = testing_host::MakeSeries("", "");
    automation::ComPtr<IVantrel> bridge = MakeBridge();
    CGUIOpenDlg dialog;
    CapturedMessages boxes;

    FiveColumns()
    {
        bridge->SetHostSeries(series.Get());
        dialog.SetHost(series.Get(), Object(bridge));
        dialog.show();
        // A typed path counts once a radio committed it and a field was left.
        dialog.findChild<QLineEdit *>("filePath")->setText(QString::fromStdString(Fixture("five_columns.xlsx")));
        dialog.findChild<QRadioButton *>("noTemplate")->click();
        LeaveField(dialog.findChild<QLineEdit *>("excelSheets"));
        dialog.findChild<QLineEdit *>("dateTimeColEdit")->setText("3");
        ShowTab(1);
        for (const char *radio : {"itemTypeInRow", "unitInRow", "valueTypeInRow"})
            dialog.findChild<QRadioButton *>(radio)->click();
        const std::pair<const char *, const char *> rows[] = {
            {"itemTypeRowEdit", "2"}, {"unitRowEdit", "3"}, {"valueTypeRowEdit", "4"},
            {"itemDescriptionRowEdit", "1"}, {"startRowEdit", "5"}};
        for (const auto &[name, text] : rows) dialog.findChild<QLineEdit *>(name)->setText(text);
        dialog.findChild<QCheckBox *>("deleteValueBox")->click();
        dialog.findChild<QLineEdit *>("deleteValue")->setText("-999");
    }
    void ShowTab(int index)
    {
        QTabBar *bar = dialog.TabSheet().Bar();
        QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(index).center());
    }
    const PreviewList &Upper() { return dialog.PreviewPage().Preview().SheetList(); }
    const PreviewList &Lower() { return dialog.PreviewPage().Preview().ResultList(); }
};

TEST(Preview, DateTimeInTheThirdOfFiveColumns)
{
    FiveColumns view;
    view.ShowTab(2);
    EXPECT_TRUE(view.boxes.shown.empty()) << view.boxes.shown[0].text;

    // Above: the sheet as it shows, five columns, nine rows.
    const PreviewList &upper = view.Upper();
    ASSERT_EQ(upper.columns.size(), 5u);
    ASSERT_EQ(upper.lines.size(), 9u);
    EXPECT_EQ(upper.lines[0], (std::vector<std::string>{"Alpha", "Beta", "Date/Time", "Delta", "Echo"}));
    EXPECT_EQ(upper.lines[5][0], "2.5");

    // Below: "DateTime", then the items of columns 1, 2, 4 and 5 in this order.
    const PreviewList &lower = view.Lower();
    EXPECT_EQ(Headings(lower), (std::vector<std::string>{"DateTime", "Alpha", "Beta", "Delta", "Echo"}));
    const Lines expected = {
        {"", "Water Level", "Discharge", "Rainfall", "Temperature"},
        {"", "meter", "liter/sec", "millimeter", "degree Celsius"},
        {"", "Instantaneous", "Accumulated", "Step_Accumulated", "Mean_Step_Accumulated"},
        {"2024/03/01 00:00:00", "1.5", "20.25", "0", "-2"},
        // -999 + 5e-9 is the delete value within 1e-8; -999 + 1e-7 is a number.
        {"2024/03/01 01:00:00", "2.5", "21.25", "", "-999"},
        {"2024/03/01 02:00:00", "3.5", "22.25", "1", "0"},
        {"2024/03/01 03:00:00", "4.5", "23.25", "1.5", "1"},
        {"2024/03/01 04:00:00", "5.5", "24.25", "2", "2"},
    };
    EXPECT_EQ(lower.lines, expected);

    // The page draws what it read.
    QTableWidget *control = view.dialog.PreviewPage().ResultListControl();
    ASSERT_EQ(control->columnCount(), 5);
    EXPECT_EQ(control->horizontalHeaderItem(0)->text().toStdString(), "DateTime");
    EXPECT_EQ(control->item(4, 3)->text().toStdString(), "");
    EXPECT_EQ(control->item(3, 1)->text().toStdString(), "1.5");
    EXPECT_EQ(view.dialog.PreviewPage().SheetListControl()->rowCount(), 9);

    // Like an import, the preview sets the host's delete value, and only that.
    DOUBLE deleteValue = 0.0;
    view.series->GetDeleteValue(&deleteValue);
    EXPECT_EQ(deleteValue, -999.0);
    EXPECT_EQ(testing_host::ItemCount(view.series.Get()), 0);
    view.dialog.reject();
}

TEST(Preview, SettingsRefreshTheLowerListAndSheetsTheUpper)
{
    FiveColumns view;
    view.ShowTab(2);
    ASSERT_EQ(view.Lower().lines.size(), 8u);

    // A later start row: the lower list follows, the upper one is not read again.
    view.ShowTab(1);
    view.dialog.findChild<QLineEdit *>("startRowEdit")->setText("7");
    view.ShowTab(2);
    EXPECT_TRUE(view.dialog.PreviewPage().Preview().SheetListDone());
    ASSERT_EQ(view.Lower().lines.size(), 6u);
    EXPECT_EQ(view.Lower().lines[3][0], "2024/03/01 02:00:00");

    // A first sheet with no cell: the upper list follows the field at once and
    // says so; the lower list follows the string as it stood before this
    // commit, and comes into line at the next refresh, empty, since the
    // inspection refuses the sheet.
    QLineEdit *sheets = view.dialog.findChild<QLineEdit *>("excelSheets");
    sheets->setText("2");
    LeaveField(sheets);
    EXPECT_TRUE(view.Upper().lines.empty());
    ASSERT_FALSE(view.boxes.shown.empty());
    EXPECT_EQ(view.boxes.shown.back().text, "There is no data in the given sheet.");
    EXPECT_EQ(view.Lower().lines.size(), 6u);
    LeaveField(sheets);
    EXPECT_TRUE(view.Lower().lines.empty());
    EXPECT_NE(testing_host::Specification(view.series.Get()).find("ExcelSheet=2;"), std::string::npos);

    // A sheet the workbook lacks.
    sheets->setText("5");
    LeaveField(sheets);
    EXPECT_EQ(view.boxes.shown.back().text, "Preview dialog can not get the No. 5 sheet");

    // A text with no sheet in 1 to 10 is told, and the preview keeps its file.
    const size_t before = view.boxes.shown.size();
    sheets->setText("12");
    LeaveField(sheets);
    ASSERT_GT(view.boxes.shown.size(), before);
    EXPECT_EQ(view.boxes.shown[before].text,
              "The sheet list \"12\" names no sheet to preview. Use sheet numbers from 1 to 10, a range like 2-4, "
              "or all.");
    view.dialog.reject();
}

TEST(Preview, TypedPathCountsOnlyOnceCommitted)
{
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    CGUIOpenDlg dialog;
    dialog.SetHost(series.Get(), Object(bridge));
    dialog.show();
    QLineEdit *path = dialog.findChild<QLineEdit *>("filePath");
    path->setText(QString::fromStdString(Fixture("five_columns.xlsx")));
    LeaveField(path);  // the host gets the string as last committed: no path yet
    EXPECT_EQ(FilePath(series.Get()), "");
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;StartRow=3;GlobalUnitType=;GlobalUnit=;GlobalValueType=;ItemDescriptionRow=2;"
              "ExcelSheet=1;FilePath=;");
    QTabBar *bar = dialog.TabSheet().Bar();
    QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(2).center());
    EXPECT_TRUE(dialog.PreviewPage().Preview().SheetList().lines.empty());
    dialog.reject();
}

}  // namespace
