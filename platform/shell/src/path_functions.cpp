// SPDX-License-Identifier: MIT
// PathFileExistsA and PathAddExtensionA on POSIX paths.
#include <sys/stat.h>

#include <cstring>
#include <string_view>

#include "shell/shell.h"

namespace {

// The extension of the last component: from its last '.', when no blank
// follows that dot. Folders before the last '/' never count.
bool HasExtension(std::string_view path)
{
    const std::size_t slash = path.rfind('/');
    const std::string_view last = slash == std::string_view::npos ? path : path.substr(slash + 1);
    const std::size_t dot = last.rfind('.');
    if (dot == std::string_view::npos) return false;
    return last.substr(dot).find(' ') == std::string_view::npos;
}

}  // namespace

BOOL PathFileExistsA(const char *path)
{
    if (!path || !*path) return 0;
    struct stat info {};
    return stat(path, &info) == 0 ? 1 : 0;
}

BOOL PathAddExtensionA(char *path, const char *ext)
{
    if (!path) return 0;
    // A buffer holds MAX_PATH chars with the zero; never read past it.
    const std::size_t length = strnlen(path, MAX_PATH);
    if (length == MAX_PATH) return 0;
    if (HasExtension(std::string_view(path, length))) return 0;
    const char *added = ext ? ext : ".xml";
    const std::size_t extLength = std::strlen(added);
    if (length + extLength + 1 > MAX_PATH) return 0;
    std::memcpy(path + length, added, extLength + 1);
    return 1;
}
