// SPDX-License-Identifier: MIT
// A workbook written by the engine (values, number formats, fitted column
// widths) as other programs read it: openpyxl finds the same values, formats
// and widths, and LibreOffice shows the same texts; a sheet large enough to
// be deflated in several pieces inflates with zlib to what the engine reads.
#include <nlohmann/json.hpp>

#include <sstream>

#include "engine_test_support.h"
#include "ooxml/document.h"
#include "support/program_run.h"
#include "workbook/cell_source.h"

namespace {

using automation::Variant;

constexpr int kRows = 5;
constexpr int kColumns = 8;

// Writes the sheet an export would write: a title row, a date/time column
// and value columns under several number formats, fitted to their texts.
void WriteBook(const std::string &path)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(engine_test::Missing().Raw());
    auto sheet = book->GetWorksheets()->Item(1);
    const char *titles[kColumns] = {"Date/time", "Level", "Share", "Count", "Note", "Flag", "Elapsed", "Local"};
    for (int c = 0; c < kColumns; ++c)
        sheet->GetRange(std::string(1, char('A' + c)) + "1")->SetValue2(Variant::String(titles[c]).Raw());
    for (int r = 2; r <= kRows; ++r) {
        const std::string row = std::to_string(r);
        sheet->GetRange("A" + row)->SetValue2(Variant::R8(45351.25 + (r - 2) / 24.0).Raw());
        sheet->GetRange("B" + row)->SetValue2(Variant::R8(1.0 / 3.0 * r).Raw());
        sheet->GetRange("C" + row)->SetValue2(Variant::R8(0.125 * r).Raw());
        sheet->GetRange("D" + row)->SetValue2(Variant::R8(1234567.0 * r).Raw());
        sheet->GetRange("E" + row)->SetValue2(Variant::String(r == 3 ? "a rather longer note, with a comma" : "n").Raw());
        sheet->GetRange("F" + row)->SetValue2(Variant::Bool(r % 2 == 0).Raw());
        sheet->GetRange("G" + row)->SetValue2(Variant::R8(1.25 * r + 1.0 / 3.0).Raw());
        sheet->GetRange("H" + row)->SetValue2(Variant::R8(45351.5 + r).Raw());
    }
    sheet->GetRange("A2", "A5")->SetNumberFormat("yyyy-mm-dd hh:mm:ss");
    sheet->GetRange("B2", "B5")->SetNumberFormat("0.00");
    sheet->GetRange("C2", "C5")->SetNumberFormat("0.0%");
    sheet->GetRange("D2", "D5")->SetNumberFormat("#,##0");
    sheet->GetRange("G2", "G5")->SetNumberFormat("[h]:mm");
    sheet->GetRange("H2", "H5")->SetNumberFormat("dd.mm.yyyy hh:mm");
    sheet->UsedRange()->Columns()->AutoFit();
    book->SaveAs(path);
    book->Close(false);
    app->Quit();
}

