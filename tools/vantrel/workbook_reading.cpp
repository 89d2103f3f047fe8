// SPDX-License-Identifier: MIT
#include "workbook_reading.h"

#include "automation/com_error.h"
#include "module/string_table.h"

namespace vantrel_cli {

std::shared_ptr<workbook::Workbook> OpenForReading(workbook::Application &app, const std::string &path,
                                                   std::ostream &err)
{
    // Opening is the step that can fail on a user's file.
    try {
        return app.GetWorkbooks()->Open(path);
    } catch (const automation::ComError &e) {
        err << vantrel::FormatMessage(121) << "\n" << e.what() << "\n";
        return nullptr;
    }
}

bool ReadsWhole(workbook::Worksheet &sheet, std::ostream &err)
{
    // The engine reads a sheet on first use: a sheet it can't read is a
    // workbook that doesn't open.
    try {
        sheet.UsedRange();
        return true;
    } catch (const automation::ComError &e) {
        err << vantrel::FormatMessage(121) << "\n" << e.what() << "\n";
        return false;
    }
}

std::string ColumnName(int32_t column)
{
    std::string name;
    for (; column > 0; column = (column - 1) / 26) name.insert(name.begin(), char('A' + (column - 1) % 26));
    return name;
}

}  // namespace vantrel_cli
