// SPDX-License-Identifier: MIT
// "vantrel export" end to end: the series text goes in, a workbook comes out,
// openpyxl reads it, and "vantrel import" gives the same series back.
#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <filesystem>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

#include "datetime/format_presets.h"
#include "support/files.h"
#include "support/program_run.h"
#include "support/temp_dir.h"

namespace {

using testing_host::ReadFile;
using testing_host::Vantrel;
using testing_host::WriteFile;
using Lines = std::vector<std::string>;

const char kDefaultLayout[] = "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;";

// A series in the form import prints: quoted titles, names of the catalogue,
// shortest float texts, empty fields for the delete value.
const char kSeries[] =
    "title,Gauge A,\"B, \"\"quoted\"\"\",plain\n"
    "item type,Rainfall,Discharge,Temperature\n"
    "unit,millimeter,liter/sec,degree Celsius\n"
    "value type,Accumulated,Reverse_Mean_Step_Accumulated,5\n"
    "delete value,-9999\n"
    "2020-01-02 03:04:05,1.5,,0.1\n"
    "2020-01-02 03:04:06,,3e+20,-2.25\n"
    "2020-02-29 23:59:59,1e-07,16777216,3.4028235e+38\n"
    "2021-12-31 00:00:00,0,-1.1754944e-38,\n";

// The lines of dump_export.py: changed zip entries and the cells openpyxl reads.
Lines Dump(const std::string &before, const std::string &after)
{
    const auto run = testing_host::RunProgram(
        "/usr/bin/python3", {VANTREL_SOURCE_DIR "/tests/data/export/dump_export.py", before, after});
    EXPECT_EQ(run.status, 0) << run.err;
    Lines lines;
    std::istringstream in(run.out);
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
}

// count steps an hour apart from start, one item, as import prints them;
// the steps in halfSeconds carry half a second (and print as no import does).
std::string HourlySeries(std::chrono::sys_seconds start, int count, const std::set<int> &halfSeconds = {})
{
    using namespace std::chrono;
    std::string text = "title,A\nitem type,\nunit,\nvalue type,Instantaneous\ndelete value,-9999\n";
    char line[64];
    for (int step = 0; step < count; ++step) {
        const sys_seconds time = start + hours(step);
        const year_month_day date(floor<days>(time));
        const hh_mm_ss clock(time - floor<days>(time));
        std::snprintf(line, sizeof line, "%04d-%02u-%02u %02d:%02d:%02d%s,%d\n", int(date.year()),
                      unsigned(date.month()), unsigned(date.day()), int(clock.hours().count()),
                      int(clock.minutes().count()), int(clock.seconds().count()),
                      halfSeconds.count(step) ? ".5" : "", step);
        text += line;
    }
    return text;
}

class ExportCommand : public ::testing::Test {
protected:
    std::string File(const std::string &name) { return dir_.File(name); }
    testing_host::TempDir dir_;
};

TEST_F(ExportCommand, DefaultLayoutRoundTripsThroughImport)
{
    WriteFile(File("series.csv"), kSeries);
    const auto exported = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""});
    ASSERT_EQ(exported.status, 0) << exported.err;
    EXPECT_EQ(exported.out + exported.err, "");
    const auto imported = Vantrel({"import", File("book.xlsx"), "--spec", kDefaultLayout});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_EQ(imported.out, kSeries);

    // The same through standard input and the JSON form; JSON keeps the data type.
    const auto json = Vantrel({"import", File("book.xlsx"), "--spec", kDefaultLayout, "--json"});
    ASSERT_EQ(json.status, 0) << json.err;
    WriteFile(File("series.json"), json.out);
    const auto again = Vantrel({"export", "-", File("again.xlsx"), "--spec", kDefaultLayout}, {File("series.json"), {}});
    ASSERT_EQ(again.status, 0) << again.err;
    const auto back = Vantrel({"import", File("again.xlsx"), "--spec", kDefaultLayout, "--json"});
    EXPECT_EQ(back.out, json.out);
}

