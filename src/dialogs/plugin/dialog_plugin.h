// SPDX-License-Identifier: MIT
// The boundary between the module and the dialogs' plug-in. The dialogs and
// Qt live in a shared library beside the module, loaded when a dialog is
// first asked for, so that a host that never shows one never loads Qt or X.
// Both sides are built from these sources by one build, so the table passes
// the bridge's own types; no exception crosses it.
#pragma once

#include <cstddef>
#include <string>

#include "dialogs/dialog_application.h"
#include "hostseries/hostseries.h"

class CExcelVantrel;

namespace vantrel::dialogs {

// The plug-in's file name, looked for in the folder of the module.
inline constexpr char kDialogPluginFile[] = "GenericExcelVantrelDialogs.so";
// The name of the plug-in's one exported function.
inline constexpr char kDialogPluginEntry[] = "VantrelDialogPlugin";
// Raised whenever the table or the types it passes change.
inline constexpr int kDialogPluginVersion = 1;

using DialogRunner = DialogOutcome (*)(IHostSeries &series, CExcelVantrel &bridge, std::string &error) noexcept;

struct DialogPluginTable {
    int version;
    std::size_t bridgeSize;  // sizeof(CExcelVantrel) on the plug-in's side
    DialogRunner runOpen;
    DialogRunner runSave;
};

using DialogPluginEntry = const DialogPluginTable *(*)();

}  // namespace vantrel::dialogs
