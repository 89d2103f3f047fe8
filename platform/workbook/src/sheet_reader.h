// SPDX-License-Identifier: MIT
// Reads a worksheet part into the compact store in one streaming pass.
#pragma once

#include <string>

#include "sheet_model.h"
#include "string_pool.h"
#include "zip_source.h"

namespace workbook {

struct SheetContext {
    StringPool &strings;
    uint32_t sharedStringCount;  // pool indexes below it are shared strings
    bool date1904;
};

// Raises ComError on malformed XML, a position beyond the sheet grid, or a
// reference to a shared string that doesn't exist.
SheetModel ReadSheet(const PackageSource &source, const std::string &entry, const SheetContext &ctx);

}  // namespace workbook
