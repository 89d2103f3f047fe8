// SPDX-License-Identifier: MIT
// Reads a worksheet part into the compact store in one streaming pass.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "cells/sheet_model.h"
#include "cells/string_pool.h"
#include "package/zip_source.h"
#include "workbook/limits.h"

namespace workbook {

struct SheetContext {
    StringPool &strings;
    uint32_t sharedStringCount;  // pool indexes below it are shared strings
    bool date1904;
    // What the workbook's sheets read before leave of its bound on cells.
    uint64_t cellLimit = limits::kMaxCellsPerSheet;
};

// Who reads the rows inside sheetData: the hand-written scanner wherever the
// part allows it (expat reads the rest), or expat throughout. Both give the
// same model and the same errors.
enum class SheetScan { Fast, ExpatOnly };

// Reads one worksheet part handed over in pieces of any size. Raises ComError
// on malformed XML, a position beyond the sheet grid, or a reference to a
// shared string that doesn't exist.
class SheetPartReader {
public:
    SheetPartReader(const std::string &entry, const SheetContext &ctx, SheetScan scan = SheetScan::Fast);
    ~SheetPartReader();
    SheetPartReader(const SheetPartReader &) = delete;
    SheetPartReader &operator=(const SheetPartReader &) = delete;

    void Feed(const char *data, size_t size);
    SheetModel Finish();
    // Rows the scanner read (none with ExpatOnly, or where it stood aside).
    uint64_t RowsScanned() const;

private:
    struct Impl;
    std::unique_ptr<Impl> impl_;
};

SheetModel ReadSheet(const PackageSource &source, const std::string &entry, const SheetContext &ctx,
                     SheetScan scan = SheetScan::Fast);

}  // namespace workbook
