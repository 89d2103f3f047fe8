// SPDX-License-Identifier: MIT
// The parts of a new workbook: one empty worksheet named "Sheet1", a plain
// stylesheet and an empty shared-string table, in the transitional format.
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "xml/namespaces.h"

namespace workbook {

// What every part a workbook made here begins with, and the relationship
// types its parts name.
inline constexpr const char *kXmlHead = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n";
inline constexpr const char *kOfficeDocument =
    "http://schemas.openxmlformats.org/officeDocument/2006/relationships/officeDocument";
inline std::string RelType(const char *kind) { return std::string(ns::RelTypeBase(ns::kMain)) + kind; }

std::vector<std::pair<std::string, std::string>> NewWorkbookParts();

}  // namespace workbook
