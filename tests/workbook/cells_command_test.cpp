// SPDX-License-Identifier: MIT
// "vantrel cells" run as a user runs it: exact JSON for small fixtures, a few
// corpus workbooks as an independent reader saw them, and the exit statuses.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <set>
#include <string>

#include "support/files.h"
#include "support/program_run.h"

namespace {

using nlohmann::json;
using testing_host::ProgramRun;

const std::string kFixtures = VANTREL_SOURCE_DIR "/tests/data/workbook";

ProgramRun Cells(std::vector<std::string> arguments)
{
    arguments.insert(arguments.begin(), "cells");
    return testing_host::Vantrel(arguments);
}

TEST(CellsCommand, ExactJsonOfFixtures)
{
    const ProgramRun run = Cells({kFixtures + "/cell_kinds.xlsx"});
    EXPECT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(run.out,
              "{\"sheets\":1,\"sheet\":1,\"usedRange\":[1,1,2,6],\"cells\":["
              "[1,1,\"number\",1.5,\"1.5\"],[1,2,\"string\",\"abc\",\"abc\"],[1,3,\"string\",\"12.5\",\"12.5\"],"
              "[1,4,\"bool\",true,\"TRUE\"],[1,5,\"error\",\"#N/A\",\"#N/A\"],[1,6,\"string\",\"xyz\",\"xyz\"],"
              "[2,1,\"bool\",false,\"FALSE\"],[2,3,\"error\",\"#DIV/0!\",\"#DIV/0!\"]]}\n");

    // Chart sheets don't count; a used range from C3; shortest round-trip numbers.
    const ProgramRun second = Cells({kFixtures + "/several_sheets.xlsx", "--sheet", "2"});
    EXPECT_EQ(second.status, 0) << second.err;
    EXPECT_EQ(second.out,
              "{\"sheets\":3,\"sheet\":2,\"usedRange\":[3,3,7,5],\"cells\":["
              "[3,3,\"string\",\"top left\",\"top left\"],[5,4,\"number\",0.1,\"0.1\"],[7,5,\"number\",42,\"42\"]]}\n");
    // Dates: the serial as value, the date as text.
    const json third = json::parse(Cells({kFixtures + "/several_sheets.xlsx", "--sheet", "3"}).out);
    EXPECT_EQ(third["cells"][0], json::parse("[1,1,\"number\",45351.57326388889,\"2024-02-29\"]"));
    EXPECT_EQ(third["cells"][8], json::parse("[5,1,\"number\",45351.57326388889,\"1088437:45\"]"));
    EXPECT_EQ(third["cells"][10], json::parse("[7,1,\"number\",1,\"1900-01-01\"]"));
}

TEST(CellsCommand, FailuresAndUsage)
{
    testing_host::TempDir dir;
    const std::string text = dir.File("notes.xlsx");
    testing_host::WriteFile(text, "not a workbook");
    const std::string fifo = dir.File("pipe.csv");  // nobody writes to it: reading would wait for ever
    ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
    // The reason follows on its own line, starting with the file.
    const std::vector<std::pair<std::string, std::string>> refused{
        {dir.File("missing.xlsx"), "no such file"},
        {text, "the file is not a workbook package: Not a zip archive"},
        {dir.Path().string(), "it is a folder, not a file"},
        {fifo, "it is a FIFO, a socket or a device, not a file"}};
    for (const auto &[path, reason] : refused)
        for (const char *command : {"cells", "sheets"}) {
            const ProgramRun run = testing_host::Vantrel({command, path});
            EXPECT_EQ(run.status, 1) << path;
            EXPECT_EQ(run.out, "");
            EXPECT_EQ(run.err, "Excel Workbook could not open file.\n" + path + ": " + reason + "\n");
        }
    const ProgramRun beyond = Cells({kFixtures + "/several_sheets.xlsx", "--sheet", "4"});
    EXPECT_EQ(beyond.status, 1);
    EXPECT_EQ(beyond.err, "The sheet index is greater than the total number of sheets in the file.\n");
    const std::string book = kFixtures + "/cell_kinds.xlsx";
    const std::vector<std::vector<std::string>> bad = {
        {}, {"--sheet", "1"}, {book, "--sheet", "0"}, {book, "--sheet", "x"}, {book, "--sheet", "1x"},
        {book, "--sheet"}, {book, "--other"}, {book, book}};
    for (const auto &arguments : bad) {
        const ProgramRun run = Cells(arguments);
        EXPECT_EQ(run.status, 2) << arguments.size();
        EXPECT_EQ(run.out, "");
        EXPECT_NE(run.err.find("usage: vantrel cells BOOK [--sheet N]"), std::string::npos) << run.err;
    }
}

// Workbooks of every cell kind, 1904 dates, error cells and hidden and chart sheets.
TEST(CellsCommand, CorpusWorkbooksAsAnIndependentReaderSawThem)
{
    const std::set<std::string> chosen = {"testcelltypes.xlsx", "date_1904.xlsx", "errors.xlsx", "any_sheets.xlsx"};
    int sheetsSeen = 0;
    for (const auto &entry : std::filesystem::recursive_directory_iterator(VANTREL_SOURCE_DIR "/../shared/corpus")) {
        const std::string book = entry.path().string();
        if (!chosen.count(entry.path().filename().string())) continue;
        const json expected = json::parse(testing_host::ReadFile(book + ".expected.json"));
        std::vector<json> worksheets;
        for (const auto &s : expected["sheets"])
            if (s["kind"] == "worksheet") worksheets.push_back(s);
        for (size_t k = 0; k < worksheets.size(); ++k, ++sheetsSeen) {
            const std::string where = book + " sheet " + std::to_string(k + 1);
            const ProgramRun run = Cells({book, "--sheet", std::to_string(k + 1)});
            ASSERT_EQ(run.status, 0) << where << ": " << run.err;
            const json ours = json::parse(run.out);
            EXPECT_EQ(ours["sheets"], worksheets.size()) << where;
            // Ours, in row-major order, against theirs: dates are numbers with the serial as value.
            json theirs = json::array();
            for (const auto &cell : worksheets[k]["cells"])
                theirs.push_back({cell[0], cell[1], cell[2] == "date" ? "number" : cell[2], cell[2] == "date" ? cell[4] : cell[3]});
            json mine = json::array();
            for (const auto &cell : ours["cells"]) mine.push_back({cell[0], cell[1], cell[2], cell[3]});
            EXPECT_EQ(mine, theirs) << where;
            EXPECT_EQ(ours["usedRange"].is_null(), theirs.empty()) << where;
        }
    }
    EXPECT_GE(sheetsSeen, 8);
}

// "vantrel sheets" on every corpus workbook gives the sheets an independent
// reader lists: numbers for worksheets alone, and the range of their values.
TEST(SheetsCommand, EveryCorpusWorkbookAsAnIndependentReaderListsIt)
{
    for (const auto &entry : std::filesystem::recursive_directory_iterator(VANTREL_SOURCE_DIR "/../shared/corpus")) {
        const std::string path = entry.path().string(), suffix = ".expected.json";
        if (!path.ends_with(suffix)) continue;
        const std::string book = path.substr(0, path.size() - suffix.size());
        const json theirs = json::parse(testing_host::ReadFile(path));
        json expected = json::array();
        int worksheets = 0;
        for (const auto &s : theirs["sheets"]) {
            const json r = s.value("used_range", json());
            const auto cell = [&](int row, int column, std::string name = "") {
                for (int c = r[column].get<int>(); c > 0; c = (c - 1) / 26) name.insert(name.begin(), char('A' + (c - 1) % 26));
                return name + r[row].dump(); };
            expected.push_back({{"number", s["kind"] == "worksheet" ? json(++worksheets) : json()}, {"name", s["name"]},
                                {"kind", s["kind"]}, {"visibility", s["state"]},
                                {"usedRange", r.is_null() ? json() : json(cell(0, 1) + ":" + cell(2, 3))}});
        }
        EXPECT_EQ(json::parse(testing_host::Vantrel({"sheets", book, "--json"}).out), expected) << book;
        if (!book.ends_with("/any_sheets.xlsx")) continue;
        EXPECT_EQ(testing_host::Vantrel({"sheets", book}).out, "number  name        kind        visibility  used range\n1       Visible"
                  "     worksheet   visible     A1:B5\n2       Hidden      worksheet   hidden      empty\n3       VeryHidden  "
                  "worksheet   veryHidden  empty\n-       Chart       chartsheet  visible\n");
    }
}

// Written by a library that leaves computing to the program that opens the
// file: every formula without a result comes out computed, or the open fails
// naming the cell.
TEST(CellsCommand, FormulasWithoutResults)
{
    testing_host::TempDir dir;
    const std::string script =
        "import sys, openpyxl\n"
        "wb = openpyxl.Workbook(); ws = wb.active; ws.title = 'Data'\n"
        "wb.create_sheet('Other Sheet')['A1'] = 10\n"
        "for ref, v in [('A1', 2), ('B1', 3), ('A2', 2024), ('B2', 3), ('C2', '=A1*B1+1'),\n"
        "               ('A3', '=SUM(A1:B1)'), ('B3', \"='Other Sheet'!A1/4\"), ('C3', '=\"n=\"&A1'),\n"
        "               ('A4', '=DATE(A2,B2,1)'), ('B4', '=A4+1/24'), ('C4', '=HOUR(B4)>0')]:\n"
        "    ws[ref] = v\n"
        "ws['A4'].number_format = 'yyyy-mm-dd'\n"
        "wb.save(sys.argv[1])\n"
        "ws['D1'] = '=FOO(A1)'\n"
        "wb.save(sys.argv[2])\n";
    const ProgramRun made = testing_host::RunProgram("/usr/bin/python3", {"-c", script, dir.File("ok.xlsx"), dir.File("bad.xlsx")});
    ASSERT_EQ(made.status, 0) << made.err;
    const ProgramRun run = Cells({dir.File("ok.xlsx")});
    EXPECT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(run.out,
              "{\"sheets\":2,\"sheet\":1,\"usedRange\":[1,1,4,3],\"cells\":["
              "[1,1,\"number\",2,\"2\"],[1,2,\"number\",3,\"3\"],[2,1,\"number\",2024,\"2024\"],"
              "[2,2,\"number\",3,\"3\"],[2,3,\"number\",7,\"7\"],[3,1,\"number\",5,\"5\"],"
              "[3,2,\"number\",2.5,\"2.5\"],[3,3,\"string\",\"n=2\",\"n=2\"],"
              "[4,1,\"number\",45352,\"2024-03-01\"],[4,2,\"number\",45352.041666666664,\"45352.04167\"],"
              "[4,3,\"bool\",true,\"TRUE\"]]}\n");
    const ProgramRun bad = Cells({dir.File("bad.xlsx")});
    EXPECT_EQ(bad.status, 1);
    EXPECT_EQ(bad.err, "Excel Workbook could not open file.\n" + dir.File("bad.xlsx") +
                           ": Data!D1: the formula =FOO(A1) could not be computed: unknown function FOO\n");
}

// Delimited text: one sheet, each field typed as an entry typed into a cell;
// a text that can't be read names its line.
TEST(CellsCommand, DelimitedTextTypedAsEntries)
{
    testing_host::TempDir dir;
    const std::string head = "{\"sheets\":1,\"sheet\":1,\"usedRange\":";
    const struct {
        const char *name, *text, *json;
    } read[] = {
        // A byte-order mark, CRLF, quotes with the separator, a doubled quote and a break inside.
        {"comma.csv",
         "\xEF\xBB\xBFTime,Level,Note\r\n2024-03-01 06:00,1.5,\"a, b\"\r\n"
         "2024-03-01 07:00,-2e3,\"two\r\nlines \"\"quoted\"\"\"\r\n,TRUE,0012",
         "[1,1,4,3],\"cells\":[[1,1,\"string\",\"Time\",\"Time\"],[1,2,\"string\",\"Level\",\"Level\"],"
         "[1,3,\"string\",\"Note\",\"Note\"],[2,1,\"number\",45352.25,\"2024-03-01 06:00\"],[2,2,\"number\",1.5,\"1.5\"],"
         "[2,3,\"string\",\"a, b\",\"a, b\"],[3,1,\"number\",45352.291666666664,\"2024-03-01 07:00\"],"
         "[3,2,\"number\",-2000,\"-2.00E+03\"],[3,3,\"string\",\"two\\nlines \\\"quoted\\\"\",\"two\\nlines \\\"quoted\\\"\"],"
         "[4,2,\"bool\",true,\"TRUE\"],[4,3,\"number\",12,\"12\"]]}\n"},
        // Semicolons, since commas split the lines unevenly; "1,5" is no number to a typed entry.
        {"semicolon.csv", "Date;Level\n2024-03-01;1,5\n2024-03-02;2.5\n",
         "[1,1,3,2],\"cells\":[[1,1,\"string\",\"Date\",\"Date\"],[1,2,\"string\",\"Level\",\"Level\"],"
         "[2,1,\"number\",45352,\"2024-03-01\"],[2,2,\"string\",\"1,5\",\"1,5\"],[3,1,\"number\",45353,\"2024-03-02\"],"
         "[3,2,\"number\",2.5,\"2.5\"]]}\n"},
        {"levels [m].txt", "a\tb, c\t10%\r\r12:30\t\"x\"y\n",
         "[1,1,3,3],\"cells\":[[1,1,\"string\",\"a\",\"a\"],[1,2,\"string\",\"b, c\",\"b, c\"],[1,3,\"number\",0.1,\"10%\"],"
         "[3,1,\"number\",0.5208333333333334,\"12:30\"],[3,2,\"string\",\"xy\",\"xy\"]]}\n"},
        {"empty.csv", "", "null,\"cells\":[]}\n"},
    };
    for (const auto &c : read) {
        testing_host::WriteFile(dir.File(c.name), c.text);
        const ProgramRun run = Cells({dir.File(c.name)});
        EXPECT_EQ(run.status, 0) << c.name << run.err;
        EXPECT_EQ(run.out, head + c.json) << c.name;
    }
    const std::string kSaveAsUtf8 = ": save the file as UTF-8";
    const std::pair<std::string, std::string> refused[] = {
        {"a,b\n1,\"open\n2,3\n", "line 2 opens a quoted field that the file never closes: a \" is missing"},
        {std::string("\xFF\xFE" "a\0,\0", 6), "line 1 begins with the byte-order mark of UTF-16: the text is UTF-16, not UTF-8" + kSaveAsUtf8},
        {"a,b\nc,caf\xE9\n", "line 2 is not UTF-8 text (at byte 0xE9)" + kSaveAsUtf8},
        {std::string("a\0b\0", 4), "line 1 holds a zero byte, which UTF-8 text never does (UTF-16?)" + kSaveAsUtf8},
        {std::string(1048576, '\n') + "x", "line 1048577 holds record 1048577, beyond the last row of a sheet (1048576)"},
        {std::string(16384, ',') + "x", "line 1 has more than 16384 fields, more than a sheet has columns"},
        {"1\n\"" + std::string((1 << 20) + 1, 'a') + "\"", "line 2 starts a field longer than 1 MiB, more than a cell holds"},
        {testing_host::ReadFile(kFixtures + "/cell_kinds.xlsx"),
         "the file holds an Office Open XML workbook (.xlsx, .xlsm), not what its name says: give it the extension of what it holds"},
    };
    for (const auto &[text, reason] : refused) {
        testing_host::WriteFile(dir.File("bad.csv"), text);
        const ProgramRun run = Cells({dir.File("bad.csv")});
        EXPECT_EQ(run.status, 1) << reason;
        EXPECT_EQ(run.err, "Excel Workbook could not open file.\n" + dir.File("bad.csv") + ": " + reason + "\n");
    }
    // The import reads the typed dates as the times they are.
    testing_host::WriteFile(dir.File("gauge.csv"), "Time;Level\n2024-03-01 06:00;1.5\n2024-03-01 07:00:30;2\n");
    const ProgramRun import = testing_host::Vantrel(
        {"import", dir.File("gauge.csv"), "--spec", "DateTimeCol=1;StartRow=2;ItemDescriptionRow=1;"});
    EXPECT_EQ(import.status, 0) << import.err;
    EXPECT_EQ(import.out, "title,Level\nitem type,\nunit,\nvalue type,Instantaneous\ndelete value,-9999\n"
                          "2024-03-01 06:00:00,1.5\n2024-03-01 07:00:30,2\n");
}

}  // namespace
