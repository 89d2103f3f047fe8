// SPDX-License-Identifier: MIT
// How the text of a dialog field becomes a number and back: a whole number
// may carry a sign and surrounding blanks, nothing else; a number is a
// decimal or exponent text read whole.
#pragma once

#include <string>

namespace vantrel::dialogs {

// False, with value untouched, for a text that is no whole number or lies
// outside the 32-bit range.
bool ParseWholeNumber(const std::string &text, int &value);
// False, with value untouched, for a text that is no finite number.
bool ParseNumber(const std::string &text, double &value);

std::string WholeNumberText(int value);
// Fifteen significant digits: -1e-30 stays "-1e-30".
std::string NumberText(double value);

// "%d" and "%g", as the specification string prints numbers.
std::string KeyNumberText(int value);
std::string KeyDoubleText(double value);

}  // namespace vantrel::dialogs

namespace vantrel::dialogs {

// Where a spin's arrow takes a field: one step from the number the field
// holds (or from position when it holds none), kept within low and high.
int SpinStep(const std::string &text, int position, int step, int low, int high);

}  // namespace vantrel::dialogs
