// SPDX-License-Identifier: MIT
// The registration side of the command-line host: "register" and
// "unregister" call a module's exports as a registration tool does, and
// "--progid" finds the module of a class through the registry.
#pragma once

#include <string>

namespace vantrel_cli {

// Runs "vantrel register [MODULE]" (registering) or "vantrel unregister
// [MODULE]"; an empty module is the one beside the program. Returns the exit
// status: 0 done, 1 failed.
int RunRegistration(bool registering, const std::string &module);

// The module registered for the class that progId names, looked up as a host
// does: the class id under the ProgID, then that class's InprocServer32.
// Throws std::runtime_error when the ProgID or the class isn't registered, or
// the class isn't the bridge class.
std::string ModuleOfProgId(const std::string &progId);

}  // namespace vantrel_cli
