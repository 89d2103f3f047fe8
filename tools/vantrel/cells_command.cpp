// SPDX-License-Identifier: MIT
// "vantrel cells": every non-empty cell of one worksheet with its kind, the
// value Value2 gives and the text Text shows, read by the engine directly.
#include "cells_command.h"

#include <charconv>
#include <cmath>
#include <iostream>
#include <limits>
#include <nlohmann/json.hpp>

#include "automation/com_error.h"
#include "module/string_table.h"
#include "workbook/cell_source.h"
#include "workbook/engine.h"

namespace vantrel_cli {
namespace {

constexpr const char kCellsUsage[] = "usage: vantrel cells BOOK [--sheet N]\n";

// A JSON string; bytes that aren't UTF-8 become U+FFFD instead of failing.
std::string JsonText(const std::string &text)
{
    return nlohmann::json(text).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

// The shortest text that reads back as the same double.
std::string JsonNumber(double value)
{
    if (!std::isfinite(value)) return "null";  // a sheet holds none; JSON has no such number
    char buffer[64];
    const auto result = std::to_chars(buffer, buffer + sizeof buffer, value);
    return std::string(buffer, result.ptr);
}

const char *ErrorText(int32_t code)
{
    switch (code) {
    case 2000: return "#NULL!";
    case 2007: return "#DIV/0!";
    case 2015: return "#VALUE!";
    case 2023: return "#REF!";
    case 2029: return "#NAME?";
    case 2036: return "#NUM!";
    case 2042: return "#N/A";
    case 2043: return "#GETTING_DATA";
    default: return "#VALUE!";
    }
}

std::string ColumnName(int32_t column)
{
    std::string name;
    for (; column > 0; column = (column - 1) / 26) name.insert(name.begin(), char('A' + (column - 1) % 26));
    return name;
}

std::string DisplayedText(workbook::Worksheet &sheet, int32_t row, int32_t column)
{
    const std::string address = ColumnName(column) + std::to_string(row);
    const automation::Variant text = sheet.GetRange(address)->GetText();
    return text.Type() == VT_BSTR ? automation::BstrToUtf8(text.Raw().bstrVal) : std::string();
}

// [row, column, kind, value, text]
std::string CellJson(workbook::Worksheet &sheet, int32_t row, int32_t column, const workbook::CellContent &cell)
{
    using Kind = workbook::CellContent::Kind;
    std::string kind, value;
    switch (cell.kind) {
    case Kind::Number:
        kind = "number";
        value = JsonNumber(cell.number);
        break;
    case Kind::Text:
        kind = "string";
        value = JsonText(cell.text);
        break;
    case Kind::Boolean:
        kind = "bool";
        value = cell.boolean ? "true" : "false";
        break;
    case Kind::Error:
        kind = "error";
        value = JsonText(ErrorText(cell.error));
        break;
    case Kind::Empty: return {};
    }
    return "[" + std::to_string(row) + "," + std::to_string(column) + ",\"" + kind + "\"," + value + "," +
           JsonText(DisplayedText(sheet, row, column)) + "]";
}

// Opening is the step that can fail on a user's file; the message is the one
// a session gives for it, with the engine's reason on its own line.
std::shared_ptr<workbook::Workbook> OpenBook(workbook::Application &app, const std::string &path, std::string &reason)
{
    try {
        return app.GetWorkbooks()->Open(path);
    } catch (const automation::ComError &e) {
        reason = e.what();
        return nullptr;
    }
}

}  // namespace

int PrintCells(const std::string &path, int sheetNumber, std::ostream &out, std::ostream &err)
{
    auto app = workbook::CreateApplication();
    std::string reason;
    auto book = OpenBook(*app, path, reason);
    if (!book) {
        err << vantrel::FormatMessage(121) << "\n" << reason << "\n";
        return 1;
    }
    auto sheets = book->GetWorksheets();
    const int32_t count = sheets->Count();
    if (sheetNumber > count) {
        err << vantrel::FormatMessage(122) << "\n";
        book->Close(false);
        return 1;
    }
    auto sheet = sheets->Item(sheetNumber);
    auto *cells = dynamic_cast<workbook::CellSource *>(sheet.get());
    if (!cells) throw automation::ComError(E_NOINTERFACE, "the worksheet offers no direct cell reads");

    std::string text = "{\"sheets\":" + std::to_string(count) + ",\"sheet\":" + std::to_string(sheetNumber) +
                       ",\"usedRange\":";
    std::string list;
    bool any = false;
    cells->ForEachValue([&](int32_t row, int32_t column, const workbook::CellContent &cell) {
        list += any ? "," : "";
        list += CellJson(*sheet, row, column, cell);
        any = true;
    });
    if (any) {
        const workbook::UsedBounds used = cells->GetUsedBounds();
        text += "[" + std::to_string(used.firstRow) + "," + std::to_string(used.firstColumn) + "," +
                std::to_string(used.lastRow) + "," + std::to_string(used.lastColumn) + "]";
    } else {
        text += "null";
    }
    text += ",\"cells\":[" + list + "]}\n";
    out << text;
    book->Close(false);
    app->Quit();
    return 0;
}

int RunCells(int argc, char **argv)
{
    std::string path;
    int sheet = 1;
    bool havePath = false;
    for (int i = 2; i < argc; ++i) {
        const std::string arg = argv[i];
        if (arg == "--sheet" && i + 1 < argc) {
            const std::string number = argv[++i];
            const auto result = std::from_chars(number.data(), number.data() + number.size(), sheet);
            if (result.ec != std::errc() || result.ptr != number.data() + number.size() || sheet < 1) {
                std::cerr << kCellsUsage;
                return 2;
            }
        } else if (!arg.empty() && arg[0] == '-') {
            std::cerr << kCellsUsage;
            return 2;
        } else if (!havePath) {
            path = arg;
            havePath = true;
        } else {
            std::cerr << kCellsUsage;
            return 2;
        }
    }
    if (!havePath) {
        std::cerr << kCellsUsage;
        return 2;
    }
    try {
        return PrintCells(path, sheet, std::cout, std::cerr);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
        return 1;
    }
}

}  // namespace vantrel_cli
