// SPDX-License-Identifier: MIT
// The save dialog's preview, filled from the host object alone as a user
// brings it up: a number field left, the format box clicked.
#include <gtest/gtest.h>

#include <QCheckBox>
#include <QTableWidget>

#include "dialog_driver.h"
#include "dialogs/save_dialog.h"
#include "dialogs/save_preview.h"
#include "module/string_table.h"
#include "save_host.h"

using namespace dialog_testing;
using save_testing::ThreeGauges;
using Line = std::vector<std::string>;

namespace {

// The list control as the user sees it: every line, every column.
std::vector<Line> Shown(const CGUISaveDlg &dialog)
{
    const QTableWidget *list = dialog.PreviewListControl();
    std::vector<Line> lines;
    for (int row = 0; row < list->rowCount(); ++row) {
        Line line;
        for (int column = 0; column < list->columnCount(); ++column) {
            const QTableWidgetItem *item = list->item(row, column);
            line.push_back(item ? item->text().toStdString() : std::string());
        }
        lines.push_back(line);
    }
    return lines;
}

void Type(CGUISaveDlg &dialog, const char *field, const char *text)
{
    dialog.findChild<QLineEdit *>(field)->setText(QString::fromUtf8(text));
}

// Types the rows and leaves the last field, which refreshes the preview.
void TypeRows(CGUISaveDlg &dialog, const std::vector<std::pair<const char *, const char *>> &rows)
{
    for (const auto &[field, text] : rows) Type(dialog, field, text);
    LeaveField(dialog.findChild<QLineEdit *>(rows.back().first));
}

const char *const kHeaders[] = {"Water Level[meter]:Instantaneous", "Discharge[liter/sec]:Accumulated",
                                "Rainfall[millimeter]:Step_Accumulated"};

TEST(SavePreview, ThreeItemsOf25StepsUnderTheDefaults)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    ASSERT_TRUE(dialog.SetHost(series.Get(), nullptr));
    EXPECT_EQ(dialog.PreviewListControl()->columnCount(), 0);  // empty until the first refresh
    CapturedMessages boxes;
    LeaveField(dialog.findChild<QLineEdit *>("dataStartRowEdit"));
    EXPECT_TRUE(boxes.shown.empty());

    const std::vector<Line> lines = Shown(dialog);
    ASSERT_EQ(dialog.PreviewListControl()->columnCount(), 4);
    ASSERT_EQ(lines.size(), 12u);
    EXPECT_EQ(lines[0], (Line{"", kHeaders[0], kHeaders[1], kHeaders[2]}));
    EXPECT_EQ(lines[1], (Line{"Date/time", "Ardmore level", "Ardmore flow", "Ardmore rain"}));
    // The first ten hours; the time is a date cell turned into text.
    for (int t = 0; t < 10; ++t) {
        const Line &line = lines[size_t(2 + t)];
        // The locale's words: the date, and the time of day unless it is midnight.
        EXPECT_EQ(line[0].rfind("2024-03-01", 0), 0u) << line[0];
        if (t > 0) {
            EXPECT_NE(line[0].find(std::to_string(t) + ":00:00"), std::string::npos) << line[0];
        }
        char level[16], flow[16];
        std::snprintf(level, sizeof level, "%g", 1.25 + 0.5 * t);
        std::snprintf(flow, sizeof flow, "%g", 15.5 + 0.25 * t);
        EXPECT_EQ(line[1], level);
        EXPECT_EQ(line[2], flow);
        // The delete value is an empty cell while no delete value row is written.
        EXPECT_EQ(line[3], t == 2 ? "" : std::to_string(t));
    }

    // Checking the box alone refreshes nothing; leaving a field does, and the
    // delete value then stands in its row, column 1, and in the values.
    dialog.findChild<QCheckBox *>("useDeleteRow")->click();
    EXPECT_EQ(Shown(dialog)[4][3], "");
    TypeRows(dialog, {{"deleteValueRowEdit", "1"}});
    const std::vector<Line> withDeleteRow = Shown(dialog);
    EXPECT_EQ(withDeleteRow[0], (Line{"-999", kHeaders[0], kHeaders[1], kHeaders[2]}));
    EXPECT_EQ(withDeleteRow[4][3], "-999");
    EXPECT_TRUE(boxes.shown.empty());
}

