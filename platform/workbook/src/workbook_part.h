// SPDX-License-Identifier: MIT
// The workbook part (xl/workbook.xml): the sheet list and the date system.
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

}  // namespace workbook
