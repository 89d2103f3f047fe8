// SPDX-License-Identifier: MIT
// GUIDs written as constants, and their braced text.
#pragma once

#include <string>

#include "automation/automation.h"

namespace automation {

// "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}", upper-case hex.
AUTOMATION_CXX_API std::string GuidToString(const GUID &guid);

}  // namespace automation
