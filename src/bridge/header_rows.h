// SPDX-License-Identifier: MIT
// The header rows of an export: item type t, unit u and value type v of each
// item share cells as their row numbers coincide ("t[u]:v", "t[u]", "t:v",
// "u:v").
#pragma once

#include <string>
#include <vector>

// Fills lists with 1 to 3 lists of one text an item, in item order, and
// returns their number: 1 when the three rows are equal, 2 when two are, 3
// when none are. 0, with nothing filled, when the three inputs differ in length.
int ComposeHeaderRows(const std::vector<std::string> &itemTypes, const std::vector<std::string> &units,
                      const std::vector<std::string> &valueTypes,
                      std::vector<std::vector<std::string>> &lists, int unitTypeRow, int unitRow,
                      int valueTypeRow);
