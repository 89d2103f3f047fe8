// SPDX-License-Identifier: MIT
#include "dialogs/catalogue_lists.h"

#include "dialogs/sorted_entries.h"
#include "units/kvt.h"

namespace vantrel::dialogs {

std::vector<std::string> CatalogueItemTypes()
{
    std::vector<std::string> names;
    const int count = kvtGetItemTypeCount();
    for (int seq = 1; seq <= count; ++seq) {
        int ident = 0;
        const char *name = nullptr;
        if (kvtGetItemTypeSeq(seq, &ident, &name) && name) names.emplace_back(name);
    }
    return names;
}

std::vector<std::string> GetUnitsOfItemType(const std::string &itemType)
{
    int ident = 0;
    const int count = kvtGetItemTypeCount();
    for (int seq = 1; seq <= count; ++seq) {
        int found = 0;
        const char *name = nullptr;
        if (!kvtGetItemTypeSeq(seq, &found, &name)) continue;
        ident = found;
        if (name && EqualIgnoringCase(name, itemType)) break;
    }
    std::vector<std::string> units;
    const int unitCount = kvtGetItemUnitCount(ident);
    for (int seq = 1; seq <= unitCount; ++seq) {
        int unit = 0;
        const char *name = nullptr;
        if (kvtGetItemUnitSeq(ident, seq, &unit, &name) && name) units.emplace_back(name);
    }
    return units;
}

}  // namespace vantrel::dialogs
