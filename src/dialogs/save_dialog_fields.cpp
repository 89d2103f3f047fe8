// SPDX-License-Identifier: MIT
#include "dialogs/save_dialog_fields.h"

#include "specification/parsing_type.h"

namespace vantrel::dialogs {
namespace {

constexpr int kHeadingBelowData = 115;
constexpr int kTitleRowShared = 116;
constexpr int kWrongStartRow = 133;

// A quoted format makes the cell a true date.
constexpr const char kDateCellFormat[] = "\"YYYY/MM/DD hh:mm:ss\"";

bool GiveNumber(std::string &value, int number)
{
    value = std::to_string(number);
    return number != 0;
}

}  // namespace

int SaveDialogFields::CheckHeaderRows() const
{
    const int s = m_dataStartRow;
    if (m_unitTypeRow >= s || m_saveValueTypeRow >= s || m_saveItemDescriptionRow >= s ||
        (m_useDeleteRow == 1 && m_saveDeleteValueRow >= s))
        return kHeadingBelowData;
    const int title = m_saveItemDescriptionRow;
    if (title == m_unitTypeRow || title == m_saveUnitRow || title == m_saveValueTypeRow ||
        (m_useDeleteRow != 0 && m_saveDeleteValueRow == title))
        return kTitleRowShared;
    return 0;
}

int SaveDialogFields::CheckPreviewRows() const
{
    if (const int message = CheckHeaderRows()) return message;
    return m_dataStartRow == 0 ? kWrongStartRow : 0;
}

SaveSpecification SaveDialogFields::ToSaveSpecification() const
{
    SaveSpecification record;
    record.DateTimeCol = m_dateTimeColumn;
    record.UseDTFormat = 0;
    record.DateTimeFormat = m_format;
    record.UnitTypeRow = m_unitTypeRow;
    record.UnitRow = m_saveUnitRow;
    record.ValueTypeRow = m_saveValueTypeRow;
    record.ItemDescriptionRow = m_saveItemDescriptionRow;
    record.StartRow = m_dataStartRow;
    record.UseDelValNotEmpty = 0;
    record.DeleteValueRow = m_saveDeleteValueRow;
    return record;
}

bool CSaveDialogKeys::GetDialogKeyValue(int key, std::string &value) const
{
    value.clear();
    const SaveDialogFields &f = m_fields;
    switch (key) {
    case DateTimeCol:
        return GiveNumber(value, f.m_dateTimeColumn);
    case DateTimeFormat:
        value = f.m_format;
        return f.m_multiColumns == 1 && !f.m_format.empty();
    case StartRow:
        return GiveNumber(value, f.m_dataStartRow);
    case UnitTypeRow:
        return GiveNumber(value, f.m_unitTypeRow);
    case UnitRow:
        return GiveNumber(value, f.m_saveUnitRow);
    case ValueTypeRow:
        return GiveNumber(value, f.m_saveValueTypeRow);
    case ItemDescriptionRow:
        return GiveNumber(value, f.m_saveItemDescriptionRow);
    case DelValRow:
        return GiveNumber(value, f.m_saveDeleteValueRow) && f.m_useDeleteRow == 1;
    case TemplateFilePath:
        value = f.m_templatePath;
        return f.m_templateMode != 0;
    case FilePath:
        value = f.m_filePath;
        return true;
    default:
        return false;
    }
}

std::string PreviewFormat(const SaveDialogFields &fields)
{
    if (fields.m_multiColumns == 1 && !fields.m_format.empty()) return fields.m_format;
    return kDateCellFormat;
}

}  // namespace vantrel::dialogs
