// SPDX-License-Identifier: MIT
// The parts of a new workbook: one empty worksheet named "Sheet1", a plain
// stylesheet and an empty shared-string table, in the transitional format.
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace workbook {

std::vector<std::pair<std::string, std::string>> NewWorkbookParts();

}  // namespace workbook
