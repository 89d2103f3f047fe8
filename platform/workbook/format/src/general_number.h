// SPDX-License-Identifier: MIT
// The General rendering of a number, shared by display_text.cpp and the
// number sections that hold the General keyword.
#pragma once

#include <string>

namespace workbook::format {

// |value| in General, without a sign; value must be finite.
std::string GeneralMagnitudeText(double value);

}  // namespace workbook::format
