// SPDX-License-Identifier: MIT
// Item attributes, the translation of sequence numbers through the units
// catalogue, and the values of each data type.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"
#include "units/kvt.h"

namespace {

using automation::ComPtr;

ComPtr<IHostItem> NewItem(IHostSeries &series)
{
    ComPtr<IHostItem> item;
    EXPECT_HR(S_OK, series.AddItem(nullptr, item.Out()));
    return item;
}

LONG TypeOf(IHostItem &item)
{
    LONG ident = -1;
    EXPECT_HR(S_OK, item.GetItemType(&ident));
    return ident;
}

LONG UnitOf(IHostItem &item)
{
    LONG ident = -1;
    EXPECT_HR(S_OK, item.GetItemUnit(&ident));
    return ident;
}

// A one-dimensional, zero-based array variant of T.
template <typename T>
VARIANT ArrayOf(VARTYPE elementType, const std::vector<T> &values)
{
    SAFEARRAY *psa = SafeArrayCreateVector(elementType, 0, static_cast<ULONG>(values.size()));
    void *data = nullptr;
    SafeArrayAccessData(psa, &data);
    for (std::size_t i = 0; i < values.size(); ++i) static_cast<T *>(data)[i] = values[i];
    SafeArrayUnaccessData(psa);
    VARIANT v;
    VariantInit(&v);
    v.vt = VT_ARRAY | elementType;
    v.parray = psa;
    return v;
}

// GetData's array read as T, after checking its shape.
template <typename T>
std::vector<T> DataAs(IHostItem &item, VARTYPE expectedElement)
{
    automation::Variant data;
    EXPECT_HR(S_OK, item.GetData(data.Out()));
    EXPECT_EQ(data.Type(), VT_ARRAY | expectedElement);
    if (data.Type() != (VT_ARRAY | expectedElement)) return {};
    SAFEARRAY *psa = data.Raw().parray;
    EXPECT_EQ(SafeArrayGetDim(psa), 1u);
    EXPECT_EQ(SafeArrayGetElemsize(psa), sizeof(T));
    LONG lower = -1;
    LONG upper = -1;
    SafeArrayGetLBound(psa, 1, &lower);
    SafeArrayGetUBound(psa, 1, &upper);
    EXPECT_EQ(lower, 0) << "element index is step - 1";
    std::vector<T> values;
    for (LONG i = lower; i <= upper; ++i) {
        T value{};
        EXPECT_HR(S_OK, SafeArrayGetElement(psa, &i, &value));
        values.push_back(value);
    }
    return values;
}

TEST(HostItem, AttributesStartEmptyAndKeepWhatIsSet)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostItem> item = NewItem(*series.Get());
    ItemDataType type = ItemDataTypeDouble;
    ASSERT_HR(S_OK, item->GetDataType(&type));
    EXPECT_EQ(type, ItemDataTypeFloat);
    automation::Bstr title;
    ASSERT_HR(S_OK, item->GetTitle(title.Out()));
    EXPECT_EQ(title.Utf8(), "");
    LONG valueType = -1;
    ASSERT_HR(S_OK, item->GetValueType(&valueType));
    EXPECT_EQ(valueType, 0);
    EXPECT_EQ(TypeOf(*item.Get()), 0);
    EXPECT_EQ(UnitOf(*item.Get()), 0);
    EXPECT_TRUE(hostseries::ReadValues(*item.Get()).empty());

    automation::Bstr name("Pegel Köln");
    ASSERT_HR(S_OK, item->SetTitle(name.Get()));
    ASSERT_HR(S_OK, item->GetTitle(title.Out()));
    EXPECT_EQ(title.Utf8(), "Pegel Köln");
    ASSERT_HR(S_OK, item->SetValueType(4));
    ASSERT_HR(S_OK, item->GetValueType(&valueType));
    EXPECT_EQ(valueType, 4);

    for (LONG accepted = 1; accepted <= 7; ++accepted) {
        ASSERT_HR(S_OK, item->SetDataType(static_cast<ItemDataType>(accepted)));
        ASSERT_HR(S_OK, item->GetDataType(&type));
        EXPECT_EQ(type, accepted);
    }
    for (LONG refused : {0, 8, -1}) {
        EXPECT_HR(E_INVALIDARG, item->SetDataType(static_cast<ItemDataType>(refused)));
        ASSERT_HR(S_OK, item->GetDataType(&type));
        EXPECT_EQ(type, 7) << "a refused data type changed the item";
    }
}

