// SPDX-License-Identifier: MIT
// What kind of workbook a file holds, told by its first bytes (and, for plain
// text, which has none of its own, by its name), and whether its name agrees.
#pragma once

#include <string>

namespace workbook {

enum class FileKind {
    Package,         // a zip: Office Open XML (.xlsx, .xlsm) or OpenDocument (.ods)
    BinaryWorkbook,  // the compound-file binary format (.xls)
    DelimitedText,   // .csv, .tsv or .txt
    Unknown,         // none of these, or a file that can't be read (the zip layer says why)
};

// The kind by content; text only when the name ends in .csv, .tsv or .txt.
FileKind SniffFileKind(const std::string &path);

// The kind the file's extension promises; Unknown for an extension of none
// of them, or none at all.
FileKind KindOfExtension(const std::string &path);

// Whether the name ends in .ods or .ots.
bool IsOpenDocumentName(const std::string &path);
// Whether the name ends in .xlsm or .xltm, the macro-enabled kinds.
bool IsMacroWorkbookName(const std::string &path);

// What a file of this kind is called in messages ("an .xls workbook").
const char *KindName(FileKind kind);

}  // namespace workbook
