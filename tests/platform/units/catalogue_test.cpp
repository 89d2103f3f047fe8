// SPDX-License-Identifier: MIT
// The units catalogue through its exported functions: sequence numbers lead
// to identifiers that are neither sequence numbers nor shared, each with its
// key and, for units, an abbreviation of its own within the item type.
#include <gtest/gtest.h>

#include <set>
#include <string>

#include "units/kvt.h"

namespace {

TEST(UnitsCatalogue, SequenceWalksGiveDistinctIdentifiersKeysAndAbbreviations)
{
    std::set<int> idents;
    const int typeCount = kvtGetItemTypeCount();
    ASSERT_GE(typeCount, 2);
    for (int seq = 1; seq <= typeCount; ++seq) {
        int typeIdent = 0, unitIdent = 0;
        const char *name = nullptr, *key = nullptr, *abbreviation = nullptr;
        ASSERT_NE(kvtGetItemTypeSeq(seq, &typeIdent, &name), 0) << seq;
        EXPECT_TRUE(typeIdent != seq && idents.insert(typeIdent).second) << name;
        ASSERT_TRUE(kvtGetItemTypeKey(typeIdent, &key) && key == std::string(name)) << name;
        const int unitCount = kvtGetItemUnitCount(typeIdent);
        EXPECT_GE(unitCount, 1) << name;
        std::set<std::string> abbreviations;
        for (int useq = 1; useq <= unitCount; ++useq) {
            ASSERT_NE(kvtGetItemUnitSeq(typeIdent, useq, &unitIdent, &name), 0);
            EXPECT_TRUE(unitIdent != useq && idents.insert(unitIdent).second) << name;
            ASSERT_TRUE(kvtGetUnitKey(unitIdent, &key) && key == std::string(name)) << name;
            ASSERT_TRUE(kvtGetUnitAbbreviation(unitIdent, &abbreviation) && *abbreviation) << name;
            EXPECT_TRUE(abbreviations.insert(abbreviation).second) << name << ": " << abbreviation << " twice";
        }
        EXPECT_EQ(kvtGetItemUnitSeq(typeIdent, unitCount + 1, &unitIdent, &name), 0) << "past the last unit";
    }
    int ident = 0;
    const char *name = nullptr;
    EXPECT_EQ(kvtGetItemTypeSeq(typeCount + 1, &ident, &name), 0) << "past the last type";
    EXPECT_EQ(kvtGetItemTypeKey(-12345, &name), 0) << "an identifier the catalogue lacks";

    const char *meter = nullptr;
    ASSERT_NE(kvtGetItemTypeSeq(2, &ident, &name), 0);
    ASSERT_NE(kvtGetItemUnitSeq(ident, 1, &ident, &name), 0);
    ASSERT_NE(kvtGetUnitAbbreviation(ident, &meter), 0);
    EXPECT_STREQ(meter, "m") << "the first unit of the water level";
}

}  // namespace
