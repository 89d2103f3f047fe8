// SPDX-License-Identifier: MIT
#include "workbook/save_lock.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "errors.h"
#include "package/atomic_file.h"
#include "package/interrupted_save.h"

namespace workbook {
namespace {

struct PathParts {
    std::string folder;  // with its trailing slash, or empty
    std::string name;
};

PathParts Split(const std::string &path)
{
    const size_t slash = path.rfind('/');
    if (slash == std::string::npos) return {"", path};
    return {path.substr(0, slash + 1), path.substr(slash + 1)};
}

// Whether fd still names the file at path: a writer that releases the lock
// removes the file, so one that waited on the removed file must start again.
bool StillThere(int fd, const std::string &path)
{
    struct stat held, named;
    return ::fstat(fd, &held) == 0 && ::stat(path.c_str(), &named) == 0 && held.st_dev == named.st_dev &&
           held.st_ino == named.st_ino;
}

}  // namespace

SaveLock::SaveLock(const std::string &givenPath)
{
    const PathParts parts = Split(FileBehindLinks(givenPath));
    const std::string officeLock = ".~lock." + parts.name + "#";
    struct stat st;
    if (::lstat((parts.folder + officeLock).c_str(), &st) == 0)
        Fail(E_ACCESSDENIED, "cannot save '" + givenPath + "': another program has the workbook open (its lock file '" +
                                 officeLock + "' is beside it). Close the workbook there and try again; a lock "
                                 "file that no program holds any more may be deleted");
    lockPath_ = parts.folder + "." + parts.name + ".vantrel-lock";
    for (;;) {
        fd_ = ::open(lockPath_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600);
        // A folder that takes no new file takes no saved workbook either:
        // the save tells why.
        if (fd_ < 0) return;
        int locked;
        while ((locked = ::flock(fd_, LOCK_EX)) != 0 && errno == EINTR) {
        }
        if (locked != 0) {
            const int err = errno;
            ::close(fd_);
            fd_ = -1;
            Fail(E_FAIL, "cannot save '" + givenPath + "': its lock file '" + lockPath_ + "' can't be locked: " +
                             std::strerror(err));
        }
        if (StillThere(fd_, lockPath_)) {
            removedOnSignal_ = std::make_unique<TemporaryFileGuard>(lockPath_.c_str());
            return;
        }
        ::close(fd_);
    }
}

SaveLock::~SaveLock()
{
    if (fd_ < 0) return;
    // Removed while still held, so that no writer locks it after this one and
    // another makes a new one beside it.
    ::unlink(lockPath_.c_str());
    removedOnSignal_.reset();
    ::close(fd_);
}

}  // namespace workbook
