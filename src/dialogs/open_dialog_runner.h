// SPDX-License-Identifier: MIT
// Runs the open dialog modally for the bridge's OpenDialog: it makes a Qt
// application when the host runs none (and a display can be had), puts the
// message presenter in place, and tells how the dialog ended.
#pragma once

#include <functional>
#include <string>

#include "dialogs/dialog_application.h"
#include "hostseries/hostseries.h"

class CExcelVantrel;
class CGUIOpenDlg;

namespace vantrel::dialogs {

// On Failed, error says why the dialog couldn't be shown.
DialogOutcome RunOpenDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error);

// Called with the dialog right before its modal loop starts; tests drive the
// dialog from there. An empty hook removes it.
void SetOpenDialogHook(std::function<void(CGUIOpenDlg &)> hook);

}  // namespace vantrel::dialogs
