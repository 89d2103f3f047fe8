// SPDX-License-Identifier: MIT
// OpenDialog and SaveDialog in a host without a Qt application: with no usable
// display they fail with a reason; with one they make the application and end it.
#include <gtest/gtest.h>

#include <cstdlib>

#include "dialog_driver.h"

using namespace dialog_testing;

namespace {

using Call = HRESULT (IVantrel::*)();

// No platform and the given X display (nullptr: none) while it lives; the
// offscreen platform afterwards.
struct XDisplay {
    explicit XDisplay(const char *display)
    {
        unsetenv("QT_QPA_PLATFORM");
        unsetenv("WAYLAND_DISPLAY");
        display ? setenv("DISPLAY", display, 1) : unsetenv("DISPLAY");
    }
    ~XDisplay()
    {
        setenv("QT_QPA_PLATFORM", "offscreen", 1);
        unsetenv("DISPLAY");
    }
};

TEST(DialogsWithoutApplication, NoDisplayGivesAReasonAndChangesNothing)
{
    const std::string none = " needs a display, but none is set: give DISPLAY or WAYLAND_DISPLAY, or name a Qt "
                             "platform in QT_QPA_PLATFORM.";
    const std::string silent = " needs a display, but the X display \":4242\" named in DISPLAY doesn't answer.";
    const struct {
        Call call;
        const char *display;  // no X server listens on display 4242
        std::string reason;
    } cases[] = {{&IVantrel::OpenDialog, nullptr, "The open dialog" + none},
                 {&IVantrel::SaveDialog, nullptr, "The save dialog" + none},
                 {&IVantrel::OpenDialog, ":4242", "The open dialog" + silent},
                 {&IVantrel::SaveDialog, ":4242", "The save dialog" + silent}};
    ASSERT_EQ(QCoreApplication::instance(), nullptr);
    auto series = testing_host::MakeSeries("", "StartRow=4;");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    for (const auto &c : cases) {
        XDisplay display(c.display);
        SetErrorInfo(0, nullptr);
        EXPECT_HR(E_FAIL, (bridge.Get()->*c.call)());
        EXPECT_EQ(testing_host::TakeErrorDescription(), c.reason);
        EXPECT_EQ(QCoreApplication::instance(), nullptr);
        EXPECT_EQ(testing_host::Specification(series.Get()), "StartRow=4;");
    }
}

TEST(DialogsWithoutApplication, MadeForTheDialogAndGoneAfter)
{
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    auto series = testing_host::MakeSeries("", "");
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(series.Get());
    GermanLocale german;
    std::setlocale(LC_ALL, "C");  // the host's, which the user's doesn't reach
    int ranInApplication = 0;
    std::vector<std::string> locales;  // character types, numbers
    // Cancels the dialog once it is up, counting the times an application ran it.
    auto cancel = [&ranInApplication, &locales](QDialog &dialog) {
        ranInApplication += qobject_cast<QApplication *>(QCoreApplication::instance()) != nullptr;
        for (const int category : {LC_CTYPE, LC_NUMERIC}) locales.push_back(std::setlocale(category, nullptr));
        QTimer::singleShot(0, &dialog, [&dialog] { Click(dialog, "cancel"); });
    };
    OpenDialogHook openHook(cancel);
    SaveDialogHook saveHook(cancel);
    for (Call call : {&IVantrel::OpenDialog, &IVantrel::SaveDialog}) {
        EXPECT_HR(E_ABORT, (bridge.Get()->*call)());
        EXPECT_EQ(QCoreApplication::instance(), nullptr);
    }
    EXPECT_EQ(ranInApplication, 2);
    // The application took up the user's locale, but the numbers kept the host's.
    EXPECT_EQ(locales, (std::vector<std::string>{GermanLocale::kName, "C", GermanLocale::kName, "C"}));
}

}  // namespace
