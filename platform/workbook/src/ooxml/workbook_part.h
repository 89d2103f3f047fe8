// SPDX-License-Identifier: MIT
// The workbook part (xl/workbook.xml): the sheet list, the date system and
// the calculation settings.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace workbook {

struct SheetEntry {
    std::string name;
    std::string relId;
    std::string state;  // visible, hidden or veryHidden
};

struct WorkbookPart {
    std::string mainNs;  // the spreadsheet namespace the part is written in
    bool date1904 = false;
    std::vector<SheetEntry> sheets;

    static WorkbookPart Parse(std::string_view xml, const std::string &partName);
};

// The workbook part's text with calcPr fullCalcOnLoad="1", added or set and
// the element's other attributes kept, so that a spreadsheet program computes
// every formula again on opening a workbook whose cells changed.
std::string WithFullCalcOnLoad(std::string_view xml, const std::string &partName);

}  // namespace workbook
