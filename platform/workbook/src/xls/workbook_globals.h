// SPDX-License-Identifier: MIT
// What the first part of a workbook stream says for all its sheets: the
// version, the sheets and where they start, the shared strings, the number
// formats of the cell formats, the date system and the code page.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "xls/biff_text.h"

namespace workbook::xls {

enum class Version { Biff2To4, Biff5, Biff8 };

struct SheetEntry {
    std::string name;
    uint32_t streamOffset = 0;  // of the sheet's BOF record, as the workbook says
};

struct WorkbookGlobals {
    Version version = Version::Biff8;
    bool date1904 = false;
    bool hasGlobals = false;          // false: a lone worksheet stream, one sheet
    size_t sheetsFrom = 0;            // stream offset after the globals
    std::vector<SheetEntry> sheets;   // the worksheets, in the workbook's order
    std::vector<std::string> strings; // the shared strings
    std::vector<std::string> numberFormatOfXf;  // "" for General
    std::unique_ptr<CodePage> codePage = std::make_unique<CodePage>();
};

// Reads the globals from the start of stream. Raises ComError (kBadFile) for
// a stream that starts with no workbook records or an encrypted workbook.
WorkbookGlobals ReadGlobals(std::string_view stream);

}  // namespace workbook::xls
