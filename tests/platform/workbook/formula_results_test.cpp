// SPDX-License-Identifier: MIT
// Formulas a file holds without a result are computed as the workbook opens:
// shared formulas move their references with each cell, stored results stay
// as the file has them, and what can't be computed fails the open by name.
#include "engine_test_support.h"
#include "workbook/cell_source.h"

namespace {

std::string Cell(const std::string &ref, const std::string &inside, const std::string &type = "")
{
    return "<c r=\"" + ref + "\"" + (type.empty() ? "" : " t=\"" + type + "\"") + ">" + inside + "</c>";
}

TEST(FormulaResults, SharedFormulasStoredResultsAndTypes)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("shared.xlsx");
    engine_test::WriteZip(path, engine_test::MinimalPackage(
        "<sheetData><row r=\"1\">" + Cell("A1", "<v>1</v>") + Cell("B1", "<f t=\"shared\" ref=\"B1:B3\" si=\"0\">A1*10</f>") +
        Cell("C1", "<f>A1+1</f><v>99</v>") + Cell("D1", "<f>B3&amp;\" m\"</f>") + Cell("E1", "<f>C1&gt;=99</f>") +
        "</row><row r=\"2\">" + Cell("A2", "<v>2</v>") + Cell("B2", "<f t=\"shared\" si=\"0\"/>") +
        "</row><row r=\"3\">" + Cell("A3", "<v>3</v>") + Cell("B3", "<f t=\"shared\" si=\"0\"/><v></v>") +
        "</row></sheetData>"));
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    auto &cells = dynamic_cast<workbook::CellSource &>(*sheet);
    for (auto [row, tens] : {std::pair{1, 10.0}, {2, 20.0}, {3, 30.0}}) EXPECT_EQ(cells.GetCell(row, 2).number, tens);
    EXPECT_EQ(cells.GetCell(1, 3).number, 99);  // the stored result, not A1+1
    EXPECT_EQ(engine_test::Utf8(sheet->GetRange("D1")->GetValue2()), "30 m");
    EXPECT_EQ(sheet->GetRange("E1")->GetValue2().Raw().vt, VT_BOOL);
    app->Quit();
}

TEST(FormulaResults, WhatCannotBeComputedFailsTheOpenByCell)
{
    testing_host::TempDir dir;
    const std::vector<std::pair<std::string, std::string>> cases{
        {Cell("A1", "<f>B1</f>") + Cell("B1", "<f>A1*2</f>"),
         "Data!A1: the formula =B1 could not be computed: a circular reference through Data!B1"},
        {Cell("A1", "<f>NOW()</f>"), "Data!A1: the formula =NOW() could not be computed: the function NOW is not supported"},
        {Cell("A1", "<f>Rate*2</f>"), "Data!A1: the formula =Rate*2 could not be computed: unknown name RATE"},
        {Cell("A1", "<f t=\"array\" ref=\"A1\">SUM(B1:B2*2)</f>"),
         "Data!A1: the formula =SUM(B1:B2*2) could not be computed: array formulas and data tables are not computed"},
        {Cell("A1", "<f>[1]Sheet1!B2</f>"),
         "Data!A1: the formula =[1]Sheet1!B2 could not be computed: it refers to another workbook"},
        {Cell("A1", "<f>FOO(" + std::string(200, '1') + ")</f>"),
         "Data!A1: the formula \"=FOO(" + std::string(35, '1') + "...\" (206 bytes) could not be computed: unknown "
         "function FOO"},
    };
    for (const auto &[cells, reason] : cases) {
        SCOPED_TRACE(reason);
        const std::string path = dir.File("bad.xlsx");
        engine_test::WriteZip(path, engine_test::MinimalPackage("<sheetData><row r=\"1\">" + cells + "</row></sheetData>"));
        EXPECT_COM_ERROR(engine_test::OpenAndRead(path), E_FAIL, path + ": " + reason);
    }
}

}  // namespace
