// SPDX-License-Identifier: MIT
#include "serial_date.h"

#include <chrono>

namespace workbook::format {
namespace {

using std::chrono::day;
using std::chrono::days;
using std::chrono::month;
using std::chrono::sys_days;
using std::chrono::year;
using std::chrono::year_month_day;

constexpr sys_days kEpoch1900 = sys_days{year{1899} / month{12} / day{30}};
constexpr sys_days kEpoch1904 = sys_days{year{1904} / month{1} / day{1}};
constexpr long kFictitiousLeapDay = 60;  // 1900-02-29

CalendarDate ToCalendar(sys_days date, int weekday) {
    const year_month_day ymd{date};
    return CalendarDate{static_cast<int>(ymd.year()), static_cast<int>(unsigned(ymd.month())),
                        static_cast<int>(unsigned(ymd.day())), weekday};
}

}  // namespace

std::optional<CalendarDate> DateFromSerial(long serial, bool date1904) {
    if (serial < 0) return std::nullopt;
    if (date1904) {
        if (serial > kLastSerial1904) return std::nullopt;
        return ToCalendar(kEpoch1904 + days{serial}, static_cast<int>((serial + 5) % 7));
    }
    if (serial > kLastSerial1900) return std::nullopt;
    // The application counts 1900 as a leap year: serial 1 is a Sunday.
    const int weekday = static_cast<int>((serial + 6) % 7);
    if (serial == 0) return CalendarDate{1900, 1, 0, weekday};
    if (serial == kFictitiousLeapDay) return CalendarDate{1900, 2, 29, weekday};
    if (serial < kFictitiousLeapDay) return ToCalendar(kEpoch1900 + days{serial + 1}, weekday);
    return ToCalendar(kEpoch1900 + days{serial}, weekday);
}

std::optional<long> SerialFromDate(int y, int m, int d) {
    if (y < 1900 || y > 9999 || m < 1 || m > 12 || d < 1 || d > 31) return std::nullopt;
    if (y == 1900 && m == 2 && d == 29) return kFictitiousLeapDay;
    const year_month_day ymd{year{y}, month{static_cast<unsigned>(m)}, day{static_cast<unsigned>(d)}};
    if (!ymd.ok()) return std::nullopt;
    const long count = static_cast<long>((sys_days{ymd} - kEpoch1900).count());
    return count < kFictitiousLeapDay + 1 ? count - 1 : count;
}

}  // namespace workbook::format
