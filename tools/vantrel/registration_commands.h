// SPDX-License-Identifier: MIT
// The registration side of the command-line host: "register" and
// "unregister" call a module's exports as a registration tool does, and
// "--progid" finds the module of a class through the registry.
#pragma once

#include <optional>
#include <string>

namespace vantrel_cli {

// Runs "vantrel register [MODULE]" or "vantrel unregister [MODULE]" and
// returns the exit status: 0 done, 1 failed, 2 usage. nullopt when argv names
// another command.
std::optional<int> RunRegistrationCommand(int argc, char **argv);

// Takes "--progid NAME" out of argv (argc shrinks); empty when not given.
std::string TakeProgIdOption(int &argc, char **argv);

// The module registered for the class that progId names, looked up as a host
// does: the class id under the ProgID, then that class's InprocServer32.
// Throws std::runtime_error when the ProgID or the class isn't registered, or
// the class isn't the bridge class.
std::string ModuleOfProgId(const std::string &progId);

}  // namespace vantrel_cli
