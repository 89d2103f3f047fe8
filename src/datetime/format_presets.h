// SPDX-License-Identifier: MIT
// The preset formats that a date/time format combo box offers. The lists stand
// in the order of adding; the combo box keeps its list sorted itself, so the
// order on the screen is the control's and not this one.
#pragma once

#include <string>
#include <vector>

namespace vantrel::datetime {

// The kinds of format combo box.
enum FormatPresetKind {
    FormatPresetDateTime = 0,  // "Date/time format", "Date/time in multiple columns"
    FormatPresetDate = 1,      // "Date format"
    FormatPresetTime = 2,      // "Time format"
};

// The dates and times that the date/time presets are made of, in order.
const std::vector<std::string> &DatePresetList();
const std::vector<std::string> &TimePresetList();

// The presets of a kind in the order of adding: ten for date and time, five
// for a date, four for a time; none for any other kind.
const std::vector<std::string> &FormatPresets(int kind);

// The list of a combo box is drop-down with an edit field and sorted.
inline constexpr bool kFormatComboListSorted = true;

}  // namespace vantrel::datetime
