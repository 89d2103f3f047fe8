// SPDX-License-Identifier: MIT
// A host whose calls fail: the in-memory host behind wrappers that fail the
// Nth call of any of its interfaces, with a null out pointer. Every operation
// must end in S_OK or in a failure with error info, whichever call fails.
#include <gtest/gtest.h>

#include <atomic>
#include <functional>
#include <string>

#include "bridge/export_host.h"
#include "support/message_boxes.h"
#include "support/temp_dir.h"

namespace {

using automation::ComPtr;

// Counts the calls; the one numbered failAt fails.
struct CallBudget {
    int failAt;
    int calls = 0;
    bool Fails() { return ++calls == failAt; }
};

template <typename Interface>
class Failing : public Interface {
public:
    Failing(Interface *inner, CallBudget &budget) : inner_(inner), budget_(budget) { inner_->AddRef(); }
    virtual ~Failing() { inner_->Release(); }
    HRESULT QueryInterface(REFIID riid, void **object) override
    {
        *object = nullptr;
        if (!(riid == IID_IUnknown)) return E_NOINTERFACE;
        *object = static_cast<IUnknown *>(this);
        AddRef();
        return S_OK;
    }
    ULONG AddRef() override { return ++refs_; }
    ULONG Release() override
    {
        const ULONG left = --refs_;
        if (left == 0) delete this;
        return left;
    }

protected:
    // The inner call, unless this call is the one that fails.
    template <typename Call>
    HRESULT Pass(Call &&call)
    {
        return budget_.Fails() ? E_FAIL : call(*inner_);
    }
    // A setter's array is the host's whether the call fails or not.
    template <typename Call>
    HRESULT PassArray(VARIANT &array, Call &&call)
    {
        if (!budget_.Fails()) return call(*inner_);
        VariantClear(&array);
        return E_FAIL;
    }
    // An interface out of the inner object, wrapped; null when the call fails.
    template <typename Wrapper, typename Out, typename Call>
    HRESULT PassObject(Out **out, Call &&call)
    {
        *out = nullptr;
        if (budget_.Fails()) return E_FAIL;
        ComPtr<Out> got;
        const HRESULT hr = call(*inner_, got.Out());
        if (SUCCEEDED(hr) && got) *out = new Wrapper(got.Get(), budget_), (*out)->AddRef();
        return hr;
    }

