// SPDX-License-Identifier: MIT
// The command-line host, run as a user runs it: vantrel import and inspect on
// the sample workbook, the fixtures and workbooks made to hurt a reader.
#include <gtest/gtest.h>

#include <map>
#include <string>

#include <nlohmann/json.hpp>

#include "hostile_packages.h"
#include "support/files.h"
#include "support/program_run.h"
#include "support/temp_dir.h"

namespace {

using testing_host::ReadFile;
using testing_host::Vantrel;

const std::string kSample = std::string(VANTREL_SOURCE_DIR) + "/samples/hydrometric.xlsx";
const std::string kData = std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/";
const std::string kSampleSpec = "DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;";

TEST(VantrelProgram, ImportPrintsTheSampleAsCsvAndJson)
{
    const auto csv = Vantrel({"import", kSample, "--spec", kSampleSpec + "ExcelSheet=1,2;"});
    EXPECT_EQ(csv.status, 0) << csv.err;
    EXPECT_EQ(csv.out, ReadFile(kData + "hydrometric.csv"));

    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("spec.txt"), kSampleSpec + "ExcelSheet=2;\n");
    const auto json = Vantrel({"import", kSample, "--spec", "@" + dir.File("spec.txt"), "--json", "--output", dir.File("out.json")});
    EXPECT_EQ(json.status, 0) << json.err;
    EXPECT_EQ(json.out, "");
    const auto document = nlohmann::json::parse(ReadFile(dir.File("out.json")));
    EXPECT_EQ(document["deleteValue"], -9999.0);
    ASSERT_EQ(document["times"].size(), 48u);
    EXPECT_EQ(document["times"][1], "2024-03-01 01:00:00");
    ASSERT_EQ(document["items"].size(), 2u);
    const auto &rain = document["items"][0];
    for (const auto &[key, value] : std::map<std::string, nlohmann::json>{
             {"title", "Ardmore rain"}, {"itemType", "Rainfall"}, {"unit", "millimeter"}, {"valueType", "Step_Accumulated"}, {"dataType", 1}})
        EXPECT_EQ(rain[key], value) << key;
    EXPECT_EQ(rain["values"][1], 0.445);
}

TEST(VantrelProgram, DeleteValuesAreNullsInJsonAndMillisecondsShow)
{
    const auto json = Vantrel({"import", kData + "import.xlsx", "--json", "--spec",
                               "DateTimeCol=1;StartRow=6;ItemDescriptionRow=1;DelValRow=5;ExcelSheet=3;"});
    EXPECT_EQ(nlohmann::json::parse(json.out)["items"][0]["values"], nlohmann::json::parse("[null, 2.0, null]"));
    const auto tenth = Vantrel({"import", kData + "inspection.xlsx", "--spec", "DateTimeCol=1;StartRow=5;ItemDescriptionRow=2;ExcelSheet=9;"});
    EXPECT_EQ(tenth.status, 0) << tenth.err;
    EXPECT_NE(tenth.out.find("\n2024-03-01 00:00:00.100,1.5,10\n"), std::string::npos) << tenth.out;
}

TEST(VantrelProgram, InspectTellsWhyAndFailuresExitNonZero)
{
    const auto fits = Vantrel({"inspect", kSample, "--spec", kSampleSpec + "ExcelSheet=1,2;"});
    EXPECT_EQ(fits.status, 0);
    EXPECT_EQ(fits.out, "fits\n");
    // Silent by default, and still the reason of the failed check.
    const auto unknown = Vantrel({"inspect", kData + "inspection.xlsx", "--spec", kSampleSpec + "ExcelSheet=4;"});
    EXPECT_EQ(unknown.status, 1);
    EXPECT_EQ(unknown.out, "The unit type or unit is not valid.\n");
    // A failed import: the bridge's reason on stderr, exit 1.
    const auto equal = Vantrel({"import", kData + "import.xlsx", "--spec", "DateTimeCol=1;StartRow=5;ExcelSheet=5;"});
    EXPECT_EQ(equal.status, 1);
    EXPECT_EQ(equal.out, "");
    EXPECT_EQ(equal.err, "The date and time is not in ascending order - error at time step 2.\n");

    EXPECT_EQ(Vantrel({"import", kSample}).status, 2);
    EXPECT_EQ(Vantrel({"export-nothing", kSample, "--spec", "x"}).status, 2);
    EXPECT_EQ(Vantrel({"import", kSample, "--spec", "@/nonexistent/spec.txt"}).status, 1);
}

// Workbooks that fail in the zip, in the XML and in the package's links:
// import refuses each with the bridge's message, never a crash or a hang, and
// inspect leaves the verdict to the read.
TEST(VantrelProgram, HostileWorkbooksAreRefusedWithTheBridgesMessage)
{
    testing_host::TempDir dir;
    const engine_test::Parts sound = engine_test::MinimalPackage(hostile::kOkSheet);
    engine_test::WriteZip(dir.File("sound.xlsx"), sound);
    const std::string soundBytes = ReadFile(dir.File("sound.xlsx"));
    const std::string entities = hostile::EntityBomb(
        "worksheet", std::string("<worksheet xmlns=\"") + engine_test::kMainNs +
                         "\"><sheetData><row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>&l9;</t></is></c></row></sheetData></worksheet>");

    testing_host::WriteFile(dir.File("cut.xlsx"), soundBytes.substr(0, soundBytes.size() * 2 / 3));
    engine_test::WriteZip(dir.File("entities.xlsx"), hostile::Replace(sound, "xl/worksheets/sheet1.xml", entities));
    engine_test::WriteZip(dir.File("climb.xlsx"), hostile::Edit(sound, "xl/_rels/workbook.xml.rels", "worksheets/sheet1.xml", "../../../etc/passwd"));
    const std::string spec = "DateTimeCol=1;StartRow=2;ItemDescriptionRow=1;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;";
    // The bridge's message, then the engine's reason on a line of its own.
    const std::vector<std::pair<std::string, std::string>> cases{
        {"cut.xlsx", "the file is not a workbook package: Not a zip archive"},
        {"entities.xlsx",
         "sheet part 'xl/worksheets/sheet1.xml' is not well-formed XML: a document type declaration is not allowed (line 1)"},
        {"climb.xlsx", "relationship target '../../../etc/passwd' points outside the package"}};
    for (const auto &[name, reason] : cases) {
        SCOPED_TRACE(name);
        const auto import = Vantrel({"import", dir.File(name), "--spec", spec});
        EXPECT_EQ(import.status, 1);
        EXPECT_EQ(import.err, "Excel Workbook could not open file.\n" + dir.File(name) + ": " + reason + "\n");
        EXPECT_EQ(import.out, "");
        const auto inspect = Vantrel({"inspect", dir.File(name), "--spec", spec});
        EXPECT_EQ(inspect.status, 0);
        EXPECT_EQ(inspect.out, "fits\n");
    }
}

}  // namespace
