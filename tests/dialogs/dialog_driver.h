// SPDX-License-Identifier: MIT
// Driving the dialogs in tests: their controls, their key strings, and modal
// windows (file choosers, message boxes) acted on while a modal loop runs.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <clocale>
#include <cstdlib>
#include <functional>
#include <initializer_list>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <QAbstractButton>
#include <QApplication>
#include <QCheckBox>
#include <QComboBox>
#include <QFileDialog>
#include <QFocusEvent>
#include <QLineEdit>
#include <QMessageBox>
#include <QTableWidget>
#include <QTabBar>
#include <QTest>
#include <QTimer>

#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "dialogs/dialog_to_string.h"
#include "dialogs/open_dialog.h"
#include "dialogs/open_dialog_runner.h"
#include "dialogs/save_dialog.h"
#include "dialogs/save_dialog_runner.h"
#include "module/string_table.h"
#include "specification/specification.h"
#include "support/bridge_factory.h"
#include "support/expect_hr.h"
#include "support/files.h"
#include "support/message_boxes.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace dialog_testing {

using Texts = std::vector<std::string>;

inline std::string Fixture(const std::string &name) { return VANTREL_SOURCE_DIR "/tests/dialogs/data/" + name; }
inline std::string Sample() { return VANTREL_SOURCE_DIR "/samples/hydrometric.xlsx"; }

inline CExcelVantrel *Object(const automation::ComPtr<IVantrel> &bridge)
{
    return static_cast<CExcelVantrel *>(bridge.Get());
}

inline std::string WorkbookPath(IHostSeries *series)
{
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    automation::Bstr path;
    connection->GetFilePath(path.Out());
    return path.Utf8();
}

// The specification string a dialog's committed fields give.
inline std::string Keys(const CDialogKeySource &dialog)
{
    CSpecification specification;
    std::string spec;
    DialogToString(specification, dialog, spec);
    return spec;
}

// A named control; a missing one fails the test.
template <typename Widget>
Widget *Find(QWidget &parent, const char *name)
{
    auto *widget = parent.findChild<Widget *>(name);
    EXPECT_NE(widget, nullptr) << name;
    return widget;
}

inline QLineEdit *Edit(QWidget &parent, const char *name) { return Find<QLineEdit>(parent, name); }
inline void Type(QWidget &parent, const char *name, const std::string &text)
{
    Edit(parent, name)->setText(QString::fromStdString(text));
}
inline void Type(QWidget &parent, std::initializer_list<std::pair<const char *, std::string>> fields)
{
    for (const auto &[name, text] : fields) Type(parent, name, text);
}
inline void Click(QWidget &parent, const char *name) { Find<QAbstractButton>(parent, name)->click(); }
inline void Click(QWidget &parent, std::initializer_list<const char *> buttons)
{
    for (const char *name : buttons) Click(parent, name);
}

