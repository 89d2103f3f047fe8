// SPDX-License-Identifier: MIT
// Cell texts against column formats, and the letters of a format.
#include <gtest/gtest.h>

#include <string>

#include "datetime/date_time_util.h"

namespace {

const std::string kMsg117 = "The data value in file is not corresponding to Date/Time format.";
const std::string kMsg118 = "The Date/Time format is not supported.";
const std::string kMsg140 =
    "Only the letters 'Y','y', 'M','m', 'D','d','H','h' are allowed when specifying the "
    "date/time format.";

TEST(FormatCheck, ValueAgainstFormat)
{
    const struct {
        const char *value;
        const char *format;
        bool fits;
        const std::string *message;  // null: no message
    } cases[] = {
        {"2012/03/04 05:06:07", "YYYY/MM/DD HH:mm:ss", true, nullptr},
        {"2012/3-4", "YYYY-MM-DD", true, nullptr},       // any separator will do
        {"2012-04-31", "YYYY-MM-DD", true, nullptr},     // no calendar check here
        {"12a:30:15", "HH:mm:ss", true, nullptr},        // 12a reads as 12
        {"9999-12-31", "YYYY-MM-DD", true, nullptr},
        {"0100-01-01", "YYYY-MM-DD", true, nullptr},
        {"23:59:59", "hh:mm:SS", true, nullptr},
        // A different count of tokens.
        {"12:30:15.5", "HH:mm:ss", false, &kMsg117},     // the full stop separates
        {"12:30", "HH:mm:ss", false, &kMsg117},
        {"", "HH:mm:ss", false, &kMsg117},
        {"2012 03 04 05", "YYYY|MM|DD", false, &kMsg117},
        // A field of mixed letters, before the value is looked at.
        {"2012-03-04", "YMD-MM-DD", false, &kMsg118},
        {"x", "Yy", false, &kMsg118},
        // Out of range or unreadable: false with no message.
        {"2012-13-04", "YYYY-MM-DD", false, nullptr},
        {"2012-00-04", "YYYY-MM-DD", false, nullptr},
        {"2012-03-32", "YYYY-MM-DD", false, nullptr},
        {"2012-03-00", "YYYY-MM-DD", false, nullptr},
        {"0099-03-04", "YYYY-MM-DD", false, nullptr},
        {"10000-03-04", "YYYY-MM-DD", false, nullptr},
        {"12-03-04", "YY-MM-DD", false, nullptr},        // two-digit year under YY
        {"24:00:00", "HH:mm:ss", false, nullptr},
        {"12:60:00", "HH:mm:ss", false, nullptr},
        {"12:30:60", "HH:mm:ss", false, nullptr},
        {"ab:30:15", "HH:mm:ss", false, nullptr},
        {"99999999999:00:00", "HH:mm:ss", false, nullptr},
        {"2012-03-04", "QQQQ-MM-DD", false, nullptr},    // a letter of no field
    };
    for (const auto &c : cases) {
        std::string error = "stale";
        EXPECT_EQ(CDateTimeUtil::CheckValueAgainstFormat(c.value, c.format, error), c.fits)
            << c.value << " / " << c.format;
        EXPECT_EQ(error, c.message ? *c.message : std::string()) << c.value << " / " << c.format;
    }
}

TEST(FormatCheck, FormatLetters)
{
    const struct {
        const char *format;
        bool wellFormed;
    } cases[] = {
        {"YYYY/MM/DD HH:mm:ss", true},
        {"YYYY-MM-DDTHH:mm:ss", true},
        {"YYYY|MM|DD|HH|mm|ss", true},
        {"yyyy.dd hh-SS", true},     // S and s are accepted though 140 doesn't name them
        {"", true},
        {" | ", true},
        {"YMD", false},              // mixed letters
        {"YYYY-QQ", false},          // a letter of no field
        {"HH:mm:ss.fff", false},
        {"YYYY/MM/DD 1", false},
    };
    for (const auto &c : cases) {
        std::string error = "stale";
        EXPECT_EQ(CDateTimeUtil::CheckFormatLetters(c.format, error), c.wellFormed) << c.format;
        EXPECT_EQ(error, c.wellFormed ? std::string() : kMsg140) << c.format;
    }
}

}  // namespace
