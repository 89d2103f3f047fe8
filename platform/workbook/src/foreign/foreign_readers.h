// SPDX-License-Identifier: MIT
// The readers of the formats the engine reads but doesn't write. Each fills
// a converted book from its file and raises ComError (kBadFile) with the
// reason when the file can't be read; the reason need not name the file.
#pragma once

#include <memory>
#include <string>

#include "foreign/converted_book.h"
#include "foreign/file_kind.h"
#include "package/zip_source.h"

namespace workbook {

// Whether a zip package is an OpenDocument spreadsheet rather than an Office
// Open XML one.
bool IsOpenDocument(const PackageSource &package);

// The reader of a file of this kind (BinaryWorkbook or DelimitedText) or of
// an OpenDocument package: fills book, or raises ComError.
void ReadConverted(FileKind kind, const std::string &path, PackageSource *package, ConvertedBook &book);

}  // namespace workbook
