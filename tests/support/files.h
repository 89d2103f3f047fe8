// SPDX-License-Identifier: MIT
// Whole files in and out, bytes as they are.
#pragma once

#include <fstream>
#include <iterator>
#include <string>

namespace testing_host {

// The file's bytes, or "" when it can't be read.
inline std::string ReadFile(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

inline void WriteFile(const std::string &path, const std::string &bytes)
{
    std::ofstream(path, std::ios::binary | std::ios::trunc) << bytes;
}

}  // namespace testing_host
