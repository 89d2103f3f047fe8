// SPDX-License-Identifier: MIT
// The units library through its eight exported functions.
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "units/catalogue.h"
#include "units/kvt.h"

namespace {

struct UnitRow {
    int ident;
    std::string name;
};

struct TypeRow {
    int ident;
    std::string name;
    std::vector<UnitRow> units;
};

// The whole catalogue, read by sequence walks only.
std::vector<TypeRow> WalkCatalogue()
{
    std::vector<TypeRow> rows;
    const int count = kvtGetItemTypeCount();
    for (int seq = 1; seq <= count; ++seq) {
        int ident = 0;
        const char *name = nullptr;
        EXPECT_NE(kvtGetItemTypeSeq(seq, &ident, &name), 0) << "type seq " << seq;
        if (!name) continue;
        TypeRow row{ident, name, {}};
        const int unitCount = kvtGetItemUnitCount(ident);
        EXPECT_GE(unitCount, 1) << row.name;
        for (int useq = 1; useq <= unitCount; ++useq) {
            int unit = 0;
            const char *unitName = nullptr;
            EXPECT_NE(kvtGetItemUnitSeq(ident, useq, &unit, &unitName), 0)
                << row.name << " unit seq " << useq;
            if (unitName) row.units.push_back({unit, unitName});
        }
        rows.push_back(std::move(row));
    }
    return rows;
}

TEST(UnitsCatalogue, WalksAreConsistentAndFitTheExpectedShape)
{
    const std::vector<TypeRow> rows = WalkCatalogue();
    ASSERT_GE(rows.size(), 15u);
    ASSERT_LE(rows.size(), 25u);

    EXPECT_EQ(rows[0].name, "Undefined");
    ASSERT_EQ(rows[0].units.size(), 1u);
    EXPECT_EQ(rows[0].units[0].name, "undefined");

    std::set<std::string> typeNames;
    std::set<int> typeIdents;
    std::set<int> unitIdents;
    for (std::size_t i = 0; i < rows.size(); ++i) {
        const TypeRow &row = rows[i];
        EXPECT_NE(row.ident, static_cast<int>(i + 1)) << "identifier equals sequence: " << row.name;
        EXPECT_TRUE(typeNames.insert(row.name).second) << "duplicate type name " << row.name;
        EXPECT_TRUE(typeIdents.insert(row.ident).second) << "duplicate type ident " << row.ident;
        std::set<std::string> unitNames;
        for (std::size_t u = 0; u < row.units.size(); ++u) {
            EXPECT_NE(row.units[u].ident, static_cast<int>(u + 1)) << row.units[u].name;
            EXPECT_TRUE(unitIdents.insert(row.units[u].ident).second)
                << "unit ident used twice: " << row.units[u].ident;
            EXPECT_TRUE(unitNames.insert(row.units[u].name).second)
                << row.name << " lists " << row.units[u].name << " twice";
        }
    }
    // No unit identifier is also an item type identifier.
    for (int ident : typeIdents) EXPECT_EQ(unitIdents.count(ident), 0u) << ident;

    // What a hydrology user looks for is there.
    for (const char *expected : {"Water Level", "Discharge", "Rainfall", "Temperature", "Wind Speed",
                                 "Wind Direction", "Pressure", "Concentration", "Volume", "Area"})
        EXPECT_EQ(typeNames.count(expected), 1u) << expected;
}

TEST(UnitsCatalogue, KeysEqualNamesAndEveryIdentifierResolvesBack)
{
    for (const TypeRow &row : WalkCatalogue()) {
        const char *text = nullptr;
        ASSERT_NE(kvtGetItemTypeIdent(row.ident, &text), 0) << row.name;
        EXPECT_STREQ(text, row.name.c_str());
        text = nullptr;
        ASSERT_NE(kvtGetItemTypeKey(row.ident, &text), 0) << row.name;
        EXPECT_STREQ(text, row.name.c_str());

        std::set<std::string> abbreviations;
        for (const UnitRow &unit : row.units) {
            text = nullptr;
            ASSERT_NE(kvtGetUnitKey(unit.ident, &text), 0) << unit.name;
            EXPECT_STREQ(text, unit.name.c_str());
            text = nullptr;
            ASSERT_NE(kvtGetUnitAbbreviation(unit.ident, &text), 0) << unit.name;
            ASSERT_NE(text, nullptr);
            EXPECT_STRNE(text, "") << unit.name;
            EXPECT_TRUE(abbreviations.insert(text).second)
                << row.name << ": abbreviation " << text << " used twice";
            for (const char *p = text; *p; ++p) EXPECT_LT(static_cast<unsigned char>(*p), 0x80);
        }
    }
}

TEST(UnitsCatalogue, SameUnitNameUnderSeveralTypesHasDistinctIdentifiers)
{
    std::vector<int> meters;
    for (const TypeRow &row : WalkCatalogue())
        for (const UnitRow &unit : row.units)
            if (unit.name == "meter") meters.push_back(unit.ident);
    ASSERT_GE(meters.size(), 2u);
    EXPECT_EQ(std::set<int>(meters.begin(), meters.end()).size(), meters.size());

    const int waterLevel = *units::ItemTypeIdentFromSeq(2);
    EXPECT_EQ(units::ItemTypeKey(waterLevel), "Water Level");
    const int meter = *units::UnitIdentFromSeq(waterLevel, 1);
    EXPECT_EQ(units::UnitKey(meter), "meter");
    EXPECT_EQ(units::UnitAbbreviation(meter), "m");
}

TEST(UnitsCatalogue, InvalidArgumentsFailAndLeaveOutputsUntouched)
{
    const int count = kvtGetItemTypeCount();
    int firstType = 0;
    const char *name = nullptr;
    ASSERT_NE(kvtGetItemTypeSeq(1, &firstType, &name), 0);
    int firstUnit = 0;
    ASSERT_NE(kvtGetItemUnitSeq(firstType, 1, &firstUnit, &name), 0);
    const int unitCount = kvtGetItemUnitCount(firstType);

    const char *const sentinel = "untouched";
    for (int seq : {0, -1, count + 1, 1 << 30}) {
        int ident = -77;
        const char *text = sentinel;
        EXPECT_EQ(kvtGetItemTypeSeq(seq, &ident, &text), 0) << seq;
        EXPECT_EQ(ident, -77);
        EXPECT_EQ(text, sentinel);

        int unit = -77;
        EXPECT_EQ(kvtGetItemUnitSeq(firstType, seq == count + 1 ? unitCount + 1 : seq, &unit, &text), 0)
            << seq;
        EXPECT_EQ(unit, -77);
        EXPECT_EQ(text, sentinel);
    }

    // Identifiers that name nothing, and identifiers of the wrong kind.
    for (int ident : {0, -1, 1, 2, firstUnit, 123456}) {
        const char *text = sentinel;
        EXPECT_EQ(kvtGetItemTypeIdent(ident, &text), 0) << ident;
        EXPECT_EQ(kvtGetItemTypeKey(ident, &text), 0) << ident;
        EXPECT_EQ(kvtGetItemUnitCount(ident), 0) << ident;
        int unit = -77;
        EXPECT_EQ(kvtGetItemUnitSeq(ident, 1, &unit, &text), 0) << ident;
        EXPECT_EQ(unit, -77);
        EXPECT_EQ(text, sentinel);
    }
    for (int unit : {0, -1, 1, firstType, 123456}) {
        const char *text = sentinel;
        EXPECT_EQ(kvtGetUnitKey(unit, &text), 0) << unit;
        EXPECT_EQ(kvtGetUnitAbbreviation(unit, &text), 0) << unit;
        EXPECT_EQ(text, sentinel);
    }

    // Null out pointers: no crash, no success, the other output untouched.
    int ident = -77;
    const char *text = sentinel;
    EXPECT_EQ(kvtGetItemTypeSeq(1, nullptr, &text), 0);
    EXPECT_EQ(text, sentinel);
    EXPECT_EQ(kvtGetItemTypeSeq(1, &ident, nullptr), 0);
    EXPECT_EQ(ident, -77);
    EXPECT_EQ(kvtGetItemTypeIdent(firstType, nullptr), 0);
    EXPECT_EQ(kvtGetItemTypeKey(firstType, nullptr), 0);
    EXPECT_EQ(kvtGetItemUnitSeq(firstType, 1, nullptr, &text), 0);
    EXPECT_EQ(text, sentinel);
    EXPECT_EQ(kvtGetItemUnitSeq(firstType, 1, &ident, nullptr), 0);
    EXPECT_EQ(ident, -77);
    EXPECT_EQ(kvtGetUnitKey(firstUnit, nullptr), 0);
    EXPECT_EQ(kvtGetUnitAbbreviation(firstUnit, nullptr), 0);
}

TEST(UnitsCatalogue, TranslationHelpersGoBothWays)
{
    const std::vector<TypeRow> rows = WalkCatalogue();
    for (std::size_t i = 0; i < rows.size(); ++i) {
        const int seq = static_cast<int>(i + 1);
        EXPECT_EQ(units::ItemTypeIdentFromSeq(seq), rows[i].ident);
        EXPECT_EQ(units::ItemTypeSeqFromIdent(rows[i].ident), seq);
        for (std::size_t u = 0; u < rows[i].units.size(); ++u) {
            const int useq = static_cast<int>(u + 1);
            EXPECT_EQ(units::UnitIdentFromSeq(rows[i].ident, useq), rows[i].units[u].ident);
            EXPECT_EQ(units::UnitSeqFromIdent(rows[i].ident, rows[i].units[u].ident), useq);
        }
    }
    EXPECT_EQ(units::ItemTypeIdentFromSeq(0), std::nullopt);
    EXPECT_EQ(units::ItemTypeSeqFromIdent(1), std::nullopt);
    // A unit of one type is not found within another.
    EXPECT_EQ(units::UnitSeqFromIdent(rows[1].ident, rows[2].units[0].ident), std::nullopt);
    EXPECT_EQ(units::ItemTypeKey(0), std::nullopt);
    EXPECT_EQ(units::UnitKey(0), std::nullopt);
}

}  // namespace
