// SPDX-License-Identifier: MIT
// "vantrel export" end to end: the series text goes in, a workbook comes out,
// and "vantrel import" gives the same series back.
#include <gtest/gtest.h>

#include <sys/wait.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>
#include <sstream>
#include <string>
#include <vector>

#include "support/temp_dir.h"

namespace {

struct Result {
    int status = -1;
    std::string out;
    std::string err;
};

std::string Quote(const std::string &text)
{
    std::string quoted = "'";
    for (const char c : text) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return quoted + "'";
}

std::string ReadFile(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

void WriteFile(const std::string &path, const std::string &text) { std::ofstream(path, std::ios::binary) << text; }

class ExportCommand : public ::testing::Test {
protected:
    // Runs a program with the arguments, standard input from a file when given.
    Result Run(const std::string &program, const std::vector<std::string> &args, const std::string &input = "")
    {
        std::string command = Quote(program);
        for (const std::string &arg : args) command += " " + Quote(arg);
        if (!input.empty()) command += " < " + Quote(input);
        command += " > " + Quote(dir_.File("stdout")) + " 2> " + Quote(dir_.File("stderr"));
        Result result;
        const int raw = std::system(command.c_str());
        result.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
        result.out = ReadFile(dir_.File("stdout"));
        result.err = ReadFile(dir_.File("stderr"));
        return result;
    }
    Result Vantrel(const std::vector<std::string> &args, const std::string &input = "")
    {
        return Run(VANTREL_BINARY_DIR "/bin/vantrel", args, input);
    }
    // Lines of the workbook dump: changed zip entries and the cells openpyxl reads.
    std::vector<std::string> Dump(const std::string &before, const std::string &after)
    {
        const Result result =
            Run("/usr/bin/python3", {VANTREL_SOURCE_DIR "/tests/data/export/dump_export.py", before, after});
        EXPECT_EQ(result.status, 0) << result.err;
        std::vector<std::string> lines;
        std::istringstream in(result.out);
        for (std::string line; std::getline(in, line);) lines.push_back(line);
        return lines;
    }
    std::string File(const std::string &name) { return dir_.File(name); }

    testing_host::TempDir dir_;
};

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

TEST_F(ExportCommand, DefaultLayoutRoundTripsThroughImport)
{
    WriteFile(File("series.csv"), kSeries);
    const Result exported = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""});
    ASSERT_EQ(exported.status, 0) << exported.err;
    EXPECT_EQ(exported.out, "");
    EXPECT_EQ(exported.err, "");
    const Result imported = Vantrel({"import", File("book.xlsx"), "--spec", kDefaultLayout});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_EQ(imported.out, kSeries);

    // The same through standard input and the JSON form; JSON keeps the data type.
    const Result json = Vantrel({"import", File("book.xlsx"), "--spec", kDefaultLayout, "--json"});
    ASSERT_EQ(json.status, 0) << json.err;
    WriteFile(File("series.json"), json.out);
    const Result again = Vantrel({"export", "-", File("again.xlsx"), "--spec", kDefaultLayout}, File("series.json"));
    ASSERT_EQ(again.status, 0) << again.err;
    const Result back = Vantrel({"import", File("again.xlsx"), "--spec", kDefaultLayout, "--json"});
    ASSERT_EQ(back.status, 0) << back.err;
    EXPECT_EQ(back.out, json.out);
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
    const Result exported = Vantrel({"export", File("long.csv"), File("long.xlsx"), "--spec", ""});
    ASSERT_EQ(exported.status, 0) << exported.err;
    const Result imported = Vantrel({"import", File("long.xlsx"), "--spec", kDefaultLayout});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_TRUE(imported.out == series.str()) << "the long series came back changed";
}

TEST_F(ExportCommand, DeleteValueRowRoundTripsTheMarkerAndTheGaps)
{
    const std::string spec = "DateTimeCol=1;StartRow=4;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;DelValRow=3;";
    const std::string series =
        "title,a,b\n"
        "item type,Water Level,Water Level\n"
        "unit,meter,feet\n"
        "value type,Instantaneous,Instantaneous\n"
        "delete value,-99.5\n"
        "2019-06-01 12:00:00,,7\n"
        "2019-06-01 12:15:00,2.5,\n";
    WriteFile(File("series.csv"), series);
    const Result exported = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", spec});
    ASSERT_EQ(exported.status, 0) << exported.err;
    const auto dump = Dump("-", File("book.xlsx"));
    const std::set<std::string> cells(dump.begin(), dump.end());
    EXPECT_TRUE(cells.count("cell Sheet1!A3 -99.5 | General")) << ::testing::PrintToString(dump);
    const Result imported = Vantrel({"import", File("book.xlsx"), "--spec", spec});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_EQ(imported.out, series);
}

