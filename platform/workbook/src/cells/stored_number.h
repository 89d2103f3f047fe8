// SPDX-License-Identifier: MIT
// A number as a workbook file stores it in text, read the one way every
// reader reads it: a number beyond what a cell can hold is told, not fatal.
#pragma once

#include <string_view>

namespace workbook {

struct StoredNumber {
    enum class Kind {
        Finite,      // value holds it
        Underflow,   // too small to tell from 0: value is 0
        Unreadable,  // beyond the range of a double, NaN, infinity, or no number at all
    };
    Kind kind = Kind::Unreadable;
    double value = 0;
};

StoredNumber ReadStoredNumber(std::string_view text);

}  // namespace workbook