// A person at the keyboard and mouse: a field clicked, its text selected and
// typed over; a button, box, radio or tab clicked; the Tab key pressed.
inline void KeyIn(QWidget &parent, const char *name, const std::string &text)
{
    QWidget *field = Find<QWidget>(parent, name);
    field->window()->activateWindow();
    EXPECT_TRUE(QTest::qWaitForWindowActive(field->window()));
    field->setFocus(Qt::MouseFocusReason);
    QTest::keyClick(field, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(field, Qt::Key_Backspace);
    QTest::keyClicks(field, QString::fromStdString(text));
}
inline void Press(QWidget &parent, const char *name)
{
    QWidget *widget = Find<QWidget>(parent, name);  // on its box or circle, left of the stretch
    QTest::mouseClick(widget, Qt::LeftButton, {}, QPoint(std::min(8, widget->width() / 2), widget->height() / 2));
}
inline void PressTab()
{
    ASSERT_NE(QApplication::focusWidget(), nullptr);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
}
// The controls the Tab key reaches, up to Cancel.
inline std::vector<std::string> WalkWithTab()
{
    std::vector<std::string> walked;
    while (walked.size() < 24 && (walked.empty() || walked.back() != "cancel")) {
        PressTab();
        walked.push_back(QApplication::focusWidget()->objectName().toStdString());
    }
    return walked;
}
inline void ShowTab(CGUIOpenDlg &dialog, int index)
{
    QTabBar *bar = dialog.TabSheet().Bar();
    QTest::mouseClick(bar, Qt::LeftButton, {}, bar->tabRect(index).center());
}

// Sends the focus-leaving that a user's Tab key gives.
inline void LeaveField(QWidget *widget)
{
    QFocusEvent event(QEvent::FocusOut, Qt::TabFocusReason);
    QApplication::sendEvent(widget, &event);
}

// Runs act with the dialog once the bridge has it up, before its modal loop.
template <typename Dialog, void (*Set)(std::function<void(Dialog &)>)>
struct DialogHook {
    explicit DialogHook(std::function<void(Dialog &)> act) { Set(std::move(act)); }
    ~DialogHook() { Set({}); }
};
using OpenDialogHook = DialogHook<CGUIOpenDlg, vantrel::dialogs::SetOpenDialogHook>;
using SaveDialogHook = DialogHook<CGUISaveDlg, vantrel::dialogs::SetSaveDialogHook>;

// Picks path in the next file chooser (cancels it for an empty path), typed
// into its name field as a person would (selectFile leaves a focused name
// field alone); look sees the chooser first. A chooser that never comes fails
// the test after a few seconds instead of hanging it.
inline void ChooseInFileDialog(const std::string &path, std::function<void(QFileDialog &)> look = {})
{
    auto *timer = new QTimer;
    auto polls = std::make_shared<int>(0);
    QObject::connect(timer, &QTimer::timeout, [timer, polls, path, look] {
        auto *chooser = qobject_cast<QFileDialog *>(QApplication::activeModalWidget());
        bool done = false;
        if (auto *name = chooser ? chooser->findChild<QLineEdit *>("fileNameEdit") : nullptr) {
            if (look) look(*chooser);
            name->setText(QString::fromStdString(path));
            path.empty() ? chooser->reject() : void(QMetaObject::invokeMethod(chooser, "accept"));
            done = !chooser->isVisible();
        }
        if (!done && ++*polls > 500) {
            ADD_FAILURE() << "no file chooser took " << path;
            // Every modal window closed, a box over the chooser included: a
            // failure never leaves a modal loop running.
            for (int i = 0; i < 8 && QApplication::activeModalWidget(); ++i) QApplication::activeModalWidget()->close();
            done = true;
        }
        if (done) {
            timer->stop();
            timer->deleteLater();
        }
    });
    timer->start(10);
}

// Answers every real modal message box shown while it lives, and keeps their
// texts and captions.
class MessageBoxWatcher {
public:
    MessageBoxWatcher()
    {
        QObject::connect(&timer_, &QTimer::timeout, [this] {
            if (auto *box = qobject_cast<QMessageBox *>(QApplication::activeModalWidget())) {
                texts.push_back(box->text().toStdString());
                captions.push_back(box->windowTitle().toStdString());
                icons.push_back(box->icon());
                box->accept();
            }
        });
        timer_.start(10);
    }
    std::vector<std::string> texts, captions;
    std::vector<QMessageBox::Icon> icons;

private:
    QTimer timer_;
};

// A German user's locale, where numbers have a decimal comma, in the C library
// (setlocale) and in LC_ALL, which a Qt application made meanwhile takes up,
// while it lives. A machine without it fails the test.
class GermanLocale {
public:
    static constexpr const char *kName = "de_DE.UTF-8";
    GermanLocale() : previousLocale_(std::setlocale(LC_ALL, nullptr))
    {
        const char *variable = std::getenv("LC_ALL");
        if (variable) previousVariable_ = variable;
        setenv("LC_ALL", kName, 1);
        EXPECT_NE(std::setlocale(LC_ALL, kName), nullptr)
            << "the locale " << kName << " is missing: scripts/install-packages.sh generates it";
        EXPECT_EQ(std::string(std::localeconv()->decimal_point), ",");
    }
    ~GermanLocale()
    {
        previousVariable_ ? setenv("LC_ALL", previousVariable_->c_str(), 1) : unsetenv("LC_ALL");
        std::setlocale(LC_ALL, previousLocale_.c_str());
    }
    GermanLocale(const GermanLocale &) = delete;
    GermanLocale &operator=(const GermanLocale &) = delete;

private:
    std::string previousLocale_;
    std::optional<std::string> previousVariable_;
};

}  // namespace dialog_testing
