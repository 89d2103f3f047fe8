// SPDX-License-Identifier: MIT
// The built-in catalogue of item types and units.
#pragma once

#include <span>

namespace units::detail {

struct UnitEntry {
    int ident;
    const char *name;  // also the key text
    const char *abbreviation;
};

struct ItemTypeEntry {
    int ident;
    const char *name;  // also the key text
    std::span<const UnitEntry> units;
};

// In sequence order: entry i has sequence number i + 1.
std::span<const ItemTypeEntry> ItemTypes() noexcept;

}  // namespace units::detail
