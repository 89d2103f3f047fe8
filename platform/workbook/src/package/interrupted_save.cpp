// SPDX-License-Identifier: MIT
#include "package/interrupted_save.h"

#include <signal.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <cstring>
#include <mutex>

namespace workbook {
namespace {

constexpr int kSignals[] = {SIGINT, SIGTERM};
constexpr size_t kSlots = 16;        // saves under way at once in one process
constexpr size_t kPathBytes = 4096;  // PATH_MAX

// Prepared before a save writes, so that the handler only reads them: the
// handler may run at any point of the program and must not allocate or lock.
struct Slot {
    std::atomic<bool> ready{false};
    char path[kPathBytes];
};
std::array<Slot, kSlots> slots;
std::array<struct sigaction, std::size(kSignals)> previous;
std::atomic<bool> previousKept{false};
std::mutex installing;
int guardsAlive = 0;

int IndexOf(int signal)
{
    for (size_t i = 0; i < std::size(kSignals); ++i)
        if (kSignals[i] == signal) return int(i);
    return -1;
}

void RemoveTemporaries(int signal)
{
    const int savedErrno = errno;
    for (Slot &slot : slots)
        if (slot.ready.load()) ::unlink(slot.path);
    // The action the signal had before; raised again, it comes once this
    // handler returns (the signal is blocked while it runs).
    const int index = IndexOf(signal);
    if (index >= 0 && previousKept.load()) ::sigaction(signal, &previous[size_t(index)], nullptr);
    ::raise(signal);
    errno = savedErrno;
}

void Install()
{
    struct sigaction action {};
    action.sa_handler = RemoveTemporaries;
    sigemptyset(&action.sa_mask);
    for (size_t i = 0; i < std::size(kSignals); ++i) {
        ::sigaction(kSignals[i], nullptr, &previous[i]);
        // A signal the program ignores stays ignored.
        if (previous[i].sa_handler == SIG_IGN && !(previous[i].sa_flags & SA_SIGINFO)) continue;
        ::sigaction(kSignals[i], &action, nullptr);
    }
    previousKept.store(true);
}

void Restore()
{
    for (size_t i = 0; i < std::size(kSignals); ++i) {
        struct sigaction current {};
        ::sigaction(kSignals[i], nullptr, &current);
        // Left as it is when the program changed it meanwhile.
        if (current.sa_handler == RemoveTemporaries) ::sigaction(kSignals[i], &previous[i], nullptr);
    }
    previousKept.store(false);
}

}  // namespace

TemporaryFileGuard::TemporaryFileGuard(const char *path)
{
    const size_t length = std::strlen(path);
    if (length >= kPathBytes) return;
    std::lock_guard<std::mutex> lock(installing);
    for (size_t i = 0; i < kSlots; ++i) {
        if (slots[i].ready.load()) continue;
        std::memcpy(slots[i].path, path, length + 1);
        slots[i].ready.store(true);
        slot_ = int(i);
        break;
    }
    if (slot_ >= 0 && guardsAlive++ == 0) Install();
}

TemporaryFileGuard::~TemporaryFileGuard()
{
    if (slot_ < 0) return;
    std::lock_guard<std::mutex> lock(installing);
    slots[size_t(slot_)].ready.store(false);
    if (--guardsAlive == 0) Restore();
}

SignalsHeld::SignalsHeld()
{
    sigset_t held;
    sigemptyset(&held);
    sigaddset(&held, SIGINT);
    sigaddset(&held, SIGTERM);
    pthread_sigmask(SIG_BLOCK, &held, &before_);
}

SignalsHeld::~SignalsHeld() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }

}  // namespace workbook