TEST(SavePreview, RowsOfTheExampleSplitTheHeaders)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), nullptr);
    CapturedMessages boxes;
    TypeRows(dialog, {{"unitTypeRowEdit", "1"},
                      {"unitRowEdit", "2"},
                      {"valueTypeRowEdit", "1"},
                      {"itemDescriptionRowEdit", "3"},
                      {"dataStartRowEdit", "4"}});
    EXPECT_TRUE(boxes.shown.empty());
    const std::vector<Line> lines = Shown(dialog);
    ASSERT_EQ(lines.size(), 13u);
    EXPECT_EQ(lines[0], (Line{"", "Water Level:Instantaneous", "Discharge:Accumulated", "Rainfall:Step_Accumulated"}));
    EXPECT_EQ(lines[1], (Line{"", "meter", "liter/sec", "millimeter"}));
    EXPECT_EQ(lines[2], (Line{"Date/time", "Ardmore level", "Ardmore flow", "Ardmore rain"}));
    EXPECT_EQ(lines[3][1], "1.25");
    EXPECT_EQ(lines[12][1], "5.75");

    // All three rows apart: one text each.
    TypeRows(dialog, {{"valueTypeRowEdit", "4"}, {"itemDescriptionRowEdit", "5"}, {"dataStartRowEdit", "6"}});
    const std::vector<Line> apart = Shown(dialog);
    ASSERT_EQ(apart.size(), 15u);
    EXPECT_EQ(apart[0][1], "Water Level");
    EXPECT_EQ(apart[1][1], "meter");
    EXPECT_EQ(apart[3][1], "Instantaneous");
    EXPECT_EQ(apart[4][0], "Date/time");
}

TEST(SavePreview, FormatColumnsDateTimeColumnAndNoSteps)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), nullptr);
    CapturedMessages boxes;
    auto *combo = dialog.findChild<QComboBox *>("format");
    dialog.findChild<QCheckBox *>("multiColumns")->click();  // commits and refreshes
    EXPECT_TRUE(combo->isEnabled());
    EXPECT_EQ(Shown(dialog)[2][0], "2024/03/01 00:00:00");  // the user's format gives the export's text
    combo->setEditText("YYYY|MM|DD|HH|mm|ss");
    LeaveField(combo);
    EXPECT_EQ(combo->count(), 10);  // a preset: nothing added
    std::vector<Line> lines = Shown(dialog);
    ASSERT_EQ(dialog.PreviewListControl()->columnCount(), 1 + 5 + 3);
    EXPECT_EQ((Line(lines[1].begin() + 6, lines[1].end())), (Line{"Ardmore level", "Ardmore flow", "Ardmore rain"}));
    EXPECT_EQ((Line(lines[3].begin(), lines[3].begin() + 6)), (Line{"2024", "03", "01", "01", "00", "00"}));
    EXPECT_EQ(lines[0][6], kHeaders[0]);

    // The date/time moved to column 3: two empty columns before it; the
    // delete value still stands in column 1.
    dialog.findChild<QCheckBox *>("multiColumns")->click();
    dialog.findChild<QCheckBox *>("useDeleteRow")->click();
    TypeRows(dialog, {{"deleteValueRowEdit", "1"}, {"dateTimeColumnEdit", "3"}});
    lines = Shown(dialog);
    ASSERT_EQ(dialog.PreviewListControl()->columnCount(), 2 + 1 + 3);
    EXPECT_EQ(lines[0], (Line{"-999", "", "", kHeaders[0], kHeaders[1], kHeaders[2]}));
    EXPECT_EQ(lines[1], (Line{"", "", "Date/time", "Ardmore level", "Ardmore flow", "Ardmore rain"}));
    EXPECT_TRUE(boxes.shown.empty());

    // A host object without time steps: titles and headers, s - 1 lines.
    auto empty = ThreeGauges(0);
    CGUISaveDlg bare;
    bare.SetHost(empty.Get(), nullptr);
    LeaveField(bare.findChild<QLineEdit *>("unitRowEdit"));
    lines = Shown(bare);
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(lines[1], (Line{"Date/time", "Ardmore level", "Ardmore flow", "Ardmore rain"}));
}

