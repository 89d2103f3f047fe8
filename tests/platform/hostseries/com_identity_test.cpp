// SPDX-License-Identifier: MIT
// IUnknown of the four objects, references, lifetimes and null out arguments.
#include <gtest/gtest.h>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"

namespace {

using automation::ComPtr;

void *const kGarbage = reinterpret_cast<void *>(0x1);

// Checks QueryInterface of one object: IUnknown and its own IID give the same
// pointer with a new reference; every other IID gives E_NOINTERFACE and null.
// held is the number of references that the object has now.
void ExpectInterfaceRules(IUnknown *object, const IID &own, ULONG held)
{
    const IID *others[] = {&IID_IHostSeries, &IID_IHostConnection, &IID_IHostTimeAxis,
                           &IID_IHostItem,   &IID_IVantrel,        &IID_IDispatch,
                           &IID_IClassFactory};
    for (const IID *other : others) {
        if (*other == own) continue;
        void *pv = kGarbage;
        EXPECT_HR(E_NOINTERFACE, object->QueryInterface(*other, &pv));
        EXPECT_EQ(pv, nullptr);
    }
    EXPECT_HR(E_POINTER, object->QueryInterface(own, nullptr));

    void *asOwn = nullptr;
    void *asUnknown = nullptr;
    EXPECT_HR(S_OK, object->QueryInterface(own, &asOwn));
    EXPECT_HR(S_OK, object->QueryInterface(IID_IUnknown, &asUnknown));
    EXPECT_EQ(asOwn, static_cast<void *>(object));
    EXPECT_EQ(asUnknown, static_cast<void *>(object));
    // Two references were added; the counts say so on the way back.
    EXPECT_EQ(object->AddRef(), held + 3);
    EXPECT_EQ(object->Release(), held + 2);
    EXPECT_EQ(static_cast<IUnknown *>(asOwn)->Release(), held + 1);
    EXPECT_EQ(static_cast<IUnknown *>(asUnknown)->Release(), held);
}

TEST(HostSeriesCom, QueryInterfaceAndCountsOfEveryObject)
{
    const long before = hostseries::LiveObjectCount();
    IHostSeries *series = nullptr;
    EXPECT_HR(E_POINTER, HostSeriesCreate(nullptr));
    ASSERT_HR(S_OK, HostSeriesCreate(&series));
    ASSERT_NE(series, nullptr);
    // The series, its connection and its axis.
    EXPECT_EQ(hostseries::LiveObjectCount(), before + 3);
    ExpectInterfaceRules(series, IID_IHostSeries, 1);

    IHostConnection *connection = nullptr;
    ASSERT_HR(S_OK, series->GetConnection(&connection));
    // The series holds one reference to each of its parts, the caller another.
    ExpectInterfaceRules(connection, IID_IHostConnection, 2);
    IHostTimeAxis *axis = nullptr;
    ASSERT_HR(S_OK, series->GetTimeAxis(&axis));
    ExpectInterfaceRules(axis, IID_IHostTimeAxis, 2);
    IHostItem *item = nullptr;
    LONG index = 0;
    ASSERT_HR(S_OK, series->AddItem(&index, &item));
    EXPECT_EQ(hostseries::LiveObjectCount(), before + 4);
    ExpectInterfaceRules(item, IID_IHostItem, 2);

    // The same connection and axis every time.
    IHostConnection *again = nullptr;
    ASSERT_HR(S_OK, series->GetConnection(&again));
    EXPECT_EQ(again, connection);
    again->Release();

    EXPECT_EQ(item->Release(), 1u);  // the series' own reference remains
    EXPECT_EQ(axis->Release(), 1u);
    EXPECT_EQ(connection->Release(), 1u);
    EXPECT_EQ(series->Release(), 0u);
    EXPECT_EQ(hostseries::LiveObjectCount(), before);
}

TEST(HostSeriesCom, OutReferencesOutliveRemovalAndTheSeries)
{
    const long before = hostseries::LiveObjectCount();
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    const double values[] = {1.5, 2.5};
    ComPtr<IHostItem> first = hostseries::AddItemWithValues(*series.Get(), ItemDataTypeFloat, values, "first");
    ComPtr<IHostItem> second = hostseries::AddItemWithValues(*series.Get(), ItemDataTypeFloat, values, "second");
    EXPECT_EQ(hostseries::LiveObjectCount(), before + 5);

    ASSERT_HR(S_OK, series->RemoveItem(1));
    EXPECT_EQ(hostseries::LiveObjectCount(), before + 5);  // still held here
    EXPECT_EQ(hostseries::ReadValues(*first.Get()), (std::vector<double>{1.5, 2.5}));
    first.Reset();
    EXPECT_EQ(hostseries::LiveObjectCount(), before + 4);

    ASSERT_HR(S_OK, series->RemoveAllItems());
    EXPECT_EQ(hostseries::ReadValues(*second.Get()), (std::vector<double>{1.5, 2.5}));

    ComPtr<IHostConnection> connection;
    ASSERT_HR(S_OK, series->GetConnection(connection.Out()));
    series.Reset();
    // The connection and the second item are all that is left.
    EXPECT_EQ(hostseries::LiveObjectCount(), before + 2);
    EXPECT_HR(S_OK, connection->SetFilePath(nullptr));
    connection.Reset();
    second.Reset();
    EXPECT_EQ(hostseries::LiveObjectCount(), before);
}

TEST(HostSeriesCom, NullOutArgumentsGiveEPointer)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    EXPECT_HR(E_POINTER, series->GetConnection(nullptr));
    EXPECT_HR(E_POINTER, series->GetItemCount(nullptr));
    EXPECT_HR(E_POINTER, series->GetDeleteValue(nullptr));
    EXPECT_HR(E_POINTER, series->GetTimeAxis(nullptr));
    VARIANT one;
    VariantInit(&one);
    one.vt = VT_I4;
    one.lVal = 1;
    EXPECT_HR(E_POINTER, series->GetItem(one, nullptr));
    LONG index = -5;
    EXPECT_HR(E_POINTER, series->AddItem(&index, nullptr));
    EXPECT_EQ(index, -5);
    LONG count = -1;
    EXPECT_HR(S_OK, series->GetItemCount(&count));
    EXPECT_EQ(count, 0) << "a failed AddItem added an item";

    // The number of a new item is optional.
    ComPtr<IHostItem> item;
    EXPECT_HR(S_OK, series->AddItem(nullptr, item.Out()));
    EXPECT_NE(item.Get(), nullptr);

    ComPtr<IHostConnection> connection;
    ASSERT_HR(S_OK, series->GetConnection(connection.Out()));
    EXPECT_HR(E_POINTER, connection->GetFilePath(nullptr));
    EXPECT_HR(E_POINTER, connection->GetSpecification(nullptr));
    EXPECT_HR(E_POINTER, connection->GetSilent(nullptr));

    ComPtr<IHostTimeAxis> axis;
    ASSERT_HR(S_OK, series->GetTimeAxis(axis.Out()));
    EXPECT_HR(E_POINTER, axis->GetStepCount(nullptr));
    EXPECT_HR(E_POINTER, axis->GetTime(1, nullptr));

    EXPECT_HR(E_POINTER, item->GetDataType(nullptr));
    EXPECT_HR(E_POINTER, item->GetTitle(nullptr));
    EXPECT_HR(E_POINTER, item->GetValueType(nullptr));
    EXPECT_HR(E_POINTER, item->GetData(nullptr));
    EXPECT_HR(E_POINTER, item->GetItemType(nullptr));
    EXPECT_HR(E_POINTER, item->GetItemUnit(nullptr));
}

}  // namespace
