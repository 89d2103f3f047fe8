// SPDX-License-Identifier: MIT
// OpenDialog and SaveDialog in a host that runs no Qt application: without a
// display, or with an X display that doesn't answer, they fail with a reason
// instead of ending the process; with one they make the application for the
// dialog and take it down afterwards.
#include <gtest/gtest.h>

#include <cstdlib>

#include <QApplication>
#include <QPushButton>
#include <QTimer>

#include "dialog_driver.h"
#include "dialogs/open_dialog.h"
#include "dialogs/open_dialog_runner.h"
#include "dialogs/save_dialog.h"
#include "dialogs/save_dialog_runner.h"

using namespace dialog_testing;

namespace {

TEST(OpenDialogWithoutApplication, NoDisplayGivesAReason)
{
    ASSERT_EQ(QCoreApplication::instance(), nullptr);
    const std::string platform = std::getenv("QT_QPA_PLATFORM") ? std::getenv("QT_QPA_PLATFORM") : "";
    unsetenv("QT_QPA_PLATFORM");
    unsetenv("DISPLAY");
    unsetenv("WAYLAND_DISPLAY");
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    SetErrorInfo(0, nullptr);
    EXPECT_HR(E_FAIL, bridge->OpenDialog());
    EXPECT_EQ(testing_host::TakeErrorDescription(),
              "The open dialog needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, or name a Qt "
              "platform in QT_QPA_PLATFORM.");
    EXPECT_EQ(QCoreApplication::instance(), nullptr);
    if (!platform.empty()) setenv("QT_QPA_PLATFORM", platform.c_str(), 1);
}

TEST(OpenDialogWithoutApplication, MadeForTheDialogAndGoneAfter)
{
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ASSERT_EQ(QCoreApplication::instance(), nullptr);
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    bool hadApplication = false;
    vantrel::dialogs::SetOpenDialogHook([&](CGUIOpenDlg &dialog) {
        hadApplication = qobject_cast<QApplication *>(QCoreApplication::instance()) != nullptr;
        QTimer::singleShot(0, &dialog, [&dialog] { dialog.findChild<QPushButton *>("cancel")->click(); });
    });
    EXPECT_HR(E_ABORT, bridge->OpenDialog());
    vantrel::dialogs::SetOpenDialogHook({});
    EXPECT_TRUE(hadApplication);
    EXPECT_EQ(QCoreApplication::instance(), nullptr);
}

TEST(SaveDialogWithoutApplication, NoDisplayOrOneThatDoesntAnswer)
{
    ASSERT_EQ(QCoreApplication::instance(), nullptr);
    const std::string platform = std::getenv("QT_QPA_PLATFORM") ? std::getenv("QT_QPA_PLATFORM") : "";
    unsetenv("QT_QPA_PLATFORM");
    unsetenv("WAYLAND_DISPLAY");
    auto series = testing_host::MakeSeries("", "StartRow=4;");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());

    setenv("DISPLAY", ":4242", 1);  // no X server listens there
    SetErrorInfo(0, nullptr);
    EXPECT_HR(E_FAIL, bridge->SaveDialog());
    EXPECT_EQ(testing_host::TakeErrorDescription(),
              "The save dialog needs a display, but the X display \":4242\" named in DISPLAY doesn't answer.");
    SetErrorInfo(0, nullptr);
    EXPECT_HR(E_FAIL, bridge->OpenDialog());
    EXPECT_EQ(testing_host::TakeErrorDescription(),
              "The open dialog needs a display, but the X display \":4242\" named in DISPLAY doesn't answer.");

    unsetenv("DISPLAY");
    SetErrorInfo(0, nullptr);
    EXPECT_HR(E_FAIL, bridge->SaveDialog());
    EXPECT_EQ(testing_host::TakeErrorDescription(),
              "The save dialog needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, or name a Qt "
              "platform in QT_QPA_PLATFORM.");
    EXPECT_EQ(QCoreApplication::instance(), nullptr);
    EXPECT_EQ(testing_host::Specification(series.Get()), "StartRow=4;");
    if (!platform.empty()) setenv("QT_QPA_PLATFORM", platform.c_str(), 1);
}

TEST(SaveDialogWithoutApplication, MadeForTheDialogAndGoneAfter)
{
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ASSERT_EQ(QCoreApplication::instance(), nullptr);
    auto series = testing_host::MakeSeries("", "");
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    bool hadApplication = false;
    vantrel::dialogs::SetSaveDialogHook([&](CGUISaveDlg &dialog) {
        hadApplication = qobject_cast<QApplication *>(QCoreApplication::instance()) != nullptr;
        QTimer::singleShot(0, &dialog, [&dialog] { dialog.findChild<QPushButton *>("cancel")->click(); });
    });
    EXPECT_HR(E_ABORT, bridge->SaveDialog());
    vantrel::dialogs::SetSaveDialogHook({});
    EXPECT_TRUE(hadApplication);
    EXPECT_EQ(QCoreApplication::instance(), nullptr);
}

}  // namespace