TEST(SavePreview, WrongRowsAreToldAndTheListStays)
{
    auto series = ThreeGauges();
    CGUISaveDlg dialog;
    dialog.SetHost(series.Get(), nullptr);
    LeaveField(dialog.findChild<QLineEdit *>("unitRowEdit"));
    const std::vector<Line> before = Shown(dialog);
    ASSERT_EQ(before.size(), 12u);

    CapturedMessages boxes;
    TypeRows(dialog, {{"itemDescriptionRowEdit", "3"}});
    TypeRows(dialog, {{"itemDescriptionRowEdit", "1"}});
    TypeRows(dialog, {{"unitTypeRowEdit", "-1"}, {"valueTypeRowEdit", "-3"}, {"unitRowEdit", "-4"},
                      {"itemDescriptionRowEdit", "-2"}, {"dataStartRowEdit", "0"}});
    ASSERT_EQ(boxes.shown.size(), 3u);
    EXPECT_EQ(boxes.shown[0].text, vantrel::LoadMessage(115));
    EXPECT_EQ(boxes.shown[1].text, vantrel::LoadMessage(116));
    EXPECT_EQ(boxes.shown[2].text, "Wrong number of the Data start row.");
    EXPECT_EQ(boxes.shown[2].caption, "Excel Vantrel");
    EXPECT_EQ(Shown(dialog), before);

    // Unit row 5 with data start row 3 passes the preview's check.
    TypeRows(dialog, {{"unitTypeRowEdit", "1"}, {"valueTypeRowEdit", "1"}, {"itemDescriptionRowEdit", "2"},
                      {"dataStartRowEdit", "3"}, {"unitRowEdit", "5"}});
    EXPECT_EQ(boxes.shown.size(), 3u);
    EXPECT_EQ(Shown(dialog)[0][1], "Water Level:Instantaneous");
    // Row 5 is also the third step's row: there, as on the sheet, the values win.
    EXPECT_EQ(Shown(dialog)[4][1], "2.25");
}

TEST(SavePreview, ValueTextsByDataType)
{
    using vantrel::dialogs::PreviewValueText;
    std::string text;
    // Floats compare with the delete value narrowed, doubles exactly.
    EXPECT_TRUE(PreviewValueText(ItemDataTypeFloat, double(0.1f), 0.1, false, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeDouble, double(0.1f), 0.1, false, text));
    EXPECT_EQ(text, "0.1");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeDouble, 0.1, 0.1, true, text));
    EXPECT_EQ(text, "0.1");
    // Integers against the delete value cut to their width.
    EXPECT_TRUE(PreviewValueText(ItemDataTypeInt32, -999, -999.7, false, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeInt32, 7, 1e300, false, text));
    EXPECT_EQ(text, "7");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeUInt32, 3000000000.0, -1, false, text));
    EXPECT_EQ(text, "-1294967296");  // "%d" of the same 32 bits
    EXPECT_TRUE(PreviewValueText(ItemDataTypeUInt32, 4294967295.0, -1, false, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeInt16, -5, 65531, false, text));
    EXPECT_EQ(text, "");  // the low 16 bits agree
    EXPECT_TRUE(PreviewValueText(ItemDataTypeInt16, -5, 0, false, text));
    EXPECT_EQ(text, "-5");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeUInt16, 65535, -1, false, text));
    EXPECT_EQ(text, "");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeUInt16, 65535, 0, false, text));
    EXPECT_EQ(text, "65535");
    EXPECT_TRUE(PreviewValueText(ItemDataTypeFloat, 2.5, std::nan(""), false, text));
    EXPECT_EQ(text, "2.5");
    // An unhandled type gives no text at all.
    EXPECT_FALSE(PreviewValueText(ItemDataType(3), 1, 0, false, text));
    EXPECT_FALSE(PreviewValueText(ItemDataType(9), 1, 0, true, text));
}

}  // namespace
