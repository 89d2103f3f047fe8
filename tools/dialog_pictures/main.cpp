// SPDX-License-Identifier: MIT
// dialog_pictures: renders each page of the open dialog, filled from a
// sample workbook, and the save dialog over the series imported from it,
// into PNG files, so that a reader sees the dialogs before running them.
//
//   dialog_pictures BOOK FOLDER
//
// It runs on Qt's offscreen platform unless another is named, and writes
// open_dialog_time.png, open_dialog_data.png, open_dialog_preview.png,
// save_dialog.png and save_dialog_layout.png.
#include <cstdlib>
#include <iostream>
#include <string>

#include <QApplication>
#include <QCheckBox>
#include <QComboBox>
#include <QFocusEvent>
#include <QMouseEvent>
#include <QRadioButton>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "dialogs/open_dialog.h"
#include "dialogs/save_dialog.h"
#include "shell/message_box.h"

namespace {

void Type(QDialog &dialog, const char *field, const char *text)
{
    dialog.findChild<QLineEdit *>(field)->setText(QString::fromUtf8(text));
}

void LeaveField(QWidget *widget)
{
    QFocusEvent event(QEvent::FocusOut, Qt::TabFocusReason);
    QApplication::sendEvent(widget, &event);
}

// A left click on a tab, as the tab control hears it.
void ShowTab(CGUIOpenDlg &dialog, int index)
{
    QTabBar *bar = dialog.TabSheet().Bar();
    const QPointF at = bar->tabRect(index).center();
    QMouseEvent press(QEvent::MouseButtonPress, at, bar->mapToGlobal(at), Qt::LeftButton, Qt::LeftButton,
                      Qt::NoModifier);
    QApplication::sendEvent(bar, &press);
    QMouseEvent release(QEvent::MouseButtonRelease, at, bar->mapToGlobal(at), Qt::LeftButton, Qt::NoButton,
                        Qt::NoModifier);
    QApplication::sendEvent(bar, &release);
    QApplication::processEvents();
}

bool Save(QDialog &dialog, const std::string &folder, const char *name)
{
    const std::string path = folder + "/" + name;
    if (dialog.grab().save(QString::fromStdString(path))) return true;
    std::cerr << "dialog_pictures: cannot write " << path << "\n";
    return false;
}

// The three pages of the open dialog, filled for the sample.
bool OpenDialogPictures(IHostSeries &series, IVantrel &bridge, const std::string &book, const std::string &folder)
{
    CGUIOpenDlg dialog;
    dialog.SetHost(&series, static_cast<CExcelVantrel *>(&bridge));
    dialog.resize(760, 640);
    dialog.show();
    QApplication::processEvents();

    // The sample's layout: date/time in column 1, attributes in rows 2 to 4,
    // titles in row 1, data from row 5, both sheets.
    Type(dialog, "filePath", book.c_str());
    Type(dialog, "excelSheets", "1,2");
    dialog.findChild<QRadioButton *>("noTemplate")->click();
    LeaveField(dialog.findChild<QLineEdit *>("excelSheets"));
    dialog.findChild<QCheckBox *>("dateTimeFormatBox")->click();
    dialog.findChild<QCheckBox *>("dateTimeFormatBox")->click();
    bool saved = Save(dialog, folder, "open_dialog_time.png");

    ShowTab(dialog, 1);
    for (const char *radio : {"itemTypeInRow", "unitInRow", "valueTypeInRow"})
        dialog.findChild<QRadioButton *>(radio)->click();
    Type(dialog, "itemTypeRowEdit", "2");
    Type(dialog, "unitRowEdit", "3");
    Type(dialog, "valueTypeRowEdit", "4");
    Type(dialog, "itemDescriptionRowEdit", "1");
    Type(dialog, "startRowEdit", "5");
    saved = Save(dialog, folder, "open_dialog_data.png") && saved;

    ShowTab(dialog, 2);
    saved = Save(dialog, folder, "open_dialog_preview.png") && saved;
    dialog.reject();
    return saved;
}

// The save dialog over the series imported from the sample: first as it
// opens, then with a format of the user's, a delete value row and the header
// rows apart.
bool SaveDialogPictures(IHostSeries &series, IVantrel &bridge, const std::string &book, const std::string &folder)
{
    automation::ComPtr<IHostConnection> connection;
    series.GetConnection(connection.Out());
    connection->SetFilePath(automation::Bstr(book).Get());
    connection->SetSpecification(
        automation::Bstr("DateTimeCol=1;StartRow=5;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ItemDescriptionRow=1;"
                         "ExcelSheet=1;")
            .Get());
    if (FAILED(bridge.ReadData())) {
        std::cerr << "dialog_pictures: the sample could not be read\n";
        return false;
    }

    CGUISaveDlg dialog;
    dialog.SetHost(&series, static_cast<CExcelVantrel *>(&bridge));
    dialog.resize(760, 700);
    dialog.show();
    QApplication::processEvents();
    Type(dialog, "filePath", "gauges.xlsx");
    LeaveField(dialog.findChild<QLineEdit *>("dataStartRowEdit"));
    bool saved = Save(dialog, folder, "save_dialog.png");

    dialog.findChild<QCheckBox *>("multiColumns")->click();
    dialog.findChild<QComboBox *>("format")->setEditText("YYYY-MM-DD|HH:mm");
    dialog.findChild<QCheckBox *>("useDeleteRow")->click();
    Type(dialog, "unitTypeRowEdit", "2");
    Type(dialog, "unitRowEdit", "3");
    Type(dialog, "valueTypeRowEdit", "4");
    Type(dialog, "deleteValueRowEdit", "5");
    Type(dialog, "itemDescriptionRowEdit", "1");
    Type(dialog, "dataStartRowEdit", "6");
    LeaveField(dialog.findChild<QComboBox *>("format"));
    saved = Save(dialog, folder, "save_dialog_layout.png") && saved;
    dialog.reject();
    return saved;
}

}  // namespace

int main(int argc, char **argv)
{
    if (argc != 3) {
        std::cerr << "usage: dialog_pictures BOOK FOLDER\n";
        return 2;
    }
    const std::string book = argv[1];
    const std::string folder = argv[2];
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    QApplication application(argc, argv);
    // Messages would need a person; they go to stderr here.
    shell::ScopedMessageSink messages([](std::string_view text, std::string_view caption) {
        std::cerr << caption << ": " << text << "\n";
    });

    automation::ComPtr<IHostSeries> series;
    HostSeriesCreate(series.Out());
    automation::ComPtr<IVantrel> bridge;
    if (FAILED(CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()))) return 1;
    bridge->SetHostSeries(series.Get());
    bool saved = OpenDialogPictures(*series.Get(), *bridge.Get(), book, folder);
    saved = SaveDialogPictures(*series.Get(), *bridge.Get(), book, folder) && saved;
    return saved ? 0 : 1;
}
