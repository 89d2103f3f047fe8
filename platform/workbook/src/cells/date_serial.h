// SPDX-License-Identifier: MIT
// Date serials of the workbook's two date systems, from ISO 8601 cell text
// (t="d") and from calendar days, which automation/civil_days.h counts.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "automation/civil_days.h"

namespace workbook {

// "2021-01-01", "2021-01-01T10:10:10.5", "10:10:10" (a time alone is a
// fraction of a day). In the 1900 system serial 60 is the phantom 29 February
// 1900, so dates before March 1900 count one less. None when unreadable.
std::optional<double> IsoTextToSerial(std::string_view text, bool date1904);

// The serial of a day: month and day may run over (month 13 is January of the
// next year, day 0 the last day of the month before), as in DATE().
double SerialOfDay(int64_t year, int64_t month, int64_t day, bool date1904);

using automation::CivilDay;
// The day a serial falls on (its whole part); 1900-02-29 for serial 60 of the
// 1900 system, as spreadsheets count it.
CivilDay DayOfSerial(double serial, bool date1904);

}  // namespace workbook
