// SPDX-License-Identifier: MIT
#include "dialogs/data_page_fields.h"

#include "dialogs/field_parsing.h"
#include "specification/parsing_type.h"

namespace vantrel::dialogs {

bool DataPageFields::GetKeyValue(int key, std::string &value) const
{
    value.clear();
    switch (key) {
    case StartRow:
        value = KeyNumberText(m_startRow);
        return true;
    case UnitTypeRow:
        value = KeyNumberText(m_itemTypeRow);
        return m_itemTypeInRow == 1;
    case GlobalUnitType:
        value = m_itemType;
        return m_itemTypeInRow == 0;
    case UnitRow:
        value = KeyNumberText(m_unitRow);
        return m_unitInRow == 1;
    case GlobalUnit:
        value = m_unit;
        return m_unitInRow == 0;
    case ValueTypeRow:
        value = KeyNumberText(m_valueTypeRow);
        return m_valueTypeInRow == 1;
    case GlobalValueType:
        value = m_valueType;
        return m_valueTypeInRow == 0;
    case ItemDescriptionRow:
        value = KeyNumberText(m_itemDescriptionRow);
        return true;
    case DeleteValue:
        value = KeyDoubleText(m_deleteValue);
        return m_useDelValNotEmpty == 1 && m_deleteValueInRow == 0;
    case DelValRow:
        value = KeyNumberText(m_deleteValueRow);
        return m_useDelValNotEmpty == 1 && m_deleteValueInRow == 1;
    default:
        return false;
    }
}

int DataPageFields::CheckDataRows() const
{
    constexpr int kHeadingBelowData = 115;
    constexpr int kTitleRowShared = 116;
    if (m_itemTypeInRow == 1 && m_itemTypeRow >= m_startRow) return kHeadingBelowData;
    if (m_unitInRow == 1 && m_unitRow >= m_startRow) return kHeadingBelowData;
    if (m_valueTypeInRow == 1 && m_valueTypeRow >= m_startRow) return kHeadingBelowData;
    if (m_itemDescriptionRow >= m_startRow) return kHeadingBelowData;
    if (m_useDelValNotEmpty == 1 && m_deleteValueInRow == 1 && m_deleteValueRow >= m_startRow)
        return kHeadingBelowData;
    // The attribute rows may share a row with each other, never with the titles.
    if ((m_itemTypeInRow == 1 && m_itemTypeRow == m_itemDescriptionRow) ||
        (m_unitInRow == 1 && m_unitRow == m_itemDescriptionRow) ||
        (m_valueTypeInRow == 1 && m_valueTypeRow == m_itemDescriptionRow))
        return kTitleRowShared;
    return 0;
}

DataPageEnables DataEnables(int itemTypeInRow, int unitInRow, int valueTypeInRow, bool boxChecked,
                            int deleteValueInRow)
{
    DataPageEnables enables;
    enables.itemTypeList = itemTypeInRow != 1;
    enables.itemTypeRow = itemTypeInRow == 1;
    enables.unitList = unitInRow != 1;
    enables.unitRow = unitInRow == 1;
    enables.valueTypeList = valueTypeInRow != 1;
    enables.valueTypeRow = valueTypeInRow == 1;
    enables.deleteRadios = boxChecked;
    enables.deleteValue = boxChecked && deleteValueInRow != 1;
    enables.deleteValueRow = boxChecked && deleteValueInRow == 1;
    return enables;
}

}  // namespace vantrel::dialogs
