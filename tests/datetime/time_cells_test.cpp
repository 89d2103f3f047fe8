// SPDX-License-Identifier: MIT
// The cells of a row's date/time columns to a point in time, and back.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "cell_arrays.h"
#include "datetime/date_time_util.h"

namespace {

using automation::Variant;
using datetime_test::CellAt;
using datetime_test::EmptyCells;
using datetime_test::kMarch4th2012;
using datetime_test::kSixMinutesPastFive;
using datetime_test::MakeCells;
using datetime_test::TextAt;
using datetime_test::TextCells;

constexpr double kTolerance = 1e-9;
constexpr double kWorkedExample = kMarch4th2012 + kSixMinutesPastFive;

// The serial of a successful parse, checked to be a date.
double ParsedSerial(SAFEARRAY *cells, const std::string &format, int mode,
                    const std::string &globalText = "")
{
    Variant result;
    EXPECT_TRUE(CDateTimeUtil::ParseTimeCells(cells, format, mode, result, globalText)) << format;
    EXPECT_EQ(result.Type(), VT_DATE) << format;
    return result.Type() == VT_DATE ? result.Raw().date : -99999.0;
}

// A parse that fails leaves the result as it was.
void ExpectNoTime(SAFEARRAY *cells, const std::string &format, int mode,
                  const std::string &globalText = "")
{
    Variant result = Variant::I4(42);
    EXPECT_FALSE(CDateTimeUtil::ParseTimeCells(cells, format, mode, result, globalText)) << format;
    EXPECT_EQ(result.Type(), VT_I4) << format;
    EXPECT_EQ(result.Raw().lVal, 42) << format;
}

TEST(TimeCells, OneColumnAndSixColumnsGiveTheSamePoint)
{
    auto one = TextCells({"2012/03/04 05:06:07"});
    EXPECT_NEAR(ParsedSerial(one.Get(), "YYYY/MM/DD HH:mm:ss", kModeDateAndTime), 40972.212581, 5e-7);
    EXPECT_NEAR(ParsedSerial(one.Get(), "YYYY/MM/DD HH:mm:ss", kModeDateAndTime), kWorkedExample,
                kTolerance);

    auto six = TextCells({"2012", "3", "4", "5", "6", "7"});
    EXPECT_NEAR(ParsedSerial(six.Get(), "YYYY|MM|DD|HH|mm|ss", kModeDateAndTime), kWorkedExample,
                kTolerance);

    // Numbers in the cells count by their plain text.
    auto numbers = MakeCells({Variant::R8(2012), Variant::R8(3), Variant::R8(4), Variant::R8(5),
                              Variant::R8(6), Variant::R8(7)});
    EXPECT_NEAR(ParsedSerial(numbers.Get(), "YYYY|MM|DD|HH|mm|ss", kModeDateAndTime),
                kWorkedExample, kTolerance);

    // A date column and a time column.
    auto two = TextCells({"2012-03-04", "05:06:07"});
    EXPECT_NEAR(ParsedSerial(two.Get(), "YYYY-MM-DD|HH:mm:ss", kModeDateAndTime), kWorkedExample,
                kTolerance);

    // A quoted format reads like the same format without quotes, in one column.
    EXPECT_NEAR(ParsedSerial(one.Get(), "\"YYYY/MM/DD HH:mm:ss\"", kModeDateAndTime),
                kWorkedExample, kTolerance);
    auto quotedBars = TextCells({"2012|03|04"});
    EXPECT_NEAR(ParsedSerial(quotedBars.Get(), "\"YYYY|MM|DD\"", kModeDateAndTime), kMarch4th2012,
                kTolerance);
}

TEST(TimeCells, FormatModeZero)
{
    auto dateOnly = TextCells({"2012-03-04"});
    EXPECT_NEAR(ParsedSerial(dateOnly.Get(), "YYYY-MM-DD", kModeDateAndTime), kMarch4th2012,
                kTolerance);
    auto noSeconds = TextCells({"04-03-2012 05:06"});
    EXPECT_NEAR(ParsedSerial(noSeconds.Get(), "DD-MM-YYYY HH:mm", kModeDateAndTime),
                kMarch4th2012 + (5 * 3600 + 6 * 60) / 86400.0, kTolerance);

    for (const char *refused : {"2012/03/04 24:00:00", "2012/03/04 05:06:60", "12/03/04 05:06:07",
                                "2012/04/31 05:06:07", "2012/xx/04 05:06:07"}) {
        SCOPED_TRACE(refused);
        auto cells = TextCells({refused});
        ExpectNoTime(cells.Get(), "YYYY/MM/DD HH:mm:ss", kModeDateAndTime);
    }
}

TEST(TimeCells, FormatWithGlobalTimeOrDate)
{
    // Mode 1: the date from the cells, the time of day from the global text.
    auto date = TextCells({"2012-03-04"});
    EXPECT_NEAR(ParsedSerial(date.Get(), "YYYY-MM-DD", kModeDateWithGlobalTime, "05:06:07"),
                kWorkedExample, kTolerance);
    auto dateColumns = TextCells({"2012", "3", "4"});
    EXPECT_NEAR(ParsedSerial(dateColumns.Get(), "YYYY|MM|DD", kModeDateWithGlobalTime, "05:06:07"),
                kWorkedExample, kTolerance);
    // A time in the cells is not read in mode 1.
    auto dateAndTime = TextCells({"2012-03-04 23:59:59"});
    EXPECT_NEAR(ParsedSerial(dateAndTime.Get(), "YYYY-MM-DD HH:mm:ss", kModeDateWithGlobalTime,
                             "05:06:07"),
                kWorkedExample, kTolerance);

    // Mode 2: the time from the cells, the date from the global text.
    auto time = TextCells({"05:06:07"});
    EXPECT_NEAR(ParsedSerial(time.Get(), "HH:mm:ss", kModeTimeWithGlobalDate, "2012-03-04"),
                kWorkedExample, kTolerance);
    auto timeColumns = TextCells({"5", "6", "7"});
    EXPECT_NEAR(ParsedSerial(timeColumns.Get(), "HH|mm|ss", kModeTimeWithGlobalDate, "2012-03-04"),
                kWorkedExample, kTolerance);

    // A field out of range refuses the row in either mode.
    auto badDate = TextCells({"12-03-04"});
    ExpectNoTime(badDate.Get(), "YYYY-MM-DD", kModeDateWithGlobalTime, "05:06:07");
    auto badTime = TextCells({"24:00:00"});
    ExpectNoTime(badTime.Get(), "HH:mm:ss", kModeTimeWithGlobalDate, "2012-03-04");
    // So does a day that the month lacks.
    auto april31 = TextCells({"2012-04-31"});
    ExpectNoTime(april31.Get(), "YYYY-MM-DD", kModeDateWithGlobalTime, "05:06:07");
}

TEST(TimeCells, FormatWithUnknownModeGivesNothing)
{
    auto cells = TextCells({"2012/03/04 05:06:07"});
    ExpectNoTime(cells.Get(), "YYYY/MM/DD HH:mm:ss", kModeNone);
    ExpectNoTime(cells.Get(), "YYYY/MM/DD HH:mm:ss", 3);
}

TEST(TimeCells, TrueDateCells)
{
    // Case 1: the cell's value as a date.
    auto number = MakeCells({Variant::R8(kWorkedExample)});
    EXPECT_NEAR(ParsedSerial(number.Get(), "", kModeDateAndTime), kWorkedExample, kTolerance);
    auto date = MakeCells({Variant::Date(kWorkedExample)});
    EXPECT_NEAR(ParsedSerial(date.Get(), "", kModeDateAndTime), kWorkedExample, kTolerance);
    auto text = MakeCells({Variant::String("no date")});
    ExpectNoTime(text.Get(), "", kModeDateAndTime);

    // Case 2, mode 1: the time of day of the cell is dropped for the global time.
    auto evening = MakeCells({Variant::R8(40972.9)});
    EXPECT_NEAR(ParsedSerial(evening.Get(), "", kModeDateWithGlobalTime, "05:06:07"),
                kWorkedExample, kTolerance);
    auto eveningDate = MakeCells({Variant::Date(40972.9)});
    EXPECT_NEAR(ParsedSerial(eveningDate.Get(), "", kModeDateWithGlobalTime, "05:06:07"),
                kWorkedExample, kTolerance);

    // Case 2, mode 2: the date of the cell is dropped for the global date.
    auto otherDay = MakeCells({Variant::Date(30000.0 + kSixMinutesPastFive)});
    EXPECT_NEAR(ParsedSerial(otherDay.Get(), "", kModeTimeWithGlobalDate, "2012-03-04"),
                kWorkedExample, kTolerance);

    // A cell that is no date gives nothing.
    ExpectNoTime(text.Get(), "", kModeDateWithGlobalTime, "05:06:07");
}

TEST(TimeCells, UnusableArraysAreRefused)
{
    Variant result = Variant::I4(42);
    EXPECT_FALSE(CDateTimeUtil::ParseTimeCells(nullptr, "YYYY", kModeDateAndTime, result, ""));
    EXPECT_FALSE(CDateTimeUtil::ParseTimeCells(nullptr, "", kModeDateAndTime, result, ""));
    EXPECT_EQ(result.Type(), VT_I4);

    // Fewer cells than the format has columns.
    auto three = TextCells({"2012", "3", "4"});
    ExpectNoTime(three.Get(), "YYYY|MM|DD|HH|mm|ss", kModeDateAndTime);

    // An array of doubles is no row of cells.
    automation::SafeArray doubles(SafeArrayCreateVector(VT_R8, 0, 1));
    ExpectNoTime(doubles.Get(), "", kModeDateAndTime);

    EXPECT_FALSE(CDateTimeUtil::FormatTimeCells(Variant::Date(kWorkedExample).Raw(), "", nullptr));
    EXPECT_FALSE(CDateTimeUtil::FormatTimeCells(Variant::Date(kWorkedExample).Raw(), "",
                                                doubles.Get()));
}

TEST(TimeCells, FormatForExport)
{
    const Variant time = Variant::Date(kWorkedExample);

    auto one = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(time.Raw(), "", one.Get()));
    EXPECT_EQ(TextAt(one.Get(), 0), "2012/03/04 05:06:07");

