// SPDX-License-Identifier: MIT
// The slips in a specification string that a run would pass over in silence:
// keys that match nothing, formats whose letters read other fields than the
// user meant, a delete value that is no number.
#pragma once

#include <string>
#include <string_view>

#include "bridge/run_report.h"

namespace vantrel::bridge {

void WarnAboutSpecification(const std::string &spec, RunReport &report);

// The number that a text begins with, with a decimal point whatever the
// locale, narrowed to a 32-bit float; a text that begins with none gives 0.
float LeadingFloat(std::string_view text);

}  // namespace vantrel::bridge
