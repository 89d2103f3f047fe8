// SPDX-License-Identifier: MIT
// The fields of the data page, the keys they give, the row check and which
// controls the radios and the box leave enabled.
#pragma once

#include <string>

namespace vantrel::dialogs {

struct DataPageFields {
    int m_useDelValNotEmpty = 0;
    std::string m_unit;
    std::string m_itemType;
    std::string m_valueType;
    double m_deleteValue = -1e-30;
    int m_deleteValueRow = 0;
    int m_itemDescriptionRow = 0;
    int m_unitRow = 0;
    int m_itemTypeRow = 0;
    int m_valueTypeRow = 0;
    int m_startRow = 0;
    // Radio values: 0 the first choice of the group ("Use same ..."), 1 the row.
    int m_itemTypeInRow = 0;
    int m_unitInRow = 0;
    int m_valueTypeInRow = 0;
    int m_deleteValueInRow = 0;

    // The value of a data key (StartRow to DelValRow) whatever the radios say;
    // the result says whether the key is given. value is emptied first; a key
    // that isn't the page's gives false.
    bool GetKeyValue(int key, std::string &value) const;

    // The row check of OK: 0 when the rows are in order, else the number of
    // the message that says what is wrong (115 or 116), by the first case
    // that holds.
    int CheckDataRows() const;
};

// What the radios and the box leave enabled.
struct DataPageEnables {
    bool itemTypeList = true;
    bool itemTypeRow = false;
    bool unitList = true;
    bool unitRow = false;
    bool valueTypeList = true;
    bool valueTypeRow = false;
    bool deleteRadios = false;
    bool deleteValue = false;
    bool deleteValueRow = false;
};

// The states for radios and a box as the controls show them.
DataPageEnables DataEnables(int itemTypeInRow, int unitInRow, int valueTypeInRow, bool boxChecked,
                            int deleteValueInRow);

}  // namespace vantrel::dialogs
