// SPDX-License-Identifier: MIT
// The one date or time of day that a split layout gives all rows, as a user
// types it: 2024-03-01, 2024/03/01 or 01.03.2024; 05:06, 05:06:07 or
// 05:06:07.250. Read the same in every locale.
#include <charconv>
#include <chrono>
#include <cmath>

#include "datetime/date_time_util.h"
#include "datetime/format_text.h"

using namespace vantrel::datetime;

namespace {

// A cursor over the text being read.
class Reader {
public:
    explicit Reader(std::string_view text) : text_(text) {}

    bool AtEnd() const { return text_.empty(); }

    // minDigits to maxDigits decimal digits, and no digit behind them.
    bool Number(size_t minDigits, size_t maxDigits, int &value, size_t *count = nullptr)
    {
        size_t digits = 0;
        while (digits < text_.size() && text_[digits] >= '0' && text_[digits] <= '9') ++digits;
        if (digits < minDigits || digits > maxDigits) return false;
        std::from_chars(text_.data(), text_.data() + digits, value);
        text_.remove_prefix(digits);
        if (count) *count = digits;
        return true;
    }

    bool Char(char c)
    {
        if (text_.empty() || text_.front() != c) return false;
        text_.remove_prefix(1);
        return true;
    }

    char Peek() const { return text_.empty() ? '\0' : text_.front(); }

private:
    std::string_view text_;
};

constexpr std::chrono::sys_days kSerialEpoch = std::chrono::sys_days{std::chrono::year{1899} / 12 / 30};

std::optional<DATE> SerialOfDay(int year, int month, int day)
{
    const std::chrono::year_month_day date{std::chrono::year{year}, std::chrono::month{unsigned(month)},
                                           std::chrono::day{unsigned(day)}};
    if (year < 100 || year > 9999 || !date.ok()) return std::nullopt;
    return double((std::chrono::sys_days{date} - kSerialEpoch).count());
}

}  // namespace

std::optional<DATE> CDateTimeUtil::ParseGlobalDate(std::string_view text)
{
    Reader in(TrimWhiteSpace(text));
    int first = 0, month = 0, last = 0;
    if (!in.Number(1, 4, first)) return std::nullopt;
    const char separator = in.Peek();
    if (separator != '-' && separator != '/' && separator != '.') return std::nullopt;
    if (!in.Char(separator) || !in.Number(1, 2, month) || !in.Char(separator)) return std::nullopt;
    // Year first with a hyphen or a slash; day first, and a full year, with a point.
    const bool dayFirst = separator == '.';
    if (!in.Number(dayFirst ? 4 : 1, dayFirst ? 4 : 2, last) || !in.AtEnd()) return std::nullopt;
    if (!dayFirst && first < 100) return std::nullopt;
    const std::optional<DATE> serial = dayFirst ? SerialOfDay(last, month, first) : SerialOfDay(first, month, last);
    return serial;
}

std::optional<double> CDateTimeUtil::ParseGlobalTime(std::string_view text)
{
    Reader in(TrimWhiteSpace(text));
    int hour = 0, minute = 0, second = 0, millis = 0;
    if (!in.Number(1, 2, hour) || !in.Char(':') || !in.Number(2, 2, minute)) return std::nullopt;
    if (in.Char(':')) {
        if (!in.Number(2, 2, second)) return std::nullopt;
        size_t digits = 0;
        if (in.Char('.') && !in.Number(1, 3, millis, &digits)) return std::nullopt;
        for (; digits > 0 && digits < 3; ++digits) millis *= 10;  // .5 is 500 ms
    }
    if (!in.AtEnd() || hour > 23 || minute > 59 || second > 59) return std::nullopt;
    return ((hour * 60.0 + minute) * 60.0 + second + millis / 1000.0) / 86400.0;
}

DATE CDateTimeUtil::AddTimeOfDay(DATE day, double timeOfDay)
{
    // A time that rounded up to midnight belongs to the next day.
    const double carried = std::floor(timeOfDay);
    day += carried;
    timeOfDay -= carried;
    // Below zero the fraction runs the other way: -1.25 is 29 December, 06:00.
    return day < 0.0 ? day - timeOfDay : day + timeOfDay;
}
