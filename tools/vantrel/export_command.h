// SPDX-License-Identifier: MIT
// "vantrel export": lays a series, as "vantrel import" prints it, out on the
// first sheet of a workbook.
#pragma once

#include <string>

#include "host_series.h"

namespace vantrel_cli {

// Reads the series (a file, or "-" for standard input), runs the bridge's
// export and returns 0; on failure prints the bridge's reason to stderr and
// returns 1. Messages of a run that succeeded still go to stderr.
int RunExport(const Request &request, const std::string &seriesPath);

}  // namespace vantrel_cli
