// SPDX-License-Identifier: MIT
// "vantrel save-dialog": lets a person lay a series out in the bridge's save
// dialog; after OK the bridge writes the workbook.
#pragma once

#include <string>

#include "host_series.h"

namespace vantrel_cli {

// Takes the request's spec and module. The series is read as "vantrel export"
// reads it, before any window comes up. Returns 0 after the write (the
// workbook's path and the specification string on stdout), 1 when the series
// doesn't read, the dialog was cancelled or the bridge failed (the reason on
// stderr).
int RunSaveDialogCommand(const Request &request, const std::string &seriesPath);

}  // namespace vantrel_cli
