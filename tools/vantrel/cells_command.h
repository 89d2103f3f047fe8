// SPDX-License-Identifier: MIT
// "vantrel cells": what the workbook engine sees in one worksheet, as JSON.
#pragma once

#include <iosfwd>
#include <string>

namespace vantrel_cli {

// Runs "vantrel cells BOOK --sheet N" and returns the exit status: 0 printed,
// 1 the book or sheet can't be read.
int RunCells(const std::string &path, int sheet);

// Prints worksheet `sheet` (from 1) of the workbook at path to out as one JSON
// object. Returns 0, or 1 with the message on err.
int PrintCells(const std::string &path, int sheet, std::ostream &out, std::ostream &err);

}  // namespace vantrel_cli
