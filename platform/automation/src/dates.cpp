// SPDX-License-Identifier: MIT
// Date serials against broken-down dates and times.
#include "automation/automation.h"
#include "calendar.h"

using automation::detail::DateTimeFields;

namespace {

SYSTEMTIME ToSystemTime(const DateTimeFields &f)
{
    SYSTEMTIME st{};
    st.wYear = static_cast<WORD>(f.year);
    st.wMonth = static_cast<WORD>(f.month);
    st.wDayOfWeek = static_cast<WORD>(f.dayOfWeek);
    st.wDay = static_cast<WORD>(f.day);
    st.wHour = static_cast<WORD>(f.hour);
    st.wMinute = static_cast<WORD>(f.minute);
    st.wSecond = static_cast<WORD>(f.second);
    st.wMilliseconds = 0;  // serials are broken down to whole seconds
    return st;
}

}  // namespace

// wMilliseconds and wDayOfWeek are not read: a serial built here always
// stands on a whole second.
AUTOMATION_API INT SystemTimeToVariantTime(SYSTEMTIME *lpSystemTime, DATE *pvtime)
{
    if (!lpSystemTime || !pvtime) return FALSE;
    DateTimeFields f;
    f.year = lpSystemTime->wYear;
    f.month = lpSystemTime->wMonth;
    f.day = lpSystemTime->wDay;
    f.hour = lpSystemTime->wHour;
    f.minute = lpSystemTime->wMinute;
    f.second = lpSystemTime->wSecond;
    return automation::detail::FieldsToSerial(f, *pvtime) ? TRUE : FALSE;
}

AUTOMATION_API INT VariantTimeToSystemTime(DATE vtime, SYSTEMTIME *lpSystemTime)
{
    DateTimeFields f;
    if (!lpSystemTime || !automation::detail::SerialToFields(vtime, f)) return FALSE;
    *lpSystemTime = ToSystemTime(f);
    return TRUE;
}

// dwFlags changes nothing here: the fields are always broken down in full.
AUTOMATION_API HRESULT VarUdateFromDate(DATE dateIn, ULONG /*dwFlags*/, UDATE *pudateOut)
{
    DateTimeFields f;
    if (!pudateOut || !automation::detail::SerialToFields(dateIn, f)) return E_INVALIDARG;
    pudateOut->st = ToSystemTime(f);
    pudateOut->wDayOfYear = static_cast<USHORT>(f.dayOfYear);
    return S_OK;
}