TEST_F(ExportCommand, EveryFormatOfTheSaveDialogReadsBackWithTheSameString)
{
    // Unit and value type share a row ("unit:value type" cells); the default
    // date/time (no format) keeps milliseconds as true dates that show them.
    const std::string subSecond = "title,A\nitem type,Rainfall\nunit,millimeter\nvalue type,Accumulated\n"
                                  "delete value,-9999\n2020-01-01 00:00:00,1\n2020-01-01 00:00:00.500,2\n"
                                  "2020-01-01 00:00:01.250,3\n";
    std::vector<std::pair<std::string, std::string>> cases = {
        {"", kSeries}, {"", subSecond}, {"DateTimeFormat=YYYY-MM-DD|HH:mm:ss;", kSeries}};
    for (const std::string &preset : vantrel::datetime::FormatPresets(vantrel::datetime::FormatPresetDateTime))
        cases.emplace_back("DateTimeFormat=" + preset + ";", kSeries);
    for (const auto &[format, series] : cases) {
        SCOPED_TRACE(format);
        const std::string spec = "DateTimeCol=1;" + format + "StartRow=4;UnitTypeRow=1;UnitRow=2;ValueTypeRow=2;"
                                 "ItemDescriptionRow=3;";
        WriteFile(File("series.csv"), series);
        const auto exported = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", spec});
        ASSERT_EQ(exported.status, 0) << exported.err;
        const auto imported = Vantrel({"import", File("book.xlsx"), "--spec", spec});
        EXPECT_EQ(imported.status, 0) << imported.err;
        EXPECT_EQ(imported.out, series);
        std::filesystem::remove(File("book.xlsx"));
    }
    // A format with no place for milliseconds is refused, before a file is made.
    WriteFile(File("series.csv"), subSecond);
    const auto refused = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec",
                                  "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=2;"});
    EXPECT_EQ(refused.status, 1);
    EXPECT_EQ(refused.err, "Time step 2 (2020-01-01 00:00:00.500) would not read back as itself but as 2020-01-01 "
                           "00:00:00 under DateTimeFormat=YYYY-MM-DD HH:mm:ss: leave DateTimeFormat out, so that the "
                           "cells are true dates that keep the milliseconds.\n");
    EXPECT_FALSE(std::filesystem::exists(File("book.xlsx")));
}

TEST_F(ExportCommand, LongSeriesComesBackWholeAndInOrder)
{
    // More steps than import writes in one block, and a last block of its own:
    // every line must come back, once, in its place.
    std::ostringstream series;
    series << "title,A,B\nitem type,,\nunit,,\nvalue type,Instantaneous,Instantaneous\ndelete value,-9999\n";
    const char *quarters[] = {"", ".25", ".5", ".75"};
    char time[32];
    for (int step = 0; step < 20001; ++step) {
        std::snprintf(time, sizeof time, "2020-01-01 %02d:%02d:%02d", step / 3600, step / 60 % 60, step % 60);
        series << time << ',' << step / 4 << quarters[step % 4] << ',';
        if (step % 13 != 0) series << 100000 + step;
        series << '\n';
    }
    WriteFile(File("long.csv"), series.str());
    const auto exported = Vantrel({"export", File("long.csv"), File("long.xlsx"), "--spec", ""});
    ASSERT_EQ(exported.status, 0) << exported.err;
    const auto imported = Vantrel({"import", File("long.xlsx"), "--spec", kDefaultLayout});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_TRUE(imported.out == series.str()) << "the long series came back changed";
}

