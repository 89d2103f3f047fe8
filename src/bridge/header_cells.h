// SPDX-License-Identifier: MIT
// The attribute header cells of a sheet. One cell may hold all three
// attributes as "Type[Unit]:ValueType", as an export writes them when the
// header rows coincide; each attribute cuts its own part out of the cell and
// turns it into a number when that part reads as one.
#pragma once

#include <optional>
#include <string_view>

#include "automation/values.h"

namespace vantrel::bridge {

// The text without blanks at its ends as a 32-bit integer, when that is all it holds.
std::optional<int> TextAsInteger(std::string_view text);

// Case-blind equality of two texts.
bool EqualsIgnoringCase(std::string_view a, std::string_view b);

// Before the first "[" and before the first ":"; only a text cell changes.
automation::Variant NormalizeTypeCell(const automation::Variant &cell);
// Between the first "[" and the following "]", or before the first ":" in a
// text without "["; a number that is whole becomes an integer, also when not text.
automation::Variant NormalizeUnitCell(const automation::Variant &cell);
// Behind the first ":"; a number that is whole becomes an integer, also when not text.
automation::Variant NormalizeValueTypeCell(const automation::Variant &cell);

}  // namespace vantrel::bridge
