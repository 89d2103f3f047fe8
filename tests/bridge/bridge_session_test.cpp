// SPDX-License-Identifier: MIT
// The bridge's operations around the workbook session: what a host sees
// through IVantrel, the error info and the message boxes.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "shell/message_box.h"
#include "support/expect_hr.h"
#include "support/temp_dir.h"
#include "support/test_host.h"
#include "workbook/excel_obj.h"

namespace {

using automation::ComPtr;
using testing_host::MakeSeries;
using testing_host::TakeErrorDescription;

ComPtr<IVantrel> MakeBridge()
{
    ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    return bridge;
}

// Collects the message boxes shown while it lives.
struct MessageBoxes {
    std::vector<std::string> texts;
    shell::ScopedMessageSink sink{[this](std::string_view text, std::string_view caption) {
        EXPECT_EQ(caption, "Excel Vantrel");
        texts.emplace_back(text);
    }};
};

// Counts engine starts, or makes every start fail.
struct EngineStarts {
    int count = 0;
    explicit EngineStarts(bool fail = false)
    {
        CExcelObj::SetApplicationFactory([this, fail]() -> std::shared_ptr<workbook::Application> {
            ++count;
            if (fail) throw automation::ComError(REGDB_E_CLASSNOTREG, "no engine");
            return workbook::CreateApplication();
        });
    }
    ~EngineStarts() { CExcelObj::ResetApplicationFactory(); }
};

const char kMissingEngine[] =
    "Could not locate Excel. Please verify that MS Excel has been installed correctly.";

TEST(BridgeObject, HostSeriesAndFileExists)
{
    testing_host::TempDir dir;
    const std::string file = dir.File("present.xlsx");
    std::ofstream(file) << "x";

    auto bridge = MakeBridge();
    auto series = MakeSeries(file, "StartRow=2;");
    EXPECT_HR(E_POINTER, bridge->FileExists(nullptr));
    EXPECT_HR(S_OK, bridge->SetHostSeries(series.Get()));
    EXPECT_HR(E_POINTER, bridge->SetHostSeries(nullptr));

    // The stored series stays after a null one was refused: the true value is 1, not 0xFFFF.
    SHORT exists = 7;
    EXPECT_HR(S_OK, bridge->FileExists(&exists));
    EXPECT_EQ(exists, 1);

    auto missing = MakeSeries(dir.File("absent.xlsx"), "");
    bridge->SetHostSeries(missing.Get());
    EXPECT_HR(S_OK, bridge->FileExists(&exists));
    EXPECT_EQ(exists, 0);

    auto empty = MakeSeries("", "");
    bridge->SetHostSeries(empty.Get());
    exists = 7;
    EXPECT_HR(S_OK, bridge->FileExists(&exists));
    EXPECT_EQ(exists, 0);
    EXPECT_HR(S_OK, bridge->NoOperation());
}

TEST(BridgeObject, InterfacesAndErrorInfoSupport)
{
    auto bridge = MakeBridge();
    ComPtr<ISupportErrorInfo> support;
    ASSERT_HR(S_OK, bridge.As(IID_ISupportErrorInfo, support));
    EXPECT_HR(S_OK, support->InterfaceSupportsErrorInfo(IID_IVantrel));
    EXPECT_HR(S_FALSE, support->InterfaceSupportsErrorInfo(IID_IDispatch));
    EXPECT_HR(S_FALSE, support->InterfaceSupportsErrorInfo(IID_IUnknown));

    ComPtr<IUnknown> unknown1, unknown2;
    EXPECT_HR(S_OK, bridge.As(IID_IUnknown, unknown1));
    EXPECT_HR(S_OK, support.As(IID_IUnknown, unknown2));
    EXPECT_EQ(unknown1.Get(), unknown2.Get());
    ComPtr<IHostSeries> wrong;
    EXPECT_HR(E_NOINTERFACE, bridge.As(IID_IHostSeries, wrong));
    EXPECT_FALSE(wrong);
    EXPECT_HR(E_POINTER, bridge->QueryInterface(IID_IVantrel, nullptr));
}

TEST(BridgeObject, LateBoundCalls)
{
    testing_host::TempDir dir;
    const std::string file = dir.File("present.xlsx");
    std::ofstream(file) << "x";
    auto bridge = MakeBridge();
    auto series = MakeSeries(file, "");

    std::u16string setName = u"sethostseries", existsName = u"FileExists", bogus = u"Bogus";
    LPOLESTR names[] = {setName.data()};
    DISPID setId = 0, existsId = 0, bogusId = 0;
    EXPECT_HR(S_OK, bridge->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &setId));
    names[0] = existsName.data();
    EXPECT_HR(S_OK, bridge->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &existsId));
    names[0] = bogus.data();
    EXPECT_HR(DISP_E_UNKNOWNNAME, bridge->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &bogusId));

    VARIANT arg;
    VariantInit(&arg);
    arg.vt = VT_UNKNOWN;
    arg.punkVal = series.Get();
    DISPPARAMS params = {&arg, nullptr, 1, 0};
    EXPECT_HR(S_OK, bridge->Invoke(setId, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &params,
                                   nullptr, nullptr, nullptr));
    DISPPARAMS none = {nullptr, nullptr, 0, 0};
    automation::Variant result;
    EXPECT_HR(S_OK, bridge->Invoke(existsId, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &none,
                                   result.Out(), nullptr, nullptr));
    EXPECT_EQ(result.Type(), VT_I2);
    EXPECT_EQ(result.Raw().iVal, 1);
    EXPECT_HR(DISP_E_BADPARAMCOUNT, bridge->Invoke(existsId, IID_NULL, LOCALE_USER_DEFAULT,
                                                   DISPATCH_METHOD, &params, nullptr, nullptr, nullptr));
    UINT count = 9;
    EXPECT_HR(S_OK, bridge->GetTypeInfoCount(&count));
    EXPECT_EQ(count, 0u);
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