// A series long enough to be checked in two halves: every time cell takes the
// number format its text gives, and in a workbook of the 1904 date system the
// steps before 1904 (texts there) and after come back as they went in.
TEST_F(ExportCommand, TimeCellsOfALongSeriesTakeTheFormatsTheirTextsGive)
{
    using namespace std::chrono;
    const std::string book1904 = VANTREL_SOURCE_DIR "/tests/data/bridge/dates1904.xlsx";
    const sys_seconds in2020 = sys_days(2020y / 1 / 1), before1904 = sys_days(1903y / 12 / 31) + 12h;
    const struct {
        const char *format, *workbook;
        sys_seconds start;
        std::vector<std::string> formats;  // of the date/time columns, when the workbook is new
    } cases[] = {{"", "", in2020, {"yyyy/mm/dd hh:mm:ss"}},
                 {"DateTimeFormat=YYYY-MM-DD|HH:mm:ss;", "", in2020, {"yyyy-mm-dd", "hh:mm:ss"}},
                 {"DateTimeFormat=YYYY-MM-DD HH:mm:ss;", "", in2020, {"YYYY-MM-DD HH:mm:ss"}},
                 {"DateTimeFormat=YYYY-MM-DD HH:mm:ss;", book1904.c_str(), before1904, {}},
                 {"DateTimeFormat=YYYY|MM|DD|HH|mm|ss;", book1904.c_str(), before1904, {}}};
    constexpr int kSteps = 20000;
    for (const auto &c : cases) {
        SCOPED_TRACE(std::string(c.format) + c.workbook);
        const std::string series = HourlySeries(c.start, kSteps);
        const std::string spec = std::string("DateTimeCol=1;") + c.format + "StartRow=3;ItemDescriptionRow=2;";
        WriteFile(File("series.csv"), series);
        std::filesystem::remove(File("book.xlsx"));
        if (*c.workbook) std::filesystem::copy_file(c.workbook, File("book.xlsx"));
        const auto exported = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", spec});
        ASSERT_EQ(exported.status, 0) << exported.err;
        EXPECT_TRUE(Vantrel({"import", File("book.xlsx"), "--spec", spec}).out == series) << "the series came back changed";
        if (c.formats.empty()) continue;
        // "cell Sheet!B123 VALUE | FORMAT": the formats of the data rows, by column.
        std::vector<std::map<std::string, int>> formats(c.formats.size());
        for (const std::string &line : Dump("-", File("book.xlsx"))) {
            const size_t at = line.find('!') + 1;
            const size_t column = size_t(line[at] - 'A');
            if (column < formats.size() && std::stoi(line.substr(at + 1)) >= 3)
                ++formats[column][line.substr(line.rfind(" | ") + 3)];
        }
        for (size_t i = 0; i < formats.size(); ++i)
            EXPECT_EQ(formats[i], (std::map<std::string, int>{{c.formats[i], kSteps}})) << "column " << i + 1;
    }
}

// The first step that doesn't read back is named, in either half of a long series.
TEST_F(ExportCommand, TheFirstStepOfALongSeriesThatDoesNotReadBackIsNamed)
{
    using namespace std::chrono;
    const struct {
        std::set<int> halfSeconds;
        const char *refusal;
    } cases[] = {{{4000, 15000}, "Time step 4001 (2020-06-15 16:00:00.500) would not read back as itself but as "
                                 "2020-06-15 16:00:01"},
                 {{15000, 19000}, "Time step 15001 (2021-09-17 00:00:00.500) would not read back as itself but as "
                                  "2021-09-17 00:00:00"}};
    for (const auto &c : cases) {
        WriteFile(File("series.csv"), HourlySeries(sys_days(2020y / 1 / 1), 20000, c.halfSeconds));
        const auto refused = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec",
                                      "DateTimeCol=1;DateTimeFormat=YYYY-MM-DD HH:mm:ss;StartRow=2;"});
        EXPECT_EQ(refused.status, 1);
        EXPECT_EQ(refused.err, std::string(c.refusal) + " under DateTimeFormat=YYYY-MM-DD HH:mm:ss: leave DateTimeFormat "
                               "out, so that the cells are true dates that keep the milliseconds.\n");
        EXPECT_FALSE(std::filesystem::exists(File("book.xlsx")));
    }
}

