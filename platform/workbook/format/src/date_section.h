// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>

#include "workbook/format/format_code.h"

namespace workbook::format {

// The text of a date section for a serial, or nothing when the serial is
// negative or past 9999-12-31 after rounding.
std::optional<std::string> FormatDateSection(double serial, const FormatSection &section,
                                             bool date1904);

}  // namespace workbook::format
