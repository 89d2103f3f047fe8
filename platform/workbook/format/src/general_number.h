// SPDX-License-Identifier: MIT
// The General rendering of a number, shared by display_text.cpp, the number
// sections that hold the General keyword and the column widths.
#pragma once

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace workbook::format {

// |value| in General, without a sign; value must be finite.
std::string GeneralMagnitudeText(double value);

// The shortest text that reads back as magnitude (positive and finite), when
// General shows exactly that: plain, within the width, no digit to round
// away. Most measured values are such, and this costs a fraction of the
// rounding GeneralMagnitudeText does otherwise. The text lies in buffer.
using ShortestBuffer = std::array<char, 32>;
std::optional<std::string_view> ShortestGeneralText(double magnitude, ShortestBuffer &buffer);

}  // namespace workbook::format
