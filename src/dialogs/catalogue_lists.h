// SPDX-License-Identifier: MIT
// What the data page's lists hold, out of the units catalogue.
#pragma once

#include <string>
#include <vector>

namespace vantrel::dialogs {

// The names of the item types in sequence order; a sequence number that
// doesn't answer is passed over.
std::vector<std::string> CatalogueItemTypes();

// The unit names of the first item type whose name equals itemType, ignoring
// case, in sequence order. With no such item type, the units of the last
// entry walked (an item type name that the lists never offer).
std::vector<std::string> GetUnitsOfItemType(const std::string &itemType);

}  // namespace vantrel::dialogs
