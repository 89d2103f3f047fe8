// SPDX-License-Identifier: MIT
#include "dialogs/time_page_fields.h"

#include <chrono>
#include <ctime>

#include "datetime/date_time_util.h"
#include "dialogs/field_parsing.h"
#include "specification/parsing_type.h"

namespace vantrel::dialogs {

bool TimePageFields::GetKeyValue(int key, std::string &value) const
{
    value.clear();
    switch (key) {
    case DateTimeCol:
        value = KeyNumberText(m_dateTimeCol);
        return m_timeMode == 0;
    case DateTimeFormat:
        value = m_dateTimeFormat;
        return m_timeMode == 0 && m_useDTFormat == 1;
    case TimeCol:
        value = KeyNumberText(m_timeCol);
        return m_timeMode == 1;
    case TimeFormat:
        value = m_timeFormat;
        return m_timeMode == 1 && m_useTFormat == 1;
    case GlobalDate:
        value = CDateTimeUtil::FormatDateLocal(m_globalDate, VAR_DATEVALUEONLY, LOCALE_USER_DEFAULT);
        return m_timeMode == 1;
    case DateCol:
        value = KeyNumberText(m_dateCol);
        return m_timeMode == 2;
    case DateFormat:
        value = m_dateFormat;
        return m_timeMode == 2 && m_useDFormat == 1;
    case GlobalTime:
        value = CDateTimeUtil::FormatDateLocal(m_globalTime, VAR_TIMEVALUEONLY, LOCALE_USER_DEFAULT);
        return m_timeMode == 2;
    default:
        return false;
    }
}

DateValue LocalNow()
{
    DateValue now{0.0, kDateInvalid};
    const std::time_t clock = std::chrono::system_clock::to_time_t(std::chrono::system_clock::now());
    std::tm local{};
    if (!localtime_r(&clock, &local)) return now;
    SYSTEMTIME fields{};
    fields.wYear = WORD(local.tm_year + 1900);
    fields.wMonth = WORD(local.tm_mon + 1);
    fields.wDay = WORD(local.tm_mday);
    fields.wHour = WORD(local.tm_hour);
    fields.wMinute = WORD(local.tm_min);
    fields.wSecond = WORD(local.tm_sec);
    DATE serial = 0.0;
    if (!CDateTimeUtil::MakeDateValue(fields, serial)) return now;
    return {serial, kDateValid};
}

}  // namespace vantrel::dialogs
