// SPDX-License-Identifier: MIT
// Delimited text (.csv, .tsv, .txt) as a workbook of one sheet, named after
// the file: each field typed as a person typing it into a cell would get it
// (numbers, dates and times with their format, TRUE and FALSE, else text).
#pragma once

#include <string>

#include "foreign/converted_book.h"

namespace workbook::csv {

// Reads the file at path into book, streaming; raises ComError (kBadFile)
// with the reason, naming the line, when the text can't be read.
void ReadDelimitedText(const std::string &path, ConvertedBook &book);

}  // namespace workbook::csv
