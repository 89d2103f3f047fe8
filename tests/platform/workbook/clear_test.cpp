// SPDX-License-Identifier: MIT
// Worksheet.Clear on a sheet dressed with everything a spreadsheet program
// puts on one (tests/data/workbook/decorated_sheets.xlsx): nothing of it is
// left in the saved package, openpyxl finds none of it either, the other
// sheets keep their parts byte for byte, and a protected sheet is refused.
#include <nlohmann/json.hpp>

#include <filesystem>
#include <set>

#include "engine_test_support.h"
#include "support/program_run.h"

namespace {

using automation::Variant;

const std::string kDecorated = WORKBOOK_FIXTURE_DIR "/decorated_sheets.xlsx";

TEST(ClearTest, AClearedSheetKeepsNothingAndOtherSheetsKeepTheirParts)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(kDecorated, path);
    auto before = engine_test::ZipEntries(path);

    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    auto sheet = book->GetWorksheets()->Item(1);
    sheet->Clear();
    EXPECT_EQ(sheet->UsedRange()->Count(), 1);
    sheet->GetRange("A1")->SetValue2(Variant::R8(42).Raw());
    book->Close(true);
    auto after = engine_test::ZipEntries(path);

    // The parts only the cleared sheet used are gone: its drawing with the
    // chart on it, the comments with their shapes, the table.
    std::set<std::string> gone;
    for (const auto &entry : before)
        if (!after.count(entry.first)) gone.insert(entry.first);
    EXPECT_EQ(gone, (std::set<std::string>{"xl/charts/chart1.xml", "xl/comments/comment1.xml",
                                           "xl/drawings/_rels/drawing1.xml.rels", "xl/drawings/commentsDrawing1.vml",
                                           "xl/drawings/drawing1.xml", "xl/tables/table1.xml"}));
    EXPECT_EQ(after.size() + gone.size(), before.size());
    const std::set<std::string> edited = {"xl/worksheets/sheet1.xml", "xl/worksheets/_rels/sheet1.xml.rels",
                                          "[Content_Types].xml"};
    for (const auto &[name, bytes] : after)
        if (!edited.count(name)) { EXPECT_EQ(bytes, before[name]) << name << " changed"; }
    for (const std::string &name : gone)
        EXPECT_EQ(after["[Content_Types].xml"].find("/" + name + "\""), std::string::npos) << name;
    EXPECT_EQ(after["xl/worksheets/_rels/sheet1.xml.rels"].find("<Relationship "), std::string::npos);
    const std::string &xml = after["xl/worksheets/sheet1.xml"];
    for (const char *element : {"<cols", "<mergeCells", "<conditionalFormatting", "<dataValidations", "<hyperlinks",
                                "<drawing", "<legacyDrawing", "<tableParts", "hidden="})
        EXPECT_EQ(xml.find(element), std::string::npos) << element;
    EXPECT_NE(xml.find("<sheetData><row r=\"1\"><c r=\"A1\"><v>42</v></c></row></sheetData><pageMargins "),
              std::string::npos) << xml;

    // openpyxl, reading on its own, finds the first sheet bare and the second as it was.
    const std::string script =
        "import json, sys, openpyxl\n"
        "wb = openpyxl.load_workbook(sys.argv[1])\n"
        "def seen(ws):\n"
        "    return {'cells': [[c.coordinate, c.value] for row in ws.iter_rows() for c in row if c.value is not None],\n"
        "            'merged': [str(r) for r in ws.merged_cells.ranges], 'tables': sorted(ws.tables),\n"
        "            'comments': [c.coordinate for row in ws.iter_rows() for c in row if c.comment],\n"
        "            'links': [c.coordinate for row in ws.iter_rows() for c in row if c.hyperlink],\n"
        "            'formats': len(ws.conditional_formatting), 'validations': len(ws.data_validations.dataValidation),\n"
        "            'charts': len(ws._charts), 'hidden': [k for k, d in ws.row_dimensions.items() if d.hidden]\n"
        "                                        + [k for k, d in ws.column_dimensions.items() if d.hidden]}\n"
        "print(json.dumps([seen(wb['Data']), seen(wb['Other'])]))\n";
    const testing_host::ProgramRun run = testing_host::RunProgram(WORKBOOK_PYTHON, {"-c", script, path});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(nlohmann::json::parse(run.out), nlohmann::json::parse(R"json([
        {"cells": [["A1", 42]], "merged": [], "tables": [], "comments": [], "links": [],
         "formats": 0, "validations": 0, "charts": 0, "hidden": []},
        {"cells": [["A1", "kept"], ["B1", "=SUM(Data!B2:B5)"], ["A2", "https://example.org/kept"],
                   ["A3", "Name"], ["B3", "Value"], ["A4", "x"], ["B4", 1]],
         "merged": ["D1:E1"], "tables": ["Kept"], "comments": ["A1"], "links": ["A2"],
         "formats": 0, "validations": 0, "charts": 1, "hidden": []}])json"));
}

TEST(ClearTest, AProtectedSheetIsRefusedAndStaysAsItWas)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(kDecorated, path);
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    auto locked = book->GetWorksheets()->Item(3);
    EXPECT_COM_ERROR(locked->Clear(), static_cast<HRESULT>(0x800A03EC),
                     "sheet 'Locked' is protected and can't be cleared: unprotect it in a spreadsheet program, save "
                     "the workbook and try again");
    EXPECT_EQ(engine_test::Utf8(locked->GetRange("A1")->GetValue2()), "protected");
    // Cleared twice before one save: the second clear starts from the first.
    auto data = book->GetWorksheets()->Item(1);
    data->Clear();
    data->GetRange("B2")->SetValue2(Variant::R8(1).Raw());
    data->Clear();
    book->Close(true);
    auto parts = engine_test::ZipEntries(path);
    EXPECT_EQ(parts["xl/worksheets/sheet3.xml"], engine_test::ZipEntries(kDecorated)["xl/worksheets/sheet3.xml"]);
    EXPECT_NE(parts["xl/worksheets/sheet1.xml"].find("<sheetData/>"), std::string::npos);
}

}  // namespace
