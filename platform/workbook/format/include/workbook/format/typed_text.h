// SPDX-License-Identifier: MIT
// The reading of a text as a person typing it into a cell would have it read,
// in this system's fixed locale: decimal point, no digit grouping, ISO dates
// (year-month-day with '-' or '/'), 24-hour times.
#pragma once

#include <string>
#include <string_view>

namespace workbook::format {

enum class TypedKind { Number, Date, Boolean, Text };

struct TypedValue {
    TypedKind kind = TypedKind::Text;
    double value = 0.0;        // the number, the serial (1900 system) or 1/0
    std::string numberFormat;  // the format the cell takes on; empty if none
};

// Blanks around the text are ignored. Recognised forms:
//   "12", "-3.5", "+.5", "1e3"         number ("1e3" takes "0.00E+00")
//   "12%", "12.5%"                    number / 100 with "0%" or "0.00%"
//   "true", "FALSE" (any case)        boolean
//   "2012-03-04", "2012/3/4"          date, "yyyy-mm-dd" / "yyyy/mm/dd"
//   "05:06", "05:06:07", "05:06:07.1" time fraction, "hh:mm", "hh:mm:ss",
//                                     "hh:mm:ss.0" (one '0' a digit, 1 to 3)
//   date, one blank, time              serial with both formats joined
// An impossible date or time (31 April, hour 24, minute 60) and anything else
// stays text; so does the empty text.
TypedValue ParseTypedText(std::string_view text);

}  // namespace workbook::format
