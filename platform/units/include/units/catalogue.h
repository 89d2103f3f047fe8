// SPDX-License-Identifier: MIT
// C++ helpers over the units library: translation between sequence numbers
// and identifiers, and copies of the catalogue's texts.
#pragma once

#include <optional>
#include <string>

#include "units/kvt.h"

namespace units {

// Identifier of the item type with sequence number seq.
inline std::optional<int> ItemTypeIdentFromSeq(int seq)
{
    int ident = 0;
    const char *name = nullptr;
    if (!kvtGetItemTypeSeq(seq, &ident, &name)) return std::nullopt;
    return ident;
}

// Sequence number of the item type ident, found by walking the catalogue.
inline std::optional<int> ItemTypeSeqFromIdent(int ident)
{
    const int count = kvtGetItemTypeCount();
    for (int seq = 1; seq <= count; ++seq)
        if (ItemTypeIdentFromSeq(seq) == ident) return seq;
    return std::nullopt;
}

// Identifier of the unit with sequence number seq within the item type typeIdent.
inline std::optional<int> UnitIdentFromSeq(int typeIdent, int seq)
{
    int unit = 0;
    const char *name = nullptr;
    if (!kvtGetItemUnitSeq(typeIdent, seq, &unit, &name)) return std::nullopt;
    return unit;
}

// Sequence number of the unit unitIdent within the item type typeIdent.
inline std::optional<int> UnitSeqFromIdent(int typeIdent, int unitIdent)
{
    const int count = kvtGetItemUnitCount(typeIdent);
    for (int seq = 1; seq <= count; ++seq)
        if (UnitIdentFromSeq(typeIdent, seq) == unitIdent) return seq;
    return std::nullopt;
}

inline std::optional<std::string> ItemTypeKey(int ident)
{
    const char *text = nullptr;
    if (!kvtGetItemTypeKey(ident, &text)) return std::nullopt;
    return std::string(text);
}

inline std::optional<std::string> UnitKey(int unit)
{
    const char *text = nullptr;
    if (!kvtGetUnitKey(unit, &text)) return std::nullopt;
    return std::string(text);
}

inline std::optional<std::string> UnitAbbreviation(int unit)
{
    const char *text = nullptr;
    if (!kvtGetUnitAbbreviation(unit, &text)) return std::nullopt;
    return std::string(text);
}

}  // namespace units
