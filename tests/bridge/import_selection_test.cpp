// SPDX-License-Identifier: MIT
// What a template brings to an import: the selected items and the lists of
// titles, item types, units and value types. Only a template sets them, so
// the tests put them into the bridge directly and run the import on a real
// workbook.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "bridge/excel_vantrel.h"
#include "hostseries/memory_series.h"
#include "support/test_host.h"

// The seam: the bridge's import run with a template's lists in place.
struct CExcelVantrelProbe {
    std::string selectedItems;
    std::vector<std::string> titles, itemTypes, itemUnits, valueTypes;

    bool ReadSheets(IHostSeries *series, const std::string &book, const std::string &spec) const
    {
        automation::ComPtr<IVantrel> object;
        EXPECT_EQ(CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, object.OutVoid()), S_OK);
        auto &bridge = *static_cast<CExcelVantrel *>(object.Get());
        bridge.SetHostSeries(series);
        bridge.m_silent = 1;
        bridge.m_selectedItems = selectedItems;
        bridge.m_itemTitles = titles;
        bridge.m_itemTypes = itemTypes;
        bridge.m_itemUnits = itemUnits;
        bridge.m_valueTypes = valueTypes;
        std::string message;
        bool ok = bridge.EnsureSession(message) && bridge.m_excel->OpenWorkbook(book, message);
        if (ok) {
            ok = bridge.ReadSheets(spec, message);
            bridge.m_excel->CloseWorkbook(0);
        }
        bridge.EndSession();
        return ok;
    }

    bool Parse(const std::string &text, std::vector<int32_t> &items) const
    {
        automation::ComPtr<IVantrel> object;
        CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, object.OutVoid());
        auto &bridge = *static_cast<CExcelVantrel *>(object.Get());
        bridge.m_selectedItems = text;
        return bridge.ParseSelectedItems(items);
    }
};

namespace {

const std::string kBook = std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/import.xlsx";
const std::string kRows = "DateTimeCol=1;StartRow=5;ItemDescriptionRow=1;UnitTypeRow=2;UnitRow=3;ValueTypeRow=4;";

struct Kept {
    std::string title;
    LONG itemType = 0, unit = 0, valueType = 0;
    size_t valueCount = 0;
    bool operator==(const Kept &) const = default;
};

void PrintTo(const Kept &k, std::ostream *out)
{
    *out << "{" << k.title << ", " << k.itemType << ", " << k.unit << ", " << k.valueType << ", " << k.valueCount << "}";
}

std::vector<Kept> ReadWith(const CExcelVantrelProbe &probe, const std::string &spec)
{
    auto series = hostseries::MakeSeries();
    EXPECT_TRUE(probe.ReadSheets(series.Get(), kBook, spec));
    std::vector<Kept> kept;
    for (LONG i = 1; i <= testing_host::ItemCount(series.Get()); ++i) {
        auto item = hostseries::ItemAt(*series.Get(), i);
        Kept k;
        automation::Bstr title;
        item->GetTitle(title.Out());
        k.title = title.Utf8();
        item->GetItemType(&k.itemType);
        item->GetItemUnit(&k.unit);
        item->GetValueType(&k.valueType);
        k.valueCount = hostseries::ReadValues(*item.Get()).size();
        kept.push_back(k);
    }
    return kept;
}

std::vector<std::string> Titles(const std::vector<Kept> &kept)
{
    std::vector<std::string> titles;
    for (const Kept &k : kept) titles.push_back(k.title);
    return titles;
}

using Names = std::vector<std::string>;

TEST(ImportSelection, SelectedItemsCountWhatEarlierSheetsKept)
{
    CExcelVantrelProbe probe;
    probe.selectedItems = "SelItems=0,2";
    EXPECT_EQ(Titles(ReadWith(probe, kRows + "ExcelSheet=7;")), (Names{"S1 a", "S1 c"}));

    // The second sheet's items are numbered after the two that the first kept.
    probe.selectedItems = "SelItems=0,2,3";
    const auto overTwo = ReadWith(probe, kRows + "ExcelSheet=7,8;");
    EXPECT_EQ(Titles(overTwo), (Names{"S1 a", "S1 c", "S2 a", "S2 b"}));
    for (const Kept &k : overTwo) EXPECT_EQ(k.valueCount, 3u) << k.title;
    probe.selectedItems = "SelItems=1";
    EXPECT_EQ(Titles(ReadWith(probe, kRows + "ExcelSheet=7,8;")), (Names{"S1 b", "S2 a"}));

    // No selection, or one that names nothing, means all items.
    for (const char *text : {"", "SelItems=", "Other=2"}) {
        probe.selectedItems = text;
        EXPECT_EQ(ReadWith(probe, kRows + "ExcelSheet=7;").size(), 3u) << text;
    }

    std::vector<int32_t> items{99};
    EXPECT_TRUE(probe.Parse("SelItems=2,,5", items));
    EXPECT_EQ(items, (std::vector<int32_t>{2, 5}));
    EXPECT_FALSE(probe.Parse("SelItems=", items));
    EXPECT_TRUE(items.empty());
    EXPECT_FALSE(probe.Parse("selitems=1", items));
    EXPECT_FALSE(probe.Parse("", items));
}

TEST(ImportSelection, TemplateListsStandInForMissingRows)
{
    const std::string noHeaders = "DateTimeCol=1;StartRow=5;ExcelSheet=7;";
    CExcelVantrelProbe probe;
    probe.itemTypes = {"Water Level", "discharge", "Rainfall"};
    probe.itemUnits = {"cm", "l/s", "inch"};
    probe.valueTypes = {"Instantaneous", "accumulated", "Step_Accumulated"};
    probe.titles = {"One", "Two", "Three"};
    const std::vector<Kept> expected = {
        {"One", 1000, 2101, 0, 3},
        {"Two", 1001, 2201, 1, 3},
        {"Three", 1002, 2303, 2, 3},
    };
    EXPECT_EQ(ReadWith(probe, noHeaders), expected);

    // Fewer titles than items: the rest are named by their columns, and every
    // item gets its values. A unit list of another length leaves the units
    // unset but keeps the item types.
    probe.titles = {"One"};
    probe.itemUnits = {"cm"};
    const std::vector<Kept> partly = {
        {"One", 1000, 0, 0, 3},
        {"C", 1001, 0, 1, 3},
        {"D", 1002, 0, 2, 3},
    };
    EXPECT_EQ(ReadWith(probe, noHeaders), partly);

    // A type list of another length fails the types for the whole sheet.
    probe.itemTypes = {"Water Level"};
    probe.titles.clear();
    const auto untyped = ReadWith(probe, noHeaders);
    ASSERT_EQ(untyped.size(), 3u);
    EXPECT_EQ(untyped[0], (Kept{"B", 0, 0, 0, 3}));
    EXPECT_EQ(untyped[2].valueType, 2);
}

}  // namespace
