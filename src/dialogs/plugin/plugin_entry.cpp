// SPDX-License-Identifier: MIT
// The plug-in's one export: the table of the two dialog runners.
#include <exception>
#include <new>

#include "bridge/excel_vantrel.h"
#include "dialogs/open_dialog_runner.h"
#include "dialogs/plugin/dialog_plugin.h"
#include "dialogs/save_dialog_runner.h"

namespace vantrel::dialogs {
namespace {

// Runs a dialog so that nothing thrown reaches the module: a fault is a
// failed dialog with its reason.
template <typename Runner>
DialogOutcome Contained(Runner runner, IHostSeries &series, CExcelVantrel &bridge, std::string &error) noexcept
{
    try {
        return runner(series, bridge, error);
    } catch (const std::bad_alloc &) {
        error = "Out of memory.";
    } catch (const std::exception &e) {
        error = e.what();
    } catch (...) {
        error = "Unexpected failure.";
    }
    return DialogOutcome::Failed;
}

DialogOutcome OpenEntry(IHostSeries &series, CExcelVantrel &bridge, std::string &error) noexcept
{
    return Contained(RunOpenDialog, series, bridge, error);
}

DialogOutcome SaveEntry(IHostSeries &series, CExcelVantrel &bridge, std::string &error) noexcept
{
    return Contained(RunSaveDialog, series, bridge, error);
}

constexpr DialogPluginTable kTable{kDialogPluginVersion, sizeof(CExcelVantrel), OpenEntry, SaveEntry};

}  // namespace
}  // namespace vantrel::dialogs

extern "C" __attribute__((visibility("default"))) const vantrel::dialogs::DialogPluginTable *VantrelDialogPlugin()
{
    return &vantrel::dialogs::kTable;
}