TEST(BridgeInspect, EngineMissingAndSilentFlag)
{
    EngineStarts starts(/*fail=*/true);
    auto bridge = MakeBridge();

    // A host that never wrote the flag is silent: no box, but the failure stands.
    {
        MessageBoxes boxes;
        auto series = MakeSeries("/nowhere.xlsx", "StartRow=2;");
        bridge->SetHostSeries(series.Get());
        SHORT fits = SHORT(VARIANT_TRUE);
        EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
        EXPECT_EQ(fits, 0);
        EXPECT_TRUE(boxes.texts.empty());
    }
    // A host that asks for messages gets the box with the engine's message.
    {
        MessageBoxes boxes;
        auto series = MakeSeries("/nowhere.xlsx", "StartRow=2;", /*silent=*/false);
        bridge->SetHostSeries(series.Get());
        SHORT fits = SHORT(VARIANT_TRUE);
        EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
        EXPECT_EQ(fits, 0);
        ASSERT_EQ(boxes.texts.size(), 1u);
        EXPECT_EQ(boxes.texts[0], kMissingEngine);
    }
    EXPECT_EQ(starts.count, 2);  // a failed start leaves no session behind
}

TEST(BridgeRead, SilentFlagIsTakenOnlyByInspection)
{
    EngineStarts starts(/*fail=*/true);
    auto bridge = MakeBridge();
    auto series = MakeSeries("/nowhere.xlsx", "StartRow=2;", /*silent=*/true);
    bridge->SetHostSeries(series.Get());

    // Before any inspection the flag is 0: the read shows its box although the host asks for silence.
    MessageBoxes boxes;
    EXPECT_HR(E_FAIL, bridge->ReadData());
    ASSERT_EQ(boxes.texts.size(), 1u);
    EXPECT_EQ(boxes.texts[0], kMissingEngine);
    EXPECT_EQ(TakeErrorDescription(), kMissingEngine);

    SHORT fits = 0;
    EXPECT_HR(E_FAIL, bridge->InspectWorkbook(&fits));
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(boxes.texts.size(), 1u);  // silent from now on
    EXPECT_EQ(TakeErrorDescription(), kMissingEngine);
}

