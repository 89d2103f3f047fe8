// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "workbook/format/format_code.h"

namespace workbook::format {

// The text of a number section with a fraction ("# ?/?", "?/8") for |value|;
// the caller adds any sign.
std::string FormatFractionSection(double value, const FormatSection &section);

}  // namespace workbook::format
