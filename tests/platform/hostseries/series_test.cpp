// SPDX-License-Identifier: MIT
// The series' item list, its delete value, and its connection.
#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "automation/values.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "support/expect_hr.h"

namespace {

using automation::Bstr;
using automation::ComPtr;

std::string Title(IHostItem *item)
{
    Bstr title;
    EXPECT_HR(S_OK, item->GetTitle(title.Out()));
    return title.Utf8();
}

// GetItem with an index variant; the title of what came back, or the HRESULT.
std::string TitleAt(IHostSeries &series, const VARIANT &index)
{
    IHostItem *item = reinterpret_cast<IHostItem *>(0x1);
    const HRESULT hr = series.GetItem(index, &item);
    if (FAILED(hr)) {
        EXPECT_EQ(item, nullptr);
        return "failed " + std::to_string(static_cast<uint32_t>(hr));
    }
    ComPtr<IHostItem> held = ComPtr<IHostItem>::Attach(item);
    return Title(item);
}

VARIANT I4(LONG v)
{
    VARIANT r;
    VariantInit(&r);
    r.vt = VT_I4;
    r.lVal = v;
    return r;
}

const std::string kBadIndex = "failed " + std::to_string(static_cast<uint32_t>(DISP_E_BADINDEX));

TEST(HostSeries, ItemsKeepTheirOrderAndMoveUpOnRemoval)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    for (const char *title : {"A", "B", "C", "D"}) {
        ComPtr<IHostItem> item;
        LONG index = 0;
        ASSERT_HR(S_OK, series->AddItem(&index, item.Out()));
        Bstr text(title);
        item->SetTitle(text.Get());
        LONG count = 0;
        series->GetItemCount(&count);
        EXPECT_EQ(index, count) << "the new item is the last";
    }

    EXPECT_EQ(TitleAt(*series.Get(), I4(1)), "A");
    EXPECT_EQ(TitleAt(*series.Get(), I4(4)), "D");
    automation::Variant shortIndex = automation::Variant::I2(2);
    EXPECT_EQ(TitleAt(*series.Get(), shortIndex.Raw()), "B");
    automation::Variant realIndex = automation::Variant::R8(3.0);
    EXPECT_EQ(TitleAt(*series.Get(), realIndex.Raw()), "C");
    for (LONG outside : {0, -1, 5})
        EXPECT_EQ(TitleAt(*series.Get(), I4(outside)), kBadIndex) << outside;
    automation::Variant numericText = automation::Variant::String("4");
    EXPECT_EQ(TitleAt(*series.Get(), numericText.Raw()), "D");
    automation::Variant text = automation::Variant::String("first");
    EXPECT_EQ(TitleAt(*series.Get(), text.Raw()),
              "failed " + std::to_string(static_cast<uint32_t>(DISP_E_TYPEMISMATCH)));

    // B goes; C and D move up one place.
    ASSERT_HR(S_OK, series->RemoveItem(2));
    EXPECT_EQ(TitleAt(*series.Get(), I4(1)), "A");
    EXPECT_EQ(TitleAt(*series.Get(), I4(2)), "C");
    EXPECT_EQ(TitleAt(*series.Get(), I4(3)), "D");
    EXPECT_EQ(TitleAt(*series.Get(), I4(4)), kBadIndex);
    EXPECT_HR(DISP_E_BADINDEX, series->RemoveItem(0));
    EXPECT_HR(DISP_E_BADINDEX, series->RemoveItem(4));
    ASSERT_HR(S_OK, series->RemoveItem(3));
    EXPECT_EQ(Title(hostseries::ItemAt(*series.Get(), 2).Get()), "C");

    ASSERT_HR(S_OK, series->RemoveAllItems());
    LONG count = -1;
    series->GetItemCount(&count);
    EXPECT_EQ(count, 0);
    EXPECT_EQ(TitleAt(*series.Get(), I4(1)), kBadIndex);
    try {
        hostseries::ItemAt(*series.Get(), 1);
        ADD_FAILURE() << "ItemAt found an item in an empty series";
    } catch (const automation::ComError &e) {
        EXPECT_HR(DISP_E_BADINDEX, e.Code());
    }

    // Numbering starts again from 1.
    ComPtr<IHostItem> item;
    LONG index = 0;
    ASSERT_HR(S_OK, series->AddItem(&index, item.Out()));
    EXPECT_EQ(index, 1);
}

