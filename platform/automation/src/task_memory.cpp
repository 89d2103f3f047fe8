// SPDX-License-Identifier: MIT
// Task memory: what a callee allocates and its caller frees.
#include <cstdlib>

#include "automation/automation.h"

// A request for zero bytes still gives a block that CoTaskMemFree takes.
AUTOMATION_API void *CoTaskMemAlloc(size_t cb) { return std::malloc(cb ? cb : 1); }

AUTOMATION_API void CoTaskMemFree(void *pv) { std::free(pv); }
