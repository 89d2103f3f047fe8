// SPDX-License-Identifier: MIT
// Type library records under TypeLib\{libid}\<version>.
#include <gtest/gtest.h>

#include "platform/registry/registry_fixture.h"
#include "registry/type_library.h"
#include "support/expect_hr.h"

namespace {

using namespace testing_registry;

constexpr GUID kLibrary = {0xE2A939FB, 0x7148, 0x46F8, {0xB5, 0x0A, 0x63, 0x86, 0xDE, 0xB8, 0xF1, 0xBB}};
const std::string kKey = "TypeLib\\{E2A939FB-7148-46F8-B50A-6386DEB8F1BB}";

std::string QueryPath(WORD major, WORD minor)
{
    char path[256];
    DWORD size = sizeof path;
    const HRESULT hr = RegistryQueryPathOfTypeLib(kLibrary, major, minor, path, &size);
    return hr == S_OK ? std::string(path) : "<" + ::vantrel::testing::HrText(hr) + ">";
}

TEST(RegistryTypeLibrary, RegisteringRecordsAndUnregisteringRemoves)
{
    ScopedRegistryRoot root;
    EXPECT_EQ(QueryPath(1, 0), "<0x8002801D>");

    ASSERT_HR(S_OK, RegistryRegisterTypeLib(kLibrary, 1, 0, "/opt/bridge/module.so", "A bridge"));
    EXPECT_EQ(QueryPath(1, 0), "/opt/bridge/module.so");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, kKey + "\\1.0"), "A bridge");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, kKey + "\\1.0\\0\\linux64"), "/opt/bridge/module.so");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, kKey + "\\1.0\\FLAGS"), "0");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, kKey + "\\1.0\\HELPDIR"), "/opt/bridge");

    // Registering again replaces the record whole.
    const std::string once = FileText(root.ClassesFile());
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, (kKey + "\\1.0\\Leftover").c_str());
    RegistrySetValue(REGISTRY_CLASSES_ROOT, (kKey + "\\1.0").c_str(), "Stale", "x");
    ASSERT_HR(S_OK, RegistryRegisterTypeLib(kLibrary, 1, 0, "/opt/bridge/module.so", "A bridge"));
    EXPECT_EQ(FileText(root.ClassesFile()), once);

    // Versions are apart, written in hex.
    ASSERT_HR(S_OK, RegistryRegisterTypeLib(kLibrary, 10, 11, "/elsewhere/new.so", nullptr));
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, kKey + "\\a.b"), "");
    EXPECT_EQ(QueryPath(10, 11), "/elsewhere/new.so");

    EXPECT_HR(S_OK, RegistryUnRegisterTypeLib(kLibrary, 1, 0));
    EXPECT_EQ(QueryPath(1, 0), "<0x8002801D>");
    EXPECT_EQ(QueryPath(10, 11), "/elsewhere/new.so");
    EXPECT_HR(S_OK, RegistryUnRegisterTypeLib(kLibrary, 10, 11));
    EXPECT_FALSE(KeyExists(REGISTRY_CLASSES_ROOT, kKey));
    EXPECT_TRUE(KeyExists(REGISTRY_CLASSES_ROOT, "TypeLib"));

    // What isn't recorded is gone already.
    EXPECT_HR(S_OK, RegistryUnRegisterTypeLib(kLibrary, 1, 0));
}

TEST(RegistryTypeLibrary, FailuresAreReported)
{
    ScopedRegistryRoot root;
    EXPECT_HR(E_INVALIDARG, RegistryRegisterTypeLib(kLibrary, 1, 0, "", "x"));
    EXPECT_HR(E_INVALIDARG, RegistryRegisterTypeLib(kLibrary, 1, 0, nullptr, "x"));
    EXPECT_HR(E_POINTER, RegistryQueryPathOfTypeLib(kLibrary, 1, 0, nullptr, nullptr));

    WriteFile(root.ClassesFile(), "; vantrel registry, version 1\n[TypeLib\n");
    EXPECT_HR(TYPE_E_REGISTRYACCESS, RegistryRegisterTypeLib(kLibrary, 1, 0, "/m.so", "x"));
    EXPECT_NE(std::string(RegistryLastFailure()).find("line 2: a key line must be [path]"), std::string::npos)
        << RegistryLastFailure();
    EXPECT_HR(TYPE_E_REGISTRYACCESS, RegistryUnRegisterTypeLib(kLibrary, 1, 0));
    EXPECT_EQ(FileText(root.ClassesFile()), "; vantrel registry, version 1\n[TypeLib\n");
}

}  // namespace
