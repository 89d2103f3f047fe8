// SPDX-License-Identifier: MIT
// The command-line host, run as a user runs it: vantrel import and inspect on
// the sample workbook, the fixtures and workbooks made to hurt a reader.
#include <gtest/gtest.h>

#include <filesystem>
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
    EXPECT_EQ(Vantrel({"import", kSample, "--spec", "@/nonexistent/spec.txt"}).status, 1);
}

// Workbooks that fail in the zip, in the XML and in the package's links:
// import refuses each with the bridge's message, never a crash or a hang, and
// inspect says that it could not open them.
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
        EXPECT_EQ(inspect.status, 1);
        EXPECT_EQ(inspect.out.rfind("could not open: Excel Workbook could not open file.\n", 0), 0u)
            << inspect.out;
    }
}

const std::string kHeaderRows = "DateTimeCol=1;StartRow=4;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;";

std::string WarningsBook(const testing_host::TempDir &dir)
{
    const std::string book = dir.File("warnings.xlsx");
    const auto made = testing_host::RunProgram("/usr/bin/python3", {kData + "make_warnings.py", book});
    EXPECT_EQ(made.status, 0) << made.err;
    return book;
}

// What a read passes over or reads other than the sheet shows: a warning line
// that names the place and what to do, exit 0, and exit 1 with --strict.
TEST(VantrelProgram, WarningsNameThePlaceAndStrictRefusesThem)
{
    testing_host::TempDir dir;
    const std::string book = WarningsBook(dir);
    const std::pair<std::string, std::string> cases[] = {
        {"ExcelSheet=2;", "sheet 2, row 6: the date/time cell is blank, so the rows from here on are not read (row 6 holds "
                          "data); fill the cell or delete the row"},
        {"ExcelSheet=3;", "sheet 3, column D: holds data but is not read, as the read ends at column B before the empty "
                          "column C; delete the empty column or move the data beside the others"},
        {"ExcelSheet=5;", "sheet 5, row 5, column B: 1e+39 is beyond the 32-bit float range and reads as infinity (2 "
                          "values of the sheet); scale the values or mark them missing"},
        {"ExcelSheet=6,7;DelValRow=3;", "sheet 7, row 3: the delete value -999 differs from -9999 of sheet 6; the last "
                                        "sheet's value marks missing values of all sheets; make the cells equal"},
        {" ExcelSheet=1;", "specification string, \" ExcelSheet=1\": a blank around the key ExcelSheet, so it is "
                           "ignored; remove the blank"},
        {"startrow=4;", "specification string, \"startrow=4\": keys match in case only, so it is ignored; write StartRow"},
        {"Sheets=1;", "specification string, \"Sheets=1\": unknown key, ignored; check its spelling"},
        {"DateTimeFormat=yyyy-mm-dd hh:mm:ss;", "DateTimeFormat \"yyyy-mm-dd hh:mm:ss\": \"mm\" beside \"yyyy\" "
                                                "reads minutes, not the month; write \"MM\" for the month"},
        {"DeleteValue=n/a;", "specification string, DeleteValue \"n/a\": not a number, so 0 marks missing values; "
                             "write a number such as -9999"},
    };
    for (const auto &[extra, warning] : cases) {
        SCOPED_TRACE(extra);
        const auto lenient = Vantrel({"import", book, "--spec", extra + kHeaderRows});
        EXPECT_EQ(lenient.status, 0);
        EXPECT_EQ(lenient.err, "warning: " + warning + "\n");
        EXPECT_NE(lenient.out, "");
        const auto strict = Vantrel({"import", book, "--strict", "--spec", extra + kHeaderRows});
        EXPECT_EQ(strict.status, 1);
        EXPECT_EQ(strict.err, "warning: " + warning + "\nvantrel: --strict: 1 warning, nothing written\n");
        EXPECT_EQ(strict.out, "");
        EXPECT_EQ(Vantrel({"inspect", book, "--strict", "--spec", extra + kHeaderRows}).status, extra == "ExcelSheet=5;" ? 0 : 1);
    }
    const auto loose = Vantrel({"inspect", book, "--spec", "TemplateFilePath=/nonexistent/open;"});
    EXPECT_EQ(loose.status, 1);
    EXPECT_EQ(loose.err, "warning: template \"/nonexistent/open\" did not load (Can not Open the xml file.); its "
                         "settings are not used; fix the template or name another\n");
}

