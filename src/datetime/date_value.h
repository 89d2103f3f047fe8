// SPDX-License-Identifier: MIT
// A point in time as the date/time operations pass it around.
#pragma once

// An automation date serial: days since 30 December 1899, midnight, with the
// time of day as the fraction. status tells whether the serial means anything.
struct DateValue {
    double serial = 0.0;
    int status = 0;
};

inline constexpr int kDateValid = 0;
inline constexpr int kDateInvalid = 1;

// Two points closer than this count as the same time: 1/172800 of a day.
inline constexpr double HalfSecond = 1.0 / 172800.0;

// Where the parts of a row's time come from (the mode of a time layout).
inline constexpr int kModeDateAndTime = 0;         // both in the cells
inline constexpr int kModeDateWithGlobalTime = 1;  // date in the cells, GlobalTime
inline constexpr int kModeTimeWithGlobalDate = 2;  // time in the cells, GlobalDate
// What a layout holds when the specification names no date/time column.
inline constexpr int kModeNone = -1;

// Results of CDateTimeUtil::ClassifyFormat.
inline constexpr int kFormatDateAndTime = 0;
inline constexpr int kFormatDateOnly = 1;
inline constexpr int kFormatTimeOnly = 2;
inline constexpr int kFormatIncomplete = -1;
