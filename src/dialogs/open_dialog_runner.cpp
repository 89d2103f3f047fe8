// SPDX-License-Identifier: MIT
#include "dialogs/open_dialog_runner.h"

#include <cstdlib>
#include <memory>

#include <QApplication>

#include "dialogs/message_presenter.h"
#include "dialogs/open_dialog.h"
#include "module/string_table.h"

namespace vantrel::dialogs {
namespace {

std::function<void(CGUIOpenDlg &)> &Hook()
{
    static std::function<void(CGUIOpenDlg &)> hook;
    return hook;
}

bool Given(const char *name)
{
    const char *value = std::getenv(name);
    return value && *value;
}

// The arguments of an application made for a host; Qt keeps referring to them.
int g_argc = 1;
char g_name[] = "vantrel";
char *g_argv[] = {g_name, nullptr};

}  // namespace

void SetOpenDialogHook(std::function<void(CGUIOpenDlg &)> hook) { Hook() = std::move(hook); }

bool DisplayAvailable()
{
    return Given("QT_QPA_PLATFORM") || Given("DISPLAY") || Given("WAYLAND_DISPLAY");
}

DialogOutcome RunOpenDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error)
{
    // Without a display Qt would end the process; the host gets a reason instead.
    std::unique_ptr<QApplication> made;
    if (!QCoreApplication::instance()) {
        if (!DisplayAvailable()) {
            error = LoadMessage(148);
            return DialogOutcome::Failed;
        }
        made = std::make_unique<QApplication>(g_argc, g_argv);
    } else if (!qobject_cast<QApplication *>(QCoreApplication::instance())) {
        error = LoadMessage(149);
        return DialogOutcome::Failed;
    }

    int result = QDialog::Rejected;
    {
        CGuiMessagePresenter presenter;
        CGUIOpenDlg dialog;
        dialog.SetHost(&series, &bridge);
        if (Hook()) Hook()(dialog);
        result = dialog.exec();
    }
    return result == QDialog::Accepted ? DialogOutcome::Confirmed : DialogOutcome::Cancelled;
}

}  // namespace vantrel::dialogs