// import refuses what inspect refuses, unless told --no-inspect; a failure
// about a time step names the sheet and its row.
TEST(VantrelProgram, ImportInspectsFirstAndTimeStepFailuresNameTheirPlace)
{
    testing_host::TempDir dir;
    const std::string book = WarningsBook(dir);
    const std::string apart = "sheet 8, row 4: The sheets don't share the same date/time.\n";
    EXPECT_EQ(Vantrel({"inspect", book, "--spec", kHeaderRows + "ExcelSheet=1,8;"}).out, apart);
    const auto refused = Vantrel({"import", book, "--spec", kHeaderRows + "ExcelSheet=1,8;"});
    EXPECT_EQ(refused.status, 1);
    EXPECT_EQ(refused.err, apart);
    EXPECT_EQ(refused.out, "");
    EXPECT_EQ(Vantrel({"import", book, "--no-inspect", "--spec", kHeaderRows + "ExcelSheet=1,8;"}).status, 0);

    const auto unordered = Vantrel({"import", book, "--no-inspect", "--spec", kHeaderRows + "ExcelSheet=9;"});
    EXPECT_EQ(unordered.status, 1);
    EXPECT_EQ(unordered.err, "sheet 9, row 6: The date and time is not in ascending order - error at time step 2.\n");

    const std::string unit = "warning: sheet 4, row 3, column B: the unit \"m3/s\" is not known for the column's item "
                             "type; the items of the sheet are read without unit; write a name from the catalogue\n";
    const auto unknown = Vantrel({"import", book, "--spec", kHeaderRows + "ExcelSheet=4;"});
    EXPECT_EQ(unknown.status, 1);
    EXPECT_EQ(unknown.err, unit + "The unit type or unit is not valid.\n");
    const auto unchecked = Vantrel({"import", book, "--no-inspect", "--spec", kHeaderRows + "ExcelSheet=4;"});
    EXPECT_EQ(unchecked.status, 0);
    EXPECT_EQ(unchecked.err, unit);
}

// The habits of command lines: help and version on stdout, an option joined to
// its value, "-" for the standard streams, usage errors that say what was wrong.
TEST(VantrelProgram, CommandLineHabits)
{
    const std::string spec = kSampleSpec + "ExcelSheet=1,2;";
    const std::string help = Vantrel({"--help"}).out;
    EXPECT_NE(help.find("--progid NAME"), std::string::npos);
    for (const std::string command : {"inspect", "import", "export", "sheets", "cells", "open-dialog", "save-dialog", "register", "unregister"})
        EXPECT_TRUE(Vantrel({command, "-h"}).out.starts_with("usage: vantrel " + command + " ") &&
                    help.find("vantrel " + command + " ") != std::string::npos) << command;
    EXPECT_EQ(Vantrel({"--version"}).out, "vantrel " VANTREL_VERSION "\n");
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("spec.txt"), spec);
    const auto joined = Vantrel({"import", kSample, "--spec=" + spec, "--output", "-"});
    EXPECT_EQ(std::pair(joined.out, std::filesystem::exists("-")), std::pair(ReadFile(kData + "hydrometric.csv"), false));
    EXPECT_EQ(Vantrel({"import", kSample, "--spec", "@-"}, {dir.File("spec.txt"), {}}).out, joined.out);
    const std::pair<std::vector<std::string>, std::string> wrong[] = {
        {{"imports", kSample}, "vantrel: unknown command \"imports\"\nusage: vantrel inspect BOOK"},
        {{"import", kSample, "--spec", spec, "--jsn"}, "vantrel: The following argument was not expected: --jsn\nusage: vantrel import BOOK"},
        {{"cells", kSample, std::string(100000, 'A')},
         "vantrel: The following argument was not expected: \"" + std::string(40, 'A') + "...\" (100000 bytes)\nusage: vantrel cells"},
        {{"imp\x01orts"}, "vantrel: unknown command \"imp\\x01orts\"\nusage: vantrel inspect BOOK"},
        {{"export", "s.csv", "b.xlsx"}, "vantrel: --spec is required\nusage: vantrel export SERIES BOOK"},
        {{"export", "s.csv", "--spec", ""}, "vantrel: BOOK is required\nusage: vantrel export SERIES BOOK"},
        {{"import", "-", "--spec", spec}, "vantrel: a workbook is read from its file, not from standard input\nusage: vantrel import"},
        {{"export", "-", "b.xlsx", "--spec", "@-"}, "vantrel: standard input can't be both the series and the specification string\nusage: vantrel export"},
    };
    for (const auto &[arguments, says] : wrong) {
        const auto run = Vantrel(arguments);
        EXPECT_EQ(std::tuple(run.status, run.out, run.err.substr(0, says.size())), std::tuple(2, "", says));
    }
}