TEST(BridgeRead, FailuresLeaveNoItems)
{
    EngineStarts starts;
    auto bridge = MakeBridge();
    auto series = MakeSeries("/no/such/folder/book.xlsx", "", /*silent=*/false);
    LONG index = 0;
    ComPtr<IHostItem> item;
    series->AddItem(&index, item.Out());
    series->AddItem(&index, item.Out());
    bridge->SetHostSeries(series.Get());

    MessageBoxes boxes;
    // An empty string fails before anything is touched, and the session stays.
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), "Specification string is empty!");
    EXPECT_EQ(testing_host::ItemCount(series.Get()), 2);

    // A workbook that doesn't open: error info, no box, and the items are gone.
    auto unreadable = MakeSeries("/no/such/folder/book.xlsx", "StartRow=2;", /*silent=*/false);
    unreadable->AddItem(&index, item.Out());
    bridge->SetHostSeries(unreadable.Get());
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), "Excel Workbook could not open file.");
    EXPECT_EQ(testing_host::ItemCount(unreadable.Get()), 0);
    EXPECT_TRUE(boxes.texts.empty());
    // The first read kept its session for the second; the second ended it.
    EXPECT_EQ(starts.count, 1);
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(starts.count, 2);
}

TEST(BridgeWrite, CreatesInspectsAndReadsBack)
{
    EngineStarts starts;
    testing_host::TempDir dir;
    const std::string file = dir.File("export.xlsx");
    auto bridge = MakeBridge();
    auto series = MakeSeries(file, "", /*silent=*/false);
    bridge->SetHostSeries(series.Get());

    MessageBoxes boxes;
    // An empty string is no failure for an export; the missing workbook is made.
    EXPECT_HR(S_OK, bridge->WriteData());
    EXPECT_TRUE(std::filesystem::exists(file));
    EXPECT_EQ(starts.count, 1);

    // An inspection leaves its session to the read that follows: one start
    // for both, whatever their verdict on the new, empty sheet.
    auto reader = MakeSeries(file, "StartRow=2;", /*silent=*/true);
    bridge->SetHostSeries(reader.Get());
    SHORT fits = 0;
    bridge->InspectWorkbook(&fits);
    bridge->ReadData();
    EXPECT_EQ(starts.count, 2);
    // The read ended its session: the next call starts anew.
    bridge->ReadData();
    EXPECT_EQ(starts.count, 3);
    EXPECT_TRUE(boxes.texts.empty());
}

TEST(BridgeWrite, FailuresShowTheirMessage)
{
    auto bridge = MakeBridge();
    auto series = MakeSeries("/no/such/folder/book.xlsx", "StartRow=2;", /*silent=*/false);
    bridge->SetHostSeries(series.Get());
    SHORT fits = 0;
    bridge->InspectWorkbook(&fits);  // takes the host's flag: messages wanted
    TakeErrorDescription();

    MessageBoxes boxes;
    EXPECT_HR(E_FAIL, bridge->WriteData());
    ASSERT_EQ(boxes.texts.size(), 1u);
    EXPECT_EQ(boxes.texts[0], "Excel could not create file");
    EXPECT_EQ(TakeErrorDescription(), "<none>");  // a write sets no error info

    EngineStarts starts(/*fail=*/true);
    auto other = MakeBridge();
    other->SetHostSeries(series.Get());
    other->InspectWorkbook(&fits);
    boxes.texts.clear();
    EXPECT_HR(E_FAIL, other->WriteData());
    EXPECT_EQ(boxes.texts, std::vector<std::string>({kMissingEngine}));
}

TEST(BridgeInspect, WorkbookThatDoesNotOpenIsNoVerdict)
{
    testing_host::TempDir dir;
    const std::string file = dir.File("broken.xlsx");
    std::ofstream(file) << "this is not a workbook";
    auto bridge = MakeBridge();
    auto series = MakeSeries(file, "StartRow=2;", /*silent=*/false);
    bridge->SetHostSeries(series.Get());
    MessageBoxes boxes;
    SHORT fits = 0;
    EXPECT_HR(S_OK, bridge->InspectWorkbook(&fits));
    EXPECT_EQ(fits, SHORT(VARIANT_TRUE));
    EXPECT_TRUE(boxes.texts.empty());
    // The read that follows reports it.
    EXPECT_HR(E_FAIL, bridge->ReadData());
    EXPECT_EQ(TakeErrorDescription(), "Excel Workbook could not open file.");
    EXPECT_EQ(std::filesystem::file_size(file), 22u);  // nothing was written to it
}

}  // namespace
