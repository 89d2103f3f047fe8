// SPDX-License-Identifier: MIT
// The names of the value types, by number. Import also accepts the number 5,
// which has no name.
#pragma once

#include <array>

namespace vantrel {

inline constexpr std::array<const char *, 5> ValueTypeNames = {
    "Instantaneous",
    "Accumulated",
    "Step_Accumulated",
    "Mean_Step_Accumulated",
    "Reverse_Mean_Step_Accumulated",
};

}  // namespace vantrel
