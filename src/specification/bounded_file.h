// SPDX-License-Identifier: MIT
// Reading a whole file that must be a regular file of bounded size, so that a
// FIFO, a device or a folder is refused at once instead of blocking the
// reader or filling memory.
#pragma once

#include <cstddef>
#include <limits>
#include <string>

namespace vantrel {

constexpr size_t kNoFileBound = std::numeric_limits<size_t>::max();

// The file's bytes into text; false with the reason ("is not a regular file",
// "is larger than N bytes", ...) when it cannot be read or is refused.
bool ReadBoundedFile(const std::string &path, size_t maxBytes, std::string &text, std::string &reason);

}  // namespace vantrel
