// SPDX-License-Identifier: MIT
// The parts of a package that nothing points at any more once some
// relationships are gone, so that a save can leave them out.
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "package/zip_source.h"

namespace workbook {

// Of the candidates (entry names), those that no relationship of a part
// staying in the package names, with their own relationships parts and,
// in turn, what only they named. editedRels holds the text of relationships
// parts that differ from the package's; removed are parts already gone.
std::set<std::string> PartsLeftUnused(const PackageSource &source, const std::map<std::string, std::string> &editedRels,
                                      const std::set<std::string> &removed, std::vector<std::string> candidates);

}  // namespace workbook
