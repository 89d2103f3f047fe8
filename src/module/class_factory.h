// SPDX-License-Identifier: MIT
// The class object of CExcelVantrel: made once per process at the first
// request, under a lock, and kept until the module ends.
#pragma once

#include "automation/automation.h"

namespace vantrel {

IClassFactory &ExcelVantrelClassObject();

}  // namespace vantrel
