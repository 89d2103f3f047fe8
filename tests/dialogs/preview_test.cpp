// SPDX-License-Identifier: MIT
// The preview page on real workbooks: the raw cells above, the import's
// reading below, refreshed when the tab is shown.
#include <gtest/gtest.h>

#include <QTabBar>
#include <QTest>

#include "dialog_driver.h"

using namespace dialog_testing;
using vantrel::dialogs::PreviewList;

namespace {

Texts Headings(const PreviewList &list)
{
    Texts headings;
    for (const auto &column : list.columns) headings.push_back(column.heading);
    return headings;
}

using Lines = std::vector<Texts>;

// The dialog with the five-column workbook typed in and committed as a user
// would leave it: date/time in column 3, the attributes in rows 2 to 4.
struct FiveColumns {
    automation::ComPtr<IHostSeries> series = testing_host::MakeSeries("", "");
    automation::ComPtr<IVantrel> bridge = testing_host::MakeBridge();
    CGUIOpenDlg dialog;
    testing_host::MessageBoxes boxes;

    FiveColumns()
    {
        bridge->SetHostSeries(series.Get());
        dialog.SetHost(series.Get(), Object(bridge));
        dialog.show();
        // A typed path counts once a radio committed it and a field was left.
        Type(dialog, "filePath", Fixture("five_columns.xlsx"));
        Click(dialog, "noTemplate");
        LeaveField(Edit(dialog, "excelSheets"));
        Type(dialog, "dateTimeColEdit", "3");
        ShowTab(1);
        Click(dialog, {"itemTypeInRow", "unitInRow", "valueTypeInRow"});
        Type(dialog, {{"itemTypeRowEdit", "2"}, {"unitRowEdit", "3"}, {"valueTypeRowEdit", "4"},
                      {"itemDescriptionRowEdit", "1"}, {"startRowEdit", "5"}});
        Click(dialog, "deleteValueBox");
        Type(dialog, "deleteValue", "-999");
    }
    void ShowTab(int index) { dialog_testing::ShowTab(dialog, index); }
    const PreviewList &Upper() { return dialog.PreviewPage().Preview().SheetList(); }
    const PreviewList &Lower() { return dialog.PreviewPage().Preview().ResultList(); }
};

TEST(Preview, DateTimeInTheThirdOfFiveColumns)
{
    GermanLocale german;  // the texts keep their decimal point
    FiveColumns view;
    view.ShowTab(2);
    EXPECT_EQ(view.boxes.texts, Texts{});

    // Above: the sheet as it shows. Below: "DateTime", then columns 1, 2, 4, 5.
    ASSERT_EQ(view.Upper().lines.size(), 9u);
    EXPECT_EQ(view.Upper().lines[0], (Texts{"Alpha", "Beta", "Date/Time", "Delta", "Echo"}));
    EXPECT_EQ(Headings(view.Lower()), (Texts{"DateTime", "Alpha", "Beta", "Delta", "Echo"}));
    EXPECT_EQ(view.Lower().lines, (Lines{
        {"", "Water Level", "Discharge", "Rainfall", "Temperature"},
        {"", "meter", "liter/sec", "millimeter", "degree Celsius"},
        {"", "Instantaneous", "Accumulated", "Step_Accumulated", "Mean_Step_Accumulated"},
        {"2024/03/01 00:00:00", "1.5", "20.25", "0", "-2"},
        // -999 + 5e-9 and -999 + 1e-7 are both -999 as the import's floats: missing.
        {"2024/03/01 01:00:00", "2.5", "21.25", "", ""},
        {"2024/03/01 02:00:00", "3.5", "22.25", "1", "0"},
        {"2024/03/01 03:00:00", "4.5", "23.25", "1.5", "1"},
        {"2024/03/01 04:00:00", "5.5", "24.25", "2", "2"},
    }));
    // Like an import, the preview sets the host's delete value, and only that.
    DOUBLE deleteValue = 0.0;
    view.series->GetDeleteValue(&deleteValue);
    EXPECT_EQ(std::pair(deleteValue, testing_host::ItemCount(view.series.Get())), std::pair(-999.0, LONG(0)));

    // Under the default delete value real zeros stay; without a title row the columns name the items.
    view.ShowTab(1);
    KeyIn(view.dialog, "deleteValue", "-1e-30");
    KeyIn(view.dialog, "itemDescriptionRowEdit", "0");
    view.ShowTab(2);
    EXPECT_EQ(Headings(view.Lower()), (Texts{"DateTime", "A", "B", "D", "E"}));
    EXPECT_EQ((Texts{view.Lower().lines[3][3], view.Lower().lines[5][4]}), (Texts{"0", "0"}));
}

TEST(Preview, SettingsRefreshTheLowerListAndSheetsTheUpper)
{
    FiveColumns view;
    view.ShowTab(2);

    // A later start row: the lower list follows, the upper one is not read again.
    view.ShowTab(1);
    Type(view.dialog, "startRowEdit", "7");
    view.ShowTab(2);
    EXPECT_TRUE(view.dialog.PreviewPage().Preview().SheetListDone());
    ASSERT_EQ(view.Lower().lines.size(), 6u);
    EXPECT_EQ(view.Lower().lines[3][0], "2024/03/01 02:00:00");

    // A sheet with no cell: both lists follow the field at once, and the
    // inspection's refusal is told once.
    QLineEdit *sheets = Edit(view.dialog, "excelSheets");
    sheets->setText("2");
    LeaveField(sheets);
    EXPECT_TRUE(view.Upper().lines.empty());
    EXPECT_TRUE(view.Lower().lines.empty());
    EXPECT_NE(testing_host::Specification(view.series.Get()).find("ExcelSheet=2;"), std::string::npos);
    // A sheet the workbook lacks; no sheet in 1 to 10, which reads nothing.
    for (const char *text : {"5", "12"}) {
        sheets->setText(text);
        LeaveField(sheets);
    }
    const std::string no5 = "Preview dialog can not get the No. 5 sheet";
    EXPECT_EQ(view.boxes.texts, (Texts{"There is no data in the given sheet.", no5,
                                       "The sheet list \"12\" names no sheet to preview. Use sheet numbers from 1 to "
                                       "10, a range like 2-4, or all."}));
    view.dialog.reject();
}

}  // namespace
