// SPDX-License-Identifier: MIT
#include "dialogs/open_dialog_fields.h"

#include "specification/parsing_type.h"

namespace vantrel::dialogs {

bool COpenDialogKeys::GetDialogKeyValue(int key, std::string &value) const
{
    value.clear();
    switch (key) {
    case ExcelSheet:
        // An empty field means the first sheet, as its label says.
        value = m_dialog.m_excelSheets.find_first_not_of(" \t") == std::string::npos ? "1" : m_dialog.m_excelSheets;
        return true;
    case TemplateFilePath:
        value = m_dialog.m_templatePath;
        return m_dialog.m_templateMode != 0;
    case SaveTemplateFilePath:
        return false;
    case FilePath:
        value = m_dialog.m_filePath;
        return true;
    default:
        if (key >= DateCol && key <= GlobalTime) return m_time.GetKeyValue(key, value);
        if (key >= StartRow && key <= DelValRow) return m_data.GetKeyValue(key, value);
        return false;
    }
}

}  // namespace vantrel::dialogs
