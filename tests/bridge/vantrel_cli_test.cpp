// SPDX-License-Identifier: MIT
// The command-line host, run as a user runs it: the built vantrel on the
// sample workbook and on the inspection fixtures.
#include <gtest/gtest.h>

#include <sys/wait.h>

#include <array>
#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>

#include <nlohmann/json.hpp>

#include "support/temp_dir.h"

namespace {

struct ProgramRun {
    int status = -1;
    std::string out;
};

// Runs vantrel with the arguments (already quoted for the shell); stderr goes to errFile.
ProgramRun Vantrel(const std::string &arguments, const std::string &errFile = "/dev/null")
{
    const std::string command = std::string(VANTREL_PROGRAM) + " " + arguments + " 2>" + errFile;
    ProgramRun run;
    FILE *pipe = popen(command.c_str(), "r");
    if (!pipe) return run;
    std::array<char, 4096> buffer;
    size_t n;
    while ((n = fread(buffer.data(), 1, buffer.size(), pipe)) > 0) run.out.append(buffer.data(), n);
    const int status = pclose(pipe);
    run.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return run;
}

std::string ReadFile(const std::string &path)
{
    std::ifstream file(path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

const std::string kSample = std::string(VANTREL_SOURCE_DIR) + "/samples/hydrometric.xlsx";
const std::string kSampleSpec =
    "'DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ExcelSheet=1,2;'";

TEST(VantrelProgram, ImportPrintsTheSampleAsCsvAndJson)
{
    const ProgramRun csv = Vantrel("import " + kSample + " --spec " + kSampleSpec);
    EXPECT_EQ(csv.status, 0);
    EXPECT_EQ(csv.out, ReadFile(std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/hydrometric.csv"));

    testing_host::TempDir dir;
    std::ofstream(dir.File("spec.txt")) << "DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;"
                                           "ValueTypeRow=4;ExcelSheet=2;\n";
    const ProgramRun json = Vantrel("import " + kSample + " --spec @" + dir.File("spec.txt") + " --json --output " +
                             dir.File("out.json"));
    EXPECT_EQ(json.status, 0);
    EXPECT_EQ(json.out, "");
    const auto document = nlohmann::json::parse(ReadFile(dir.File("out.json")));
    EXPECT_EQ(document["deleteValue"], -9999.0);
    ASSERT_EQ(document["times"].size(), 48u);
    EXPECT_EQ(document["times"][1], "2024-03-01 01:00:00");
    ASSERT_EQ(document["items"].size(), 2u);
    const auto &rain = document["items"][0];
    EXPECT_EQ(rain["title"], "Ardmore rain");
    EXPECT_EQ(rain["itemType"], "Rainfall");
    EXPECT_EQ(rain["unit"], "millimeter");
    EXPECT_EQ(rain["valueType"], "Step_Accumulated");
    EXPECT_EQ(rain["dataType"], 1);
    EXPECT_EQ(rain["values"][1], 0.445);
}

TEST(VantrelProgram, DeleteValuesAndMilliseconds)
{
    testing_host::TempDir dir;
    const std::string book = std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/import.xlsx";
    // Delete values are empty fields (CSV) and nulls (JSON).
    const ProgramRun csv = Vantrel("import " + book +
                            " --spec 'DateTimeCol=1;StartRow=6;ItemDescriptionRow=1;DelValRow=5;ExcelSheet=3;'");
    EXPECT_EQ(csv.status, 0);
    EXPECT_EQ(csv.out,
              "title,Level\nitem type,\nunit,\nvalue type,Instantaneous\ndelete value,-999\n"
              "2024-03-01 00:00:00,\n2024-03-01 01:00:00,2\n2024-03-01 02:00:00,\n");
    const ProgramRun json = Vantrel("import " + book +
                             " --json --spec 'DateTimeCol=1;StartRow=6;ItemDescriptionRow=1;DelValRow=5;ExcelSheet=3;'");
    const auto document = nlohmann::json::parse(json.out);
    EXPECT_TRUE(document["items"][0]["values"][0].is_null());
    EXPECT_EQ(document["items"][0]["values"][1], 2.0);

    // A tenth of a second shows as milliseconds.
    const std::string fixture = std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/inspection.xlsx";
    const ProgramRun tenth = Vantrel("import " + fixture + " --spec 'DateTimeCol=1;StartRow=5;ItemDescriptionRow=2;ExcelSheet=9;'");
    EXPECT_EQ(tenth.status, 0);
    EXPECT_NE(tenth.out.find("\n2024-03-01 00:00:00.100,1.5,10\n"), std::string::npos) << tenth.out;
}

TEST(VantrelProgram, InspectTellsWhyAndFailuresExitNonZero)
{
    const ProgramRun fits = Vantrel("inspect " + kSample + " --spec " + kSampleSpec);
    EXPECT_EQ(fits.status, 0);
    EXPECT_EQ(fits.out, "fits\n");

    // Silent by default, and still the reason of the failed check.
    const std::string fixture = std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/inspection.xlsx";
    const ProgramRun unknown = Vantrel("inspect " + fixture +
                                " --spec 'DateTimeCol=1;StartRow=5;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;ExcelSheet=4;'");
    EXPECT_EQ(unknown.status, 1);
    EXPECT_EQ(unknown.out, "The unit type or unit is not valid.\n");

    // A failed import: the bridge's reason on stderr, exit 1.
    testing_host::TempDir dir;
    const ProgramRun equal = Vantrel("import " + std::string(VANTREL_SOURCE_DIR) +
                                  "/tests/data/bridge/import.xlsx --spec 'DateTimeCol=1;StartRow=5;ExcelSheet=5;'",
                              dir.File("err.txt"));
    EXPECT_EQ(equal.status, 1);
    EXPECT_EQ(equal.out, "");
    EXPECT_EQ(ReadFile(dir.File("err.txt")), "The date and time is not in ascending order - error at time step 2.\n");

    EXPECT_EQ(Vantrel("import " + kSample).status, 2);
    EXPECT_EQ(Vantrel("export-nothing " + kSample + " --spec x").status, 2);
    EXPECT_EQ(Vantrel("import " + kSample + " --spec @/nonexistent/spec.txt").status, 1);
}

}  // namespace
