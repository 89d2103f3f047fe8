// SPDX-License-Identifier: MIT
// The cells of a row's date/time columns to a point in time, and back.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "automation/automation.h"
#include "automation/values.h"
#include "datetime/date_time_util.h"
#include "datetime/format_presets.h"

namespace {

using automation::Variant;
using namespace vantrel::datetime;

// 4 March 2012, and 05:06:07 as a fraction of a day.
constexpr double kMarch4th2012 = 40972.0;
constexpr double kSixMinutesPastFive = (5 * 3600 + 6 * 60 + 7) / 86400.0;
constexpr double kWorked = kMarch4th2012 + kSixMinutesPastFive;

// A one-dimensional array of variants, as a row of cells.
automation::SafeArray MakeCells(std::vector<Variant> values)
{
    automation::SafeArray cells(SafeArrayCreateVector(VT_VARIANT, 0, static_cast<ULONG>(values.size())));
    for (LONG i = 0; i < static_cast<LONG>(values.size()); ++i)
        EXPECT_EQ(SafeArrayPutElement(cells.Get(), &i, values[static_cast<size_t>(i)].Ptr()), S_OK);
    return cells;
}

Variant CellAt(SAFEARRAY *cells, LONG index)
{
    Variant value;
    EXPECT_EQ(SafeArrayGetElement(cells, &index, value.Out()), S_OK);
    return value;
}

// The element as text, or its type when it isn't text.
std::string TextAt(SAFEARRAY *cells, LONG index)
{
    const Variant value = CellAt(cells, index);
    return value.Type() == VT_BSTR ? automation::BstrToUtf8(value.Raw().bstrVal) : "<type " + std::to_string(value.Type()) + ">";
}

std::vector<Variant> Texts(std::initializer_list<const char *> texts)
{
    std::vector<Variant> cells;
    for (const char *text : texts) cells.push_back(Variant::String(text));
    return cells;
}

constexpr double kRefused = -1;

TEST(TimeCells, RowToPointInTime)
{
    // serial kRefused: no point in time, and the result stays as it was.
    const struct { std::vector<Variant> cells; const char *format; int mode; const char *global; double serial; } cases[] = {
        {Texts({"2012/03/04 05:06:07"}), "YYYY/MM/DD HH:mm:ss", kModeDateAndTime, "", kWorked},
        {Texts({"2012", "3", "4", "5", "6", "7"}), "YYYY|MM|DD|HH|mm|ss", kModeDateAndTime, "", kWorked},
        // Numbers in the cells count by their plain text.
        {{Variant::R8(2012), Variant::R8(3), Variant::R8(4), Variant::R8(5), Variant::R8(6), Variant::R8(7)},
         "YYYY|MM|DD|HH|mm|ss", kModeDateAndTime, "", kWorked},
        {Texts({"2012-03-04", "05:06:07"}), "YYYY-MM-DD|HH:mm:ss", kModeDateAndTime, "", kWorked},
        // True dates under a format: the date it holds, a date beside a time as
        // their sum, milliseconds kept; a number whose text fits stays that text.
        {{Variant::R8(kWorked + 0.5 / 86400)}, "YYYY-MM-DD HH:mm:ss", kModeDateAndTime, "", kWorked + 0.5 / 86400},
        {{Variant::R8(kMarch4th2012), Variant::R8(kSixMinutesPastFive)}, "YYYY-MM-DD|HH:mm:ss", kModeDateAndTime, "", kWorked},
        {{Variant::R8(kWorked)}, "\"YYYY/MM/DD hh:mm:ss\"", kModeDateAndTime, "", kWorked},
        {{Variant::R8(3.04)}, "MM.DD", kModeDateAndTime, "", 64.0},  // 4 March 1900
        {Texts({"2012|03|04"}), "\"YYYY|MM|DD\"", kModeDateAndTime, "", kMarch4th2012},  // quoted: one column
        {Texts({"2012/04/31 05:06:07"}), "YYYY/MM/DD HH:mm:ss", kModeDateAndTime, "", kRefused},
        {Texts({"2012", "3", "4"}), "YYYY|MM|DD|HH|mm|ss", kModeDateAndTime, "", kRefused},  // too few cells
        {Texts({"2012/03/04 05:06:07"}), "YYYY/MM/DD HH:mm:ss", kModeNone, "", kRefused},
        // The date from the cells, the time of day from the global text; a time in the cells is not read.
        {Texts({"2012-03-04"}), "YYYY-MM-DD", kModeDateWithGlobalTime, "05:06:07", kWorked},
        {Texts({"2012-03-04 23:59:59"}), "YYYY-MM-DD HH:mm:ss", kModeDateWithGlobalTime, "05:06:07", kWorked},
        {Texts({"2012-04-31"}), "YYYY-MM-DD", kModeDateWithGlobalTime, "05:06:07", kRefused},
        // The time from the cells, the date from the global text.
        {Texts({"05:06:07"}), "HH:mm:ss", kModeTimeWithGlobalDate, "2012-03-04", kWorked},
        {Texts({"24:00:00"}), "HH:mm:ss", kModeTimeWithGlobalDate, "2012-03-04", kRefused},
        // The empty format: the cell holds a true date; a global part replaces its own.
        {{Variant::R8(kWorked)}, "", kModeDateAndTime, "", kWorked},
        {Texts({"no date"}), "", kModeDateAndTime, "", kRefused},
        {{Variant::Date(40972.9)}, "", kModeDateWithGlobalTime, "05:06:07", kWorked},
        {{Variant::Date(30000.0 + kSixMinutesPastFive)}, "", kModeTimeWithGlobalDate, "2012-03-04", kWorked},
    };
    for (const auto &c : cases) {
        auto cells = MakeCells(c.cells);
        Variant result = Variant::I4(42);
        EXPECT_EQ(CDateTimeUtil::ParseTimeCells(cells.Get(), c.format, c.mode, result, c.global), c.serial != kRefused)
            << c.format << " mode " << c.mode;
        const double got = result.Type() == VT_DATE ? result.Raw().date : result.Type() == VT_I4 ? result.Raw().lVal : -2;
        EXPECT_NEAR(got, c.serial == kRefused ? 42 : c.serial, 1e-9) << c.format << " mode " << c.mode;
    }
}

TEST(TimeCells, ArraysThatAreNoRowAreRefused)
{
    Variant result = Variant::I4(42);
    automation::SafeArray doubles(SafeArrayCreateVector(VT_R8, 0, 1));
    for (SAFEARRAY *cells : {static_cast<SAFEARRAY *>(nullptr), doubles.Get()}) {
        EXPECT_FALSE(CDateTimeUtil::ParseTimeCells(cells, "YYYY", kModeDateAndTime, result, ""));
        EXPECT_FALSE(CDateTimeUtil::ParseTimeCells(cells, "", kModeDateAndTime, result, ""));
        EXPECT_FALSE(CDateTimeUtil::FormatTimeCells(Variant::Date(kWorked).Raw(), "", cells));
    }
    EXPECT_EQ(result.Type(), VT_I4);
}

TEST(TimeCells, PointInTimeToExportCells)
{
    const struct { Variant time; const char *format; std::vector<std::string> texts; } cases[] = {
        {Variant::Date(kWorked), "", {"2012/03/04 05:06:07"}},
        {Variant::Date(kWorked), "YYYY|MM|DD|HH|mm|ss", {"2012", "03", "04", "05", "06", "07"}},
        {Variant::Date(kWorked), "DD.MM.YYYY|HH:mm", {"04.03.2012", "05:06"}},
        // A quoted format whose text is no date goes in as text.
        {Variant::Date(kWorked), "\"HH mm\"", {"05 06"}},
        // A time that is no date value is changed to one first, or written as the invalid text.
        {Variant::R8(kWorked), "", {"2012/03/04 05:06:07"}},
        {Variant::String("2012-03-04 05:06:07"), "YYYY-MM-DD", {"2012-03-04"}},
        {Variant::String("no date"), "", {"Invalid DateTime"}},
    };
    for (const auto &c : cases) {
        auto cells = MakeCells(std::vector<Variant>(c.texts.size()));
        EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(c.time.Raw(), c.format, cells.Get())) << c.format;
        for (size_t i = 0; i < c.texts.size(); ++i)
            EXPECT_EQ(TextAt(cells.Get(), static_cast<LONG>(i)), c.texts[i]) << c.format;
    }

