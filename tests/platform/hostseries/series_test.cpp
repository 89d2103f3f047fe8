// SPDX-License-Identifier: MIT
// The series: its item list, delete value, connection, and the lifetimes of
// what it hands out.
#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"

namespace {

using automation::Bstr;
using automation::ComPtr;
using automation::Variant;
using vantrel::testing::HrText;

// The title of what GetItem finds with the index, or the failure code.
std::string Find(IHostSeries &series, const Variant &index)
{
    IHostItem *item = reinterpret_cast<IHostItem *>(0x1);
    const HRESULT hr = series.GetItem(index.Raw(), &item);
    if (FAILED(hr)) return HrText(hr) + (item ? " and the out pointer was left" : "");
    Bstr title;
    item->GetTitle(title.Out());
    item->Release();
    return title.Utf8();
}

TEST(HostSeries, ItemsKeepTheirOrderAndMoveUpOnRemoval)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    for (const char *title : {"A", "B", "C", "D"}) hostseries::AddItemWithValues(*series.Get(), ItemDataTypeFloat, {}, title);
    const std::pair<Variant, std::string> finds[] = {
        {Variant::I4(1), "A"}, {Variant::I2(2), "B"}, {Variant::R8(3.0), "C"}, {Variant::String("4"), "D"},
        {Variant::I4(0), HrText(DISP_E_BADINDEX)}, {Variant::I4(5), HrText(DISP_E_BADINDEX)},
        {Variant::String("first"), HrText(DISP_E_TYPEMISMATCH)}};
    for (const auto &[index, found] : finds) EXPECT_EQ(Find(*series.Get(), index), found);

    ASSERT_HR(S_OK, series->RemoveItem(2));
    EXPECT_HR(DISP_E_BADINDEX, series->RemoveItem(4));
    std::string titles;
    for (LONG number = 1; number <= 3; ++number) titles += Find(*series.Get(), Variant::I4(number));
    EXPECT_EQ(titles, "ACD");
    double deleteValue = 0;
    ASSERT_HR(S_OK, series->GetDeleteValue(&deleteValue));
    EXPECT_EQ(deleteValue, -9999.0);
}

TEST(HostSeries, WhatItHandsOutOutlivesRemovalAndTheSeries)
{
    const long before = hostseries::LiveObjectCount();
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostItem> item = hostseries::AddItemWithValues(*series.Get(), ItemDataTypeFloat, std::vector{1.5, 2.5});
    ComPtr<IHostConnection> connection;
    ASSERT_HR(S_OK, series->GetConnection(connection.Out()));
    ASSERT_HR(S_OK, series->RemoveAllItems());
    series.Reset();
    EXPECT_EQ(hostseries::ReadValues(*item.Get()), (std::vector{1.5, 2.5}));
    EXPECT_HR(S_OK, connection->SetFilePath(nullptr));
    item.Reset();
    connection.Reset();
    EXPECT_EQ(hostseries::LiveObjectCount(), before);
}

TEST(HostConnection, KeepsTheTextsAsExactUtf16AndTheSilentFlagOnceSet)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostConnection> connection;
    ASSERT_HR(S_OK, series->GetConnection(connection.Out()));
    // A surrogate pair, an unpaired surrogate and an embedded zero all survive.
    const char16_t raw[] = {u'C', u':', 0xD83D, 0xDE00, u'\u00e4', 0xDC00, 0, u'x'};
    BSTR path = SysAllocStringLen(raw, 8);
    ASSERT_HR(S_OK, connection->SetFilePath(path));
    SysFreeString(path);
    Bstr back;
    ASSERT_HR(S_OK, connection->GetFilePath(back.Out()));
    ASSERT_EQ(SysStringLen(back.Get()), 8u);
    EXPECT_EQ(std::memcmp(back.Get(), raw, sizeof raw), 0);

    // The caller's preset stands until the host sets the flag; any nonzero is silent.
    VARIANT_BOOL silent = VARIANT_TRUE;
    EXPECT_HR(S_FALSE, connection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_TRUE);
    ASSERT_HR(S_OK, HostSeriesSetSilent(series.Get(), 1));
    silent = VARIANT_FALSE;
    EXPECT_HR(S_OK, connection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_TRUE);
}

}  // namespace