TEST(HostSeries, DeleteValueDefaultsToMinus9999)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    double value = 0;
    ASSERT_HR(S_OK, series->GetDeleteValue(&value));
    EXPECT_EQ(value, -9999.0);
    ASSERT_HR(S_OK, series->SetDeleteValue(-1e30));
    ASSERT_HR(S_OK, series->GetDeleteValue(&value));
    EXPECT_EQ(value, -1e30);
}

TEST(HostConnection, KeepsPathAndSpecificationAsExactUtf16)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostConnection> connection;
    ASSERT_HR(S_OK, series->GetConnection(connection.Out()));

    Bstr empty;
    ASSERT_HR(S_OK, connection->GetFilePath(empty.Out()));
    ASSERT_NE(empty.Get(), nullptr);
    EXPECT_EQ(SysStringLen(empty.Get()), 0u);

    // A surrogate pair, an unpaired surrogate and an embedded zero all survive.
    const char16_t raw[] = {u'C', u':', 0xD83D, 0xDE00, u'\u00e4', 0xDC00, 0, u'x'};
    const UINT length = sizeof raw / sizeof raw[0];
    BSTR path = SysAllocStringLen(raw, length);
    ASSERT_HR(S_OK, connection->SetFilePath(path));
    SysFreeString(path);  // the connection keeps its own copy
    Bstr back;
    ASSERT_HR(S_OK, connection->GetFilePath(back.Out()));
    ASSERT_EQ(SysStringLen(back.Get()), length);
    EXPECT_EQ(std::memcmp(back.Get(), raw, sizeof raw), 0);

    Bstr spec("StartRow=2;DateTimeCol=1;SheetNo=1,3;");
    ASSERT_HR(S_OK, connection->SetSpecification(spec.Get()));
    Bstr specBack;
    ASSERT_HR(S_OK, connection->GetSpecification(specBack.Out()));
    EXPECT_EQ(specBack.Utf8(), "StartRow=2;DateTimeCol=1;SheetNo=1,3;");
    EXPECT_NE(specBack.Get(), spec.Get()) << "an out string must be a new one";

    ASSERT_HR(S_OK, connection->SetSpecification(nullptr));
    ASSERT_HR(S_OK, connection->GetSpecification(specBack.Out()));
    EXPECT_EQ(specBack.Utf8(), "");
}

TEST(HostConnection, SilentFlagOnlyOverridesThePresetOnceTheHostSetIt)
{
    ComPtr<IHostSeries> series = hostseries::MakeSeries();
    ComPtr<IHostConnection> connection;
    ASSERT_HR(S_OK, series->GetConnection(connection.Out()));

    VARIANT_BOOL silent = VARIANT_TRUE;
    EXPECT_HR(S_FALSE, connection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_TRUE);
    silent = VARIANT_FALSE;
    EXPECT_HR(S_FALSE, connection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_FALSE);

    ASSERT_HR(S_OK, HostSeriesSetSilent(series.Get(), VARIANT_FALSE));
    silent = VARIANT_TRUE;
    EXPECT_HR(S_OK, connection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_FALSE);

    // Any nonzero value means silent and reads back as VARIANT_TRUE.
    ASSERT_HR(S_OK, HostSeriesSetSilent(series.Get(), 1));
    silent = VARIANT_FALSE;
    EXPECT_HR(S_OK, connection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_TRUE);

    // Another series is not touched.
    ComPtr<IHostSeries> other = hostseries::MakeSeries();
    ComPtr<IHostConnection> otherConnection;
    other->GetConnection(otherConnection.Out());
    silent = VARIANT_FALSE;
    EXPECT_HR(S_FALSE, otherConnection->GetSilent(&silent));
    EXPECT_EQ(silent, VARIANT_FALSE);

    EXPECT_HR(E_POINTER, HostSeriesSetSilent(nullptr, VARIANT_TRUE));
    // Something that isn't a series of this library is refused, not touched.
    ComPtr<IHostItem> item;
    series->AddItem(nullptr, item.Out());
    EXPECT_HR(E_INVALIDARG, HostSeriesSetSilent(reinterpret_cast<IHostSeries *>(item.Get()), VARIANT_TRUE));
}

}  // namespace
