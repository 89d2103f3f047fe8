// SPDX-License-Identifier: MIT
// The command line of vantrel: its commands, their options and the usage
// text; it parses argv and runs the command named.
#pragma once

namespace vantrel_cli {

// Returns the exit status: 0 done (or help and version printed), 1 failed or
// refused, 2 a usage error (what was wrong, then the usage, on stderr).
int RunCommandLine(int argc, char **argv);

}  // namespace vantrel_cli
