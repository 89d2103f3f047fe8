// SPDX-License-Identifier: MIT
// The bridge's operations around the workbook session: what a host sees
// through IVantrel, the error info and the message boxes.
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "bridge/export_host.h"
#include "support/bridge_factory.h"
#include "support/engine_guard.h"
#include "support/files.h"
#include "support/message_boxes.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace {

using automation::ComPtr;
using testing_host::EngineGuard;
using testing_host::MakeBridge;
using testing_host::MakeSeries;
using testing_host::MessageBoxes;
using testing_host::TakeErrorDescription;
using Texts = std::vector<std::string>;

const char kMissingEngine[] =
    "Could not locate Excel. Please verify that MS Excel has been installed correctly.";

// Every box carries the application's title.
void ExpectCaptions(const MessageBoxes &boxes)
{
    for (const std::string &caption : boxes.captions) EXPECT_EQ(caption, "Excel Vantrel");
}

TEST(BridgeObject, ComSurface)
{
    auto bridge = MakeBridge();
    ComPtr<ISupportErrorInfo> support;
    ASSERT_HR(S_OK, bridge.As(IID_ISupportErrorInfo, support));
    EXPECT_HR(S_OK, support->InterfaceSupportsErrorInfo(IID_IVantrel));
    EXPECT_HR(S_FALSE, support->InterfaceSupportsErrorInfo(IID_IDispatch));
    ComPtr<IHostSeries> wrong;
    EXPECT_HR(E_NOINTERFACE, bridge.As(IID_IHostSeries, wrong));
    EXPECT_FALSE(wrong);

    // Late bound: names in any case, the series as VT_UNKNOWN, true as the VT_I2 1.
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("present.xlsx"), "x");
    auto series = MakeSeries(dir.File("present.xlsx"), "");
    const auto id = [&](std::u16string name) {
        LPOLESTR names[] = {name.data()};
        DISPID found = 0;
        const HRESULT hr = bridge->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &found);
        return hr == S_OK ? found : DISPID(hr);
    };
    EXPECT_EQ(id(u"Bogus"), DISPID(DISP_E_UNKNOWNNAME));
    VARIANT arg;
    VariantInit(&arg);
    arg.vt = VT_UNKNOWN;
    arg.punkVal = series.Get();
    DISPPARAMS one = {&arg, nullptr, 1, 0}, none = {nullptr, nullptr, 0, 0};
    EXPECT_HR(S_OK, bridge->Invoke(id(u"sethostseries"), IID_NULL, 0, DISPATCH_METHOD, &one, nullptr, nullptr, nullptr));
    EXPECT_HR(E_POINTER, bridge->SetHostSeries(nullptr));  // and the stored series stays
    automation::Variant result;
    EXPECT_HR(S_OK, bridge->Invoke(id(u"FileExists"), IID_NULL, 0, DISPATCH_METHOD, &none, result.Out(), nullptr, nullptr));
    EXPECT_EQ(result.Type(), VT_I2);
    EXPECT_EQ(result.Raw().iVal, 1);
    EXPECT_HR(DISP_E_BADPARAMCOUNT, bridge->Invoke(id(u"FileExists"), IID_NULL, 0, DISPATCH_METHOD, &one, nullptr, nullptr, nullptr));
    EXPECT_HR(E_POINTER, bridge->FileExists(nullptr));
    UINT count = 9;
    EXPECT_HR(S_OK, bridge->GetTypeInfoCount(&count));
    EXPECT_EQ(count, 0u);
    auto absent = MakeSeries(dir.File("absent.xlsx"), "");
    bridge->SetHostSeries(absent.Get());
    SHORT exists = 7;
    EXPECT_HR(S_OK, bridge->FileExists(&exists));
    EXPECT_EQ(exists, 0);
}

TEST(BridgeInspect, EmptySpecificationAndNullOut)
{
    auto bridge = MakeBridge();
    auto series = MakeSeries("/nowhere.xlsx", "");
    bridge->SetHostSeries(series.Get());
    EXPECT_HR(E_POINTER, bridge->InspectWorkbook(nullptr));
    SHORT fits = 0;
    EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, SHORT(VARIANT_TRUE));  // the out value stays true
    GUID guid{};
    std::string source;
    EXPECT_EQ(TakeErrorDescription(&guid, &source), "Specification string is empty!");
    EXPECT_TRUE(guid == IID_IVantrel);
    EXPECT_EQ(source, "GenericExcelVantrel.ExcelVantrel.1");
}

