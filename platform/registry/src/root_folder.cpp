// SPDX-License-Identifier: MIT
#include "root_folder.h"

#include <pwd.h>
#include <unistd.h>

#include <cstdlib>
#include <mutex>

#include "failure.h"

namespace registry {
namespace {

std::mutex g_mutex;
std::optional<std::filesystem::path> g_chosen;

std::optional<std::filesystem::path> FromEnvironment(const char *name)
{
    const char *value = std::getenv(name);
    if (!value || !*value) return std::nullopt;
    return std::filesystem::path(value);
}

std::optional<std::filesystem::path> HomeFolder()
{
    if (auto home = FromEnvironment("HOME")) return home;
    if (const passwd *entry = getpwuid(getuid()); entry && entry->pw_dir && *entry->pw_dir)
        return std::filesystem::path(entry->pw_dir);
    return std::nullopt;
}

}  // namespace

void SetRootFolder(std::optional<std::filesystem::path> folder)
{
    if (folder) folder = std::filesystem::absolute(*folder);
    std::lock_guard lock(g_mutex);
    g_chosen = std::move(folder);
}

std::filesystem::path RootFolder()
{
    {
        std::lock_guard lock(g_mutex);
        if (g_chosen) return *g_chosen;
    }
    if (auto root = FromEnvironment(kRootVariable)) return std::filesystem::absolute(*root);
    // The data folder of the user, as the XDG convention has it; a relative
    // XDG_DATA_HOME is to be ignored.
    if (auto data = FromEnvironment("XDG_DATA_HOME"); data && data->is_absolute()) return *data / kFolderName;
    if (auto home = HomeFolder()) return *home / ".local" / "share" / kFolderName;
    throw Failure(REGISTRY_IO_FAILED,
                  "no folder for the registry: neither VANTREL_REGISTRY_ROOT, XDG_DATA_HOME nor HOME is set");
}

}  // namespace registry