TEST_F(ExportCommand, SaveAndOpenTemplatesOfOneLayoutRoundTrip)
{
    const std::string root = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<MSExcelVantrelSpecification ";
    const std::string rows = "DateTimeCol=\"2\" UseDTFormat=\"false\" DateTimeFormat=\"YYYY-MM-DD HH:mm:ss\" UnitTypeRow=\"1\" "
                             "UnitRow=\"2\" ValueTypeRow=\"3\" ItemDescriptionRow=\"4\" StartRow=\"6\" "
                             "UseDelValNotEmpty=\"true\" DeleteValueRow=\"5\" ";
    WriteFile(File("save.xml"), root + rows + "/>");
    WriteFile(File("open.xml"), root + rows + "ExcelSheet=\"1\" DataTimeType=\"0\" GlobalDate=\"2020-01-01\" "
                                              "GlobalTime=\"00:00:00\" UseUnitTypeRow=\"true\" UseUnitRow=\"true\" "
                                              "UseValueTypeRow=\"true\" UseDeleteValueRow=\"true\" />");
    // A value type row of its own holds the value type 5 as a number, which
    // reads back as that value type.
    const std::string series = kSeries;
    WriteFile(File("series.csv"), series);
    const auto exported = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", "TemplateFilePath=" + File("save.xml") + ";"});
    ASSERT_EQ(exported.status, 0) << exported.err;
    EXPECT_EQ(exported.err, "");
    const auto imported = Vantrel({"import", File("book.xlsx"), "--spec", "TemplateFilePath=" + File("open.xml") + ";"});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_EQ(imported.out, series);

    // The open template is no save template: the export is refused, and the
    // workbook stays as it was.
    const std::string before = ReadFile(File("book.xlsx"));
    const auto wrong = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec",
                                "TemplateFilePath=" + File("open.xml") + ";DateTimeCol=1;StartRow=5;"});
    EXPECT_EQ(wrong.status, 1);
    EXPECT_EQ(wrong.err, "The xml File is not valid.\n");
    EXPECT_EQ(ReadFile(File("book.xlsx")), before);
}

TEST_F(ExportCommand, OtherSheetsOfAnExistingWorkbookStayByteForByte)
{
    const std::string original = VANTREL_SOURCE_DIR "/tests/data/export/three_sheets.xlsx";
    std::filesystem::copy_file(original, File("three.xlsx"));
    WriteFile(File("series.csv"), kSeries);
    const auto exported = Vantrel({"export", File("series.csv"), File("three.xlsx"), "--spec", ""});
    ASSERT_EQ(exported.status, 0) << exported.err;

    // What sheet 1 and the workbook-wide parts may change; nothing else. The
    // cells of the other sheets read as before.
    const std::set<std::string> mayChange = {
        "changed xl/worksheets/sheet1.xml", "changed xl/styles.xml",       "changed xl/sharedStrings.xml",
        "added xl/sharedStrings.xml",       "changed [Content_Types].xml", "changed xl/_rels/workbook.xml.rels",
        "changed xl/workbook.xml",          "changed docProps/app.xml",    "changed docProps/core.xml"};
    Lines exportCells, otherCells, otherCellsBefore;
    bool sheetChanged = false;
    for (const std::string &line : Dump(original, File("three.xlsx"))) {
        const std::string tag = line.substr(0, line.find(' ')), rest = line.substr(tag.size());
        if (tag == "cell") (rest.rfind(" Export!", 0) == 0 ? exportCells : otherCells).push_back(rest);
        else if (tag == "before") {
            if (rest.rfind(" Export!", 0) != 0) otherCellsBefore.push_back(rest);
        }
        else EXPECT_TRUE(mayChange.count(line)) << line;
        sheetChanged |= line == "changed xl/worksheets/sheet1.xml";
    }
    EXPECT_TRUE(sheetChanged);
    EXPECT_EQ(otherCells, otherCellsBefore);

    // openpyxl reads the exported values and their number formats, and
    // nothing of the old table is left beyond the new one.
    const std::set<std::string> cells(exportCells.begin(), exportCells.end());
    for (const char *cell : {" Export!C1 'Discharge[liter/sec]:Reverse_Mean_Step_Accumulated' | @",
                             " Export!C2 'B, \"quoted\"' | @",
                             " Export!A5 datetime.datetime(2020, 2, 29, 23, 59, 59) | yyyy/mm/dd hh:mm:ss",
                             " Export!B5 1e-07 | General", " Export!C5 16777216 | General",
                             " Export!D5 3.4028235e+38 | General"})
        EXPECT_TRUE(cells.count(cell)) << cell << "\n" << ::testing::PrintToString(exportCells);
    for (const std::string &cell : exportCells) EXPECT_EQ(cell.find("'old "), std::string::npos) << cell;
}

