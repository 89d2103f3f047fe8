// SPDX-License-Identifier: MIT
// A registry of its own for one test: the store's root points at a fresh
// folder for the test's lifetime, so that nobody's real registry is touched.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "registry/registry.h"
#include "support/files.h"
#include "support/temp_dir.h"

namespace testing_registry {

class ScopedRegistryRoot {
public:
    ScopedRegistryRoot() { RegistrySetRootFolder(dir_.Path().c_str()); }
    ~ScopedRegistryRoot() { RegistrySetRootFolder(nullptr); }

    const std::filesystem::path &Path() const { return dir_.Path(); }
    std::string ClassesFile() const { return dir_.File("classes.reg"); }
    std::string HostFile() const { return dir_.File("host.reg"); }

private:
    testing_host::TempDir dir_;
};

// The value's text, or nullopt when the store has no such value.
inline std::optional<std::string> Value(RegistryTree tree, const std::string &key, const char *name = nullptr)
{
    DWORD size = 0;
    if (RegistryGetValue(tree, key.c_str(), name, nullptr, &size) != REGISTRY_MORE_DATA) return std::nullopt;
    std::vector<char> buffer(size);
    if (RegistryGetValue(tree, key.c_str(), name, buffer.data(), &size) != REGISTRY_OK) return std::nullopt;
    return std::string(buffer.data(), size - 1);
}

inline bool KeyExists(RegistryTree tree, const std::string &key)
{
    return RegistryKeyExists(tree, key.c_str()) == REGISTRY_OK;
}

}  // namespace testing_registry
