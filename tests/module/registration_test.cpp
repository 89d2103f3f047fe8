// SPDX-License-Identifier: MIT
// The module's registration as a registration tool and a host meet it: the
// module is loaded with dlopen and its exports are called, against a registry
// of the test's own.
#include <gtest/gtest.h>

#include <dlfcn.h>

#include <cstdio>
#include <filesystem>
#include <memory>
#include <string>

#include "automation/com_ptr.h"
#include "automation/guid.h"
#include "module/loaded_module.h"
#include "platform/registry/registry_fixture.h"
#include "registry/classes.h"
#include "registry/type_library.h"
#include "support/expect_hr.h"
#include "support/temp_dir.h"
#include "support/test_host.h"

namespace {

using automation::ComPtr;
using namespace testing_registry;
using testing_host::kClsidExcelVantrel;
using testing_host::LoadedModule;

const std::string kClassId = "{4C2698C4-93A5-4D02-8642-B1C2705C538F}";
const std::string kClassKey = "CLSID\\" + kClassId;
const std::string kLibraryKey = "TypeLib\\{E2A939FB-7148-46F8-B50A-6386DEB8F1BB}";
const std::string kProgId = "GenericExcelVantrel.ExcelVantrel.1";
const std::string kVersionIndependentProgId = "GenericExcelVantrel.ExcelVantrel";
const std::string kBridgeKey = "ProductAreas\\4\\Bridges\\ExcelVantrel";

using RegistrationFn = HRESULT (*)();

// The module with its two registration exports.
struct RegistrationTool {
    LoadedModule module;
    RegistrationFn registerServer = reinterpret_cast<RegistrationFn>(module.Symbol("DllRegisterServer"));
    RegistrationFn unregisterServer = reinterpret_cast<RegistrationFn>(module.Symbol("DllUnregisterServer"));
};

std::string ModulePath() { return std::filesystem::canonical(VANTREL_MODULE_PATH).string(); }

// True when none of the class's entries in the classes root is left.
void ExpectNoClassEntries()
{
    EXPECT_FALSE(KeyExists(REGISTRY_CLASSES_ROOT, kProgId));
    EXPECT_FALSE(KeyExists(REGISTRY_CLASSES_ROOT, kVersionIndependentProgId));
    EXPECT_FALSE(KeyExists(REGISTRY_CLASSES_ROOT, kClassKey));
    EXPECT_FALSE(KeyExists(REGISTRY_CLASSES_ROOT, kLibraryKey));
}

TEST(ModuleRegistration, WritesTheClassTheTypeLibraryAndTheBridge)
{
    ScopedRegistryRoot root;
    RegistrationTool tool;
    ASSERT_NE(tool.registerServer, nullptr);
    ASSERT_NE(tool.unregisterServer, nullptr);
    ASSERT_HR(S_OK, tool.registerServer());

    const auto classes = REGISTRY_CLASSES_ROOT;
    EXPECT_EQ(Value(classes, kProgId), "GenericExcelVantrel Class");
    EXPECT_EQ(Value(classes, kProgId + "\\CLSID"), kClassId);
    EXPECT_EQ(Value(classes, kVersionIndependentProgId), "GenericExcelVantrel Class");
    EXPECT_EQ(Value(classes, kVersionIndependentProgId + "\\CLSID"), kClassId);
    EXPECT_EQ(Value(classes, kVersionIndependentProgId + "\\CurVer"), kProgId);

    EXPECT_EQ(Value(classes, kClassKey), "GenericExcelVantrel Class");
    EXPECT_EQ(Value(classes, kClassKey, "AppID"), "{57B1D7D7-0CDB-494C-896A-DDC1F72AFE15}");
    EXPECT_EQ(Value(classes, kClassKey + "\\ProgID"), kProgId);
    EXPECT_EQ(Value(classes, kClassKey + "\\VersionIndependentProgID"), kVersionIndependentProgId);
    EXPECT_TRUE(KeyExists(classes, kClassKey + "\\Programmable"));
    EXPECT_EQ(Value(classes, kClassKey + "\\InprocServer32"), ModulePath());
    EXPECT_EQ(Value(classes, kClassKey + "\\InprocServer32", "ThreadingModel"), "Apartment");
    EXPECT_EQ(Value(classes, kClassKey + "\\TypeLib"), "{E2A939FB-7148-46F8-B50A-6386DEB8F1BB}");
    EXPECT_FALSE(KeyExists(classes, "AppID"));  // only the named value points to it

    EXPECT_EQ(Value(classes, kLibraryKey + "\\1.0"), "Zerin Chronal Excel Bridge");
    EXPECT_EQ(Value(classes, kLibraryKey + "\\1.0\\0\\linux64"), ModulePath());

    EXPECT_EQ(Value(REGISTRY_HOST_TREE, kBridgeKey + "\\CLSID"), kClassId);
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, kBridgeKey + "\\Name"), "Excel Vantrel");

    // Registering twice gives the same state as once, to the byte.
    const std::string classesOnce = FileText(root.ClassesFile());
    const std::string hostOnce = FileText(root.HostFile());
    ASSERT_HR(S_OK, tool.registerServer());
    EXPECT_EQ(FileText(root.ClassesFile()), classesOnce);
    EXPECT_EQ(FileText(root.HostFile()), hostOnce);
}

