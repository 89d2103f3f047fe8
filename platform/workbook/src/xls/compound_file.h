// SPDX-License-Identifier: MIT
// The compound file container of a binary workbook: a small file system of
// sectors, whose stream "Workbook" (or "Book" from older writers) holds the
// workbook's records.
#pragma once

#include <string>
#include <string_view>

namespace workbook::xls {

// Whether bytes start with the compound file signature.
bool IsCompoundFile(std::string_view bytes);

// The bytes of the workbook stream of a compound file. Raises ComError
// (kBadFile) with the reason for a damaged or cut-off container, a sector
// chain that loops, or a container without a workbook stream.
std::string WorkbookStream(std::string_view file);

}  // namespace workbook::xls
