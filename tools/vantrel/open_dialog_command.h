// SPDX-License-Identifier: MIT
// "vantrel open-dialog": lets a person describe a workbook in the bridge's
// open dialog, then prints what the import read, as "vantrel import" does.
#pragma once

#include "host_series.h"

namespace vantrel_cli {

// Takes the request's json, output and module. Returns 0 after an import, 1
// when the dialog was cancelled or the bridge failed (the reason on stderr).
int RunOpenDialogCommand(const Request &request);

}  // namespace vantrel_cli
