// SPDX-License-Identifier: MIT
#include "date_serial.h"

#include <charconv>
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
