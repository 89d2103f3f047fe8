// SPDX-License-Identifier: MIT
// "vantrel cells": every non-empty cell of one worksheet with its kind, the
// value Value2 gives and the text Text shows, read by the engine directly.
#include "cells_command.h"

#include <charconv>
#include <cmath>
#include <exception>
#include <iostream>
#include <limits>
#include <nlohmann/json.hpp>

#include "automation/com_error.h"
#include "module/string_table.h"
#include "workbook/cell_source.h"
#include "workbook/engine.h"
#include "workbook_reading.h"

namespace vantrel_cli {
namespace {

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

}  // namespace

int PrintCells(const std::string &path, int sheetNumber, std::ostream &out, std::ostream &err)
{
    auto app = workbook::CreateApplication();
    auto book = OpenForReading(*app, path, err);
    if (!book) return 1;
    auto sheets = book->GetWorksheets();
    const int32_t count = sheets->Count();
    if (sheetNumber > count) {
        err << vantrel::FormatMessage(122) << "\n";
        book->Close(false);
        return 1;
    }
    auto sheet = sheets->Item(sheetNumber);
    if (!ReadsWhole(*sheet, err)) {
        book->Close(false);
        return 1;
    }
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

int RunCells(const std::string &path, int sheet)
{
    try {
        return PrintCells(path, sheet, std::cout, std::cerr);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
        return 1;
    }
}

}  // namespace vantrel_cli