TEST(ModuleRegistration, RegisteringRemovesLeftoversOfAnOlderRegistration)
{
    ScopedRegistryRoot root;
    RegistrationTool tool;
    ASSERT_HR(S_OK, tool.registerServer());
    const std::string clean = FileText(root.ClassesFile());

    RegistrySetValue(REGISTRY_CLASSES_ROOT, (kClassKey + "\\LocalServer32").c_str(), nullptr, "/old/server");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, kClassKey.c_str(), "Stale", "x");
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, (kClassKey + "\\Programmable\\Stale").c_str());
    RegistrySetValue(REGISTRY_CLASSES_ROOT, (kClassKey + "\\InprocServer32").c_str(), nullptr, "/old/module.so");
    ASSERT_HR(S_OK, tool.registerServer());
    EXPECT_EQ(FileText(root.ClassesFile()), clean);
}

TEST(ModuleRegistration, UnregisteringRemovesItsEntriesAndKeepsSharedOnes)
{
    ScopedRegistryRoot root;
    RegistrationTool tool;
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{00000000-0000-0000-0000-000000000001}", nullptr, "Other");
    RegistrySetValue(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other\\CLSID", nullptr, "{1}");
    ASSERT_HR(S_OK, tool.registerServer());
    ASSERT_HR(S_OK, tool.unregisterServer());

    ExpectNoClassEntries();
    EXPECT_TRUE(KeyExists(REGISTRY_CLASSES_ROOT, "CLSID"));
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{00000000-0000-0000-0000-000000000001}"), "Other");
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, kBridgeKey));
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other\\CLSID"), "{1}");

    // With the bridge's key gone, a second unregistering can't delete it.
    EXPECT_HR(E_UNEXPECTED, tool.unregisterServer());
    EXPECT_TRUE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other"));
}

TEST(ModuleRegistration, UnregisteringWithoutTheHostsBridgesKey)
{
    ScopedRegistryRoot root;
    RegistrationTool tool;
    ASSERT_HR(S_OK, tool.registerServer());
    ASSERT_EQ(RegistryDeleteTree(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges"), REGISTRY_OK);

    EXPECT_HR(E_UNEXPECTED, tool.unregisterServer());
    ExpectNoClassEntries();  // the class entries went first
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges"));  // nothing was made

    // On a registry that never saw the module, likewise.
    ScopedRegistryRoot fresh;
    EXPECT_HR(E_UNEXPECTED, tool.unregisterServer());
    ExpectNoClassEntries();
    EXPECT_EQ(FileText(fresh.HostFile()), "<missing>");
}

TEST(ModuleRegistration, DamagedRegistryFilesAreReportedAndKept)
{
    RegistrationTool tool;
    const std::string damaged = "; vantrel registry, version 1\n[CLSID\n";
    {
        // The classes root can't be read: nothing is written anywhere.
        ScopedRegistryRoot root;
        WriteFile(root.ClassesFile(), damaged);
        EXPECT_HR(E_UNEXPECTED, tool.registerServer());
        EXPECT_EQ(FileText(root.ClassesFile()), damaged);
        EXPECT_EQ(FileText(root.HostFile()), "<missing>");
    }
    {
        // Unregistering stops before the host's tree.
        ScopedRegistryRoot root;
        ASSERT_HR(S_OK, tool.registerServer());
        WriteFile(root.ClassesFile(), damaged);
        EXPECT_HR(E_UNEXPECTED, tool.unregisterServer());
        EXPECT_EQ(FileText(root.ClassesFile()), damaged);
        EXPECT_EQ(Value(REGISTRY_HOST_TREE, kBridgeKey + "\\CLSID"), kClassId);
    }
    {
        // The host's tree can't be read: the class entries stay, there is no undo.
        ScopedRegistryRoot root;
        WriteFile(root.HostFile(), damaged);
        EXPECT_HR(E_UNEXPECTED, tool.registerServer());
        EXPECT_EQ(FileText(root.HostFile()), damaged);
        EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, kClassKey + "\\InprocServer32"), ModulePath());
    }
}

