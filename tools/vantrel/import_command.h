// SPDX-License-Identifier: MIT
// "vantrel import": reads a workbook into a host object and prints it.
#pragma once

#include "host_series.h"

namespace vantrel_cli {

// Prints the series as CSV (or JSON) and returns 0; on failure prints the
// bridge's reason to stderr and returns 1.
int RunImport(const Request &request);

}  // namespace vantrel_cli
