// SPDX-License-Identifier: MIT
// The reader of OpenDocument spreadsheets (.ods): the package's styles and
// content parts, streamed, into a converted book.
#pragma once

#include "foreign/converted_book.h"
#include "package/zip_source.h"

namespace workbook::ods {

// Fills book with the spreadsheet's sheets and cells, or raises ComError
// (kBadFile) with the reason.
void ReadSpreadsheet(const PackageSource &package, ConvertedBook &book);

}  // namespace workbook::ods
