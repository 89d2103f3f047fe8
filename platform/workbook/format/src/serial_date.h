// SPDX-License-Identifier: MIT
// Day serials and calendar dates in the two date systems of a workbook.
#pragma once

#include <optional>

namespace workbook::format {

struct CalendarDate {
    int year;
    int month;    // 1 to 12
    int day;      // 0 to 31; day 0 only for serial 0 of the 1900 system
    int weekday;  // 0 Sunday to 6 Saturday, as the application counts them
};

// The largest serial of each system: 9999-12-31.
inline constexpr long kLastSerial1900 = 2958465;
inline constexpr long kLastSerial1904 = 2957003;

// The date of a whole serial, or nothing below 0 or past 9999-12-31.
// The 1900 system keeps the application's 1900-02-29 (serial 60), so serials
// 1 to 59 are one day later than their count from 1899-12-30 and the
// weekdays before March 1900 follow the application, not the calendar.
std::optional<CalendarDate> DateFromSerial(long serial, bool date1904);

// The 1900-system serial of a date from 1900-01-01 to 9999-12-31 (1900-02-29
// included, as 60), or nothing for a date the calendar does not have.
std::optional<long> SerialFromDate(int year, int month, int day);

}  // namespace workbook::format