// A host that knows only the ProgID: the registry leads it to the module.
TEST(ModuleHost, CreatesTheClassByProgIdThroughTheRegistry)
{
    ScopedRegistryRoot root;
    testing_host::TempDir work;
    RegistrationTool tool;

    CLSID clsid{};
    EXPECT_HR(REGDB_E_CLASSNOTREG, RegistryCLSIDFromProgID(kVersionIndependentProgId.c_str(), &clsid));
    ASSERT_HR(S_OK, tool.registerServer());

    ASSERT_HR(S_OK, RegistryCLSIDFromProgID(kVersionIndependentProgId.c_str(), &clsid));
    EXPECT_EQ(clsid, kClsidExcelVantrel);
    CLSID versioned{};
    ASSERT_HR(S_OK, RegistryCLSIDFromProgID(kProgId.c_str(), &versioned));
    EXPECT_EQ(versioned, clsid);
    char path[4096];
    DWORD size = sizeof path;
    ASSERT_HR(S_OK, RegistryGetInprocServer(clsid, path, &size));

    void *module = dlopen(path, RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(module, nullptr) << dlerror();
    const auto getClassObject =
        reinterpret_cast<HRESULT (*)(REFCLSID, REFIID, void **)>(dlsym(module, "DllGetClassObject"));
    const auto canUnloadNow = reinterpret_cast<HRESULT (*)()>(dlsym(module, "DllCanUnloadNow"));
    ASSERT_TRUE(getClassObject && canUnloadNow);
    {
        ComPtr<IClassFactory> factory;
        ASSERT_HR(S_OK, getClassObject(clsid, IID_IClassFactory, factory.OutVoid()));
        ComPtr<IVantrel> bridge;
        ASSERT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
        EXPECT_HR(S_FALSE, canUnloadNow());

        const std::string book = work.File("export.xlsx");
        auto series = testing_host::MakeSeries(book, "", true);
        ASSERT_HR(S_OK, bridge->SetHostSeries(series.Get()));
        EXPECT_HR(S_OK, bridge->WriteData());
        EXPECT_TRUE(std::filesystem::is_regular_file(book));
    }
    EXPECT_HR(S_OK, canUnloadNow());
    dlclose(module);

    ASSERT_HR(S_OK, tool.unregisterServer());
    EXPECT_HR(REGDB_E_CLASSNOTREG, RegistryCLSIDFromProgID(kProgId.c_str(), &clsid));
}

// The command-line host, run as a person runs it, with the registry root in
// its environment.
struct ToolRun {
    int status;
    std::string output;
};

ToolRun RunTool(const std::filesystem::path &registryRoot, const std::string &arguments)
{
    const std::string command = "VANTREL_REGISTRY_ROOT='" + registryRoot.string() + "' '" VANTREL_TOOL_PATH "' " +
                                arguments + " 2>&1";
    std::unique_ptr<FILE, int (*)(FILE *)> pipe(popen(command.c_str(), "r"), pclose);
    if (!pipe) return {-1, "popen failed"};
    std::string output;
    char buffer[512];
    while (size_t n = std::fread(buffer, 1, sizeof buffer, pipe.get())) output.append(buffer, n);
    const int status = pclose(pipe.release());
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, output};
}

TEST(VantrelTool, RegistersUnregistersAndCreatesByProgId)
{
    testing_host::TempDir dir;
    const auto registry = dir.Path() / "registry";
    const std::string module = ModulePath();
    const std::string inspect = "inspect '" + dir.File("book.xlsx") + "' --spec '' --progid " + kProgId;

    ToolRun run = RunTool(registry, inspect);
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.output, "vantrel: cannot find the class of " + kProgId + " (0x80040154): the ProgID " + kProgId +
                              " is not registered\n");

    run = RunTool(registry, "register '" + module + "'");
    EXPECT_EQ(run.status, 0) << run.output;
    EXPECT_EQ(run.output, "registered " + module + "\n");
    EXPECT_NE(FileText(registry / "classes.reg").find("@=\"" + module + "\""), std::string::npos);
    EXPECT_NE(FileText(registry / "host.reg").find("[ProductAreas\\4\\Bridges\\ExcelVantrel\\Name]\n@=\"Excel Vantrel\""),
              std::string::npos);

    // The bridge made through the registry runs and says why it can't inspect.
    run = RunTool(registry, inspect);
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.output, "Specification string is empty!\n");

    run = RunTool(registry, "unregister '" + module + "'");
    EXPECT_EQ(run.status, 0) << run.output;
    EXPECT_EQ(run.output, "unregistered " + module + "\n");
    run = RunTool(registry, "unregister '" + module + "'");
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.output, "vantrel: DllUnregisterServer of " + module +
                              " failed with 0x8000FFFF: the key \"ProductAreas\\4\\Bridges\\ExcelVantrel\" doesn't exist\n");

    run = RunTool(registry, "register '" + dir.File("missing.so") + "'");
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.output.rfind("vantrel: cannot load the module: ", 0), 0u) << run.output;
    EXPECT_EQ(RunTool(registry, "register a b").status, 2);
}

}  // namespace