TEST(HostItem, SequenceNumbersInIdentifiersOut)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostItem> item = NewItem(*series.Get());
    const int typeCount = kvtGetItemTypeCount();

    for (int seq = 1; seq <= typeCount; ++seq) {
        int typeIdent = 0;
        const char *typeName = nullptr;
        ASSERT_NE(kvtGetItemTypeSeq(seq, &typeIdent, &typeName), 0);
        ASSERT_HR(S_OK, item->SetItemType(seq));
        ASSERT_EQ(TypeOf(*item.Get()), typeIdent) << typeName;
        const int unitCount = kvtGetItemUnitCount(typeIdent);
        for (int useq = 1; useq <= unitCount; ++useq) {
            int unitIdent = 0;
            const char *unitName = nullptr;
            ASSERT_NE(kvtGetItemUnitSeq(typeIdent, useq, &unitIdent, &unitName), 0);
            ASSERT_HR(S_OK, item->SetItemUnit(useq));
            EXPECT_EQ(UnitOf(*item.Get()), unitIdent) << typeName << " / " << unitName;
            // What an export turns into the key texts.
            const char *key = nullptr;
            EXPECT_NE(kvtGetUnitKey(UnitOf(*item.Get()), &key), 0);
        }
        EXPECT_HR(E_INVALIDARG, item->SetItemUnit(unitCount + 1));
        EXPECT_EQ(UnitOf(*item.Get()), 0);
    }

    // The second item type, its first unit; then sequence numbers that name nothing.
    ASSERT_HR(S_OK, item->SetItemType(2));
    ASSERT_HR(S_OK, item->SetItemUnit(1));
    EXPECT_NE(TypeOf(*item.Get()), 2);
    EXPECT_NE(UnitOf(*item.Get()), 0);
    // Setting the same type again keeps the unit; another type drops it.
    ASSERT_HR(S_OK, item->SetItemType(2));
    EXPECT_NE(UnitOf(*item.Get()), 0);
    ASSERT_HR(S_OK, item->SetItemType(3));
    EXPECT_EQ(UnitOf(*item.Get()), 0);
    for (LONG unknown : {0, -1, typeCount + 1}) {
        EXPECT_HR(E_INVALIDARG, item->SetItemType(unknown)) << unknown;
        EXPECT_EQ(TypeOf(*item.Get()), 0);
        EXPECT_HR(E_INVALIDARG, item->SetItemUnit(1)) << "a unit needs an item type";
        EXPECT_EQ(UnitOf(*item.Get()), 0);
    }
}

TEST(HostItem, EachDataTypeRoundTripsItsOwnElements)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();

    ComPtr<IHostItem> floats = NewItem(*series.Get());
    const std::vector<float> floatValues = {1.5f, -2.25f, 3.4028235e38f, 1e-7f};
    ASSERT_HR(S_OK, floats->SetData(ArrayOf(VT_R4, floatValues)));
    EXPECT_EQ(DataAs<float>(*floats.Get(), VT_R4), floatValues);

    ComPtr<IHostItem> doubles = NewItem(*series.Get());
    ASSERT_HR(S_OK, doubles->SetDataType(ItemDataTypeDouble));
    const std::vector<double> doubleValues = {0.1, -1e300, 45292.25};
    ASSERT_HR(S_OK, doubles->SetData(ArrayOf(VT_R8, doubleValues)));
    EXPECT_EQ(DataAs<double>(*doubles.Get(), VT_R8), doubleValues);

    ComPtr<IHostItem> int32s = NewItem(*series.Get());
    ASSERT_HR(S_OK, int32s->SetDataType(ItemDataTypeInt32));
    const std::vector<int32_t> int32Values = {INT32_MIN, -1, 0, INT32_MAX};
    ASSERT_HR(S_OK, int32s->SetData(ArrayOf(VT_I4, int32Values)));
    EXPECT_EQ(DataAs<int32_t>(*int32s.Get(), VT_I4), int32Values);

    ComPtr<IHostItem> uint32s = NewItem(*series.Get());
    ASSERT_HR(S_OK, uint32s->SetDataType(ItemDataTypeUInt32));
    const std::vector<uint32_t> uint32Values = {0u, 2147483648u, UINT32_MAX};
    ASSERT_HR(S_OK, uint32s->SetData(ArrayOf(VT_UI4, uint32Values)));
    EXPECT_EQ(DataAs<uint32_t>(*uint32s.Get(), VT_UI4), uint32Values);
    EXPECT_EQ(hostseries::ReadValues(*uint32s.Get()), (std::vector<double>{0.0, 2147483648.0, 4294967295.0}));

    ComPtr<IHostItem> int16s = NewItem(*series.Get());
    ASSERT_HR(S_OK, int16s->SetDataType(ItemDataTypeInt16));
    const std::vector<int16_t> int16Values = {INT16_MIN, -7, INT16_MAX};
    ASSERT_HR(S_OK, int16s->SetData(ArrayOf(VT_I2, int16Values)));
    EXPECT_EQ(DataAs<int16_t>(*int16s.Get(), VT_I2), int16Values);

    ComPtr<IHostItem> uint16s = NewItem(*series.Get());
    ASSERT_HR(S_OK, uint16s->SetDataType(ItemDataTypeUInt16));
    const std::vector<uint16_t> uint16Values = {0, 40000, UINT16_MAX};
    ASSERT_HR(S_OK, uint16s->SetData(ArrayOf(VT_UI2, uint16Values)));
    EXPECT_EQ(DataAs<uint16_t>(*uint16s.Get(), VT_UI2), uint16Values);

    // The data type a bridge doesn't handle still gives an array, of bytes.
    ComPtr<IHostItem> unnamed = NewItem(*series.Get());
    ASSERT_HR(S_OK, unnamed->SetDataType(static_cast<ItemDataType>(3)));
    ASSERT_HR(S_OK, unnamed->SetData(ArrayOf(VT_R4, std::vector<float>{1.0f, -2.0f})));
    EXPECT_EQ(DataAs<int8_t>(*unnamed.Get(), VT_I1), (std::vector<int8_t>{1, -2}));

    // Each GetData is a new array: freeing one leaves the item's values.
    EXPECT_EQ(DataAs<int16_t>(*int16s.Get(), VT_I2), int16Values);
}