// The JSON loads into a pandas frame in the one call the README gives, and
// holds what the CSV holds: its titles and time steps, nulls as blanks.
TEST(VantrelProgram, JsonLoadsIntoPandasInOneCall)
{
    testing_host::TempDir dir;
    const std::string book = kData + "import.xlsx", spec = "DateTimeCol=1;StartRow=6;DelValRow=5;ExcelSheet=3;";
    const std::string csv = Vantrel({"import", book, "--spec", spec}).out;
    ASSERT_EQ(Vantrel({"import", book, "--spec", spec, "--json", "--output", dir.File("s.json")}).status, 0);
    const auto run = testing_host::RunProgram("/usr/bin/python3", {"-c",
        "import json, sys, pandas\nseries = json.load(open(sys.argv[1]))\n"
        "frame = pandas.DataFrame(zip(*(item['values'] for item in series['items'])), index=pandas.to_datetime(series['times']),\n"
        "                         columns=[item['title'] for item in series['items']])\n"
        "print(frame.to_csv(na_rep='', float_format='%g'), end='')\n", dir.File("s.json")});
    EXPECT_EQ(run.out, csv.substr(5, csv.find('\n') - 4) + csv.substr(csv.find("\n2024-") + 1)) << run.err;
}

}  // namespace

// Infinities and stored numbers that no double holds: import writes them so
// that export's reader takes them back; export writes #NUM! and says where.
TEST(VantrelProgram, ValuesNoCellHoldsSurviveImportAndExport)
{
    testing_host::TempDir dir;
    const std::string book = WarningsBook(dir), spec = kHeaderRows + "ExcelSheet=10;";
    const std::string unreadable = "warning: sheet 10, cell B6: the stored number \"1e400\" is no number a cell can "
                                   "hold; it reads as #NUM! and imports as the delete value (and 1 more cell)\n";
    // The inspection tells the unreadable numbers first; the read then adds the infinities.
    const std::string importWarnings =
        unreadable + "warning: sheet 10, row 4, column B: 1e+39 is beyond the 32-bit float range and reads as "
                     "infinity (2 values of the sheet); scale the values or mark them missing\n";
    EXPECT_EQ(Vantrel({"inspect", book, "--spec", spec}).err, unreadable);
    const std::string exportWarning = "cell B3 (item 1, time step 1): the value inf is beyond what a cell can hold; it "
                                      "is written as #NUM! (and 1 more cell)";
    const std::string strictWarning = "item 1, time step 1: the value inf is beyond what a cell can hold and would be "
                                      "written as #NUM! (and 1 more value)";
    const std::pair<std::string, std::string> forms[] = {
        {"series.csv", "2024-03-01 00:00:00,inf\n2024-03-01 01:00:00,-inf\n2024-03-01 02:00:00,\n2024-03-01 03:00:00,\n"},
        {"series.json", "\"values\": [\n        \"inf\",\n        \"-inf\",\n        null,\n        null\n      ]"},
    };
    for (const auto &[name, values] : forms) {
        SCOPED_TRACE(name);
        std::vector<std::string> args = {"import", book, "--output", dir.File(name), "--spec", spec};
        if (name.ends_with(".json")) args.push_back("--json");
        const auto imported = Vantrel(args);
        EXPECT_EQ(imported.status, 0);
        EXPECT_EQ(imported.err, importWarnings);
        EXPECT_NE(ReadFile(dir.File(name)).find(values), std::string::npos) << ReadFile(dir.File(name));
        args.push_back("--strict");
        EXPECT_EQ(Vantrel(args).status, 1);

        const std::string target = dir.File(name + ".xlsx");
        const auto strict = Vantrel({"export", dir.File(name), target, "--strict", "--spec", ""});
        EXPECT_EQ(strict.status, 1);
        EXPECT_EQ(strict.err, "warning: " + strictWarning + "\nvantrel: --strict: 1 warning, nothing written\n");
        EXPECT_FALSE(std::filesystem::exists(target));
        const auto exported = Vantrel({"export", dir.File(name), target, "--spec", ""});
        EXPECT_EQ(exported.status, 0);
        EXPECT_EQ(exported.err, "warning: " + exportWarning + "\n");
        const auto shown = testing_host::RunProgram(
            "/usr/bin/python3", {"-c", "import openpyxl, sys\nsheet = openpyxl.load_workbook(sys.argv[1]).active\n"
                                       "print([sheet.cell(row, 2).value for row in range(3, 7)])", target});
        EXPECT_EQ(shown.out, "['#NUM!', '#NUM!', None, None]\n") << shown.err;
    }
}