    Interface *inner_;
    CallBudget &budget_;
    std::atomic<ULONG> refs_{0};
};

struct FailingConnection : Failing<IHostConnection> {
    using Failing::Failing;
    HRESULT GetFilePath(BSTR *p) override { return Pass([&](auto &i) { return i.GetFilePath(p); }); }
    HRESULT SetFilePath(BSTR p) override { return Pass([&](auto &i) { return i.SetFilePath(p); }); }
    HRESULT GetSpecification(BSTR *s) override { return Pass([&](auto &i) { return i.GetSpecification(s); }); }
    HRESULT SetSpecification(BSTR s) override { return Pass([&](auto &i) { return i.SetSpecification(s); }); }
    HRESULT GetSilent(VARIANT_BOOL *s) override { return Pass([&](auto &i) { return i.GetSilent(s); }); }
};

struct FailingAxis : Failing<IHostTimeAxis> {
    using Failing::Failing;
    HRESULT GetStepCount(LONG *c) override { return Pass([&](auto &i) { return i.GetStepCount(c); }); }
    HRESULT SetStepCount(LONG c) override { return Pass([&](auto &i) { return i.SetStepCount(c); }); }
    HRESULT SetAxisKind(LONG k) override { return Pass([&](auto &i) { return i.SetAxisKind(k); }); }
    HRESULT SetTimes(VARIANT t) override { return PassArray(t, [&](auto &i) { return i.SetTimes(t); }); }
    HRESULT GetTime(LONG s, VARIANT *t) override { return Pass([&](auto &i) { return i.GetTime(s, t); }); }
};

struct FailingItem : Failing<IHostItem> {
    using Failing::Failing;
    HRESULT GetDataType(ItemDataType *t) override { return Pass([&](auto &i) { return i.GetDataType(t); }); }
    HRESULT SetDataType(ItemDataType t) override { return Pass([&](auto &i) { return i.SetDataType(t); }); }
    HRESULT SetItemType(LONG s) override { return Pass([&](auto &i) { return i.SetItemType(s); }); }
    HRESULT SetItemUnit(LONG s) override { return Pass([&](auto &i) { return i.SetItemUnit(s); }); }
    HRESULT GetTitle(BSTR *t) override { return Pass([&](auto &i) { return i.GetTitle(t); }); }
    HRESULT SetTitle(BSTR t) override { return Pass([&](auto &i) { return i.SetTitle(t); }); }
    HRESULT GetValueType(LONG *v) override { return Pass([&](auto &i) { return i.GetValueType(v); }); }
    HRESULT SetValueType(LONG v) override { return Pass([&](auto &i) { return i.SetValueType(v); }); }
    HRESULT GetData(VARIANT *d) override { return Pass([&](auto &i) { return i.GetData(d); }); }
    HRESULT SetData(VARIANT d) override { return PassArray(d, [&](auto &i) { return i.SetData(d); }); }
    HRESULT GetItemType(LONG *t) override { return Pass([&](auto &i) { return i.GetItemType(t); }); }
    HRESULT GetItemUnit(LONG *u) override { return Pass([&](auto &i) { return i.GetItemUnit(u); }); }
};

struct FailingSeries : Failing<IHostSeries> {
    using Failing::Failing;
    HRESULT GetConnection(IHostConnection **c) override
    {
        return PassObject<FailingConnection>(c, [](auto &i, auto **o) { return i.GetConnection(o); });
    }
    HRESULT GetItemCount(LONG *c) override { return Pass([&](auto &i) { return i.GetItemCount(c); }); }
    HRESULT GetDeleteValue(DOUBLE *v) override { return Pass([&](auto &i) { return i.GetDeleteValue(v); }); }
    HRESULT SetDeleteValue(DOUBLE v) override { return Pass([&](auto &i) { return i.SetDeleteValue(v); }); }
    HRESULT GetTimeAxis(IHostTimeAxis **a) override
    {
        return PassObject<FailingAxis>(a, [](auto &i, auto **o) { return i.GetTimeAxis(o); });
    }
    HRESULT GetItem(VARIANT n, IHostItem **t) override
    {
        return PassObject<FailingItem>(t, [&](auto &i, auto **o) { return i.GetItem(n, o); });
    }
    HRESULT AddItem(LONG *n, IHostItem **t) override
    {
        return PassObject<FailingItem>(t, [&](auto &i, auto **o) { return i.AddItem(n, o); });
    }
    HRESULT RemoveItem(LONG n) override { return Pass([&](auto &i) { return i.RemoveItem(n); }); }
    HRESULT RemoveAllItems() override { return Pass([&](auto &i) { return i.RemoveAllItems(); }); }
};

TEST(FailingHost, EveryOperationEndsInAFailureWithItsReasonOrSucceeds)
{
    testing_host::TempDir dir;
    testing_host::MessageBoxes boxes;
    const std::string book = dir.File("book.xlsx");
    // A host object of two items over three steps, to write and to read into.
    const auto host = [&](const std::string &spec) {
        auto series = bridge_testing::MakeHost(book, spec, 3);
        bridge_testing::AddItem(*series.Get(), ItemDataTypeDouble, {1, 2, 3}, "A", 2, 1, 0);
        bridge_testing::AddItem(*series.Get(), ItemDataTypeFloat, {4, 5, 6}, "B", 4, 1, 7);
        return series;
    };
    const std::string layout = "DateTimeCol=1;StartRow=5;UnitTypeRow=1;UnitRow=2;ValueTypeRow=2;ItemDescriptionRow=3;"
                               "DelValRow=4;";
    const struct {
        const char *name;
        std::function<HRESULT(IVantrel &)> run;
    } operations[] = {
        {"WriteData", [](IVantrel &b) { return b.WriteData(); }},
        {"InspectWorkbook", [](IVantrel &b) { SHORT fits = 0; return b.InspectWorkbook(&fits); }},
        {"ReadData", [](IVantrel &b) { return b.ReadData(); }},
    };
    for (const auto &operation : operations) {
        HRESULT hr = E_FAIL;
        int failAt = 1;
        for (; failAt < 1000 && hr != S_OK; ++failAt) {
            SCOPED_TRACE(std::string(operation.name) + ", call " + std::to_string(failAt) + " fails");
            auto inner = host(layout);
            CallBudget budget{failAt};
            ComPtr<IHostSeries> series(new FailingSeries(inner.Get(), budget));
            auto bridge = testing_host::MakeBridge();
            bridge->SetHostSeries(series.Get());
            SetErrorInfo(0, nullptr);
            hr = operation.run(*bridge.Get());
            if (hr != S_OK) {
                EXPECT_TRUE(FAILED(hr));
                EXPECT_NE(testing_host::TakeErrorDescription(), "<none>");
            }
        }
        EXPECT_HR(S_OK, hr) << operation.name << " never went through";
        EXPECT_GT(failAt, 2) << operation.name << " made no host call";
    }
}

}  // namespace