    auto six = EmptyCells(6);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(time.Raw(), "YYYY|MM|DD|HH|mm|ss", six.Get()));
    const std::vector<std::string> expected = {"2012", "03", "04", "05", "06", "07"};
    for (LONG i = 0; i < 6; ++i) EXPECT_EQ(TextAt(six.Get(), i), expected[static_cast<size_t>(i)]);

    auto two = EmptyCells(2);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(time.Raw(), "DD.MM.YYYY|HH:mm", two.Get()));
    EXPECT_EQ(TextAt(two.Get(), 0), "04.03.2012");
    EXPECT_EQ(TextAt(two.Get(), 1), "05:06");

    auto single = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(time.Raw(), "YYYY-MM-DDTHH:mm:ss", single.Get()));
    EXPECT_EQ(TextAt(single.Get(), 0), "2012-03-04T05:06:07");

    // A quoted format gives a true date value.
    auto quoted = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(time.Raw(), "\"YYYY/MM/DD hh:mm:ss\"", quoted.Get()));
    const Variant cell = CellAt(quoted.Get(), 0);
    ASSERT_EQ(cell.Type(), VT_DATE);
    EXPECT_NEAR(cell.Raw().date, kWorkedExample, kTolerance);

    // ... unless its text is no date, which then goes in as text.
    auto notADate = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(time.Raw(), "\"HH mm\"", notADate.Get()));
    EXPECT_EQ(TextAt(notADate.Get(), 0), "05 06");
}

