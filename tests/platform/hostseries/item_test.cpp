// SPDX-License-Identifier: MIT
// An item's values in each data type, and its type and unit, set by sequence
// number and kept as the units catalogue's identifiers.
#include <gtest/gtest.h>

#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"
#include "units/kvt.h"

namespace {

using automation::ComPtr;

// A zero-based array variant, for the item to take over with its elements.
template <typename T>
VARIANT ArrayOf(VARTYPE elementType, const std::vector<T> &values)
{
    VARIANT v;
    v.vt = VT_ARRAY | elementType;
    v.parray = SafeArrayCreateVector(elementType, 0, static_cast<ULONG>(values.size()));
    if (!values.empty()) std::memcpy(v.parray->pvData, values.data(), values.size() * sizeof(T));
    return v;
}

// The elements as "NAME value value ...".
template <typename T>
std::string Elements(const char *name, const SAFEARRAY &psa)
{
    std::string text = psa.rgsabound[0].lLbound == 0 ? name : "lower bound not 0";
    for (ULONG i = 0; i < psa.rgsabound[0].cElements; ++i) {
        char number[32];
        text += " " + std::string(number, std::to_chars(number, number + 32, static_cast<const T *>(psa.pvData)[i]).ptr);
    }
    return text;
}

std::string Data(IHostItem &item)
{
    automation::Variant data;
    EXPECT_HR(S_OK, item.GetData(data.Out()));
    if (!(data.Type() & VT_ARRAY) || SafeArrayGetDim(data.Raw().parray) != 1) return "no vector";
    const SAFEARRAY &psa = *data.Raw().parray;
    switch (data.Type() & VT_TYPEMASK) {
    case VT_R4: return Elements<float>("R4", psa);
    case VT_R8: return Elements<double>("R8", psa);
    case VT_I4: return Elements<int32_t>("I4", psa);
    case VT_UI4: return Elements<uint32_t>("UI4", psa);
    case VT_I2: return Elements<int16_t>("I2", psa);
    case VT_UI2: return Elements<uint16_t>("UI2", psa);
    default: return "element type " + std::to_string(data.Type());
    }
}

TEST(HostItem, ValuesAreHeldInTheItemsDataType)
{
    const double nan = std::nan("");
    struct Case {
        ItemDataType type;
        VARIANT data;
        const char *expected;
    };
    const Case cases[] = {
        {ItemDataTypeFloat, ArrayOf<float>(VT_R4, {1.5f, -2.25f, 3.4028235e38f, 1e-7f}), "R4 1.5 -2.25 3.4028235e+38 1e-07"},
        {ItemDataTypeDouble, ArrayOf<double>(VT_R8, {0.1, -1e300, 45292.25}), "R8 0.1 -1e+300 45292.25"},
        {ItemDataTypeInt32, ArrayOf<int32_t>(VT_I4, {INT32_MIN, -1, INT32_MAX}), "I4 -2147483648 -1 2147483647"},
        {ItemDataTypeUInt32, ArrayOf<uint32_t>(VT_UI4, {0u, 2147483648u, UINT32_MAX}), "UI4 0 2147483648 4294967295"},
        {ItemDataTypeInt16, ArrayOf<int16_t>(VT_I2, {INT16_MIN, -7, INT16_MAX}), "I2 -32768 -7 32767"},
        {ItemDataTypeUInt16, ArrayOf<uint16_t>(VT_UI2, {0, 40000, UINT16_MAX}), "UI2 0 40000 65535"},
        // Converted: to the nearest (ties to even), held at the limits, NaN as 0.
        {ItemDataTypeDouble, ArrayOf<float>(VT_R4, {2.5f, -9999.0f}), "R8 2.5 -9999"},
        {ItemDataTypeInt16, ArrayOf<double>(VT_R8, {1.6, -1.6, 2.5, 70000, -70000, nan}), "I2 2 -2 2 32767 -32768 0"},
        {ItemDataTypeFloat, ArrayOf<int32_t>(VT_I4, {-3, 16777216}), "R4 -3 16777216"},
        {ItemDataTypeFloat, ArrayOf<uint8_t>(VT_UI1, {200}), "R4 200"},
    };
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    for (const Case &c : cases) {
        ComPtr<IHostItem> item;
        ASSERT_HR(S_OK, series->AddItem(nullptr, item.Out()));
        ASSERT_HR(S_OK, item->SetDataType(c.type));
        ASSERT_HR(S_OK, item->SetData(c.data));
        EXPECT_EQ(Data(*item.Get()), c.expected);
    }
    // Values set first change with the data type; refused data leaves them.
    ComPtr<IHostItem> item = hostseries::AddItemWithValues(*series.Get(), ItemDataTypeFloat, std::vector{1.6, -9999.0});
    ASSERT_HR(S_OK, item->SetDataType(ItemDataTypeInt16));
    EXPECT_HR(DISP_E_TYPEMISMATCH, item->SetData(automation::Variant::String("1;2").Detach()));
    EXPECT_HR(DISP_E_TYPEMISMATCH, item->SetData(ArrayOf<BSTR>(VT_BSTR, {SysAllocString(u"1.5")})));
    SAFEARRAYBOUND bounds[2] = {{3, 0}, {1, 0}};
    VARIANT table{};
    table.vt = VT_ARRAY | VT_R4;
    table.parray = SafeArrayCreate(VT_R4, 2, bounds);
    EXPECT_HR(E_INVALIDARG, item->SetData(table));
    EXPECT_EQ(Data(*item.Get()), "I2 2 -9999");
}

// An item takes its type and unit by the catalogue's sequence numbers and
// keeps the catalogue's identifiers; a new type drops the unit.
TEST(HostItem, SequenceNumbersInIdentifiersOut)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostItem> item;
    ASSERT_HR(S_OK, series->AddItem(nullptr, item.Out()));
    LONG type = -1, unit = -1;
    const auto typeOf = [&] { return item->GetItemType(&type) == S_OK ? type : -1; };
    const auto unitOf = [&] { return item->GetItemUnit(&unit) == S_OK ? unit : -1; };
    const int typeCount = kvtGetItemTypeCount();
    for (int seq = 1; seq <= typeCount; ++seq) {
        int typeIdent = 0, unitIdent = 0;
        const char *name = nullptr;
        ASSERT_NE(kvtGetItemTypeSeq(seq, &typeIdent, &name), 0);
        ASSERT_HR(S_OK, item->SetItemType(seq));
        ASSERT_EQ(typeOf(), typeIdent) << name;
        const int unitCount = kvtGetItemUnitCount(typeIdent);
        for (int useq = 1; useq <= unitCount; ++useq) {
            ASSERT_NE(kvtGetItemUnitSeq(typeIdent, useq, &unitIdent, &name), 0);
            ASSERT_HR(S_OK, item->SetItemUnit(useq));
            EXPECT_EQ(unitOf(), unitIdent) << name;
        }
        EXPECT_HR(E_INVALIDARG, item->SetItemUnit(unitCount + 1));
        EXPECT_EQ(unitOf(), 0);
    }
    ASSERT_HR(S_OK, item->SetItemUnit(1));
    ASSERT_HR(S_OK, item->SetItemType(typeCount));  // the same type again keeps the unit; another drops it
    EXPECT_NE(unitOf(), 0);
    ASSERT_HR(S_OK, item->SetItemType(3));
    EXPECT_EQ(unitOf(), 0);
    for (LONG unknown : {0, -1, typeCount + 1}) EXPECT_HR(E_INVALIDARG, item->SetItemType(unknown)) << unknown;
    EXPECT_EQ(typeOf(), 0);
    EXPECT_HR(E_INVALIDARG, item->SetItemUnit(1)) << "a unit needs an item type";
}

}  // namespace
