// SPDX-License-Identifier: MIT
// Runs the save dialog modally for the bridge's SaveDialog, as the open
// dialog's runner does: a Qt application when the host runs none, the
// message presenter while it is up, and how the dialog ended.
#pragma once

#include <functional>
#include <string>

#include "dialogs/dialog_application.h"
#include "hostseries/hostseries.h"

class CExcelVantrel;
class CGUISaveDlg;

namespace vantrel::dialogs {

// On Failed, error says why the dialog couldn't be shown.
DialogOutcome RunSaveDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error);

// Called with the dialog right before its modal loop starts; tests drive the
// dialog from there. An empty hook removes it.
void SetSaveDialogHook(std::function<void(CGUISaveDlg &)> hook);

}  // namespace vantrel::dialogs
