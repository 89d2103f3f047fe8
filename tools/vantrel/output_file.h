// SPDX-License-Identifier: MIT
// Where the program's printed results go, told when they can't all be
// written (a full disk, a full device) rather than lost in silence.
#pragma once

#include <functional>
#include <ostream>
#include <string>

namespace vantrel_cli {

// Writes what `write` prints to standard output for "" or "-", else to the
// file output. Throws std::runtime_error with the reason when not all of it
// could be written; a file it made or truncated is then removed, so that no
// empty or cut-off file stays behind.
void WriteOutput(const std::string &output, const std::function<void(std::ostream &)> &write);

// Flushes standard output at the end of the program: the exit status, 1
// (after a message on stderr) when what was printed could not all be written.
int FinishStandardOutput(int status);

}  // namespace vantrel_cli
