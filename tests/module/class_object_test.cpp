// SPDX-License-Identifier: MIT
// The module as a host meets it: loaded with dlopen, its class made through
// DllGetClassObject, its lock count seen through DllCanUnloadNow.
#include <gtest/gtest.h>

#include <set>
#include <sstream>
#include <string>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "module/loaded_module.h"
#include "support/expect_hr.h"
#include "support/program_run.h"

namespace {

using automation::ComPtr;
using testing_host::kClsidExcelVantrel;

// Exported means bound globally (or weakly, or uniquely) in the dynamic symbol
// table: a local entry there is found by no other object.
TEST(ModuleExports, OnlyTheEntryPointsAreExported)
{
    const auto symbols =
        testing_host::RunProgram("/usr/bin/nm", {"-D", "--defined-only", "--extern-only", VANTREL_MODULE_PATH});
    ASSERT_EQ(symbols.status, 0) << symbols.err;
    std::set<std::string> exported;
    std::istringstream lines(symbols.out);
    for (std::string address, kind, name; lines >> address >> kind >> name;) exported.insert(name.substr(0, name.find('@')));
    EXPECT_EQ(exported, (std::set<std::string>{"DllCanUnloadNow", "DllGetClassObject", "DllRegisterServer",
                                               "DllUnregisterServer"}));
}

TEST(ModuleClassObject, MakesOnlyItsClassAndItsObjectsAndLocksHoldTheModule)
{
    testing_host::LoadedModule module;
    void *object = reinterpret_cast<void *>(0x1);
    EXPECT_HR(CLASS_E_CLASSNOTAVAILABLE, module.getClassObject(IID_IUnknown, IID_IClassFactory, &object));
    EXPECT_EQ(object, nullptr);
    ComPtr<IClassFactory> factory;
    ASSERT_HR(S_OK, module.getClassObject(kClsidExcelVantrel, IID_IClassFactory, factory.OutVoid()));
    EXPECT_HR(S_OK, module.canUnloadNow()) << "a held class object is no lock";

    ComPtr<IVantrel> first, second;
    ASSERT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, first.OutVoid()));
    ASSERT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, second.OutVoid()));
    first.Reset();
    EXPECT_HR(S_FALSE, module.canUnloadNow());
    second.Reset();
    EXPECT_HR(S_OK, module.canUnloadNow());
    EXPECT_HR(S_OK, factory->LockServer(TRUE));
    EXPECT_HR(S_FALSE, module.canUnloadNow());
    EXPECT_HR(S_OK, factory->LockServer(FALSE));
    EXPECT_HR(E_NOINTERFACE, factory->CreateInstance(nullptr, IID_IHostSeries, &object));
    EXPECT_EQ(object, nullptr);
    EXPECT_HR(CLASS_E_NOAGGREGATION, factory->CreateInstance(factory.Get(), IID_IVantrel, &object));
    EXPECT_EQ(object, nullptr);
    EXPECT_HR(S_OK, module.canUnloadNow()) << "the refused object is gone";
}

}  // namespace
