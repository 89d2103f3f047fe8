// SPDX-License-Identifier: MIT
// A save that SIGINT or SIGTERM ends leaves no temporary file behind: while a
// guard lives, those signals remove its file first and then take the action
// they had before (by default ending the process, by the signal).
#pragma once

#include <signal.h>

namespace workbook {

// While it lives, SIGINT and SIGTERM wait (on this thread), so that none can
// come between making a temporary file and guarding it.
class SignalsHeld {
public:
    SignalsHeld();
    ~SignalsHeld();
    SignalsHeld(const SignalsHeld &) = delete;
    SignalsHeld &operator=(const SignalsHeld &) = delete;

private:
    sigset_t before_;
};

class TemporaryFileGuard {
public:
    // path must stay valid while the guard lives; a path longer than the
    // guard's slots hold is not guarded.
    explicit TemporaryFileGuard(const char *path);
    ~TemporaryFileGuard();
    TemporaryFileGuard(const TemporaryFileGuard &) = delete;
    TemporaryFileGuard &operator=(const TemporaryFileGuard &) = delete;

private:
    int slot_ = -1;
};

}  // namespace workbook
