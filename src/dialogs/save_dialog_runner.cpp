// SPDX-License-Identifier: MIT
#include "dialogs/save_dialog_runner.h"

#include "dialogs/message_presenter.h"
#include "dialogs/save_dialog.h"

namespace vantrel::dialogs {
namespace {

std::function<void(CGUISaveDlg &)> &Hook()
{
    static std::function<void(CGUISaveDlg &)> hook;
    return hook;
}

}  // namespace

void SetSaveDialogHook(std::function<void(CGUISaveDlg &)> hook) { Hook() = std::move(hook); }

DialogOutcome RunSaveDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error)
{
    CDialogApplication application;
    if (!application.Start(DialogKind::Save, error)) return DialogOutcome::Failed;

    int result = QDialog::Rejected;
    {
        CGuiMessagePresenter presenter;
        CGUISaveDlg dialog;
        dialog.SetHost(&series, &bridge);
        if (Hook()) Hook()(dialog);
        result = dialog.exec();
    }
    return result == QDialog::Accepted ? DialogOutcome::Confirmed : DialogOutcome::Cancelled;
}

}  // namespace vantrel::dialogs