TEST_F(ExportCommand, SaveAndOpenTemplatesOfOneLayoutRoundTrip)
{
    const std::string header = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<MSExcelVantrelSpecification "
                               "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n";
    WriteFile(File("save.xml"), header +
                                    "DateTimeCol=\"2\" UseDTFormat=\"false\" DateTimeFormat=\"YYYY-MM-DD HH:mm:ss\" "
                                    "UnitTypeRow=\"1\" UnitRow=\"2\" ValueTypeRow=\"3\" ItemDescriptionRow=\"4\" "
                                    "StartRow=\"6\" UseDelValNotEmpty=\"true\" DeleteValueRow=\"5\" />");
    WriteFile(File("open.xml"), header +
                                    "ExcelSheet=\"1\" DataTimeType=\"0\" DateTimeCol=\"2\" UseDTFormat=\"false\" "
                                    "DateTimeFormat=\"YYYY-MM-DD HH:mm:ss\" GlobalDate=\"2020-01-01\" "
                                    "GlobalTime=\"00:00:00\" UseUnitTypeRow=\"true\" UnitTypeRow=\"1\" "
                                    "UseUnitRow=\"true\" UnitRow=\"2\" UseValueTypeRow=\"true\" ValueTypeRow=\"3\" "
                                    "ItemDescriptionRow=\"4\" StartRow=\"6\" UseDelValNotEmpty=\"true\" "
                                    "UseDeleteValueRow=\"true\" DeleteValueRow=\"5\" />");
    // A value type row of its own turns the text "5" into the number 5, which
    // an import doesn't take as a value type: this series names all of them.
    std::string series = kSeries;
    const std::string numbered = "Reverse_Mean_Step_Accumulated,5\n";
    series.replace(series.find(numbered), numbered.size(), "Reverse_Mean_Step_Accumulated,Step_Accumulated\n");
    WriteFile(File("series.csv"), series);
    const Result exported =
        Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", "TemplateFilePath=" + File("save.xml") + ";"});
    ASSERT_EQ(exported.status, 0) << exported.err;
    EXPECT_EQ(exported.err, "");
    const auto dump = Dump("-", File("book.xlsx"));
    const std::set<std::string> cells(dump.begin(), dump.end());
    // Three header rows, the title row, the delete value row, and the delete
    // values written as numbers; the dates are true dates, as the format is off.
    for (const char *line : {"cell Sheet1!C1 'Rainfall' | General", "cell Sheet1!C2 'millimeter' | General",
                             "cell Sheet1!C3 'Accumulated' | General", "cell Sheet1!C4 'Gauge A' | General",
                             "cell Sheet1!B5 -9999 | General",
                             "cell Sheet1!B6 datetime.datetime(2020, 1, 2, 3, 4, 5) | yyyy/mm/dd hh:mm:ss",
                             "cell Sheet1!D6 -9999 | General", "cell Sheet1!E9 -9999 | General"})
        EXPECT_TRUE(cells.count(line)) << line << "\n" << ::testing::PrintToString(dump);
    const Result imported = Vantrel({"import", File("book.xlsx"), "--spec", "TemplateFilePath=" + File("open.xml") + ";"});
    ASSERT_EQ(imported.status, 0) << imported.err;
    EXPECT_EQ(imported.out, series);
}

