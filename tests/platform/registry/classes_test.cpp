// SPDX-License-Identifier: MIT
// Finding a class by ProgID and its module, as a host does before it loads it.
#include <gtest/gtest.h>

#include "automation/guid.h"
#include "platform/registry/registry_fixture.h"
#include "registry/classes.h"
#include "support/expect_hr.h"

namespace {

using namespace testing_registry;

constexpr CLSID kClass = {0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};

TEST(RegistryClasses, ProgIdLeadsToTheClassAndItsModule)
{
    ScopedRegistryRoot root;
    CLSID clsid{};
    clsid.Data1 = 7;
    EXPECT_HR(REGDB_E_CLASSNOTREG, RegistryCLSIDFromProgID("Some.Class.1", &clsid));
    EXPECT_EQ(clsid, CLSID{});
    EXPECT_STREQ(RegistryLastFailure(), "the ProgID Some.Class.1 is not registered");

    RegistrySetValue(REGISTRY_CLASSES_ROOT, "Some.Class.1\\CLSID", nullptr, "{4c2698c4-93a5-4d02-8642-b1c2705c538f}");
    EXPECT_HR(S_OK, RegistryCLSIDFromProgID("some.CLASS.1", &clsid));
    EXPECT_EQ(clsid, kClass);

    char path[64];
    DWORD size = sizeof path;
    EXPECT_HR(REGDB_E_CLASSNOTREG, RegistryGetInprocServer(kClass, path, &size));
    EXPECT_STREQ(RegistryLastFailure(), "the class {4C2698C4-93A5-4D02-8642-B1C2705C538F} has no module registered");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{4C2698C4-93A5-4D02-8642-B1C2705C538F}\\InprocServer32", nullptr,
                     "/opt/bridge/module.so");
    EXPECT_HR(S_OK, RegistryGetInprocServer(kClass, path, &size));
    EXPECT_STREQ(path, "/opt/bridge/module.so");
    EXPECT_EQ(size, 22u);
    size = 4;
    EXPECT_HR(REGISTRY_E_MORE_DATA, RegistryGetInprocServer(kClass, path, &size));
    EXPECT_EQ(size, 22u);
}

TEST(RegistryClasses, BadEntriesAndArguments)
{
    ScopedRegistryRoot root;
    CLSID clsid{};
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "Broken.Class\\CLSID", nullptr, "not a class id");
    EXPECT_HR(CO_E_CLASSSTRING, RegistryCLSIDFromProgID("Broken.Class", &clsid));
    EXPECT_STREQ(RegistryLastFailure(), "the ProgID Broken.Class names no class id: \"not a class id\"");
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "Empty.Class\\CLSID");
    EXPECT_HR(REGDB_E_CLASSNOTREG, RegistryCLSIDFromProgID("Empty.Class", &clsid));

    EXPECT_HR(E_POINTER, RegistryCLSIDFromProgID("Broken.Class", nullptr));
    EXPECT_HR(E_INVALIDARG, RegistryCLSIDFromProgID(nullptr, &clsid));
    EXPECT_HR(E_INVALIDARG, RegistryCLSIDFromProgID("", &clsid));
    EXPECT_HR(E_INVALIDARG, RegistryCLSIDFromProgID("A\\B", &clsid));
    EXPECT_HR(E_POINTER, RegistryGetInprocServer(kClass, nullptr, nullptr));

    WriteFile(root.ClassesFile(), "damaged\n");
    EXPECT_HR(REGDB_E_READREGDB, RegistryCLSIDFromProgID("Broken.Class", &clsid));
    EXPECT_NE(std::string(RegistryLastFailure()).find("is damaged"), std::string::npos);
    DWORD size = 0;
    EXPECT_HR(REGDB_E_READREGDB, RegistryGetInprocServer(kClass, nullptr, &size));
}

}  // namespace
