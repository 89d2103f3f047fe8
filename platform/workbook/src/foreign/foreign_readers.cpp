// SPDX-License-Identifier: MIT
#include "foreign/foreign_readers.h"

#include "csv/delimited_text_reader.h"
#include "errors.h"
#include "ods/ods_reader.h"
#include "xls/xls_reader.h"

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
    if (package) return ods::ReadSpreadsheet(*package, book);
    if (kind == FileKind::BinaryWorkbook) return xls::ReadBinaryWorkbook(path, book);
    if (kind == FileKind::DelimitedText) return csv::ReadDelimitedText(path, book);
    Fail(kBadFile, std::string("the engine has no reader for ") + KindName(kind));
}

}  // namespace workbook
