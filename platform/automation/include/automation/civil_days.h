// SPDX-License-Identifier: MIT
// Days of the proleptic Gregorian calendar counted from 30 December 1899, the
// day of date serial 0: the whole part of a date serial is such a count.
#pragma once

#include <cstdint>

#include "automation/automation.h"

namespace automation {

struct CivilDay {
    int64_t year = 1899;
    unsigned month = 12;
    unsigned day = 30;
};

// The count of a day. The month and the day may run over: month 13 is January
// of the next year, month 0 December of the year before, day 0 the last day
// of the month before. Years and counts of up to a billion either way.
AUTOMATION_CXX_API int64_t DayNumber(int64_t year, int64_t month, int64_t day);

// The day of a count; the inverse of DayNumber.
AUTOMATION_CXX_API CivilDay CivilDayOf(int64_t dayNumber);

}  // namespace automation
