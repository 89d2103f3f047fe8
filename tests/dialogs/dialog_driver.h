// SPDX-License-Identifier: MIT
// Driving the open dialog in tests: a widget application for the whole test
// program, the bridge and host object it works on, and helpers that act on
// modal windows (file choosers, message boxes) while a modal loop runs.
#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include <QApplication>
#include <QFileDialog>
#include <QFocusEvent>
#include <QLineEdit>
#include <QMessageBox>
#include <QTimer>

#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "shell/message_box.h"
#include "support/expect_hr.h"
#include "support/test_host.h"

namespace dialog_testing {

inline std::string Fixture(const std::string &name)
{
    return std::string(VANTREL_SOURCE_DIR) + "/tests/dialogs/data/" + name;
}

inline std::string Sample() { return std::string(VANTREL_SOURCE_DIR) + "/samples/hydrometric.xlsx"; }

inline automation::ComPtr<IVantrel> MakeBridge()
{
    automation::ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    return bridge;
}

inline CExcelVantrel *Object(const automation::ComPtr<IVantrel> &bridge)
{
    return static_cast<CExcelVantrel *>(bridge.Get());
}

inline std::string FilePath(IHostSeries *series)
{
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    automation::Bstr path;
    connection->GetFilePath(path.Out());
    return path.Utf8();
}

// A message box as the platform was asked to show it.
struct Message {
    std::string text;
    std::string caption;
};

// Collects the message boxes shown while it lives (outside a running dialog).
struct CapturedMessages {
    std::vector<Message> shown;
    shell::ScopedMessageSink sink{[this](std::string_view text, std::string_view caption) {
        shown.push_back({std::string(text), std::string(caption)});
    }};
};

// Sends the focus-leaving that a user's Tab key gives.
inline void LeaveField(QWidget *widget)
{
    QFocusEvent event(QEvent::FocusOut, Qt::TabFocusReason);
    QApplication::sendEvent(widget, &event);
}

// Polls for a modal window and hands it to handler until handler says it
// acted. A window that never comes fails the test after a few seconds
// instead of hanging it.
inline void WhenModal(std::function<bool(QWidget *)> handler, const char *what)
{
    auto *timer = new QTimer;
    auto polls = std::make_shared<int>(0);
    QObject::connect(timer, &QTimer::timeout, [timer, polls, handler, what] {
        QWidget *modal = QApplication::activeModalWidget();
        if (modal && handler(modal)) {
            timer->stop();
            timer->deleteLater();
            return;
        }
        if (++*polls > 500) {
            ADD_FAILURE() << "no modal window for: " << what;
            timer->stop();
            timer->deleteLater();
            // Close every modal window, a box over the awaited one included,
            // so that a failure never leaves a modal loop running.
            for (int i = 0; i < 8 && QApplication::activeModalWidget(); ++i)
                QApplication::activeModalWidget()->close();
        }
    });
    timer->start(10);
}

// Picks path in the next file chooser, typed into its name field as a person
// would (selectFile leaves a focused name field alone); tries again until the
// chooser takes it.
inline void ChooseInFileDialog(const std::string &path)
{
    WhenModal(
        [path](QWidget *modal) {
            auto *chooser = qobject_cast<QFileDialog *>(modal);
            auto *name = chooser ? chooser->findChild<QLineEdit *>("fileNameEdit") : nullptr;
            if (!name) return false;
            name->setText(QString::fromStdString(path));
            QMetaObject::invokeMethod(chooser, "accept");
            return !chooser->isVisible();
        },
        "file chooser");
}

// Answers every message box that the dialog shows while it lives, and keeps
// their texts and captions.
class MessageBoxWatcher {
public:
    MessageBoxWatcher()
    {
        QObject::connect(&timer_, &QTimer::timeout, [this] {
            if (auto *box = qobject_cast<QMessageBox *>(QApplication::activeModalWidget())) {
                shown.push_back({box->text().toStdString(), box->windowTitle().toStdString()});
                box->accept();
            }
        });
        timer_.start(10);
    }
    std::vector<Message> shown;

private:
    QTimer timer_;
};

}  // namespace dialog_testing
