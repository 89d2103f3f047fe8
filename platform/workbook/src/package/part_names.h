// SPDX-License-Identifier: MIT
// Part names of a package and the targets of relationships between them.
#pragma once

#include <string>
#include <string_view>

namespace workbook {

// The part a relationship target names, relative to the part that holds the
// relationship (sourcePart empty for the package itself), without the leading
// slash. Raises ComError when the target climbs out of the package.
std::string ResolveTarget(const std::string &sourcePart, std::string_view target);

// The relationships part of a part: "xl/workbook.xml" -> "xl/_rels/workbook.xml.rels".
std::string RelsPartOf(const std::string &part);

// A target for a relationship from fromPart to toPart: relative when toPart
// lies in fromPart's folder or below it, else absolute.
std::string TargetFor(const std::string &fromPart, const std::string &toPart);

// The last segment of a relationship type URI ("worksheet", "sharedStrings"),
// which names the kind in the transitional and the strict namespaces alike.
std::string_view RelationshipKind(std::string_view typeUri);

}  // namespace workbook
