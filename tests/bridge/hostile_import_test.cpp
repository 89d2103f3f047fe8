// SPDX-License-Identifier: MIT
// Hostile workbooks end to end: vantrel import refuses each with the bridge's
// message and exit status 1, never a crash or a hang; a workbook whose
// dimension lies is read for the cells it really holds.
#include <gtest/gtest.h>

#include <sys/wait.h>

#include <array>
#include <chrono>
#include <cstdio>
#include <fstream>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

#include "hostile_packages.h"

namespace {

struct ProgramRun {
    int status = -1;  // -1: did not exit normally
    std::string out, err;
};

ProgramRun Vantrel(const std::string &arguments, const testing_host::TempDir &dir)
{
    const std::string errFile = dir.File("stderr.txt");
    const std::string command = std::string(VANTREL_PROGRAM) + " " + arguments + " 2>" + errFile;
    ProgramRun run;
    FILE *pipe = popen(command.c_str(), "r");
    if (!pipe) return run;
    std::array<char, 4096> buffer;
    size_t n;
    while ((n = fread(buffer.data(), 1, buffer.size(), pipe)) > 0) run.out.append(buffer.data(), n);
    const int status = pclose(pipe);
    run.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    run.err = engine_test::ReadBytes(errFile);
    return run;
}

const std::string kSpec = "'DateTimeCol=1;StartRow=2;ItemDescriptionRow=1;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;'";
const std::string kCannotOpen = "Excel Workbook could not open file.\n";

TEST(HostileImport, EachHostileWorkbookGivesMessage121)
{
    testing_host::TempDir dir;
    const std::string ns = std::string(" xmlns=\"") + engine_test::kMainNs + "\"";
    auto write = [&](const std::string &name, const std::string &bytes) {
        engine_test::WriteBytes(dir.File(name), bytes);
        return dir.File(name);
    };
    auto writeParts = [&](const std::string &name, const engine_test::Parts &parts) {
        engine_test::WriteZip(dir.File(name), parts);
        return dir.File(name);
    };
    const std::string sound = writeParts("sound.xlsx", engine_test::MinimalPackage(hostile::kOkSheet));
    const std::string soundBytes = engine_test::ReadBytes(sound);
    const engine_test::Parts withStrings = engine_test::MinimalPackage(
        "<sheetData><row r=\"1\"><c r=\"A1\" t=\"s\"><v>0</v></c></row></sheetData>", "<sst" + ns + "><si><t>x</t></si></sst>");
    std::string climbing;
    for (const auto &p : engine_test::MinimalPackage(hostile::kOkSheet))
        if (p.first == "xl/_rels/workbook.xml.rels") climbing = p.second;
    climbing.replace(climbing.find("worksheets/sheet1.xml"), 21, "../../../etc/passwd");

    const std::vector<std::pair<std::string, std::string>> books = {
        {"truncated zip", write("cut.xlsx", soundBytes.substr(0, soundBytes.size() * 2 / 3))},
        {"entry claiming 4 GiB", write("claims.xlsx", hostile::LyingSizes("xl/worksheets/sheet1.xml", 0, 0xFFFFFFF0u))},
        {"sheet inflating to 1.25 GiB", write("bomb.xlsx", hostile::GigabyteSheet(uint64_t{5} << 28))},
        {"entity expansion",
         writeParts("entities.xlsx",
                    hostile::Replace(engine_test::MinimalPackage(hostile::kOkSheet), "xl/worksheets/sheet1.xml",
                                     hostile::EntityBomb("worksheet", "<worksheet" + ns +
                                                                          "><sheetData><row r=\"1\"><c r=\"A1\" "
                                                                          "t=\"inlineStr\"><is><t>&l9;</t></is></c>"
                                                                          "</row></sheetData></worksheet>")))},
        {"cell beyond the last row",
         writeParts("row.xlsx", engine_test::MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1048577\"><v>1</v></c></row></sheetData>"))},
        {"cell beyond the last column",
         writeParts("col.xlsx", engine_test::MinimalPackage("<sheetData><row r=\"1\"><c r=\"XFE1\"><v>1</v></c></row></sheetData>"))},
        {"dimension beyond the grid",
         writeParts("dim.xlsx", engine_test::MinimalPackage("<dimension ref=\"A1:XFD99999999\"/>" + hostile::kOkSheet))},
        {"missing shared strings part", writeParts("nosst.xlsx", hostile::Without(withStrings, "xl/sharedStrings.xml"))},
        {"relationship out of the package",
         writeParts("climb.xlsx", hostile::Replace(engine_test::MinimalPackage(hostile::kOkSheet), "xl/_rels/workbook.xml.rels", climbing))},
    };
    for (const auto &[what, path] : books) {
        SCOPED_TRACE(what);
        const auto start = std::chrono::steady_clock::now();
        const ProgramRun import = Vantrel("import " + path + " --spec " + kSpec, dir);
        EXPECT_EQ(import.status, 1);
        EXPECT_EQ(import.err, kCannotOpen);
        EXPECT_EQ(import.out, "");
        // A workbook that doesn't open is no verdict on the layout: inspect
        // passes it on to the read, which reports it.
        const ProgramRun inspect = Vantrel("inspect " + path + " --spec " + kSpec, dir);
        EXPECT_EQ(inspect.status, 0);
        EXPECT_EQ(inspect.out, "fits\n");
        EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(120));
    }
}

TEST(HostileImport, ADimensionThatLiesIsIgnored)
{
    testing_host::TempDir dir;
    // The dimension claims one cell; the sheet holds a title row and three steps.
    const std::string body =
        "<dimension ref=\"A1\"/><sheetData>"
        "<row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>Time</t></is></c><c r=\"B1\" t=\"inlineStr\"><is><t>Gauge</t></is></c></row>"
        "<row r=\"2\"><c r=\"A2\"><v>43832</v></c><c r=\"B2\"><v>1.5</v></c></row>"
        "<row r=\"3\"><c r=\"A3\"><v>43833</v></c><c r=\"B3\"><v>2.5</v></c></row>"
        "<row r=\"4\"><c r=\"A4\"><v>43834</v></c><c r=\"B4\"><v>3.5</v></c></row></sheetData>";
    const std::string path = dir.File("lying.xlsx");
    engine_test::WriteZip(path, engine_test::MinimalPackage(body));
    const ProgramRun run = Vantrel("import " + path + " --spec " + kSpec + " --json", dir);
    ASSERT_EQ(run.status, 0) << run.err;
    const nlohmann::json series = nlohmann::json::parse(run.out);
    EXPECT_EQ(series["times"], nlohmann::json({"2020-01-02 00:00:00", "2020-01-03 00:00:00", "2020-01-04 00:00:00"}));
    ASSERT_EQ(series["items"].size(), 1u);
    EXPECT_EQ(series["items"][0]["title"], "Gauge");
    EXPECT_EQ(series["items"][0]["values"], nlohmann::json({1.5, 2.5, 3.5}));
}

}  // namespace
