// SPDX-License-Identifier: MIT
// "vantrel open-dialog": lets a person describe a workbook in the bridge's
// open dialog, then prints what the import read, as "vantrel import" does.
#pragma once

#include <string>

namespace vantrel_cli {

// argv[1] is "open-dialog"; progId, when not empty, names the registered
// module to load. Returns 0 after an import, 1 when the dialog was cancelled
// or the bridge failed (the reason on stderr), 2 for a usage error.
int RunOpenDialogCommand(int argc, char **argv, const std::string &progId);

}  // namespace vantrel_cli
