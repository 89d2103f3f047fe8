// SPDX-License-Identifier: MIT
// The text form of a tree, one file a tree:
//
//   ; vantrel registry, version 1
//   ; <title>
//
//   [CLSID\{4C2698C4-93A5-4D02-8642-B1C2705C538F}]
//   @="GenericExcelVantrel Class"
//   "AppID"="{57B1D7D7-0CDB-494C-896A-DDC1F72AFE15}"
//
// Every key below the root has its line in brackets, with its full path, and
// its values follow it: @ for the default value, a quoted name otherwise.
// Texts are quoted; a backslash escapes \ " and stands before n, r, t or xHH
// for control characters. Lines starting with ';' are comments.
#pragma once

#include <string>
#include <string_view>

#include "key_tree.h"

namespace registry {

inline constexpr std::string_view kTreeFileHeader = "; vantrel registry, version 1";

std::string FormatTree(const Key &root, std::string_view title);

// Reads text into root. Throws Failure(REGISTRY_CORRUPT) with "line N: why"
// when text isn't a tree in this form.
void ParseTree(std::string_view text, Key &root);

}  // namespace registry
