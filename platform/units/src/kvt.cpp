// SPDX-License-Identifier: MIT
// The eight exported functions over the built-in catalogue. Nothing here
// allocates or throws, so no exception can reach a caller.
#include "units/kvt.h"

#include "catalogue_table.h"

namespace {

using units::detail::ItemTypeEntry;
using units::detail::ItemTypes;
using units::detail::UnitEntry;

const ItemTypeEntry *FindItemType(int ident) noexcept
{
    for (const ItemTypeEntry &type : ItemTypes())
        if (type.ident == ident) return &type;
    return nullptr;
}

const UnitEntry *FindUnit(int unit) noexcept
{
    for (const ItemTypeEntry &type : ItemTypes())
        for (const UnitEntry &entry : type.units)
            if (entry.ident == unit) return &entry;
    return nullptr;
}

// Sequence numbers are 1-based; anything outside 1..count is no entry.
template <typename Entry>
const Entry *AtSequence(std::span<const Entry> entries, int seq) noexcept
{
    if (seq < 1 || static_cast<std::size_t>(seq) > entries.size()) return nullptr;
    return &entries[static_cast<std::size_t>(seq) - 1];
}

}  // namespace

int kvtGetItemTypeCount(void) { return static_cast<int>(ItemTypes().size()); }

int kvtGetItemTypeSeq(int seq, int *ident, const char **name)
{
    const ItemTypeEntry *type = AtSequence(ItemTypes(), seq);
    if (!type || !ident || !name) return 0;
    *ident = type->ident;
    *name = type->name;
    return 1;
}

int kvtGetItemTypeIdent(int ident, const char **text)
{
    const ItemTypeEntry *type = FindItemType(ident);
    if (!type || !text) return 0;
    *text = type->name;
    return 1;
}

int kvtGetItemTypeKey(int ident, const char **text)
{
    // The key text is the name: what an export writes reads back on import.
    return kvtGetItemTypeIdent(ident, text);
}

int kvtGetItemUnitCount(int ident)
{
    const ItemTypeEntry *type = FindItemType(ident);
    return type ? static_cast<int>(type->units.size()) : 0;
}

int kvtGetItemUnitSeq(int ident, int seq, int *unit, const char **name)
{
    const ItemTypeEntry *type = FindItemType(ident);
    if (!type || !unit || !name) return 0;
    const UnitEntry *entry = AtSequence(type->units, seq);
    if (!entry) return 0;
    *unit = entry->ident;
    *name = entry->name;
    return 1;
}

int kvtGetUnitKey(int unit, const char **text)
{
    const UnitEntry *entry = FindUnit(unit);
    if (!entry || !text) return 0;
    *text = entry->name;
    return 1;
}

int kvtGetUnitAbbreviation(int unit, const char **text)
{
    const UnitEntry *entry = FindUnit(unit);
    if (!entry || !text) return 0;
    *text = entry->abbreviation;
    return 1;
}
