// SPDX-License-Identifier: MIT
// The one locale of the automation runtime.
//
// Every LCID (LOCALE_USER_DEFAULT, 1024, and any other) is served by the same
// fixed locale, so a conversion gives the same text on every machine:
//
//   numbers   a decimal point, no digit grouping, an optional sign; printed with
//             up to 15 significant digits (7 for a 32-bit float) exactly as the
//             C format "%.15G" does: 0.1 -> "0.1", 1e20 -> "1E+20",
//             0.00001 -> "1E-05", 40972.2125810185 -> "40972.2125810185".
//             Negative zero prints as "0"; NaN and infinities print as "NAN",
//             "INF" and "-INF" and are the only texts that do not parse back.
//   dates     ISO order: "2012-03-04"; '/' may stand for '-' when read
//             ("2012/03/04"), the same separator twice.
//   times     24 hours, "05:06:07"; read also without seconds ("05:06").
//   both      "2012-03-04 05:06:07": one or more blanks between the two.
//
// A date serial is printed as its date alone when its time of day is 0, as its
// time alone when its date is 30 December 1899 (serial 0 prints "00:00:00"),
// and as both otherwise. Blanks (space, tab, CR, LF) around a text are allowed.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "automation/automation.h"

namespace automation {

// The locale that every conversion of this runtime uses.
inline constexpr LCID kFixedLocale = LOCALE_USER_DEFAULT;

// Significant digits that a number is printed with.
inline constexpr int kDoubleDigits = 15;
inline constexpr int kFloatDigits = 7;

// A number as text, with up to significantDigits significant digits (1 to 17).
AUTOMATION_CXX_API std::string FormatNumber(double value, int significantDigits = kDoubleDigits);

// Reads a number written in the locale: optional blanks, an optional sign,
// digits with an optional decimal point (".5" and "5." are numbers), an
// optional exponent ("1E+20", "1e-5"), optional blanks. Nothing else.
// False when the text is no number or lies beyond the range of a double;
// value is then unchanged.
AUTOMATION_CXX_API bool ParseNumber(std::string_view text, double &value);
AUTOMATION_CXX_API bool ParseNumber(std::u16string_view text, double &value);

// A date serial in the locale's words. flags: 0, VAR_TIMEVALUEONLY (the time
// alone) or VAR_DATEVALUEONLY (the date alone). Empty when the serial lies
// outside the years 100 to 9999 or is not a number.
AUTOMATION_CXX_API std::optional<std::string> FormatDateText(DATE serial, ULONG flags);

// Reads a date, a time, or both in the locale's words. With VAR_TIMEVALUEONLY
// the date is dropped, with VAR_DATEVALUEONLY the time. Empty when the text is
// none of these or names no real day or time (31 April, 24:00:00).
AUTOMATION_CXX_API std::optional<DATE> ParseDateText(std::u16string_view text, ULONG flags);

}  // namespace automation
