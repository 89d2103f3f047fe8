// SPDX-License-Identifier: MIT
// "vantrel cells" run as a user runs it: exact JSON for a small fixture, the
// values an independent reader found in every worksheet of the corpus, and
// the exit statuses of a file that doesn't open and of bad usage.
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <set>
#include <string>
#include <sys/wait.h>

#include "support/temp_dir.h"

namespace {

using nlohmann::json;

const std::string kFixtures = VANTREL_SOURCE_DIR "/tests/data/workbook";
const std::string kCorpus = VANTREL_SOURCE_DIR "/../shared/corpus";

struct ProgramRun {
    int status = -1;
    std::string out;
    std::string err;
};

std::string Quote(const std::string &text)
{
    std::string quoted = "'";
    for (char c : text) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return quoted + "'";
}

ProgramRun Cells(const std::vector<std::string> &arguments)
{
    testing_host::TempDir dir;
    std::string command = Quote(VANTREL_PROGRAM) + " cells";
    for (const auto &a : arguments) command += " " + Quote(a);
    command += " 2>" + Quote(dir.File("err"));
    ProgramRun run;
    FILE *pipe = popen(command.c_str(), "r");
    if (!pipe) return run;
    char buffer[65536];
    size_t n;
    while ((n = fread(buffer, 1, sizeof buffer, pipe)) > 0) run.out.append(buffer, n);
    const int raw = pclose(pipe);
    run.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
    std::ifstream err(dir.File("err"));
    run.err.assign(std::istreambuf_iterator<char>(err), std::istreambuf_iterator<char>());
    return run;
}

TEST(CellsCommand, ExactJsonOfAFixture)
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
    const ProgramRun beta = Cells({kFixtures + "/several_sheets.xlsx", "--sheet", "2"});
    EXPECT_EQ(beta.status, 0) << beta.err;
    EXPECT_EQ(beta.out,
              "{\"sheets\":3,\"sheet\":2,\"usedRange\":[3,3,7,5],\"cells\":["
              "[3,3,\"string\",\"top left\",\"top left\"],[5,4,\"number\",0.1,\"0.1\"],[7,5,\"number\",42,\"42\"]]}\n");
    // Dates: the serial as value, the date as text.
    const ProgramRun third = Cells({kFixtures + "/several_sheets.xlsx", "--sheet", "3"});
    const json g = json::parse(third.out);
    EXPECT_EQ(g["cells"][0], json::parse("[1,1,\"number\",45351.57326388889,\"2024-02-29\"]"));
    EXPECT_EQ(g["cells"][8], json::parse("[5,1,\"number\",45351.57326388889,\"1088437:45\"]"));
    EXPECT_EQ(g["cells"][10], json::parse("[7,1,\"number\",1,\"1900-01-01\"]"));
}

TEST(CellsCommand, FailuresAndUsage)
{
    testing_host::TempDir dir;
    const std::string text = dir.File("notes.xlsx");
    std::ofstream(text) << "not a workbook";
    for (const std::string &path : {dir.File("missing.xlsx"), text, dir.Path().string()}) {
        const ProgramRun run = Cells({path});
        EXPECT_EQ(run.status, 1) << path;
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.err, "Excel Workbook could not open file.\n");
    }
    const ProgramRun beyond = Cells({kFixtures + "/several_sheets.xlsx", "--sheet", "4"});
    EXPECT_EQ(beyond.status, 1);
    EXPECT_EQ(beyond.err, "The sheet index is greater than the total number of sheets in the file.\n");
    const std::vector<std::vector<std::string>> bad = {
        {}, {"--sheet", "1"}, {kFixtures + "/cell_kinds.xlsx", "--sheet", "0"},
        {kFixtures + "/cell_kinds.xlsx", "--sheet", "x"}, {kFixtures + "/cell_kinds.xlsx", "--sheet", "1x"},
        {kFixtures + "/cell_kinds.xlsx", "--sheet"}, {kFixtures + "/cell_kinds.xlsx", "--other"},
        {kFixtures + "/cell_kinds.xlsx", kFixtures + "/cell_kinds.xlsx"}};
    for (const auto &arguments : bad) {
        const ProgramRun run = Cells(arguments);
        EXPECT_EQ(run.status, 2) << arguments.size();
        EXPECT_EQ(run.out, "");
        EXPECT_NE(run.err.find("usage: vantrel cells BOOK [--sheet N]"), std::string::npos);
    }
}

