// SPDX-License-Identifier: MIT
#include "cells/date_serial.h"

#include <charconv>
#include <cmath>
#include <cstdint>

namespace workbook {
namespace {

// Days from 1970-01-01 to a civil date (proleptic Gregorian).
int64_t DaysFromCivil(int64_t y, unsigned m, unsigned d)
{
    y -= m <= 2;
    const int64_t era = (y >= 0 ? y : y - 399) / 400;
    const unsigned yoe = static_cast<unsigned>(y - era * 400);
    const unsigned doy = (153 * (m + (m > 2 ? -3 : 9)) + 2) / 5 + d - 1;
    const unsigned doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
    return era * 146097 + static_cast<int64_t>(doe) - 719468;
}

// The civil date of a count of days from 1970-01-01 (proleptic Gregorian).
CivilDay CivilFromDays(int64_t z)
{
    z += 719468;
    const int64_t era = (z >= 0 ? z : z - 146096) / 146097;
    const unsigned doe = static_cast<unsigned>(z - era * 146097);
    const unsigned yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
    const unsigned doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
    const unsigned mp = (5 * doy + 2) / 153;
    const unsigned d = doy - (153 * mp + 2) / 5 + 1;
    const unsigned m = mp < 10 ? mp + 3 : mp - 9;
    return CivilDay{static_cast<int64_t>(yoe) + era * 400 + (m <= 2), m, d};
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
    int64_t days = DaysFromCivil(y, static_cast<unsigned>(mo), static_cast<unsigned>(d));
    double serial;
    if (date1904) {
        serial = static_cast<double>(days - DaysFromCivil(1904, 1, 1));
    } else {
        serial = static_cast<double>(days - DaysFromCivil(1899, 12, 30));
        if (serial < 61) serial -= 1;
    }
    return serial + time;
}

}  // namespace workbook

namespace workbook {

double SerialOfDay(int64_t year, int64_t month, int64_t day, bool date1904)
{
    // Months beyond December or before January move into the years around.
    const int64_t months = year * 12 + (month - 1);
    const int64_t y = months >= 0 ? months / 12 : (months - 11) / 12;
    const unsigned m = static_cast<unsigned>(months - y * 12 + 1);
    const int64_t days = DaysFromCivil(y, m, 1) + (day - 1);
    if (date1904) return static_cast<double>(days - DaysFromCivil(1904, 1, 1));
    double serial = static_cast<double>(days - DaysFromCivil(1899, 12, 30));
    return serial < 61 ? serial - 1 : serial;
}

CivilDay DayOfSerial(double serial, bool date1904)
{
    const int64_t whole = static_cast<int64_t>(std::floor(serial));
    if (date1904) return CivilFromDays(DaysFromCivil(1904, 1, 1) + whole);
    if (whole == 60) return CivilDay{1900, 2, 29};
    return CivilFromDays(DaysFromCivil(1899, 12, 30) + (whole < 60 ? whole + 1 : whole));
}

}  // namespace workbook
