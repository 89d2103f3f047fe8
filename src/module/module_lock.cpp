// SPDX-License-Identifier: MIT
#include "module/module_lock.h"

#include <atomic>

namespace vantrel {
namespace {
std::atomic<long> g_locks{0};
}

void LockModule() noexcept { g_locks.fetch_add(1, std::memory_order_relaxed); }
void UnlockModule() noexcept { g_locks.fetch_sub(1, std::memory_order_acq_rel); }
long ModuleLockCount() noexcept { return g_locks.load(std::memory_order_acquire); }

}  // namespace vantrel
