// SPDX-License-Identifier: MIT
#include "cells/date_serial.h"

#include <charconv>
#include <cmath>
#include <cstdint>

#include "automation/civil_days.h"

namespace workbook {
namespace {

// Serial 0 of the 1904 date system is 1 January 1904.
constexpr int64_t kDays1904 = 1462;

// The serial of a calendar day in the workbook's date system. The 1900 system
// counts a 29 February 1900 that never was (serial 60), so the days before
// March 1900 come one earlier than the calendar's count.
double SerialOfDayNumber(int64_t dayNumber, bool date1904)
{
    if (date1904) return static_cast<double>(dayNumber - kDays1904);
    return static_cast<double>(dayNumber < 61 ? dayNumber - 1 : dayNumber);
}

bool ReadInt(std::string_view &s, size_t digits, int &out)
{
    if (s.size() < digits) return false;
    auto r = std::from_chars(s.data(), s.data() + digits, out);
    if (r.ec != std::errc() || r.ptr != s.data() + digits) return false;
    s.remove_prefix(digits);
    return true;
}

bool Expect(std::string_view &s, char c)
{
    if (s.empty() || s.front() != c) return false;
    s.remove_prefix(1);
    return true;
}

// "HH:MM[:SS[.fff]]" as a fraction of a day.
std::optional<double> ReadTime(std::string_view s)
{
    int h = 0, m = 0, sec = 0;
    if (!ReadInt(s, 2, h) || !Expect(s, ':') || !ReadInt(s, 2, m)) return std::nullopt;
    double frac = 0;
    if (Expect(s, ':')) {
        if (!ReadInt(s, 2, sec)) return std::nullopt;
        if (!s.empty() && s.front() == '.') {
            double scale = 0.1;
            s.remove_prefix(1);
            while (!s.empty() && s.front() >= '0' && s.front() <= '9') {
                frac += (s.front() - '0') * scale;
                scale /= 10;
                s.remove_prefix(1);
            }
        }
    }
    if (!s.empty() && s != "Z") return std::nullopt;
    if (h > 24 || m > 59 || sec > 60) return std::nullopt;
    return (h * 3600.0 + m * 60.0 + sec + frac) / 86400.0;
}

}  // namespace

std::optional<double> IsoTextToSerial(std::string_view s, bool date1904)
{
    if (s.size() >= 3 && s[2] == ':') return ReadTime(s);
    int y = 0, mo = 0, d = 0;
    std::string_view rest = s;
    if (!ReadInt(rest, 4, y) || !Expect(rest, '-') || !ReadInt(rest, 2, mo) || !Expect(rest, '-') ||
        !ReadInt(rest, 2, d))
        return std::nullopt;
    if (mo < 1 || mo > 12 || d < 1 || d > 31) return std::nullopt;
    double time = 0;
    if (!rest.empty()) {
        if (rest.front() != 'T' && rest.front() != ' ') return std::nullopt;
        auto t = ReadTime(rest.substr(1));
        if (!t) return std::nullopt;
        time = *t;
    }
    return SerialOfDayNumber(automation::DayNumber(y, mo, d), date1904) + time;
}


double SerialOfDay(int64_t year, int64_t month, int64_t day, bool date1904)
{
    return SerialOfDayNumber(automation::DayNumber(year, month, day), date1904);
}

CivilDay DayOfSerial(double serial, bool date1904)
{
    const int64_t whole = static_cast<int64_t>(std::floor(serial));
    if (date1904) return automation::CivilDayOf(kDays1904 + whole);
    if (whole == 60) return CivilDay{1900, 2, 29};
    return automation::CivilDayOf(whole < 60 ? whole + 1 : whole);
}

}  // namespace workbook
