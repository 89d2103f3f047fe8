// SPDX-License-Identifier: MIT
// The module's registration: its class in the classes root, its type library,
// and its bridge entry in the host's tree.
#pragma once

#include "automation/automation.h"

namespace vantrel {

// S_OK, or E_UNEXPECTED when any step failed; there is no undo of the steps
// that went before.
HRESULT RegisterModule();

// S_OK, or E_UNEXPECTED; when the class entries can't be removed, the host's
// tree is left untouched.
HRESULT UnregisterModule();

}  // namespace vantrel
