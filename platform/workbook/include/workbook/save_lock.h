// SPDX-License-Identifier: MIT
// The lock a writer holds on a workbook from reading it to replacing it, so
// that two saves of one workbook run one after the other instead of the later
// one replacing a file the earlier one is still writing.
#pragma once

#include <memory>
#include <string>

namespace workbook {

class TemporaryFileGuard;

class SaveLock {
public:
    // Waits until no other writer holds the workbook at path (followed through
    // symbolic links), then holds it. The lock is an flock on the file
    // `.NAME.vantrel-lock` beside the workbook, made when missing and removed
    // on release (a folder where it can't be made gets no lock: no save can
    // make its file there either). A workbook that a spreadsheet program has open (its lock
    // file `.~lock.NAME#` beside it) is refused as in use. Raises ComError with
    // the reason. SIGINT and SIGTERM remove the lock file while it is held.
    explicit SaveLock(const std::string &path);
    ~SaveLock();
    SaveLock(const SaveLock &) = delete;
    SaveLock &operator=(const SaveLock &) = delete;

private:
    std::string lockPath_;
    int fd_ = -1;
    std::unique_ptr<TemporaryFileGuard> removedOnSignal_;
};

}  // namespace workbook
