// SPDX-License-Identifier: MIT
// The reader of binary workbooks (.xls): the workbook stream of a compound
// file, or a bare stream of records as the oldest writers left it.
#pragma once

#include <string>

#include "foreign/converted_book.h"

namespace workbook::xls {

// Fills book with the worksheets of the workbook at path, their cells with
// values, number formats and the date system. Raises ComError (kBadFile)
// with the reason for a file that can't be read.
void ReadBinaryWorkbook(const std::string &path, ConvertedBook &book);

}  // namespace workbook::xls
