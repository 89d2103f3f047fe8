// SPDX-License-Identifier: MIT
// A workbook written by the engine (values, number formats, fitted column
// widths) as other programs read it: openpyxl finds the same values, formats
// and widths, and LibreOffice shows the same texts.
#include <nlohmann/json.hpp>

#include <cmath>
#include <cstdio>
#include <filesystem>
#include <sstream>

#include "document.h"
#include "engine_test_support.h"
#include "workbook/cell_source.h"

namespace {

using automation::Variant;

std::string RunCommand(const std::string &command, int *status = nullptr)
{
    std::string out;
    FILE *pipe = popen(command.c_str(), "r");
    if (!pipe) return out;
    char buffer[4096];
    size_t n;
    while ((n = fread(buffer, 1, sizeof buffer, pipe)) > 0) out.append(buffer, n);
    const int raw = pclose(pipe);
    if (status) *status = raw;
    return out;
}

constexpr int kRows = 5;
constexpr int kColumns = 6;

// Writes the sheet an export would write: a title row, a date/time column
// and value columns under several number formats, fitted to their texts.
void WriteBook(const std::string &path)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(engine_test::Missing().Raw());
    auto sheet = book->GetWorksheets()->Item(1);
    const char *titles[kColumns] = {"Date/time", "Level", "Share", "Count", "Note", "Flag"};
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
    }
    sheet->GetRange("A2", "A5")->SetNumberFormat("yyyy-mm-dd hh:mm:ss");
    sheet->GetRange("B2", "B5")->SetNumberFormat("0.00");
    sheet->GetRange("C2", "C5")->SetNumberFormat("0.0%");
    sheet->GetRange("D2", "D5")->SetNumberFormat("#,##0");
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
        "        cells.append([c.row, c.column, kind, v, c.number_format])\n"
        "widths = {k: d.width for k, d in ws.column_dimensions.items() if d.customWidth}\n"
        "print(json.dumps({'cells': cells, 'widths': widths}))\n";
    engine_test::WriteBytes(dir.File("read.py"), script);
    const std::string out = RunCommand(std::string(WORKBOOK_PYTHON) + " " + dir.File("read.py") + " " + path + " 2>&1");
    nlohmann::json seen;
    try {
        seen = nlohmann::json::parse(out);
    } catch (const std::exception &) {
        FAIL() << "openpyxl could not read the workbook: " << out;
    }

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
            if (cell[2] == "datetime")  // openpyxl gives a date; its serial to the microsecond
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

// One CSV line split at commas outside quotes.
std::vector<std::string> SplitCsv(const std::string &line)
{
    std::vector<std::string> fields(1);
    bool quoted = false;
    for (size_t i = 0; i < line.size(); ++i) {
        const char ch = line[i];
        if (ch == '"') {
            if (quoted && i + 1 < line.size() && line[i + 1] == '"') {
                fields.back() += '"';
                ++i;
            } else {
                quoted = !quoted;
            }
        } else if (ch == ',' && !quoted) {
            fields.emplace_back();
        } else if (ch != '\r') {
            fields.back() += ch;
        }
    }
    return fields;
}

TEST(OtherReaders, LibreOfficeShowsTheSameTexts)
{
    // LibreOffice is listed in scripts/packages.txt; a machine without it
    // can't make this check, and says so instead of passing.
    int status = 0;
    RunCommand("command -v soffice >/dev/null 2>&1", &status);
    ASSERT_EQ(status, 0) << "soffice is not installed: install libreoffice-calc-nogui "
                            "(scripts/install-packages.sh) to check workbooks against LibreOffice";

    testing_host::TempDir dir;
    const std::string path = dir.File("written.xlsx");
    WriteBook(path);
    // A profile of its own, so that parallel runs don't share one. The CSV
    // filter's options: comma, double quote, UTF-8, from line 1, and the
    // last one: cell contents as shown, by their number formats.
    const std::string command = "soffice -env:UserInstallation=file://" + dir.File("profile") +
                                " --headless --convert-to 'csv:Text - txt - csv (StarCalc):44,34,76,1,,0,false,true,true'"
                                " --outdir " + dir.File("csv") + " " + path + " 2>&1";
    const std::string log = RunCommand(command, &status);
    ASSERT_EQ(status, 0) << log;
    std::istringstream csv(engine_test::ReadBytes(dir.File("csv/written.csv")));
    ASSERT_FALSE(csv.str().empty()) << "LibreOffice wrote no CSV: " << log;

    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    std::string line;
    int row = 0;
    while (std::getline(csv, line)) {
        ++row;
        const std::vector<std::string> fields = SplitCsv(line);
        ASSERT_EQ(fields.size(), size_t(kColumns)) << line;
        for (int c = 0; c < kColumns; ++c) {
            const std::string address = std::string(1, char('A' + c)) + std::to_string(row);
            EXPECT_EQ(fields[size_t(c)], engine_test::Utf8(sheet->GetRange(address)->GetText())) << address;
        }
    }
    EXPECT_EQ(row, kRows);
}

}  // namespace