// What spreadsheet programs, editors, R and pandas write when they save the
// series again reads as the series itself.
TEST_F(ExportCommand, OtherToolsHabitsReadAsTheSameSeries)
{
    WriteFile(File("series.csv"), "\xEF\xBB\xBFtitle;A;B\nitem type;rainfall;TEMPERATURE\nunit;mm;Deg C\nvalue type;accumulated;"
                                  "instantaneous\ndelete value;-9999;;\n2020-01-02T03:04;1.5;NA\n2020-01-02 03:05:00.000;nan;-2;\n");
    ASSERT_EQ(Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""}).status, 0);
    EXPECT_EQ(Vantrel({"import", File("book.xlsx"), "--spec", kDefaultLayout}).out, "title,A,B\nitem type,Rainfall,Temperature\nunit,"
              "millimeter,degree Celsius\nvalue type,Accumulated,Instantaneous\ndelete value,-9999\n2020-01-02 03:04:00,1.5,\n2020-01-02 03:05:00,,-2\n");
}

TEST_F(ExportCommand, BadInputFailsClearlyAndLeavesTheWorkbookAlone)
{
    // Inputs that never end are refused by their kind before a byte is read, standard input at a bound.
    WriteFile(File("series.csv"), "title,a\nitem type,\nunit,\nvalue type,\ndelete value,-1\n");
    const std::tuple<std::vector<std::string>, std::string, std::string> endless[] = {
        {{"export", "/dev/zero", File("book.xlsx"), "--spec", ""}, "/dev/null", "/dev/zero: is a device"},
        {{"inspect", File("book.xlsx"), "--spec", "@/dev/zero"}, "/dev/null", "/dev/zero: is a device"},
        {{"export", "-", File("book.xlsx"), "--spec", ""}, "/dev/zero", ": the series on standard input is longer than 1 GiB; give it as a file\n"},
        {{"export", File("series.csv"), File("book.xlsx"), "--spec", "@-"}, "/dev/zero", ": the specification string on standard input is longer than 1 MiB\n"},
    };
    for (const auto &[args, input, message] : endless) {
        const auto run = Vantrel(args, {input, {}});
        EXPECT_EQ(run.status, 1) << args[1];
        EXPECT_NE(run.err.find(message), std::string::npos) << run.err;
    }

    const std::string head = "title,a\nitem type,Rainfall\nunit,millimeter\nvalue type,Accumulated\ndelete value,-1\n";
    const std::string json = "{\"deleteValue\": -1, \"times\": [], \"items\": [{";
    const std::pair<std::string, std::string> cases[] = {
        {"", "series line 1: the line \"title,...\" is missing"},
        {"title,a\nitem type,Rainfall,Discharge\nunit,a\nvalue type,b\ndelete value,1\n", "series line 2: 2 fields for 1 items"},
        {"title,a\nitem type,Rainfall\nunit,millimeter\nvalue type,Accumulated\ndelete value\n",
         "series line 5: expected \"delete value,NUMBER\""},
        {head + "2020-01-01 00:00:00,1,2\n", "series line 6: 3 fields, expected 2"},
        {head + "2020-01-01 00:00:00,x1\n", "series line 6: \"x1\" is no number"},
        {head + "2020-01-01 00:00:00,infinite\n", "series line 6: \"infinite\" is no number"},
        {head + "2020-01-01 00:00:00," + std::string(5 << 20, 'x') + "\n",
         "series line 6: \"" + std::string(40, 'x') + "...\" (5242880 bytes) is no number"},
        {head + "2020-01-01 00:00:00,\x01\xFF\xC3\"\\\xE2\x82\xAC\n", "series line 6: \"\\x01\\xFF\\xC3\\\"\\\\\xE2\x82\xAC\" is no number"},
        {"title;a\nitem type;Rainfall\nunit;mm\nvalue type;Accumulated\ndelete value;-1\n2020-01-01 00:00;1,5\n",
         "series line 6: \"1,5\" is no number; write the decimal separator as a point"},
        {head + "2020-02-30 00:00:00,1\n", "series line 6: \"2020-02-30 00:00:00\" is no time YYYY-MM-DD HH:MM:SS"},
        {head + "2020-01-01 00:00:00,\"1\n", "series line 6: a quoted field is not closed"},
        {"title,a\nitem type,Rain\nunit,mm\nvalue type,Accumulated\ndelete value,-1\n", "item 1: unknown item type \"Rain\""},
        {"title,a\nitem type,Rainfall\nunit,meter^3/sec\nvalue type,Accumulated\ndelete value,-1\n",
         "item 1: unknown unit \"meter^3/sec\" of the item type \"Rainfall\""},
        {"title,a\nitem type,Rainfall\nunit,millimeter\nvalue type,Sum\ndelete value,-1\n", "item 1: unknown value type \"Sum\""},
        {"{\"deleteValue\": -1, \"times\": [\"2020-01-01\"], \"items\": []}", "times[0] is no time YYYY-MM-DD HH:MM:SS"},
        {json + "\"values\": [\"1\"]}]}", "items[0]: values[0]: \"1\" is neither a number, \"inf\", \"-inf\" nor null"},
        {json + "\"values\": [1, \"nan\"]}]}", "items[0]: values[1]: \"nan\" is no value a cell can hold; a missing value is null"},
        {json + "\"dataType\": 4, \"values\": [\"-inf\"]}]}", "items[0]: values[0]: an item of whole numbers holds no infinity"},
        {json + "\"dataType\": 9, \"values\": []}]}", "items[0]: \"dataType\" is no number from 1 to 7"},
        {json + "\"dataType\": 1, \"values\": [1e39]}]}", "items[0]: a value lies beyond the range of a 32-bit float"},
        {"{\"times\": []}", "\"deleteValue\" is no number"},
    };
    for (const auto &[series, message] : cases) {
        WriteFile(File("series.csv"), series);
        const auto run = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""});
        EXPECT_EQ(run.status, 1) << series;
        EXPECT_EQ(run.err, "vantrel: " + message + "\n") << series;
        EXPECT_FALSE(std::filesystem::exists(File("book.xlsx"))) << series;
    }
    WriteFile(File("series.csv"), "{\"deleteValue\": ");
    const auto notJson = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""});
    EXPECT_EQ(notJson.status, 1);
    EXPECT_EQ(notJson.err.rfind("vantrel: the series is no JSON: ", 0), 0u) << notJson.err;
    const auto missing = Vantrel({"export", File("absent.csv"), File("book.xlsx"), "--spec", ""});
    EXPECT_EQ(missing.status, 1);
    EXPECT_EQ(missing.err, "vantrel: cannot read the series file " + File("absent.csv") + ": No such file or directory\n");

    // A workbook that can't be made is the bridge's failure, told on stderr;
    // a file that is no workbook is not overwritten.
    WriteFile(File("series.csv"), kSeries);
    const auto unwritable = Vantrel({"export", File("series.csv"), File("no/such/folder/book.xlsx"), "--spec", ""});
    EXPECT_EQ(unwritable.status, 1);
    EXPECT_EQ(unwritable.err, "Excel could not create file\n");
    WriteFile(File("text.xlsx"), "just text");
    const auto notBook = Vantrel({"export", File("series.csv"), File("text.xlsx"), "--spec", ""});
    EXPECT_EQ(notBook.status, 1);
    EXPECT_EQ(notBook.err, "Excel Workbook could not open file.\n" + File("text.xlsx") +
                               ": the file is not a workbook package: Not a zip archive\n");
    EXPECT_EQ(ReadFile(File("text.xlsx")), "just text");
}

