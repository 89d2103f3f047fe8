// SPDX-License-Identifier: MIT
// The module's side of the dialogs: RunOpenDialog and RunSaveDialog load the
// plug-in beside the module at their first call and hand the dialog over.
// Without the plug-in the two fail with a reason that names the file.
#include <dlfcn.h>

#include <filesystem>
#include <mutex>
#include <string>

#include "bridge/excel_vantrel.h"
#include "dialogs/open_dialog_runner.h"
#include "dialogs/plugin/dialog_plugin.h"
#include "dialogs/save_dialog_runner.h"

namespace vantrel::dialogs {
namespace {

// The folder of the file this code was loaded from: the module, or a program
// that links the bridge itself.
std::filesystem::path OwnFolder()
{
    std::error_code error;
    Dl_info info{};
    std::filesystem::path file;
    if (dladdr(reinterpret_cast<void *>(&OwnFolder), &info) != 0 && info.dli_fname && *info.dli_fname)
        file = info.dli_fname;
    else
        file = std::filesystem::read_symlink("/proc/self/exe", error);
    // A relative name is relative to the folder current when the file was loaded.
    const auto absolute = std::filesystem::weakly_canonical(std::filesystem::absolute(file, error), error);
    return (absolute.empty() ? file : absolute).parent_path();
}

// Taken as the module loads, before the host may change its current folder.
const std::filesystem::path g_moduleFolder = OwnFolder();

std::mutex g_loadLock;
const DialogPluginTable *g_table = nullptr;  // kept once loaded; the plug-in stays for the process

const DialogPluginTable *LoadPlugin(std::string &error)
{
    std::lock_guard lock(g_loadLock);
    if (g_table) return g_table;
    const std::string path = (g_moduleFolder / kDialogPluginFile).string();
    // Qt can't be unloaded cleanly, and its application may outlive the dialog.
    void *handle = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
    if (!handle) {
        const char *reason = dlerror();
        error = "The dialogs could not be loaded: " + std::string(reason ? reason : path);
        return nullptr;
    }
    auto entry = reinterpret_cast<DialogPluginEntry>(dlsym(handle, kDialogPluginEntry));
    const DialogPluginTable *table = entry ? entry() : nullptr;
    if (!table || table->version != kDialogPluginVersion || table->bridgeSize != sizeof(CExcelVantrel) ||
        !table->runOpen || !table->runSave) {
        dlclose(handle);
        error = "The dialogs could not be loaded: " + path + " is not the dialogs' plug-in of this module.";
        return nullptr;
    }
    g_table = table;
    return g_table;
}

}  // namespace

DialogOutcome RunOpenDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error)
{
    const DialogPluginTable *plugin = LoadPlugin(error);
    return plugin ? plugin->runOpen(series, bridge, error) : DialogOutcome::Failed;
}

DialogOutcome RunSaveDialog(IHostSeries &series, CExcelVantrel &bridge, std::string &error)
{
    const DialogPluginTable *plugin = LoadPlugin(error);
    return plugin ? plugin->runSave(series, bridge, error) : DialogOutcome::Failed;
}

}  // namespace vantrel::dialogs
