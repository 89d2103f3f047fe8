// SPDX-License-Identifier: MIT
// How the text of a dialog field becomes a number and back: a whole number
// may carry a sign and surrounding blanks, nothing else; a number is a
// decimal or exponent text read whole. Every number text has a decimal point
// whatever the process's locale: fields, templates, the specification string
// and the previews are read and written the same on every machine.
#pragma once

#include <string>

namespace vantrel::dialogs {

// False, with value untouched, for a text that is no whole number or lies
// outside the 32-bit range.
bool ParseWholeNumber(const std::string &text, int &value);
// False, with value untouched, for a text that is no finite number.
bool ParseNumber(const std::string &text, double &value);

std::string WholeNumberText(int value);
// The shortest text that reads back as the same double: -9999.5 gives
// "-9999.5", -1e-30 gives "-1e-30".
std::string NumberText(double value);
// Six significant digits, as "%g" prints them in the "C" locale: what the
// previews show of a value.
std::string ShortNumberText(double value);

// The specification string's numbers: whole numbers in decimal, the delete
// value as NumberText, so that it reads back exactly.
std::string KeyNumberText(int value);
std::string KeyDoubleText(double value);

}  // namespace vantrel::dialogs

namespace vantrel::dialogs {

// Where a spin's arrow takes a field: one step from the number the field
// holds (or from position when it holds none), kept within low and high.
int SpinStep(const std::string &text, int position, int step, int low, int high);

}  // namespace vantrel::dialogs
