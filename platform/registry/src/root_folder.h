// SPDX-License-Identifier: MIT
// The folder that holds the trees' files (see registry/registry.h for the
// order in which it is chosen).
#pragma once

#include <filesystem>
#include <optional>

namespace registry {

inline constexpr const char *kRootVariable = "VANTREL_REGISTRY_ROOT";
inline constexpr const char *kFolderName = "vantrel-registry";

// nullopt goes back to the environment and the user's data folder.
void SetRootFolder(std::optional<std::filesystem::path> folder);

// Throws Failure(REGISTRY_IO_FAILED) when no folder can be found.
std::filesystem::path RootFolder();

}  // namespace registry