TEST(OtherReaders, OpenpyxlFindsValuesFormatsAndWidths)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("written.xlsx");
    WriteBook(path);

    const std::string script =
        "import json, sys, openpyxl\n"
        "from openpyxl.utils.datetime import to_excel\n"
        "ws = openpyxl.load_workbook(sys.argv[1]).worksheets[0]\n"
        "cells = []\n"
        "for row in ws.iter_rows():\n"
        "    for c in row:\n"
        "        v = c.value\n"
        "        kind = type(v).__name__\n"
        "        if hasattr(v, 'year'): v = to_excel(v)\n"
        "        if hasattr(v, 'days'): v = v.total_seconds() / 86400\n"
        "        cells.append([c.row, c.column, kind, v, c.number_format])\n"
        "widths = {k: d.width for k, d in ws.column_dimensions.items() if d.customWidth}\n"
        "print(json.dumps({'cells': cells, 'widths': widths}))\n";
    const testing_host::ProgramRun run = testing_host::RunProgram(WORKBOOK_PYTHON, {"-c", script, path});
    ASSERT_EQ(run.status, 0) << "openpyxl could not read the workbook: " << run.err;
    const nlohmann::json seen = nlohmann::json::parse(run.out);

    // What the engine itself reads back from the file.
    auto doc = workbook::Document::Open(path);
    const auto &model = doc->Worksheet(0).model;
    ASSERT_EQ(seen["cells"].size(), size_t(kRows * kColumns));
    for (const auto &cell : seen["cells"]) {
        const uint32_t row = cell[0], col = cell[1];
        SCOPED_TRACE("row " + std::to_string(row) + " column " + std::to_string(col));
        const workbook::Cell *ours = model.store.Find(row, col);
        ASSERT_NE(ours, nullptr);
        EXPECT_EQ(cell[4].get<std::string>(), doc->CellFormats().NumberFormatOf(ours->style));
        switch (ours->kind) {
        case workbook::CellKind::Number:
            if (cell[2] == "datetime" || cell[2] == "timedelta")  // to the microsecond
                EXPECT_NEAR(cell[3].get<double>(), ours->Number(), 1e-9);
            else
                EXPECT_EQ(cell[3].get<double>(), ours->Number());
            break;
        case workbook::CellKind::String: EXPECT_EQ(cell[3], doc->Strings().Get(ours->StringIndex())); break;
        case workbook::CellKind::Boolean: EXPECT_EQ(cell[3], ours->Boolean()); break;
        default: ADD_FAILURE() << "unexpected kind";
        }
    }
    // Date cells are dates to openpyxl too, by their format.
    EXPECT_EQ(seen["cells"][kColumns][2], "datetime");
    EXPECT_EQ(seen["cells"][kColumns][4], "yyyy-mm-dd hh:mm:ss");

    // Every fitted column comes back with the width the engine wrote.
    int fitted = 0;
    for (const auto &spec : model.columns) {
        if (!spec.customWidth) continue;
        for (uint32_t c = spec.min; c <= spec.max; ++c) {
            const std::string letter(1, char('A' + c - 1));
            ASSERT_TRUE(seen["widths"].contains(letter)) << letter;
            EXPECT_DOUBLE_EQ(seen["widths"][letter].get<double>(), spec.width) << letter;
            ++fitted;
        }
    }
    EXPECT_EQ(fitted, kColumns);
    // The long note makes its column the widest.
    EXPECT_GT(seen["widths"]["E"].get<double>(), seen["widths"]["F"].get<double>());
}

TEST(OtherReaders, LibreOfficeShowsTheSameTexts)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("written.xlsx");
    WriteBook(path);
    // A profile of its own, so that parallel runs don't share one. The CSV
    // filter's options: tab, no quotes, UTF-8, from line 1, and the last one:
    // cell contents as shown, by their number formats. A machine without
    // LibreOffice can't make this check, and says so instead of passing.
    const testing_host::ProgramRun run = testing_host::RunProgram(
        "/usr/bin/soffice", {"-env:UserInstallation=file://" + dir.File("profile"), "--headless", "--convert-to",
                             "csv:Text - txt - csv (StarCalc):9,,76,1,,0,false,true,true", "--outdir", dir.File("csv"), path});
    ASSERT_EQ(run.status, 0) << "install libreoffice-calc-nogui (scripts/install-packages.sh) to check workbooks "
                                "against LibreOffice: "
                             << run.err;
    std::istringstream csv(testing_host::ReadFile(dir.File("csv/written.csv")));
    ASSERT_FALSE(csv.str().empty()) << "LibreOffice wrote no CSV: " << run.out << run.err;

    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    std::string line;
    int row = 0;
    while (std::getline(csv, line)) {
        ++row;
        std::string ours;
        for (int c = 0; c < kColumns; ++c)
            ours += (c ? "\t" : "") + engine_test::Utf8(sheet->GetRange(std::string(1, char('A' + c)) + std::to_string(row))->GetText());
        EXPECT_EQ(line, ours);
    }
    EXPECT_EQ(row, kRows);
}

