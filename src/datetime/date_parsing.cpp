// SPDX-License-Identifier: MIT
// Text and fields to points in time, and the order of two points.
#include <cmath>

#include "automation/text.h"
#include "datetime/date_fields.h"
#include "datetime/date_time_util.h"

using namespace vantrel::datetime;

namespace {

// Start values of fields that a text does not give.
constexpr FieldValues kStartFields = {1900, 1, 1, 0, 0, 0};

SYSTEMTIME ToSystemTime(const FieldValues &fields)
{
    SYSTEMTIME st{};
    st.wYear = static_cast<WORD>(fields[0]);
    st.wMonth = static_cast<WORD>(fields[1]);
    st.wDay = static_cast<WORD>(fields[2]);
    st.wHour = static_cast<WORD>(fields[3]);
    st.wMinute = static_cast<WORD>(fields[4]);
    st.wSecond = static_cast<WORD>(fields[5]);
    return st;
}

}  // namespace

bool CDateTimeUtil::ParseDateTimeFields(DateValue &date, const std::string &text,
                                        const std::string &format)
{
    FieldValues fields = kStartFields;
    if (!ReadFields(text, format, FieldSet::All, fields)) return false;
    DATE serial = 0.0;
    const bool made = MakeDateValue(ToSystemTime(fields), serial);
    date.serial = serial;
    date.status = made ? kDateValid : kDateInvalid;
    return true;
}

bool CDateTimeUtil::ParseDateFields(int &year, int &month, int &day, const std::string &text,
                                    const std::string &format)
{
    FieldValues fields = kStartFields;
    if (!ReadFields(text, format, FieldSet::DateOnly, fields)) return false;
    year = At(fields, Field::Year);
    month = At(fields, Field::Month);
    day = At(fields, Field::Day);
    return true;
}

bool CDateTimeUtil::ParseTimeFields(int &hour, int &minute, int &second, const std::string &text,
                                    const std::string &format)
{
    FieldValues fields = kStartFields;
    At(fields, Field::Hour) = hour;
    At(fields, Field::Minute) = minute;
    At(fields, Field::Second) = second;
    if (!ReadFields(text, format, FieldSet::TimeOnly, fields)) return false;
    hour = At(fields, Field::Hour);
    minute = At(fields, Field::Minute);
    second = At(fields, Field::Second);
    return true;
}

bool CDateTimeUtil::MakeDateValue(const SYSTEMTIME &fields, DATE &serial)
{
    SYSTEMTIME in = fields;
    DATE made = 0.0;
    if (!SystemTimeToVariantTime(&in, &made)) return false;
    // The way back unmasks fields that were carried over, such as 31 April.
    SYSTEMTIME back{};
    if (!VariantTimeToSystemTime(made, &back)) return false;
    if (back.wYear != fields.wYear || back.wMonth != fields.wMonth || back.wDay != fields.wDay ||
        back.wHour != fields.wHour || back.wMinute != fields.wMinute ||
        back.wSecond != fields.wSecond)
        return false;
    serial = made;
    return true;
}

bool CDateTimeUtil::ParseDateTimeText(DateValue &date, std::string_view text, ULONG flags,
                                      LCID locale)
{
    const std::u16string wide = automation::Utf8ToUtf16(text);
    DATE serial = 0.0;
    const HRESULT hr = VarDateFromStr(wide.c_str(), locale, flags, &serial);
    if (SUCCEEDED(hr)) {
        date.serial = serial;
        date.status = kDateValid;
        return true;
    }
    date.serial = hr == DISP_E_TYPEMISMATCH ? 0.0 : -1.0;
    date.status = kDateInvalid;
    return false;
}

namespace {

// Below zero the fraction of a serial runs the other way: -1.25 is 29 December
// 1899, 06:00, and so later than -1.0, the midnight of that day. Mirroring the
// fraction around the ceiling puts such serials in true time order.
double OrderValue(double serial)
{
    if (serial > -HalfSecond) return serial;
    const double ceiling = std::ceil(serial);
    return ceiling - (serial - ceiling);
}

}  // namespace

bool CDateTimeUtil::IsStrictlyLater(double previous, double current)
{
    if (OrderValue(previous) > OrderValue(current)) return false;
    if (current < previous + HalfSecond && current > previous - HalfSecond) return false;
    return true;
}
