// SPDX-License-Identifier: MIT
// The shortest text that reads back as the same 32-bit float, exactly as
// std::to_chars writes it, made faster for the short decimals that measured
// series are full of.
#pragma once

#include <string>

namespace vantrel_cli {

void AppendShortestFloat(std::string &out, float value);

}  // namespace vantrel_cli
