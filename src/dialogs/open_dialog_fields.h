// SPDX-License-Identifier: MIT
// The open dialog's own fields, and the keys of the whole dialog: its own
// and those of its time and data pages.
#pragma once

#include <string>

#include "dialogs/data_page_fields.h"
#include "dialogs/dialog_to_string.h"
#include "dialogs/time_page_fields.h"

namespace vantrel::dialogs {

struct OpenDialogFields {
    std::string m_filePath;
    std::string m_templatePath;
    std::string m_excelSheets = "1";
    // 0 no template, 1 use a template, 2 save a template.
    int m_templateMode = 0;
};

// The keys out of the committed fields of the dialog and its pages.
class COpenDialogKeys : public CDialogKeySource {
public:
    COpenDialogKeys(const OpenDialogFields &dialog, const TimePageFields &time, const DataPageFields &data)
        : m_dialog(dialog), m_time(time), m_data(data)
    {
    }
    bool GetDialogKeyValue(int key, std::string &value) const override;

private:
    const OpenDialogFields &m_dialog;
    const TimePageFields &m_time;
    const DataPageFields &m_data;
};

}  // namespace vantrel::dialogs
