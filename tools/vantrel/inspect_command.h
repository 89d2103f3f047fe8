// SPDX-License-Identifier: MIT
// "vantrel inspect": does a workbook fit its specification string?
#pragma once

#include "host_series.h"

namespace vantrel_cli {

// Prints "fits" and returns 0, or prints what doesn't fit and returns 1.
int RunInspect(const Request &request);

}  // namespace vantrel_cli
