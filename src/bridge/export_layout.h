// SPDX-License-Identifier: MIT
// Where an export puts things, taken from the specification string and
// checked before any workbook is opened: an export either lays the host
// object out in a form that reads back with the same string, or is refused
// with a message that names the key and what to fix.
#pragma once

#include <string>
#include <vector>

#include "automation/values.h"

namespace vantrel::bridge {

struct ExportLayout {
    int column = 0;           // c, the first date/time column
    int timeColumns = 1;      // k, the columns of the format
    int mode = 0;             // as GetDateTimeLayout gives it
    std::string format;
    std::string globalText;   // GlobalTime in mode 1, GlobalDate in mode 2
    std::string columnKey;    // the key that named c, and the key of its format
    std::string formatKey;
    int startRow = 0;
    int titleRow = -1;        // rows below 1 are not written
    int typeRow = -1, unitRow = -1, valueTypeRow = -1;
    int deleteValueRow = -1;
    bool deleteValueKey = false;  // DelValRow stands in the string
    // The time cells carry milliseconds: true dates that show them.
    bool subSecond = false;
};

// The layout of spec for itemCount items and stepCount steps; false with the
// reason when the string can't be laid out on a sheet.
bool TakeExportLayout(const std::string &spec, long itemCount, long stepCount, ExportLayout &layout,
                      std::string &message);

// Whether the export may write onto path, which exists or is to be made:
// only .xlsx and .xlsm workbooks are written, a file of another kind is
// left as it is, and no workbook is made under a name that promises another
// kind (nor under a name without extension). false with the reason.
bool CheckExportTarget(const std::string &path, bool exists, std::string &message);

// The cells of one time step, one element a date/time column.
automation::SafeArray ExportTimeCells(const ExportLayout &layout, const VARIANT &time);

// The number format of the date/time column of a layout with milliseconds.
inline constexpr const char *kSubSecondNumberFormat = "yyyy-mm-dd hh:mm:ss.000";

}  // namespace vantrel::bridge
