// SPDX-License-Identifier: MIT
// "vantrel save-dialog": lets a person lay a series out in the bridge's save
// dialog; after OK the bridge writes the workbook.
#pragma once

#include <string>

namespace vantrel_cli {

// argv[1] is "save-dialog"; progId, when not empty, names the registered
// module to load. The series is read as "vantrel export" reads it, before any
// window comes up. Returns 0 after the write (the workbook's path and the
// specification string on stdout), 1 when the series doesn't read, the dialog
// was cancelled or the bridge failed (the reason on stderr), 2 for a usage error.
int RunSaveDialogCommand(int argc, char **argv, const std::string &progId);

}  // namespace vantrel_cli
