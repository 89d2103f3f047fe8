// SPDX-License-Identifier: MIT
// Writes a worksheet part back: the part's XML as it stands, with dimension,
// cols and sheetData made anew from the sheet store.
#pragma once

#include <functional>
#include <string>

#include "cells/sheet_model.h"
#include "cells/string_pool.h"
#include "package/parallel_deflate.h"
#include "package/zip_source.h"

namespace workbook {

struct SheetWriteContext {
    const StringPool &strings;
    // The shared-string index under which a pooled text is written.
    std::function<uint32_t(uint32_t poolIndex)> sharedIndexOf;
};

// The new part, handed to sink in pieces of a few megabytes as it is made,
// so that a large sheet's text is never whole in memory. newLayout receives
// the positions in it, for the sheet to take over once the package has been
// saved.
void WriteSheet(const PackageSource &source, const std::string &entry, const SheetModel &sheet,
                const SheetWriteContext &ctx, SheetLayout &newLayout, const PieceSink &sink);

}  // namespace workbook
