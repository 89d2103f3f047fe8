// SPDX-License-Identifier: MIT
#include "foreign/converted_book.h"

#include <charconv>
#include <cmath>
#include <set>

#include "cells/cell_ref.h"
#include "errors.h"
#include "ooxml/new_package.h"
#include "package/content_types.h"
#include "package/relationships.h"
#include "workbook/limits.h"
#include "xml/namespaces.h"
#include "xml/xml_text.h"

namespace workbook {
namespace {

void AppendNumber(std::string &out, double value)
{
    char text[32];
    const auto end = std::to_chars(text, text + sizeof text, value).ptr;
    out.append(text, end);
}

// The cell's type attribute and content.
void AppendCell(std::string &out, uint32_t row, uint32_t column, const CellValue &value, uint32_t style,
                std::string_view storedNumber)
{
    out += "<c r=\"";
    out += ColumnName(column);
    out += std::to_string(row);
    out += '"';
    if (style != 0) out += " s=\"" + std::to_string(style) + '"';
    if (!storedNumber.empty()) {
        out += "><v>";
        xml::AppendEscaped(out, storedNumber);
        out += "</v></c>";
    } else if (const double *number = std::get_if<double>(&value)) {
        // A number the sheet can't hold reads as the error a spreadsheet
        // gives it, and is listed, as in any workbook.
        if (!std::isfinite(*number)) {
            out += std::isnan(*number) ? "><v>NaN</v></c>" : *number > 0 ? "><v>INF</v></c>" : "><v>-INF</v></c>";
            return;
        }
        out += "><v>";
        AppendNumber(out, *number);
        out += "</v></c>";
    } else if (const std::string *text = std::get_if<std::string>(&value)) {
        out += " t=\"inlineStr\"><is><t xml:space=\"preserve\">";
        xml::AppendCellText(out, *text);
        out += "</t></is></c>";
    } else if (const bool *flag = std::get_if<bool>(&value)) {
        out += *flag ? " t=\"b\"><v>1</v></c>" : " t=\"b\"><v>0</v></c>";
    } else {
        out += " t=\"e\"><v>";
        out += ErrorText(std::get<CellError>(value));
        out += "</v></c>";
    }
}

// The dimension element, written with room for the widest one and blanks after it.
constexpr size_t kDimensionRoom = sizeof("<dimension ref=\"XFD1048576:XFD1048576\"/>") - 1;
void AppendDimension(std::string &out, const std::string &range)
{
    const std::string element = "<dimension ref=\"" + range + "\"/>";
    out += element;
    out.append(kDimensionRoom - element.size(), ' ');
}

std::string UniqueName(std::string_view wanted, const std::set<std::string> &taken, size_t position)
{
    std::string name(wanted);
    if (name.empty()) name = "Sheet" + std::to_string(position);
    if (!taken.count(name)) return name;
    for (int n = 2;; ++n) {
        std::string candidate = name + " (" + std::to_string(n) + ")";
        if (!taken.count(candidate)) return candidate;
    }
}

}  // namespace

ConvertedBook::ConvertedBook() : styles_(Styles::Default()) {}

void ConvertedBook::AddSheet(std::string_view name)
{
    if (sheets_.size() >= limits::kMaxSheets)
        Fail(kBadFile, "more than " + std::to_string(limits::kMaxSheets) + " sheets");
    std::set<std::string> taken;
    for (const Sheet &sheet : sheets_) taken.insert(sheet.name);
    Sheet sheet;
    sheet.name = UniqueName(name, taken, sheets_.size() + 1);
    sheet.xml = std::string(kXmlHead) + "<worksheet xmlns=\"" + std::string(ns::kMain) + "\" xmlns:r=\"" +
                std::string(ns::kRel) + "\">";
    AppendDimension(sheet.xml, "A1");
    sheet.xml += "<sheetData>";
    sheets_.push_back(std::move(sheet));
}

void ConvertedBook::Put(uint32_t row, uint32_t column, const CellValue &value, std::string_view numberFormat,
                        std::string_view storedNumber)
{
    if (sheets_.empty()) AddSheet({});
    Sheet &sheet = sheets_.back();
    if (row < 1 || row > limits::kMaxRows || column < 1 || column > limits::kMaxColumns)
        Fail(kBadFile, "sheet '" + sheet.name + "': a cell at row " + std::to_string(row) + ", column " +
                           std::to_string(column) + " lies beyond the sheet's edge");
    if (row < sheet.lastRow || (row == sheet.lastRow && column <= sheet.lastColumn))
        Fail(kBadFile, "sheet '" + sheet.name + "': the cells are out of order at row " + std::to_string(row));
    if (std::holds_alternative<std::monostate>(value)) return;
    if (const std::string *text = std::get_if<std::string>(&value); text && text->size() > limits::kMaxCellTextBytes)
        Fail(kBadFile, "sheet '" + sheet.name + "': the text at row " + std::to_string(row) + " is longer than 1 MiB");
    if (++sheet.cellCount > limits::kMaxCellsPerSheet)
        Fail(kBadFile, "sheet '" + sheet.name + "' has more than " + std::to_string(limits::kMaxCellsPerSheet) + " cells");

    uint32_t style = 0;
    if (!numberFormat.empty()) {
        auto found = styleOf_.find(std::string(numberFormat));
        if (found == styleOf_.end())
            found = styleOf_.emplace(std::string(numberFormat), styles_.WithNumberFormat(0, numberFormat)).first;
        style = found->second;
    }
    if (row != sheet.lastRow) {
        if (sheet.lastRow != 0) sheet.xml += "</row>";
        sheet.xml += "<row r=\"" + std::to_string(row) + "\">";
        sheet.firstRow = sheet.firstRow == 0 ? row : sheet.firstRow;
    }
    AppendCell(sheet.xml, row, column, value, style, storedNumber);
    if (sheet.xml.size() > limits::kMaxPartBytes)
        Fail(kBadFile, "sheet '" + sheet.name + "' holds more than a sheet part may (1 GiB)");
    sheet.lastRow = row;
    sheet.lastColumn = column;
    sheet.minColumn = sheet.minColumn == 0 ? column : std::min(sheet.minColumn, column);
    sheet.maxColumn = std::max(sheet.maxColumn, column);
}

std::vector<std::pair<std::string, std::string>> ConvertedBook::TakeParts()
{
    if (sheets_.empty()) AddSheet({});
    const std::string mainNs(ns::kMain);
    const std::string relNs(ns::kRel);
    std::vector<std::pair<std::string, std::string>> parts;
    std::vector<std::pair<std::string, std::string>> types{{"xl/workbook.xml", content_type::kWorkbook},
                                                           {"xl/styles.xml", content_type::kStyles}};
    std::vector<Relationship> workbookRels{{"rId1", RelType("styles"), "styles.xml", false}};
    std::string workbook = std::string(kXmlHead) + "<workbook xmlns=\"" + mainNs + "\" xmlns:r=\"" + relNs + "\">";
    if (date1904_) workbook += "<workbookPr date1904=\"1\"/>";
    workbook += "<bookViews><workbookView/></bookViews><sheets>";
    for (size_t i = 0; i < sheets_.size(); ++i) {
        Sheet &sheet = sheets_[i];
        const std::string number = std::to_string(i + 1);
        const std::string part = "xl/worksheets/sheet" + number + ".xml";
        workbook += "<sheet name=\"";
        xml::AppendEscaped(workbook, sheet.name);
        workbook += "\" sheetId=\"" + number + "\" r:id=\"rId" + std::to_string(i + 2) + "\"/>";
        workbookRels.push_back({"rId" + std::to_string(i + 2), RelType("worksheet"), "worksheets/sheet" + number + ".xml", false});
        types.emplace_back(part, content_type::kWorksheet);

        std::string &xml = sheet.xml;
        if (sheet.lastRow != 0) {
            std::string dimension;
            AppendDimension(dimension, ColumnName(sheet.minColumn) + std::to_string(sheet.firstRow) + ":" +
                                           ColumnName(sheet.maxColumn) + std::to_string(sheet.lastRow));
            xml.replace(xml.find("<dimension "), kDimensionRoom, dimension);
            xml += "</row>";
        }
        xml += "</sheetData></worksheet>";
        parts.emplace_back(part, std::move(xml));
    }
    workbook += "</sheets></workbook>";
    parts.emplace_back("[Content_Types].xml", ContentTypes::Compose(types));
    parts.emplace_back("_rels/.rels", Relationships::Compose({{"rId1", kOfficeDocument, "xl/workbook.xml", false}}));
    parts.emplace_back("xl/workbook.xml", std::move(workbook));
    parts.emplace_back("xl/_rels/workbook.xml.rels", Relationships::Compose(workbookRels));
    parts.emplace_back("xl/styles.xml", styles_.Compose(mainNs));
    sheets_.clear();
    return parts;
}

}  // namespace workbook
