// SPDX-License-Identifier: MIT
// The module's string table: every message the system shows or reports, by
// number. Texts with placeholders are printf formats.
#pragma once

#include <string>

namespace vantrel {

// Numbers of strings that are not messages.
inline constexpr int kStringBridgeKeyName = 100;
inline constexpr int kStringApplicationTitle = 57344;

// The text of string id; empty for a number the table doesn't hold.
std::string LoadMessage(int id);

// The text of string id filled by printf rules with the arguments.
std::string FormatMessage(int id, ...);

}  // namespace vantrel
