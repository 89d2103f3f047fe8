// SPDX-License-Identifier: MIT
// Number text of the fixed locale, with the reason a text was refused.
#pragma once

#include <string_view>

namespace automation::detail {

enum class NumberParse { Ok, NotANumber, OutOfRange };

// As automation::ParseNumber, telling a text that is no number apart from a
// number beyond the range of a double.
NumberParse ParseNumberText(std::string_view text, double &value);

// Blanks that may surround a number, a date or a time.
inline bool IsBlank(char32_t c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

}  // namespace automation::detail
