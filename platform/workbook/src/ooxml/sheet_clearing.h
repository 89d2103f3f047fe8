// SPDX-License-Identifier: MIT
// What clearing a whole worksheet takes out of its part: the cells, and every
// element that holds or dresses content (column settings, merged ranges,
// hyperlinks, conditional formats, data validation, filters, the anchors of
// comments, drawings, controls and tables, and the extensions that carry more
// of the same), together with the relationships those elements name. What
// concerns the page (views, margins, set-up, header and footer) stays.
#pragma once

#include <set>
#include <string>
#include <string_view>

#include "cells/sheet_model.h"

namespace workbook {

struct ClearedSheetPart {
    std::string text;              // the part without them, its sheetData empty
    std::set<std::string> relIds;  // relationships named by the elements taken out
};

// Raises ComError (kRequestRefused) for a protected sheet, naming it, and
// kBadFile for a part that doesn't read; nothing is changed either way.
ClearedSheetPart ClearSheetPart(std::string_view text, const SheetLayout &layout, const std::string &partName,
                                const std::string &sheetName);

// Relationships of a sheet that no element names, and that go with its
// content all the same: comments, threaded comments and pivot tables.
bool GoesWithSheetContent(std::string_view relationshipType);

}  // namespace workbook
