// SPDX-License-Identifier: MIT
// Writes a worksheet part back: the part's XML as it stands, with dimension,
// cols and sheetData made anew from the sheet store.
#pragma once

#include <functional>
#include <string>

#include "cells/sheet_model.h"
#include "cells/string_pool.h"
#include "package/zip_source.h"

namespace workbook {

struct SheetWriteContext {
    const StringPool &strings;
    // The shared-string index under which a pooled text is written.
    std::function<uint32_t(uint32_t poolIndex)> sharedIndexOf;
};

// The new part. newLayout receives the positions in it, for the sheet to take
// over once the package has been saved.
std::string WriteSheet(const PackageSource &source, const std::string &entry, const SheetModel &sheet,
                       const SheetWriteContext &ctx, SheetLayout &newLayout);

// The <sheetData> element alone, for tests and new parts.
void AppendSheetData(std::string &out, const SheetModel &sheet, const SheetWriteContext &ctx,
                     std::string_view prefix);

}  // namespace workbook
