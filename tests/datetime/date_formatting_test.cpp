// SPDX-License-Identifier: MIT
// Points in time to text.
#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "cell_arrays.h"
#include "datetime/date_time_util.h"

namespace {

using datetime_test::kMarch4th2012;
using datetime_test::kSixMinutesPastFive;

const DateValue kWorkedExample{kMarch4th2012 + kSixMinutesPastFive, kDateValid};
const DateValue kInvalid{kMarch4th2012 + kSixMinutesPastFive, kDateInvalid};
const DateValue kNotANumber{std::numeric_limits<double>::quiet_NaN(), kDateValid};

TEST(DateFormatting, Strftime)
{
    EXPECT_EQ(CDateTimeUtil::FormatDate(kWorkedExample, "%Y/%m/%d %H:%M:%S"), "2012/03/04 05:06:07");
    // Day of the week and of the year are filled in: 4 March 2012 was a Sunday,
    // the 64th day of a leap year.
    EXPECT_EQ(CDateTimeUtil::FormatDate(kWorkedExample, "%A %j"), "Sunday 064");
    EXPECT_EQ(CDateTimeUtil::FormatDate(DateValue{2.0, kDateValid}, "%Y-%m-%d %j"), "1900-01-01 001");
    EXPECT_EQ(CDateTimeUtil::FormatDate(kWorkedExample, "plain"), "plain");
    // A text beyond the buffer comes out empty, not cut or overrun.
    EXPECT_EQ(CDateTimeUtil::FormatDate(kWorkedExample, std::string(300, 'x')), "");
}

TEST(DateFormatting, InvalidDatesGiveTheInvalidText)
{
    for (const char *pattern : {"%Y", "%Y/%m/%d %H:%M:%S", "", "text"}) {
        EXPECT_EQ(CDateTimeUtil::FormatDate(kInvalid, pattern), "Invalid DateTime") << pattern;
        EXPECT_EQ(CDateTimeUtil::FormatDate(kNotANumber, pattern), "Invalid DateTime") << pattern;
    }
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kInvalid, 0, LOCALE_USER_DEFAULT), "Invalid DateTime");
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kNotANumber, 0, LOCALE_USER_DEFAULT), "Invalid DateTime");
    EXPECT_EQ(CDateTimeUtil::ExpandFormat(kInvalid, "YYYY-MM"), "Invalid DateTime-Invalid DateTime");
}

TEST(DateFormatting, LocaleWords)
{
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kWorkedExample, 0, LOCALE_USER_DEFAULT),
              "2012-03-04 05:06:07");
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kWorkedExample, VAR_TIMEVALUEONLY, 1024), "05:06:07");
    EXPECT_EQ(CDateTimeUtil::FormatDateLocal(kWorkedExample, VAR_DATEVALUEONLY, 1024), "2012-03-04");
}

TEST(DateFormatting, ExpandFormat)
{
    const struct {
        const char *format;
        const char *text;
    } cases[] = {
        {"YYYY|MM|DD|HH|mm|ss", "2012|03|04|05|06|07"},
        {"YYYY/MM/DD HH:mm:ss", "2012/03/04 05:06:07"},
        {"YYYY-MM-DDTHH:mm:ss", "2012-03-04T05:06:07"},  // T is a separator and stays
        {"yy.M.d h:m:s", "2012.03.04 05:06:07"},          // letter counts don't matter
        {"YYYY//MM  DD", "2012/03 04"},                   // a run gives its first character
        {"--YYYY", "2012"},                               // leading separators vanish
        {"HH:", "05:"},                                   // the one behind the last field
        {"YYYY-QQ-DD", "2012-04"},                        // Q and its separator are dropped
        {"", ""},
    };
    for (const auto &c : cases)
        EXPECT_EQ(CDateTimeUtil::ExpandFormat(kWorkedExample, c.format), c.text) << c.format;
}

}  // namespace
