// SPDX-License-Identifier: MIT
// The module's lock count: every live object and every lock of the class
// factory holds one. The module may be unloaded only at zero.
#pragma once

namespace vantrel {

void LockModule() noexcept;
void UnlockModule() noexcept;
long ModuleLockCount() noexcept;

}  // namespace vantrel
