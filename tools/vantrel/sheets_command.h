// SPDX-License-Identifier: MIT
// "vantrel sheets": the sheets of a workbook as its tabs list them, with the
// number ExcelSheet takes for each worksheet.
#pragma once

#include <iosfwd>
#include <string>

namespace vantrel_cli {

// Runs "vantrel sheets BOOK [--json]" and returns the exit status: 0 printed,
// 1 the workbook doesn't open (the reason on stderr).
int RunSheets(const std::string &path, bool json);

// Prints the sheets of the workbook at path to out, as a table or as one JSON
// list. Returns 0, or 1 with the message on err.
int PrintSheets(const std::string &path, bool json, std::ostream &out, std::ostream &err);

}  // namespace vantrel_cli
