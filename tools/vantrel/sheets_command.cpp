// SPDX-License-Identifier: MIT
// A sheet's number is its place among the worksheets alone, as the bridge's
// ExcelSheet counts: chart sheets and other kinds are listed without one.
// The used range is that of the cells holding values.
#include "sheets_command.h"

#include <algorithm>
#include <cstdint>
#include <exception>
#include <iostream>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "workbook/cell_source.h"
#include "workbook_reading.h"

namespace vantrel_cli {
namespace {

struct SheetLine {
    workbook::SheetTab tab;
    std::string usedRange;  // "A1:D20"; empty for a sheet without values
};

// The smallest range holding every cell with a value; cells with a format
// alone don't count, so that the range tells where the data is.
std::string ValueRange(workbook::Worksheet &sheet)
{
    auto *cells = dynamic_cast<workbook::CellSource *>(&sheet);
    if (!cells) return {};
    int32_t top = INT32_MAX, left = INT32_MAX, bottom = 0, right = 0;
    cells->ForEachValue([&](int32_t row, int32_t column, const workbook::CellContent &) {
        top = std::min(top, row);
        bottom = std::max(bottom, row);
        left = std::min(left, column);
        right = std::max(right, column);
    });
    if (bottom == 0) return {};
    return ColumnName(left) + std::to_string(top) + ":" + ColumnName(right) + std::to_string(bottom);
}

void PrintTable(const std::vector<SheetLine> &lines, std::ostream &out)
{
    std::vector<std::vector<std::string>> rows{{"number", "name", "kind", "visibility", "used range"}};
    for (const SheetLine &line : lines)
        rows.push_back({line.tab.worksheetNumber ? std::to_string(line.tab.worksheetNumber) : "-", line.tab.name,
                        line.tab.kind, line.tab.visibility,
                        line.tab.kind != "worksheet" ? "" : line.usedRange.empty() ? "empty" : line.usedRange});
    std::vector<size_t> widths(rows.front().size(), 0);
    for (const auto &row : rows)
        for (size_t c = 0; c < row.size(); ++c) widths[c] = std::max(widths[c], row[c].size());
    for (const auto &row : rows) {
        std::string text;
        for (size_t c = 0; c < row.size(); ++c)
            text += c + 1 < row.size() ? row[c] + std::string(widths[c] + 2 - row[c].size(), ' ') : row[c];
        text.erase(text.find_last_not_of(' ') + 1);
        out << text << "\n";
    }
}

void PrintJson(const std::vector<SheetLine> &lines, std::ostream &out)
{
    nlohmann::ordered_json list = nlohmann::ordered_json::array();
    for (const SheetLine &line : lines) {
        nlohmann::ordered_json sheet;
        sheet["number"] = line.tab.worksheetNumber ? nlohmann::ordered_json(line.tab.worksheetNumber) : nullptr;
        sheet["name"] = line.tab.name;
        sheet["kind"] = line.tab.kind;
        sheet["visibility"] = line.tab.visibility;
        sheet["usedRange"] = line.usedRange.empty() ? nullptr : nlohmann::ordered_json(line.usedRange);
        list.push_back(std::move(sheet));
    }
    out << list.dump(2, ' ', false, nlohmann::json::error_handler_t::replace) << "\n";
}

}  // namespace

int PrintSheets(const std::string &path, bool json, std::ostream &out, std::ostream &err)
{
    auto app = workbook::CreateApplication();
    auto book = OpenForReading(*app, path, err);
    if (!book) return 1;
    auto worksheets = book->GetWorksheets();
    std::vector<SheetLine> lines;
    for (const workbook::SheetTab &tab : book->Tabs()) {
        SheetLine line{tab, {}};
        if (tab.worksheetNumber > 0) line.usedRange = ValueRange(*worksheets->Item(tab.worksheetNumber));
        lines.push_back(std::move(line));
    }
    book->Close(false);
    app->Quit();
    if (json) PrintJson(lines, out);
    else PrintTable(lines, out);
    return 0;
}

int RunSheets(const std::string &path, bool json)
{
    try {
        return PrintSheets(path, json, std::cout, std::cerr);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
        return 1;
    }
}

}  // namespace vantrel_cli
