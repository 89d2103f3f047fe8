// SPDX-License-Identifier: MIT
// dialog_pictures: renders each page of the open dialog, filled from a
// sample workbook, into PNG files, so that a reader sees the dialog before
// running it.
//
//   dialog_pictures BOOK FOLDER
//
// It runs on Qt's offscreen platform unless another is named, and writes
// open_dialog_time.png, open_dialog_data.png and open_dialog_preview.png.
#include <cstdlib>
#include <iostream>
#include <string>

#include <QApplication>
#include <QCheckBox>
#include <QFocusEvent>
#include <QMouseEvent>
#include <QRadioButton>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "dialogs/open_dialog.h"
#include "shell/message_box.h"

namespace {

void Type(CGUIOpenDlg &dialog, const char *field, const char *text)
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

bool Save(CGUIOpenDlg &dialog, const std::string &folder, const char *name)
{
    const std::string path = folder + "/" + name;
    if (dialog.grab().save(QString::fromStdString(path))) return true;
    std::cerr << "dialog_pictures: cannot write " << path << "\n";
    return false;
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

    CGUIOpenDlg dialog;
    dialog.SetHost(series.Get(), static_cast<CExcelVantrel *>(bridge.Get()));
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
    return saved ? 0 : 1;
}
