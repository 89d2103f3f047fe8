// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "workbook/format/format_code.h"

namespace workbook::format {

// The text of a number section for |value|; the caller adds any sign.
// value must be finite.
std::string FormatNumberSection(double value, const FormatSection &section);

}  // namespace workbook::format
