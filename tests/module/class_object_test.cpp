// SPDX-License-Identifier: MIT
// The module as a host meets it: loaded with dlopen, its class made through
// DllGetClassObject, its lock count seen through DllCanUnloadNow.
#include <gtest/gtest.h>

#include <atomic>
#include <cstdio>
#include <memory>
#include <set>
#include <string>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "module/loaded_module.h"
#include "support/expect_hr.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace {

using automation::ComPtr;
using testing_host::kClsidExcelVantrel;
using testing_host::LoadedModule;

ComPtr<IClassFactory> ClassObject(const LoadedModule &module)
{
    ComPtr<IClassFactory> factory;
    EXPECT_HR(S_OK, module.getClassObject(kClsidExcelVantrel, IID_IClassFactory, factory.OutVoid()));
    return factory;
}

TEST(ModuleExports, OnlyTheEntryPointsAreExported)
{
    LoadedModule module;
    ASSERT_NE(module.getClassObject, nullptr);
    ASSERT_NE(module.canUnloadNow, nullptr);

    const std::string command = std::string("nm -D --defined-only ") + VANTREL_MODULE_PATH;
    std::unique_ptr<FILE, int (*)(FILE *)> pipe(popen(command.c_str(), "r"), pclose);
    ASSERT_TRUE(pipe);
    std::set<std::string> exported;
    char line[1024];
    while (fgets(line, sizeof line, pipe.get())) {
        std::string entry(line);
        const auto name = entry.substr(entry.find_last_of(' ') + 1);
        exported.insert(name.substr(0, name.find_first_of("\n@")));
    }
    for (const auto &name : exported) EXPECT_EQ(name.rfind("Dll", 0), 0u) << name;
    EXPECT_TRUE(exported.count("DllGetClassObject"));
    EXPECT_TRUE(exported.count("DllCanUnloadNow"));
}

TEST(ModuleExports, GetClassObjectArguments)
{
    LoadedModule module;
    EXPECT_HR(E_POINTER, module.getClassObject(kClsidExcelVantrel, IID_IClassFactory, nullptr));

    void *object = reinterpret_cast<void *>(0x1);
    EXPECT_HR(CLASS_E_CLASSNOTAVAILABLE, module.getClassObject(IID_IUnknown, IID_IClassFactory, &object));
    EXPECT_EQ(object, nullptr);

    object = reinterpret_cast<void *>(0x1);
    EXPECT_HR(E_NOINTERFACE, module.getClassObject(kClsidExcelVantrel, IID_IVantrel, &object));
    EXPECT_EQ(object, nullptr);

    // One class object a process.
    auto first = ClassObject(module);
    ComPtr<IUnknown> second;
    EXPECT_HR(S_OK, module.getClassObject(kClsidExcelVantrel, IID_IUnknown, second.OutVoid()));
    EXPECT_EQ(static_cast<IUnknown *>(first.Get()), second.Get());
}

TEST(ModuleLocks, LiveObjectsAndFactoryLocksHoldTheModule)
{
    LoadedModule module;
    EXPECT_HR(S_OK, module.canUnloadNow());
    auto factory = ClassObject(module);
    EXPECT_HR(S_OK, module.canUnloadNow());  // a held class object is no lock

    ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    ComPtr<IVantrel> second;
    EXPECT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, second.OutVoid()));
    EXPECT_HR(S_FALSE, module.canUnloadNow());
    bridge.Reset();
    EXPECT_HR(S_FALSE, module.canUnloadNow());
    second.Reset();
    EXPECT_HR(S_OK, module.canUnloadNow());

    EXPECT_HR(S_OK, factory->LockServer(TRUE));
    EXPECT_HR(S_FALSE, module.canUnloadNow());
    EXPECT_HR(S_OK, factory->LockServer(FALSE));
    EXPECT_HR(S_OK, module.canUnloadNow());

    void *object = reinterpret_cast<void *>(0x1);
    EXPECT_HR(E_NOINTERFACE, factory->CreateInstance(nullptr, IID_IHostSeries, &object));
    EXPECT_EQ(object, nullptr);
    EXPECT_HR(S_OK, module.canUnloadNow());  // the refused object is gone
}

// An outer object that counts what its inner object passes on to it.
struct CountingOuter : IUnknown {
    std::atomic<ULONG> refs{1};
    IUnknown *inner = nullptr;
    HRESULT QueryInterface(REFIID riid, void **object) override
    {
        if (riid == IID_IUnknown) {
            *object = this;
            AddRef();
            return S_OK;
        }
        return inner->QueryInterface(riid, object);
    }
    ULONG AddRef() override { return ++refs; }
    ULONG Release() override { return --refs; }
};

TEST(ModuleAggregation, InnerObjectDelegatesToItsOuter)
{
    LoadedModule module;
    auto factory = ClassObject(module);
    CountingOuter outer;

    void *object = reinterpret_cast<void *>(0x1);
    EXPECT_HR(CLASS_E_NOAGGREGATION, factory->CreateInstance(&outer, IID_IVantrel, &object));
    EXPECT_EQ(object, nullptr);

    ASSERT_HR(S_OK, factory->CreateInstance(&outer, IID_IUnknown, reinterpret_cast<void **>(&outer.inner)));
    ASSERT_NE(outer.inner, nullptr);
    ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, outer.QueryInterface(IID_IVantrel, bridge.OutVoid()));
    EXPECT_EQ(outer.refs, 2u);  // the interface's count goes to the outer object

    // Its QueryInterface for IUnknown answers the outer identity.
    ComPtr<IUnknown> identity;
    EXPECT_HR(S_OK, bridge.As(IID_IUnknown, identity));
    EXPECT_EQ(identity.Get(), static_cast<IUnknown *>(&outer));
    identity.Reset();
    bridge.Reset();
    EXPECT_EQ(outer.refs, 1u);
    EXPECT_HR(S_FALSE, module.canUnloadNow());
    EXPECT_EQ(outer.inner->Release(), 0u);
    EXPECT_HR(S_OK, module.canUnloadNow());
}

TEST(ModuleHost, RunsAnExportAndReleasesEverything)
{
    testing_host::TempDir dir;
    LoadedModule module;
    {
        auto factory = ClassObject(module);
        ComPtr<IVantrel> bridge;
        ASSERT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
        auto series = testing_host::MakeSeries(dir.File("made.xlsx"), "", true);
        EXPECT_HR(S_OK, bridge->SetHostSeries(series.Get()));
        EXPECT_HR(S_OK, bridge->WriteData());
        SHORT exists = 0;
        EXPECT_HR(S_OK, bridge->FileExists(&exists));
        EXPECT_EQ(exists, 1);
    }
    EXPECT_HR(S_OK, module.canUnloadNow());
}

}  // namespace