// A title the engine couldn't read back is refused before anything is opened; a control character takes 7 bytes.
TEST_F(ExportCommand, TitleLongerThanACellHoldsIsRefusedBeforeWriting)
{
    WriteFile(File("series.csv"), kSeries);
    ASSERT_EQ(Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""}).status, 0);
    const std::string book = ReadFile(File("book.xlsx"));
    for (const std::string &title : {std::string((1 << 20) + 1, 'x'), std::string((1 << 20) - 6, 'x') + "\\u0001"}) {
        WriteFile(File("long.json"), "{\"deleteValue\": -1, \"times\": [\"2020-01-01 00:00\"], \"items\": [{\"title\": \"a\", \"values\": [1]}, "
                                     "{\"title\": \"" + title + "\", \"values\": [2]}]}");
        for (const std::string name : {"book.xlsx", "new.xlsx"})
            EXPECT_EQ(Vantrel({"export", File("long.json"), File(name), "--spec", ""}).err, "The title of item 2 takes 1048577 "
                      "bytes in a cell, more than the 1048576 a cell may hold. Shorten the title.\n");
        EXPECT_EQ(ReadFile(File("book.xlsx")), book);
        EXPECT_FALSE(std::filesystem::exists(File("new.xlsx")));
    }
}

// Workbooks are written as .xlsx or .xlsm alone: a file of another kind stays
// byte for byte, and no workbook is made under another kind's name.
TEST_F(ExportCommand, OnlyXlsxAndXlsmAreWritten)
{
    WriteFile(File("series.csv"), kSeries);
    const std::string kWritten = "workbooks are written as .xlsx or .xlsm";
    const std::string xls = ReadFile(VANTREL_SOURCE_DIR "/../shared/corpus-other/tidyverse__readxl/blanks.xls");
    ASSERT_FALSE(xls.empty());
    const struct {
        const char *name;
        std::string existing;  // "" for a new file
        std::string reason;
    } cases[] = {
        {"gauges.xls", xls, "is not written: " + kWritten + ", and this file is left as it is. Export to a workbook of one of those kinds."},
        {"gauges.csv", "a;b\n1;2\n", "is not written: " + kWritten + ", and this file is left as it is. Export to a workbook of one of those kinds."},
        {"notes.TXT", "x", "is not written: " + kWritten + ", and this file is left as it is. Export to a workbook of one of those kinds."},
        {"new.ods", "", "would be an .xlsx workbook under the extension .ods: " + kWritten + ". Give the new workbook one of those extensions."},
        {"new.csv", "", "would be an .xlsx workbook under the extension .csv: " + kWritten + ". Give the new workbook one of those extensions."},
        {"newbook", "", "has no extension: " + kWritten + ". Give the new workbook one of those extensions."},
        {".xlsx", "", "has no extension: " + kWritten + ". Give the new workbook one of those extensions."},
    };
    for (const auto &c : cases) {
        if (!c.existing.empty()) WriteFile(File(c.name), c.existing);
        const auto run = Vantrel({"export", File("series.csv"), File(c.name), "--spec", ""});
        EXPECT_EQ(run.status, 1) << c.name;
        EXPECT_EQ(run.err, File(c.name) + " " + c.reason + "\n") << c.name;
        if (c.existing.empty()) EXPECT_FALSE(std::filesystem::exists(File(c.name))) << c.name;
        else EXPECT_EQ(ReadFile(File(c.name)), c.existing) << c.name;
    }
    // The extension counts whatever its case.
    for (const char *name : {"upper.XLSX", "macros.xlsm"}) {
        const auto run = Vantrel({"export", File("series.csv"), File(name), "--spec", ""});
        EXPECT_EQ(run.status, 0) << name << run.err;
        EXPECT_EQ(ReadFile(File(name)).substr(0, 2), "PK") << name;
    }
}

}  // namespace
