// SPDX-License-Identifier: MIT
// The fields of the time page and the keys they give. Three layouts, one of
// which counts: 0 date and time in the cells, 1 one date for the sheet and
// the time in the cells, 2 one time for the sheet and the date in the cells.
#pragma once

#include <string>

#include "datetime/date_value.h"

namespace vantrel::dialogs {

struct TimePageFields {
    int m_timeMode = 0;
    int m_dateTimeCol = 1;
    int m_useDTFormat = 0;
    std::string m_dateTimeFormat = "YYYY/MM/DD HH:mm:ss";
    int m_timeCol = -1;
    int m_useTFormat = 0;
    std::string m_timeFormat = "HH:mm:ss";
    int m_dateCol = 0;
    int m_useDFormat = 0;
    std::string m_dateFormat = "YYYY/MM/DD";
    DateValue m_globalDate;
    DateValue m_globalTime;

    // The value of a time key (DateCol to GlobalTime) whatever the mode; the
    // result says whether the key is given in the present mode. value is
    // emptied first; a key that isn't the page's gives false.
    bool GetKeyValue(int key, std::string &value) const;
};

// The present local date and time as a date value; invalid (serial 0) when
// the clock can't be read or broken down.
DateValue LocalNow();

// Are the controls of a layout enabled while the radio of selectedMode is
// selected? A layout's format combo also needs its box checked.
inline bool TimeLayoutEnabled(int selectedMode, int layout) { return selectedMode == layout; }
inline bool TimeComboEnabled(int selectedMode, int layout, bool boxChecked)
{
    return selectedMode == layout && boxChecked;
}

}  // namespace vantrel::dialogs
