// SPDX-License-Identifier: MIT
#include "foreign/foreign_readers.h"

#include "csv/delimited_text_reader.h"
#include "errors.h"

namespace workbook {

bool IsOpenDocument(const PackageSource &package)
{
    const std::string entry = package.Find("mimetype");
    if (entry.empty()) return false;
    const std::string type = package.ReadAll(entry);
    return type.rfind("application/vnd.oasis.opendocument.spreadsheet", 0) == 0;
}

void ReadConverted(FileKind kind, const std::string &path, PackageSource *package, ConvertedBook &book)
{
    if (!package && kind == FileKind::DelimitedText) return csv::ReadDelimitedText(path, book);
    if (package) Fail(kBadFile, "OpenDocument spreadsheets (.ods) can't be read yet");
    Fail(kBadFile, std::string(KindName(kind)) + " can't be read yet");
}

}  // namespace workbook
