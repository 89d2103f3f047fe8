// SPDX-License-Identifier: MIT
// Date serials of the workbook's date system, from ISO 8601 cell text (t="d").
#pragma once

#include <optional>
#include <string_view>

namespace workbook {

// "2021-01-01", "2021-01-01T10:10:10.5", "10:10:10" (a time alone is a
// fraction of a day). In the 1900 system serial 60 is the phantom 29 February
// 1900, so dates before March 1900 count one less. None when unreadable.
std::optional<double> IsoTextToSerial(std::string_view text, bool date1904);

}  // namespace workbook