// The spreadsheet's value of an expected cell: dates as their serial.
json ExpectedValue(const json &cell)
{
    const std::string kind = cell[2];
    if (kind == "date") return cell[4];
    if (kind == "string" && cell.size() > 4) return cell[4];
    return cell[3];
}

TEST(CellsCommand, CorpusWorksheetsAsAnIndependentReaderSawThem)
{
    int sheetsSeen = 0;
    for (const auto &entry : std::filesystem::recursive_directory_iterator(kCorpus)) {
        const std::string name = entry.path().string();
        if (!name.ends_with(".expected.json")) continue;
        const std::string book = name.substr(0, name.size() - std::string(".expected.json").size());
        std::ifstream in(name);
        const json expected = json::parse(in);
        std::vector<json> worksheets;
        for (const auto &s : expected["sheets"])
            if (s["kind"] == "worksheet") worksheets.push_back(s);
        for (size_t k = 0; k < worksheets.size(); ++k) {
            const json &sheet = worksheets[k];
            const std::string where = book + " sheet " + std::to_string(k + 1);
            const ProgramRun run = Cells({book, "--sheet", std::to_string(k + 1)});
            ASSERT_EQ(run.status, 0) << where << ": " << run.err;
            const json ours = json::parse(run.out);
            EXPECT_EQ(ours["sheets"], worksheets.size()) << where;
            EXPECT_EQ(ours["sheet"], k + 1) << where;
            ++sheetsSeen;

            std::set<std::pair<int, int>> maybeEmpty;
            if (sheet.contains("raw_cells_openpyxl_reports_empty"))
                for (const auto &rc : sheet["raw_cells_openpyxl_reports_empty"]) maybeEmpty.insert({rc[0], rc[1]});
            std::map<std::pair<int, int>, json> got;
            std::pair<int, int> previous{0, 0};
            for (const auto &cell : ours["cells"]) {
                const std::pair<int, int> at{cell[0], cell[1]};
                EXPECT_LT(previous, at) << where << ": cells out of row-major order";
                previous = at;
                got[at] = cell;
            }
            for (const auto &cell : sheet["cells"]) {
                const std::pair<int, int> at{cell[0], cell[1]};
                auto it = got.find(at);
                if (it == got.end()) {
                    EXPECT_TRUE(maybeEmpty.count(at)) << where << " row " << at.first << " column " << at.second
                                                       << ": missing";
                    continue;
                }
                const std::string kind = cell[2] == "date" ? "number" : cell[2].get<std::string>();
                EXPECT_EQ(it->second[2], kind) << where << " row " << at.first << " column " << at.second;
                EXPECT_EQ(it->second[3], ExpectedValue(cell)) << where << " row " << at.first << " column " << at.second;
                EXPECT_TRUE(it->second[4].is_string());
                got.erase(it);
            }
            for (const auto &[at, cell] : got)
                EXPECT_TRUE(maybeEmpty.count(at) && cell[3] == "")
                    << where << " row " << at.first << " column " << at.second << ": unexpected " << cell.dump();
            if (ours["cells"].empty()) {
                EXPECT_TRUE(ours["usedRange"].is_null()) << where;
            } else {
                ASSERT_EQ(ours["usedRange"].size(), 4u) << where;
            }
        }
    }
    EXPECT_GE(sheetsSeen, 40);
}

}  // namespace