TEST(BridgeSession, SilentFlagIsTakenByTheInspection)
{
    EngineGuard starts(EngineGuard::Missing);
    MessageBoxes boxes;
    // A host that never wrote the flag is silent; one that asks gets the box.
    for (const std::optional<bool> silent : {std::optional<bool>(), std::optional<bool>(false)}) {
        auto series = MakeSeries("/nowhere.xlsx", "StartRow=2;", silent);
        auto bridge = MakeBridge();
        bridge->SetHostSeries(series.Get());
        SHORT fits = SHORT(VARIANT_TRUE);
        EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
        EXPECT_EQ(fits, 0);
    }
    EXPECT_EQ(boxes.texts, Texts{kMissingEngine});
    EXPECT_EQ(starts.starts, 2);  // a failed start leaves no session behind

    // Before any inspection a read shows its box although the host asks for silence.
    auto series = MakeSeries("/nowhere.xlsx", "StartRow=2;", /*silent=*/true);
    auto bridge = MakeBridge();
    bridge->SetHostSeries(series.Get());
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), kMissingEngine);
    SHORT fits = 0;
    EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), kMissingEngine);
    EXPECT_EQ(boxes.texts, (Texts{kMissingEngine, kMissingEngine}));
    ExpectCaptions(boxes);
}

TEST(BridgeRead, FailuresLeaveNoItems)
{
    EngineGuard starts;
    auto bridge = MakeBridge();
    auto series = MakeSeries("/no/such/folder/book.xlsx", "", /*silent=*/false);
    hostseries::AddItemWithValues(*series.Get(), ItemDataTypeFloat, std::vector<double>{1}, "kept");
    bridge->SetHostSeries(series.Get());
    MessageBoxes boxes;
    // An empty string fails before anything is touched, and the session stays.
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), "Specification string is empty!");
    EXPECT_EQ(testing_host::ItemCount(series.Get()), 1);

    // A workbook that doesn't open: error info, no box, and the items are gone.
    auto unreadable = MakeSeries("/no/such/folder/book.xlsx", "StartRow=2;", /*silent=*/false);
    hostseries::AddItemWithValues(*unreadable.Get(), ItemDataTypeFloat, std::vector<double>{1}, "lost");
    bridge->SetHostSeries(unreadable.Get());
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), "Excel Workbook could not open file.\n/no/such/folder/book.xlsx: no such file");
    EXPECT_EQ(testing_host::ItemCount(unreadable.Get()), 0);
    EXPECT_TRUE(boxes.texts.empty());
    // The first read kept its session for the second; the second ended it.
    EXPECT_EQ(starts.starts, 1);
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(starts.starts, 2);
}

TEST(BridgeWrite, ExportInspectAndReadShareTheirSessionsRight)
{
    EngineGuard starts;
    testing_host::TempDir dir;
    const std::string file = dir.File("export.xlsx");
    auto bridge = MakeBridge();
    // An empty string is no failure for an export: the default layout, on a new workbook.
    auto series = bridge_testing::MakeHost(file, "", 2, /*silent=*/false);
    bridge_testing::AddItem(*series.Get(), ItemDataTypeDouble, {1.5, 2.5}, "Gauge", 4, 1);  // Rainfall, millimeter
    bridge->SetHostSeries(series.Get());
    MessageBoxes boxes;
    EXPECT_HR(S_OK, bridge->WriteData());
    EXPECT_EQ(starts.starts, 1);
    EXPECT_EQ(testing_host::Specification(series.Get()),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;");

    // The inspection leaves its session to the read that follows: one start for both.
    auto reader = MakeSeries(file, testing_host::Specification(series.Get()), /*silent=*/false);
    bridge->SetHostSeries(reader.Get());
    SHORT fits = 0;
    EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, SHORT(VARIANT_TRUE));
    EXPECT_HR(S_OK, bridge->ReadData());
    EXPECT_EQ(starts.starts, 2);
    ASSERT_EQ(testing_host::ItemCount(reader.Get()), 1);
    EXPECT_EQ(hostseries::ReadValues(*hostseries::ItemAt(*reader.Get(), 1).Get()), (std::vector<double>{1.5, 2.5}));
    // The read ended its session: the next call starts anew.
    EXPECT_HR(S_OK, bridge->ReadData());
    EXPECT_EQ(starts.starts, 3);
    EXPECT_TRUE(boxes.texts.empty());
}

}  // namespace
