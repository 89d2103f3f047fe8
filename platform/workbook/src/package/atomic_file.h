// SPDX-License-Identifier: MIT
// Replacing a file atomically: a temporary file in the same folder, written,
// flushed to disk and renamed over the target. On any failure the temporary is
// removed and the old file stays as it was. A path that is a symbolic link is
// written through to the file it names, and the link stays; the new file takes
// the old one's mode, and its owner and group where the process may set them.
// A file that is read-only (no write permission for this process, or no write
// bit at all) is refused before anything is written.
#pragma once

#include <sys/types.h>

#include <string>
#include <string_view>

namespace workbook {

void ReplaceFileAtomically(const std::string &path, std::string_view bytes);

// The file that path names: path itself, or where its symbolic links lead (a
// link to a file not yet there leads to that file). Raises ComError on a link
// that can't be followed.
std::string FileBehindLinks(const std::string &path);

namespace detail {

// The system calls the replacement makes, so that tests can make one fail.
struct FileOps {
    int (*mkstemp)(char *templ);
    ssize_t (*write)(int fd, const void *buf, size_t count);
    int (*fsync)(int fd);
    int (*close)(int fd);
    int (*rename)(const char *from, const char *to);
    int (*unlink)(const char *path);
};

// The calls in use; a test may replace members and must restore them.
FileOps &ActiveFileOps();
// The real system calls.
FileOps SystemFileOps();

}  // namespace detail
}  // namespace workbook
