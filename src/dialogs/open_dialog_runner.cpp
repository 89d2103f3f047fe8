// SPDX-License-Identifier: MIT
#include "dialogs/open_dialog_runner.h"

#include "dialogs/message_presenter.h"
#include "dialogs/open_dialog.h"

namespace vantrel::dialogs {
namespace {

std::function<void(CGUIOpenDlg &)> &Hook()
{
    static std::function<void(CGUIOpenDlg &)> hook;
    return hook;
}

}  // namespace

void SetOpenDialogHook(std::function<void(CGUIOpenDlg &)> hook) { Hook() = std::move(hook); }

DialogOutcome RunOpenDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error)
{
    CDialogApplication application;
    if (!application.Start(DialogKind::Open, error)) return DialogOutcome::Failed;

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
