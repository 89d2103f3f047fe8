// SPDX-License-Identifier: MIT
// The times of a sheet's data rows, read in one go and parsed row by row as
// the layout says, with true dates as the workbook shows them: a workbook
// that counts its dates from 1904 has them moved onto the common base.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "automation/values.h"
#include "bridge/sheet_layout.h"

class CExcelObj;

namespace vantrel::bridge {

class SheetTimes {
public:
    // timesOnly lets a column of true dates be read straight as dates, with
    // no cells to hand out.
    SheetTimes(CExcelObj &excel, const SheetLayout &layout, int firstRow, int rowCount, bool timesOnly = false);

    // The time of row `row` (from 0); nothing when its cells give none.
    std::optional<DATE> At(int row);
    // The date/time cells of the row, the time columns of a split layout
    // behind the date columns, each as stored; valid until the next call.
    SAFEARRAY *Cells(int row);
    // The row's cells as the user wrote them, for messages: "2012-04-31", or
    // one text a column joined by bars.
    std::string RowText(int row);
    // Message 113 for a row whose cells give no time, with the reason.
    std::string NoTimeMessage(int row);

private:
    void MoveTo1900Base(SAFEARRAY *block, const std::string &format, int columnCount);

    CExcelObj &excel_;
    const SheetLayout &layout_;
    int firstRow_;
    std::vector<automation::SafeArray> blocks_;
    RowCells row_;
    std::vector<DATE> dates_;  // the straight read of true dates
};

}  // namespace vantrel::bridge