TEST_F(ExportCommand, OtherSheetsOfAnExistingWorkbookStayByteForByte)
{
    const std::string original = VANTREL_SOURCE_DIR "/tests/data/export/three_sheets.xlsx";
    std::filesystem::copy_file(original, File("three.xlsx"));
    WriteFile(File("series.csv"), kSeries);
    const Result exported = Vantrel({"export", File("series.csv"), File("three.xlsx"), "--spec", ""});
    ASSERT_EQ(exported.status, 0) << exported.err;

    // What sheet 1 and the workbook-wide parts may change; nothing else.
    const std::set<std::string> mayChange = {
        "changed xl/worksheets/sheet1.xml", "changed xl/styles.xml",         "changed xl/sharedStrings.xml",
        "added xl/sharedStrings.xml",       "changed [Content_Types].xml",   "changed xl/_rels/workbook.xml.rels",
        "changed xl/workbook.xml",          "changed docProps/app.xml",      "changed docProps/core.xml"};
    std::vector<std::string> afterCells, beforeCells;
    bool sheetChanged = false;
    for (const std::string &line : Dump(original, File("three.xlsx"))) {
        if (line.rfind("cell ", 0) == 0) {
            if (line.rfind("cell Export!", 0) != 0) afterCells.push_back(line);
            continue;
        }
        EXPECT_TRUE(mayChange.count(line)) << line;
        sheetChanged |= line == "changed xl/worksheets/sheet1.xml";
    }
    EXPECT_TRUE(sheetChanged);
    for (const std::string &line : Dump("-", original))
        if (line.rfind("cell Export!", 0) != 0) beforeCells.push_back(line);
    EXPECT_EQ(afterCells, beforeCells);

    // openpyxl reads the exported values and their number formats.
    const auto dump = Dump("-", File("three.xlsx"));
    const std::vector<std::string> sheet1(dump.begin(), dump.begin() + 16);
    EXPECT_EQ(sheet1, (std::vector<std::string>{
                          "cell Export!B1 'Rainfall[millimeter]:Accumulated' | General",
                          "cell Export!C1 'Discharge[liter/sec]:Reverse_Mean_Step_Accumulated' | General",
                          "cell Export!D1 'Temperature[degree Celsius]:5' | General",
                          "cell Export!B2 'Gauge A' | General",
                          "cell Export!C2 'B, \"quoted\"' | General",
                          "cell Export!D2 'plain' | General",
                          "cell Export!A3 datetime.datetime(2020, 1, 2, 3, 4, 5) | yyyy/mm/dd hh:mm:ss",
                          "cell Export!B3 1.5 | General",
                          "cell Export!D3 0.1 | General",
                          "cell Export!A4 datetime.datetime(2020, 1, 2, 3, 4, 6) | yyyy/mm/dd hh:mm:ss",
                          "cell Export!C4 3e+20 | General",
                          "cell Export!D4 -2.25 | General",
                          "cell Export!A5 datetime.datetime(2020, 2, 29, 23, 59, 59) | yyyy/mm/dd hh:mm:ss",
                          "cell Export!B5 1e-07 | General",
                          "cell Export!C5 16777216 | General",
                          "cell Export!D5 3.4028235e+38 | General",
                      }));
    // Nothing of the old table is left beyond the new one.
    for (const std::string &line : dump) EXPECT_EQ(line.find("'old "), std::string::npos) << line;
}