TEST(OtherReaders, ZlibInflatesALargeSheetToWhatTheEngineReads)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("large.xlsx");
    constexpr LONG kLargeRows = 150000;  // some 12 MB of sheet text
    {
        auto app = workbook::CreateApplication();
        auto book = app->GetWorkbooks()->Add(engine_test::Missing().Raw());
        SAFEARRAYBOUND bounds[2] = {{kLargeRows, 1}, {2, 1}};
        SAFEARRAY *values = SafeArrayCreate(VT_R8, 2, bounds);
        for (LONG r = 1; r <= kLargeRows; ++r)
            for (LONG c = 1; c <= 2; ++c) {
                LONG at[2] = {r, c};
                double v = r / (c + 6.0);
                SafeArrayPutElement(values, at, &v);
            }
        auto sheet = book->GetWorksheets()->Item(1);
        sheet->GetRange("A1:B" + std::to_string(kLargeRows))->SetValue2(Variant::Array(VT_R8, values).Raw());
        book->SaveAs(path);
        // Saved again, from the positions the first save left in the new file.
        sheet->GetRange("C1")->SetValue2(Variant::R8(0.5).Raw());
        book->Save();
        book->Close(false);
    }
    const std::string ours = engine_test::ZipEntries(path).at("xl/worksheets/sheet1.xml");
    ASSERT_GT(ours.size(), size_t{8} << 20);
    // Python's zipfile inflates with zlib and checks the CRC as it reads.
    const std::string script =
        "import sys, zipfile\n"
        "sys.stdout.buffer.write(zipfile.ZipFile(sys.argv[1]).read('xl/worksheets/sheet1.xml'))\n";
    const testing_host::ProgramRun run = testing_host::RunProgram(WORKBOOK_PYTHON, {"-c", script, path});
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_TRUE(run.out == ours) << "zlib inflates " << run.out.size() << " bytes, the engine " << ours.size();
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    EXPECT_EQ(sheet->GetRange("B" + std::to_string(kLargeRows))->GetValue2().Raw().dblVal, kLargeRows / 8.0);
    EXPECT_EQ(sheet->GetRange("C1")->GetValue2().Raw().dblVal, 0.5);
    // What follows the cells came through both saves whole.
    EXPECT_TRUE(ours.ends_with("</sheetData><pageMargins left=\"0.7\" right=\"0.7\" top=\"0.75\" bottom=\"0.75\" "
                               "header=\"0.3\" footer=\"0.3\"/></worksheet>"))
        << ours.substr(ours.size() - 200);
}

}  // namespace

// A long sheet is fitted in two halves of rows: the widest text of a column
// counts wherever it lies, and the widths are those of the one cell alone.
TEST(OtherReaders, ALongSheetIsFittedToItsWidestTextInEitherHalf)
{
    testing_host::TempDir dir;
    const auto fittedWidths = [&](int rows, const std::string &name) {
        auto app = workbook::CreateApplication();
        auto book = app->GetWorkbooks()->Add(engine_test::Missing().Raw());
        auto sheet = book->GetWorksheets()->Item(1);
        for (int r = 1; r < rows; ++r) sheet->GetRange("A" + std::to_string(r))->SetValue2(Variant::R8(r % 7).Raw());
        const std::string last = std::to_string(rows);
        sheet->GetRange("A1")->SetValue2(Variant::String("a note wider than the standard column").Raw());
        sheet->GetRange("B" + last)->SetValue2(Variant::String("the longest note of all, at the very end").Raw());
        sheet->GetRange("C" + last)->SetValue2(Variant::R8(-1234567.891).Raw());
        sheet->UsedRange()->Columns()->AutoFit();
        book->SaveAs(dir.File(name));
        book->Close(false);
        app->Quit();
        const auto saved = workbook::Document::Open(dir.File(name));
        std::vector<double> widths;
        for (const auto &spec : saved->Worksheet(0).model.columns) widths.push_back(spec.width);
        return widths;
    };
    const std::vector<double> alone = fittedWidths(2, "short.xlsx");
    ASSERT_EQ(alone.size(), 3u);
    EXPECT_EQ(fittedWidths(120000, "long.xlsx"), alone);
}