TEST(HostItem, ValuesConvertToTheItemsDataType)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    const double nan = std::numeric_limits<double>::quiet_NaN();

    // What an import passes, floats, held by items of other types.
    ComPtr<IHostItem> item = NewItem(*series.Get());
    ASSERT_HR(S_OK, item->SetData(ArrayOf(VT_R4, std::vector<float>{2.5f, -9999.0f})));
    ASSERT_HR(S_OK, item->SetDataType(ItemDataTypeDouble));
    EXPECT_EQ(DataAs<double>(*item.Get(), VT_R8), (std::vector<double>{2.5, -9999.0}));

    // Rounded to the nearest (ties to even), held at the limits, NaN as 0.
    ASSERT_HR(S_OK, item->SetData(ArrayOf(VT_R8, std::vector<double>{1.6, -1.6, 2.5, 70000.0, -70000.0, nan})));
    ASSERT_HR(S_OK, item->SetDataType(ItemDataTypeInt16));
    EXPECT_EQ(DataAs<int16_t>(*item.Get(), VT_I2), (std::vector<int16_t>{2, -2, 2, INT16_MAX, INT16_MIN, 0}));
    ASSERT_HR(S_OK, item->SetDataType(ItemDataTypeUInt16));
    EXPECT_EQ(DataAs<uint16_t>(*item.Get(), VT_UI2), (std::vector<uint16_t>{2, 0, 2, UINT16_MAX, 0, 0}));
    ASSERT_HR(S_OK, item->SetDataType(ItemDataTypeFloat));
    const std::vector<float> asFloats = DataAs<float>(*item.Get(), VT_R4);
    ASSERT_EQ(asFloats.size(), 6u);
    EXPECT_EQ(asFloats[0], 1.6f);
    EXPECT_TRUE(std::isnan(asFloats[5]));

    // Integer arrays into a float item, and bytes of both signs.
    ASSERT_HR(S_OK, item->SetData(ArrayOf(VT_I4, std::vector<int32_t>{-3, 16777216})));
    EXPECT_EQ(hostseries::ReadValues(*item.Get()), (std::vector<double>{-3.0, 16777216.0}));
    ASSERT_HR(S_OK, item->SetData(ArrayOf(VT_UI1, std::vector<uint8_t>{200})));
    EXPECT_EQ(hostseries::ReadValues(*item.Get()), (std::vector<double>{200.0}));

    // An empty variant clears the values.
    ASSERT_HR(S_OK, item->SetData(VARIANT{}));
    EXPECT_TRUE(hostseries::ReadValues(*item.Get()).empty());
}

TEST(HostItem, RefusedDataLeavesTheValuesAndIsFreed)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    const double values[] = {1.0, 2.0, 3.0};
    ComPtr<IHostItem> item = hostseries::AddItemWithValues(*series.Get(), ItemDataTypeDouble, values, "kept");

    EXPECT_HR(DISP_E_TYPEMISMATCH, item->SetData(automation::Variant::R8(1.0).Detach()));
    EXPECT_HR(DISP_E_TYPEMISMATCH, item->SetData(automation::Variant::String("1;2;3").Detach()));
    SAFEARRAY *texts = SafeArrayCreateVector(VT_BSTR, 0, 1);
    LONG zero = 0;
    BSTR text = SysAllocString(u"1.5");
    SafeArrayPutElement(texts, &zero, text);
    SysFreeString(text);
    VARIANT textArray;
    VariantInit(&textArray);
    textArray.vt = VT_ARRAY | VT_BSTR;
    textArray.parray = texts;
    EXPECT_HR(DISP_E_TYPEMISMATCH, item->SetData(textArray));

    SAFEARRAYBOUND bounds[2] = {{3, 0}, {1, 0}};
    VARIANT table;
    VariantInit(&table);
    table.vt = VT_ARRAY | VT_R4;
    table.parray = SafeArrayCreate(VT_R4, 2, bounds);
    EXPECT_HR(E_INVALIDARG, item->SetData(table));

    EXPECT_EQ(hostseries::ReadValues(*item.Get()), (std::vector<double>{1.0, 2.0, 3.0}));
}

}  // namespace
