// SPDX-License-Identifier: MIT
#include "calendar.h"

#include <chrono>
#include <cmath>

#include "automation/civil_days.h"

namespace automation {
namespace {

using std::chrono::days;
using std::chrono::sys_days;
using std::chrono::year_month_day;

constexpr int kSecondsPerDay = 86400;
constexpr sys_days kEpoch = sys_days{std::chrono::year{1899} / std::chrono::December / 30};

// The calendar repeats itself every 400 years, which are 146097 days: whole
// cycles are counted apart, so that any year stays in std::chrono's range.
constexpr int64_t kYearsPerCycle = 400;
constexpr int64_t kDaysPerCycle = 146097;

int64_t FloorDiv(int64_t a, int64_t b) { return a / b - ((a % b != 0) && ((a < 0) != (b < 0))); }

year_month_day ToCivil(const detail::DateTimeFields &f)
{
    return year_month_day{std::chrono::year{f.year},
                          std::chrono::month{static_cast<unsigned>(f.month)},
                          std::chrono::day{static_cast<unsigned>(f.day)}};
}

}  // namespace

int64_t DayNumber(int64_t year, int64_t month, int64_t day)
{
    const int64_t monthsIntoYear = month - 1;
    const int64_t yearsOver = FloorDiv(monthsIntoYear, 12);
    const auto monthOfYear = static_cast<unsigned>(monthsIntoYear - yearsOver * 12 + 1);
    const int64_t fullYear = year + yearsOver;
    const int64_t cycles = FloorDiv(fullYear, kYearsPerCycle);
    const auto yearOfCycle = static_cast<int>(fullYear - cycles * kYearsPerCycle);
    const sys_days first{std::chrono::year{yearOfCycle} / std::chrono::month{monthOfYear} / 1};
    return cycles * kDaysPerCycle + (first - kEpoch).count() + (day - 1);
}

CivilDay CivilDayOf(int64_t dayNumber)
{
    const int64_t cycles = FloorDiv(dayNumber, kDaysPerCycle);
    const year_month_day civil{kEpoch + days{dayNumber - cycles * kDaysPerCycle}};
    return CivilDay{static_cast<int>(civil.year()) + cycles * kYearsPerCycle,
                    static_cast<unsigned>(civil.month()), static_cast<unsigned>(civil.day())};
}

namespace detail {

bool FieldsAreValid(const DateTimeFields &f)
{
    if (f.year < kFirstYear || f.year > kLastYear) return false;
    if (f.month < 1 || f.month > 12 || f.day < 1 || f.day > 31) return false;
    if (f.hour < 0 || f.hour > 23 || f.minute < 0 || f.minute > 59) return false;
    if (f.second < 0 || f.second > 59) return false;
    return ToCivil(f).ok();
}

bool FieldsToSerial(const DateTimeFields &f, DATE &serial)
{
    if (!FieldsAreValid(f)) return false;
    const double wholeDays = static_cast<double>(DayNumber(f.year, f.month, f.day));
    const double timeOfDay =
        static_cast<double>(f.hour * 3600 + f.minute * 60 + f.second) / kSecondsPerDay;
    serial = wholeDays < 0 ? wholeDays - timeOfDay : wholeDays + timeOfDay;
    return true;
}

bool SerialToFields(DATE serial, DateTimeFields &f)
{
    // Well outside the years 100 to 9999; keeps the casts below in range.
    if (!std::isfinite(serial) || std::fabs(serial) > 4e6) return false;
    const double wholeDays = std::trunc(serial);
    const double timeOfDay = std::fabs(serial - wholeDays);
    auto dayNumber = static_cast<long>(wholeDays);
    auto seconds = static_cast<long>(std::lround(timeOfDay * kSecondsPerDay));
    if (seconds == kSecondsPerDay) {  // 23:59:59.5 and later round into the next day
        seconds = 0;
        ++dayNumber;
    }
    const sys_days date = kEpoch + days{dayNumber};
    const year_month_day civil{date};
    const int year = static_cast<int>(civil.year());
    if (year < kFirstYear || year > kLastYear) return false;

    f.year = year;
    f.month = static_cast<int>(static_cast<unsigned>(civil.month()));
    f.day = static_cast<int>(static_cast<unsigned>(civil.day()));
    f.hour = static_cast<int>(seconds / 3600);
    f.minute = static_cast<int>(seconds / 60 % 60);
    f.second = static_cast<int>(seconds % 60);
    f.dayOfWeek = static_cast<int>(std::chrono::weekday{date}.c_encoding());
    f.dayOfYear = static_cast<int>((date - sys_days{civil.year() / 1 / 1}).count()) + 1;
    return true;
}

}  // namespace detail
}  // namespace automation