    // A quoted format that reads as a date gives a true date value.
    auto quoted = MakeCells({Variant()});
    EXPECT_TRUE(CDateTimeUtil::FormatTimeCells(Variant::Date(kWorked).Raw(), "\"YYYY/MM/DD hh:mm:ss\"", quoted.Get()));
    EXPECT_EQ(CellAt(quoted.Get(), 0).Type(), VT_DATE);
    EXPECT_NEAR(CellAt(quoted.Get(), 0).Raw().date, kWorked, 1e-9);
}

// Every preset of the format combo boxes, with the part of the time that its
// cells don't hold given as the global text.
TEST(TimeCells, ExportedRowReadsBackToTheSamePoint)
{
    const struct { int kind, formatClass, mode; const char *global; std::vector<double> serials; } kinds[] = {
        {FormatPresetDateTime, kFormatDateAndTime, kModeDateAndTime, "", {kWorked, 2.0, 2958465.0 + 86399.0 / 86400.0, 45000.5}},
        {FormatPresetDate, kFormatDateOnly, kModeDateWithGlobalTime, "05:06:07", {kWorked}},
        {FormatPresetTime, kFormatTimeOnly, kModeTimeWithGlobalDate, "2012-03-04", {kWorked}},
    };
    for (const auto &k : kinds) {
        EXPECT_FALSE(FormatPresets(k.kind).empty());
        for (const std::string &format : FormatPresets(k.kind)) {
            std::string error;
            EXPECT_TRUE(CDateTimeUtil::CheckFormatLetters(format, error)) << format;
            EXPECT_EQ(CDateTimeUtil::ClassifyFormat(format), k.formatClass) << format;
            for (const double serial : k.serials) {
                SCOPED_TRACE(format + " " + std::to_string(serial));
                auto cells = MakeCells(std::vector<Variant>(size_t(CDateTimeUtil::GetFormatColumnCount(format))));
                ASSERT_TRUE(CDateTimeUtil::FormatTimeCells(Variant::Date(serial).Raw(), format, cells.Get()));
                Variant result;
                EXPECT_TRUE(CDateTimeUtil::ParseTimeCells(cells.Get(), format, k.mode, result, k.global));
                EXPECT_NEAR(result.Type() == VT_DATE ? result.Raw().date : -1, serial, 1e-8);
            }
        }
    }
}

}  // namespace
