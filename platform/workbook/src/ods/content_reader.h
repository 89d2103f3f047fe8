// SPDX-License-Identifier: MIT
// Streams an OpenDocument spreadsheet's content part into a converted book:
// each table a sheet, each row and cell with its repeats. Only the cells of
// one row are held at a time; repeated empty rows and cells cost nothing, and
// repeated cells with content are written out up to the sheet's edge and a
// bound on what repeats may expand to.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cells/cell_value.h"
#include "foreign/converted_book.h"
#include "ods/cell_text.h"
#include "ods/ods_styles.h"
#include "xml/xml_parser.h"

namespace workbook::ods {

class ContentReader : public xml::Handler {
public:
    ContentReader(Styles &styles, ConvertedBook &book) : styles_(styles), book_(book) {}

    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override;
    void OnEnd(const xml::Name &name) override;
    void OnText(std::string_view text) override;

private:
    // Cells of the row being read: one value over count columns.
    struct Run {
        uint32_t column = 0, count = 0;
        CellValue value;
        std::string format;
        std::string storedNumber;  // the text of a number that didn't read
    };
    // The default cell style of columns first..last.
    struct ColumnStyle {
        uint64_t first = 0, last = 0;
        std::string style;
    };
    // What a cell's start tag says.
    struct CellAttributes {
        std::string type, value, dateValue, timeValue, booleanValue, stringValue, style, resultType;
        bool hasStringValue = false;
        bool unreadableNumber = false;
        uint64_t repeat = 1;
    };

    void StartTable(const xml::Attributes &attrs);
    void StartColumn(const xml::Attributes &attrs);
    void StartRow(const xml::Attributes &attrs);
    void StartCell(const xml::Attributes &attrs);
    void StartInCell(const xml::Name &name, const xml::Attributes &attrs);
    void EndCell();
    void EndRow();
    CellValue ValueOfCell(std::string &format);
    const std::string &DefaultStyleOfColumn(uint64_t column) const;
    uint64_t Repeat(const xml::Attributes &attrs, const char *attribute) const;
    [[noreturn]] void FailAt(const std::string &what) const;

    Styles &styles_;
    ConvertedBook &book_;

    // Depths of the elements being read; 0 when outside them.
    int depth_ = 0, stylesDepth_ = 0, spreadsheetDepth_ = 0, tableDepth_ = 0, rowDepth_ = 0, cellDepth_ = 0,
        paragraphDepth_ = 0, skipDepth_ = 0;

    double nullDateShift_ = 0;  // days from 1899-12-30 to the file's null date
    uint64_t expandedBytes_ = 0;  // what repeated cells have cost so far
    std::string sheetName_;
    std::vector<ColumnStyle> columnStyles_;
    uint64_t nextColumnDefinition_ = 1;
    uint64_t row_ = 1, rowRepeat_ = 1;
    std::string rowStyle_;
    std::vector<Run> runs_;
    uint64_t column_ = 1;
    CellAttributes cell_;
    CellText text_;
};

}  // namespace workbook::ods
