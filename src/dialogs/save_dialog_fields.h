// SPDX-License-Identifier: MIT
// The fields of the save dialog, the keys they give, and the row checks of
// the preview and of OK.
#pragma once

#include <string>

#include "dialogs/dialog_to_string.h"
#include "specification/records.h"

namespace vantrel::dialogs {

struct SaveDialogFields {
    std::string m_filePath;
    std::string m_templatePath;
    int m_dateTimeColumn = 1;
    // 0 no template, 1 use one, 2 save one.
    int m_templateMode = 0;
    int m_unitTypeRow = 1;
    int m_saveValueTypeRow = 1;
    int m_dataStartRow = 3;
    int m_saveDeleteValueRow = 2;
    int m_saveItemDescriptionRow = 2;
    int m_saveUnitRow = 1;
    std::string m_format = "YYYY/MM/DD HH:mm:ss";
    // A delete value row is written.
    int m_useDeleteRow = 0;
    // A format of the user's is used at all.
    int m_multiColumns = 0;

    // The rows of OK: 0 when they are in order, else message 115 (a header
    // row not above the data) or 116 (the title row shared), the first that holds.
    int CheckHeaderRows() const;
    // The rows of a preview refresh: those of OK, then 133 for data start row 0.
    int CheckPreviewRows() const;

    // The record that OK checks: the fields, with both flags 0.
    SaveSpecification ToSaveSpecification() const;
};

// The keys out of the committed fields.
class CSaveDialogKeys : public CDialogKeySource {
public:
    explicit CSaveDialogKeys(const SaveDialogFields &fields) : m_fields(fields) {}
    bool GetDialogKeyValue(int key, std::string &value) const override;

private:
    const SaveDialogFields &m_fields;
};

// The format the preview lays the time out in: the user's when the box is
// checked and it isn't empty, else one column holding a true date.
std::string PreviewFormat(const SaveDialogFields &fields);

}  // namespace vantrel::dialogs
