// SPDX-License-Identifier: MIT
// Formulas the file holds without a result: a spreadsheet program computes
// them when it opens the file, and so does the engine, once, as it reads the
// workbook. Workbooks whose formulas all carry a result don't get here.
#pragma once

#include <string>
#include <vector>

#include "cells/sheet_model.h"
#include "cells/string_pool.h"

namespace workbook {

struct NamedSheet {
    std::string name;
    SheetModel *model;
};

// Computes every formula without a result on the sheets (given in the
// workbook's order, as formulas name them) and stores the result in its cell;
// the formula stays. Raises ComError (kBadFile) naming the sheet, the cell and
// the reason for a formula that can't be computed: an unknown function or
// name, a reference to another workbook, a circular reference, an array
// formula.
void ComputeFormulasWithoutResult(const std::vector<NamedSheet> &sheets, StringPool &strings, bool date1904);

}  // namespace workbook
