// SPDX-License-Identifier: MIT
// Civil dates and times of day against date serials, shared by the date
// functions and the locale's date texts.
#pragma once

#include "automation/automation.h"

namespace automation::detail {

inline constexpr int kFirstYear = 100;
inline constexpr int kLastYear = 9999;

struct DateTimeFields {
    int year = 1899;
    int month = 12;
    int day = 30;
    int hour = 0;
    int minute = 0;
    int second = 0;
    int dayOfWeek = 0;  // 0 is Sunday; filled by SerialToFields
    int dayOfYear = 1;  // from 1; filled by SerialToFields
};

// True when the six fields name a real day of the years 100 to 9999 and a time
// of day from 00:00:00 to 23:59:59.
bool FieldsAreValid(const DateTimeFields &fields);

// Days since 30 December 1899 plus the time of day as the fraction; before
// that day the fraction counts the other way (-1.25 is 29 December, 06:00).
// False when the fields are not valid.
bool FieldsToSerial(const DateTimeFields &fields, DATE &serial);

// The inverse, rounded to the nearest whole second. False for a serial that
// is not a number or lies outside the years 100 to 9999.
bool SerialToFields(DATE serial, DateTimeFields &fields);

}  // namespace automation::detail