TEST_F(ExportCommand, BadInputFailsClearlyAndLeavesTheWorkbookAlone)
{
    const Result usage = Vantrel({"export", File("series.csv"), "--spec", ""});
    EXPECT_EQ(usage.status, 2);
    EXPECT_NE(usage.err.find("vantrel export SERIES BOOK"), std::string::npos);
    EXPECT_EQ(Vantrel({"export", File("series.csv"), File("book.xlsx")}).status, 2);

    struct Case {
        std::string series;
        std::string message;
    };
    const std::string head = "title,a\nitem type,Rainfall\nunit,millimeter\nvalue type,Accumulated\ndelete value,-1\n";
    const Case cases[] = {
        {"", "vantrel: series line 1: the line \"title,...\" is missing\n"},
        {"title,a\nitem type,Rainfall,Discharge\nunit,a\nvalue type,b\ndelete value,1\n",
         "vantrel: series line 2: 2 fields for 1 items\n"},
        {"title,a\nitem type,Rainfall\nunit,millimeter\nvalue type,Accumulated\ndelete value\n",
         "vantrel: series line 5: expected \"delete value,NUMBER\"\n"},
        {head + "2020-01-01 00:00:00,1,2\n", "vantrel: series line 6: 3 fields, expected 2\n"},
        {head + "2020-01-01 00:00:00,x1\n", "vantrel: series line 6: \"x1\" is no number\n"},
        {head + "2020-02-30 00:00:00,1\n", "vantrel: series line 6: \"2020-02-30 00:00:00\" is no time YYYY-MM-DD HH:MM:SS\n"},
        {head + "2020-01-01 00:00:00,\"1\n", "vantrel: series line 6: a quoted field is not closed\n"},
        {"title,a\nitem type,Rain\nunit,mm\nvalue type,Accumulated\ndelete value,-1\n",
         "vantrel: item 1: unknown item type \"Rain\"\n"},
        {"title,a\nitem type,Rainfall\nunit,meter^3/sec\nvalue type,Accumulated\ndelete value,-1\n",
         "vantrel: item 1: unknown unit \"meter^3/sec\" of the item type \"Rainfall\"\n"},
        {"title,a\nitem type,Rainfall\nunit,millimeter\nvalue type,Sum\ndelete value,-1\n",
         "vantrel: item 1: unknown value type \"Sum\"\n"},
        {"{\"deleteValue\": -1, \"times\": [\"2020-01-01\"], \"items\": []}",
         "vantrel: times[0] is no time YYYY-MM-DD HH:MM:SS\n"},
        {"{\"deleteValue\": -1, \"times\": [], \"items\": [{\"values\": [\"1\"]}]}",
         "vantrel: items[0]: a value is neither a number nor null\n"},
        {"{\"deleteValue\": -1, \"times\": [], \"items\": [{\"dataType\": 9, \"values\": []}]}",
         "vantrel: items[0]: \"dataType\" is no number from 1 to 7\n"},
        {"{\"times\": []}", "vantrel: \"deleteValue\" is no number\n"},
        {"{\"deleteValue\": -1, \"times\": [], \"items\": [{\"dataType\": 1, \"values\": [1e39]}]}",
         "vantrel: items[0]: a value lies beyond the range of a 32-bit float\n"},
        {head + "2020-01-01 00:00:00,nan\n", "vantrel: series line 6: \"nan\" is no finite number\n"},
    };
    for (const Case &c : cases) {
        WriteFile(File("series.csv"), c.series);
        const Result result = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""});
        EXPECT_EQ(result.status, 1) << c.series;
        EXPECT_EQ(result.err, c.message) << c.series;
        EXPECT_FALSE(std::filesystem::exists(File("book.xlsx"))) << c.series;
    }
    WriteFile(File("series.csv"), "{\"deleteValue\": ");
    const Result json = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec", ""});
    EXPECT_EQ(json.status, 1);
    EXPECT_EQ(json.err.rfind("vantrel: the series is no JSON: ", 0), 0u) << json.err;

    const Result missing = Vantrel({"export", File("absent.csv"), File("book.xlsx"), "--spec", ""});
    EXPECT_EQ(missing.status, 1);
    EXPECT_EQ(missing.err, "vantrel: cannot read the series file " + File("absent.csv") + "\n");

    // A workbook that can't be made is the bridge's failure, told on stderr.
    WriteFile(File("series.csv"), kSeries);
    const Result unwritable =
        Vantrel({"export", File("series.csv"), File("no/such/folder/book.xlsx"), "--spec", ""});
    EXPECT_EQ(unwritable.status, 1);
    EXPECT_EQ(unwritable.err, "Excel could not create file\n");
    // A file that is no workbook is not overwritten.
    WriteFile(File("text.xlsx"), "just text");
    const Result notBook = Vantrel({"export", File("series.csv"), File("text.xlsx"), "--spec", ""});
    EXPECT_EQ(notBook.status, 1);
    EXPECT_EQ(notBook.err, "Excel Workbook could not open file.\n");
    EXPECT_EQ(ReadFile(File("text.xlsx")), "just text");
}

TEST_F(ExportCommand, TemplateThatDoesNotLoadIsToldAndTheStringStands)
{
    WriteFile(File("bad.xml"), "<?xml version=\"1.0\"?><MSExcelVantrelSpecification ExcelSheet=\"1\"/>");
    WriteFile(File("series.csv"), kSeries);
    const Result result = Vantrel({"export", File("series.csv"), File("book.xlsx"), "--spec",
                                   "TemplateFilePath=" + File("bad.xml") + ";DateTimeCol=1;StartRow=5;"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.err, "vantrel: The xml File is not valid.\n");
    // The string as it stood: data from row 5, no header rows.
    const auto dump = Dump("-", File("book.xlsx"));
    const std::set<std::string> cells(dump.begin(), dump.end());
    EXPECT_TRUE(cells.count("cell Sheet1!B5 1.5 | General")) << ::testing::PrintToString(dump);
    EXPECT_EQ(dump.size(), 13u) << ::testing::PrintToString(dump);
}

}  // namespace
