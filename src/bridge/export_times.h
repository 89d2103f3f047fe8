// SPDX-License-Identifier: MIT
// The time steps of an export and their date/time cells: made once, while
// the check reads them back as the import would, and then written as the
// numbers the workbook stores for them.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "bridge/export_layout.h"
#include "workbook/excel_obj.h"

namespace vantrel::bridge {

// A time cell as the export stores it, found while its read-back is checked,
// so that the write puts the number without making the cell again.
struct TimeCell {
    double value = 0.0;   // the number, or a date counted from 1899-12-30
    uint16_t format = 0;  // the number format its typed entry gives, in ExportTimes::formats
    bool known = false;   // false: no number; the write makes the cell anew
    bool date = false;

    CExcelObj::KnownNumber Number() const { return {value, date}; }
};

// The time steps of an export and the cells they become.
struct ExportTimes {
    std::vector<DATE> times;
    int columns = 1;              // time cells a step
    std::vector<TimeCell> cells;  // step after step, columns each
    std::vector<std::string> formats{std::string()};  // 0 stands for none

    std::span<const TimeCell> Step(size_t step) const
    {
        return {cells.data() + step * size_t(columns), size_t(columns)};
    }
};

// Does every step of exportTimes.times read back as the time it is, through
// the cells the export writes and the import reads with the same string?
// Sets layout.subSecond first and fills exportTimes.cells; false with the
// reason for the first step that doesn't.
bool CheckTimesReadBack(ExportLayout &layout, ExportTimes &exportTimes, std::string &message);

}  // namespace vantrel::bridge