TEST(TimeCells, ExportTimeOfOtherTypes)
{
    // A time that is not a date value is changed to one first.
    auto fromNumber = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(Variant::R8(kWorkedExample).Raw(), "", fromNumber.Get()));
    EXPECT_EQ(TextAt(fromNumber.Get(), 0), "2012/03/04 05:06:07");

    auto fromText = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(Variant::String("2012-03-04 05:06:07").Raw(),
                                               "YYYY-MM-DD", fromText.Get()));
    EXPECT_EQ(TextAt(fromText.Get(), 0), "2012-03-04");

    // One that can't be changed is written as the invalid text.
    auto invalid = EmptyCells(1);
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(Variant::String("no date").Raw(), "", invalid.Get()));
    EXPECT_EQ(TextAt(invalid.Get(), 0), "Invalid DateTime");
}

TEST(TimeCells, ExportedRowReadsBackToTheSamePoint)
{
    const double times[] = {kWorkedExample, 2.0, 2958465.0 + 86399.0 / 86400.0, 45000.5};
    const char *formats[] = {"YYYY|MM|DD|HH|mm|ss", "YYYY/MM/DD HH:mm:ss", "DD-MM-YYYY|HH:mm:ss",
                             "YYYY-MM-DDTHH:mm:ss"};
    for (const char *format : formats) {
        for (const double serial : times) {
            SCOPED_TRACE(std::string(format) + " " + std::to_string(serial));
            auto cells = EmptyCells(static_cast<ULONG>(CDateTimeUtil::GetFormatColumnCount(format)));
            ASSERT_TRUE(CDateTimeUtil::FormatTimeCells(Variant::Date(serial).Raw(), format, cells.Get()));
            EXPECT_NEAR(ParsedSerial(cells.Get(), format, kModeDateAndTime), serial, 1e-8);
        }
    }
}

}  // namespace
