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
    // message null: no message.
    const struct { const char *value, *format; bool fits; const std::string *message; } cases[] = {
        {"2012/03/04 05:06:07", "YYYY/MM/DD HH:mm:ss", true, nullptr},
        {"2012/3-4", "YYYY-MM-DD", true, nullptr},       // any separator will do
        {"2012-04-31", "YYYY-MM-DD", true, nullptr},     // no calendar check here
        {"23:59:59", "hh:mm:SS", true, nullptr}, {"12a:30:15", "HH:mm:ss", true, nullptr},  // 12a reads as 12
        {"9999-12-31", "YYYY-MM-DD", true, nullptr}, {"0100-01-01", "YYYY-MM-DD", true, nullptr},
        // A different count of tokens.
        {"12:30:15.5", "HH:mm:ss", false, &kMsg117},  // the full stop separates
        {"", "HH:mm:ss", false, &kMsg117}, {"2012 03 04 05", "YYYY|MM|DD", false, &kMsg117},
        // A field of mixed letters, before the value is looked at.
        {"2012-03-04", "YMD-MM-DD", false, &kMsg118}, {"x", "Yy", false, &kMsg118},
    };
    for (const auto &c : cases) {
        std::string error = "stale";
        EXPECT_EQ(CDateTimeUtil::CheckValueAgainstFormat(c.value, c.format, error), c.fits)
            << c.value << " / " << c.format;
        EXPECT_EQ(error, c.message ? *c.message : std::string()) << c.value << " / " << c.format;
    }
}

// Fields out of range or unreadable: the cell doesn't fit, with no message, and
// reads as no point in time, leaving the caller's value alone.
TEST(FormatCheck, FieldsOutOfRange)
{
    const struct { const char *value; const char *format; } cases[] = {
        {"2012-13-04", "YYYY-MM-DD"}, {"2012-03-32", "YYYY-MM-DD"}, {"2012-03-00", "YYYY-MM-DD"},
        {"0099-03-04", "YYYY-MM-DD"}, {"10000-03-04", "YYYY-MM-DD"}, {"2012-xx-04", "YYYY-MM-DD"},
        {"12-03-04", "YY-MM-DD"},  // two-digit years, even under YY
        {"24:00:00", "HH:mm:ss"}, {"12:60:00", "HH:mm:ss"}, {"12:30:60", "HH:mm:ss"}, {"ab:30:15", "HH:mm:ss"},
        {"99999999999:00:00", "HH:mm:ss"}, {"2012-03-04 05:06:60", "YYYY-MM-DD HH:mm:ss"},
    };
    for (const auto &c : cases) {
        std::string error = "stale";
        EXPECT_FALSE(CDateTimeUtil::CheckValueAgainstFormat(c.value, c.format, error)) << c.value;
        EXPECT_EQ(error, "") << c.value;
        DateValue date{123.0, kDateValid};
        EXPECT_FALSE(CDateTimeUtil::ParseDateTimeFields(date, c.value, c.format)) << c.value;
        EXPECT_EQ(date.serial, 123.0) << c.value;
    }
    std::string error;
    EXPECT_FALSE(CDateTimeUtil::CheckValueAgainstFormat("2012-03-04", "QQQQ-MM-DD", error));  // a letter of no field
    EXPECT_EQ(error, "");
}

TEST(FormatCheck, FormatLetters)
{
    const struct { const char *format; bool wellFormed; } cases[] = {
        {"YYYY/MM/DD HH:mm:ss", true}, {"YYYY|MM|DD|HH|mm|ss", true}, {"", true}, {" | ", true},
        {"yyyy.dd hh-SS", true},  // S and s are accepted though the message doesn't name them
        {"YMD", false}, {"YYYY-QQ", false}, {"HH:mm:ss.fff", false}, {"YYYY/MM/DD 1", false},
    };
    for (const auto &c : cases) {
        std::string error = "stale";
        EXPECT_EQ(CDateTimeUtil::CheckFormatLetters(c.format, error), c.wellFormed) << c.format;
        EXPECT_EQ(error, c.wellFormed ? std::string() : kMsg140) << c.format;
    }
}

}  // namespace
