// SPDX-License-Identifier: MIT
// A workbook read from a format the engine reads but doesn't write (.xls,
// .ods, .csv): a reader hands over its sheets cell by cell, and the book
// becomes the parts of an equivalent package, which the engine then opens as
// it opens any other. So every reading operation, the shown text included,
// behaves the same whatever the file's format.
#pragma once

#include <cstdint>
#include <unordered_map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "cells/cell_value.h"
#include "styles/styles.h"

namespace workbook {

class ConvertedBook {
public:
    ConvertedBook();

    // Dates as days since 1904-01-01 rather than since 1899-12-30.
    void SetDate1904(bool on) { date1904_ = on; }
    // A new sheet; the cells that follow belong to it. A name the book
    // already has, or an empty one, is made unique ("Sheet2", "Data (2)").
    void AddSheet(std::string_view name);
    // One cell of the last sheet, 1-based. Rows come in rising order and the
    // cells of a row in rising column order; an empty value is passed over.
    // numberFormat is the format code that shows the value ("" for General).
    // Raises ComError for a cell out of order or beyond the sheet's edge.
    // A storedNumber that isn't empty is the file's text of a number that
    // didn't read; the cell then holds that text, and reads as the engine
    // reads such a number in any workbook (value is not used).
    void Put(uint32_t row, uint32_t column, const CellValue &value, std::string_view numberFormat = {},
             std::string_view storedNumber = {});

    size_t SheetCount() const { return sheets_.size(); }
    // The package's parts; the book is spent afterwards.
    std::vector<std::pair<std::string, std::string>> TakeParts();

private:
    struct Sheet {
        std::string name;
        // The sheet part as it grows: its head, whose dimension is written
        // over when the sheet is whole, and the <row> elements, the last one
        // still open. One buffer, so that the part is never copied.
        std::string xml;
        uint32_t firstRow = 0, lastRow = 0, lastColumn = 0;
        uint32_t minColumn = 0, maxColumn = 0;
        uint64_t cellCount = 0;
    };

    std::vector<Sheet> sheets_;
    Styles styles_;
    std::unordered_map<std::string, uint32_t> styleOf_;  // format code to cell format
    bool date1904_ = false;
};

}  // namespace workbook
