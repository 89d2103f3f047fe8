// SPDX-License-Identifier: MIT
// The trees on disk: reading one, and changing one as a whole under the lock
// of the root folder.
#pragma once

#include <functional>

#include "key_tree.h"
#include "registry/registry.h"

namespace registry {

// The tree as it is on disk now; a tree whose file is missing is empty.
// Throws Failure: REGISTRY_CORRUPT naming the file and line, or
// REGISTRY_IO_FAILED.
Key ReadTree(RegistryTree tree);

// Reads the tree, lets change edit it and writes it back when it differs.
// An exception from change leaves the file as it was.
void UpdateTree(RegistryTree tree, const std::function<void(Key &)> &change);

}  // namespace registry
