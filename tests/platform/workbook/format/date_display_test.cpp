// SPDX-License-Identifier: MIT
#include <gtest/gtest.h>

#include "workbook/format/display_text.h"

namespace workbook::format {
namespace {

constexpr double kSecond = 1.0 / 86400;

// 2012-03-04, a Sunday, in the 1900 system.
constexpr double kMarch4th2012 = 40972;

// The serial of a time of day.
double At(int hour, int minute, double second) {
    return (hour * 3600 + minute * 60 + second) * kSecond;
}

struct Case {
    const char *code;
    double serial;
    const char *shown;
};

void ExpectShown(const Case &c, bool date1904 = false) {
    EXPECT_EQ(DisplayNumber(c.serial, c.code, date1904), c.shown)
        << "code " << c.code << " serial " << c.serial << (date1904 ? " (1904)" : "");
}

TEST(DateDisplay, DateFields) {
    const double serial = kMarch4th2012 + At(5, 6, 7);
    const Case cases[] = {
        {"yyyy-mm-dd", serial, "2012-03-04"},
        {"yyyy/mm/dd hh:mm:ss", serial, "2012/03/04 05:06:07"},
        {"YYYY-MM-DD HH:MM:SS", serial, "2012-03-04 05:06:07"},
        {"YYYY/MM/DD HH:mm:ss", serial, "2012/03/04 05:06:07"},
        {"YYYY MM DD HH mm ss", serial, "2012 03 04 05 06 07"},
        {"y", serial, "12"},
        {"yy", serial, "12"},
        {"yyy", serial, "2012"},
        {"m", serial, "3"},
        {"mm", serial, "03"},
        {"mmm", serial, "Mar"},
        {"mmmm", serial, "March"},
        {"mmmmm", serial, "M"},
        {"d", serial, "4"},
        {"dd", serial, "04"},
        {"ddd", serial, "Sun"},
        {"dddd", serial, "Sunday"},
        {"dddd, mmmm d, yyyy", serial, "Sunday, March 4, 2012"},
        {"d \"de\" mmmm", serial, "4 de March"},
        {"d\\d", serial, "4d"},
        {"[$-409]m/d/yy", serial, "3/4/12"},
        {"[Red]yyyy", serial, "2012"},
        {"mmmm", kMarch4th2012 + 300, "December"},
        {"dddd", kMarch4th2012 + 6, "Saturday"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(DateDisplay, TimeFieldsAndMinutes) {
    const double serial = kMarch4th2012 + At(5, 6, 7);
    const Case cases[] = {
        {"h:m:s", serial, "5:6:7"},
        {"hh:mm:ss", serial, "05:06:07"},
        {"h:mm", serial, "5:06"},
        {"mm:ss", serial, "06:07"},
        {"m:ss", serial, "6:07"},
        {"hh\"h\"mm", serial, "05h06"},
        {"m/d h:mm", serial, "3/4 5:06"},
        {"mm", serial, "03"},
        {"h:mm", kMarch4th2012 + At(10, 30, 45), "10:30"},
        {"h:mm", kMarch4th2012 + At(10, 30, 59.6), "10:31"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(DateDisplay, AmPm) {
    const Case cases[] = {
        {"h:mm AM/PM", At(0, 0, 0), "12:00 AM"},
        {"h:mm AM/PM", At(0, 30, 0), "12:30 AM"},
        {"h:mm AM/PM", At(11, 59, 0), "11:59 AM"},
        {"h:mm AM/PM", At(12, 0, 0), "12:00 PM"},
        {"h:mm AM/PM", At(13, 5, 0), "1:05 PM"},
        {"hh:mm am/pm", At(23, 0, 0), "11:00 PM"},
        {"h A/P", At(9, 0, 0), "9 A"},
        {"h a/p", At(21, 0, 0), "9 p"},
        {"hh:mm:ss AM/PM", At(11, 59, 59.6), "12:00:00 PM"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(DateDisplay, ElapsedTimes) {
    const Case cases[] = {
        {"[h]:mm:ss", 1.5, "36:00:00"},
        {"[h]:mm:ss", 0, "0:00:00"},
        {"[h]:mm", 2 + At(3, 4, 5), "51:04"},
        {"[hh]:mm", At(1, 0, 0), "01:00"},
        {"[mm]:ss", 2.75, "3960:00"},
        {"[m]", At(1, 30, 29.5), "90"},
        {"[ss]", 0.5, "43200"},
        {"[s].00", At(0, 0, 1.234), "1.23"},
        {"[h]:mm:ss", At(23, 59, 59.5), "24:00:00"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

// Times are rounded to what the section shows, with the carry going up to
// the day.
TEST(DateDisplay, FractionalSecondsAndCarry) {
    const double day = kMarch4th2012;
    const Case cases[] = {
        {"hh:mm:ss", day + At(5, 6, 7.6), "05:06:08"},
        {"hh:mm:ss", day + At(5, 6, 7.4), "05:06:07"},
        {"hh:mm:ss", day + At(5, 6, 7.5), "05:06:08"},
        {"hh:mm:ss", day + At(5, 6, 59.5), "05:07:00"},
        {"hh:mm:ss", day + At(5, 59, 59.5), "06:00:00"},
        {"yyyy-mm-dd hh:mm:ss", day + At(23, 59, 59.6), "2012-03-05 00:00:00"},
        {"hh:mm:ss.0", day + At(5, 6, 7.96), "05:06:08.0"},
        {"hh:mm:ss.00", day + At(5, 6, 7.125), "05:06:07.13"},
        {"hh:mm:ss.000", day + At(5, 6, 7.123), "05:06:07.123"},
        {"yyyy-mm-dd hh:mm:ss.000", day + At(23, 59, 59.9996), "2012-03-05 00:00:00.000"},
        {"mm:ss.0", At(0, 59, 59.97), "00:00.0"},
        {"mmss.0", At(0, 1, 2.34), "0102.3"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(DateDisplay, EarlySerialsOfThe1900System) {
    const Case cases[] = {
        {"yyyy-mm-dd", 0, "1900-01-00"},
        {"dddd", 0, "Saturday"},
        {"m/d/yyyy", 1, "1/1/1900"},
        {"dddd", 1, "Sunday"},
        {"m/d/yyyy", 31, "1/31/1900"},
        {"m/d/yyyy", 59, "2/28/1900"},
        {"m/d/yyyy", 60, "2/29/1900"},
        {"dddd", 60, "Wednesday"},
        {"m/d/yyyy", 61, "3/1/1900"},
        {"dddd", 61, "Thursday"},
        {"h:mm", 0, "0:00"},
        {"yyyy-mm-dd hh:mm", 0.75, "1900-01-00 18:00"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

TEST(DateDisplay, The1904System) {
    const Case cases[] = {
        {"yyyy-mm-dd", 0, "1904-01-01"},
        {"dddd", 0, "Friday"},
        {"yyyy-mm-dd", 1, "1904-01-02"},
        {"yyyy-mm-dd hh:mm:ss", kMarch4th2012 - 1462 + At(5, 6, 7), "2012-03-04 05:06:07"},
        {"dddd", kMarch4th2012 - 1462, "Sunday"},
        {"yyyy-mm-dd", 2957003, "9999-12-31"},
        {"yyyy-mm-dd", 2957004, "########"},
        {"yyyy-mm-dd", -1, "########"},
    };
    for (const auto &c : cases) ExpectShown(c, true);
    // The same serial is four years and a day later in the 1904 system.
    EXPECT_EQ(DisplayNumber(0, "yyyy-mm-dd", false), "1900-01-00");
    EXPECT_EQ(DisplayNumber(40000, "yyyy-mm-dd", false), "2009-07-06");
    EXPECT_EQ(DisplayNumber(40000, "yyyy-mm-dd", true), "2013-07-07");
}

TEST(DateDisplay, OutOfRangeShowsHashes) {
    const Case cases[] = {
        {"yyyy-mm-dd", -1, "########"},
        {"h:mm", -0.5, "########"},
        {"[h]:mm:ss", -0.5, "########"},
        {"m/d/yyyy", 2958465, "12/31/9999"},
        {"m/d/yyyy h:mm", 2958465 + At(23, 59, 0), "12/31/9999 23:59"},
        {"m/d/yyyy", 2958466, "########"},
        {"m/d/yyyy", 1e20, "########"},
        {"yyyy-mm-dd hh:mm:ss", 2958465 + At(23, 59, 59.7), "########"},
        {"yyyy-mm-dd;\"before 1900\"", -1, "before 1900"},
    };
    for (const auto &c : cases) ExpectShown(c);
}

}  // namespace
}  // namespace workbook::format
