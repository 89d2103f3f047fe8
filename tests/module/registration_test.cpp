// SPDX-License-Identifier: MIT
// The module's registration, against a registry of the test's own: the files
// it writes compared whole with the expected ones, and the command-line host
// that registers it and then finds it by its ProgID.
#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "module/loaded_module.h"
#include "platform/registry/registry_fixture.h"
#include "support/expect_hr.h"
#include "support/program_run.h"

namespace {

using namespace testing_registry;
using testing_host::ReadFile;
using testing_host::WriteFile;

const std::string kProgId = "GenericExcelVantrel.ExcelVantrel.1";
const std::string kModule = std::filesystem::canonical(VANTREL_MODULE_PATH).string();

std::string ReplaceAll(std::string text, const std::string &marker, const std::string &value)
{
    for (size_t at = text.find(marker); at != std::string::npos; at = text.find(marker, at + value.size()))
        text.replace(at, marker.size(), value);
    return text;
}

// An expected registry file, with the module's path and folder put in.
std::string Expected(const std::string &name)
{
    const std::string text = ReadFile(VANTREL_SOURCE_DIR "/tests/module/expected/" + name);
    return ReplaceAll(ReplaceAll(text, "@MODULE@", kModule), "@FOLDER@",
                      std::filesystem::path(kModule).parent_path().string());
}

struct RegistrationTool {
    testing_host::LoadedModule module;
    HRESULT (*registerServer)() = reinterpret_cast<HRESULT (*)()>(module.Symbol("DllRegisterServer"));
    HRESULT (*unregisterServer)() = reinterpret_cast<HRESULT (*)()>(module.Symbol("DllUnregisterServer"));
};

TEST(ModuleRegistration, WritesTheExpectedEntriesOverAnyOlderOnes)
{
    ScopedRegistryRoot root;
    RegistrationTool tool;
    ASSERT_TRUE(tool.registerServer && tool.unregisterServer);
    ASSERT_HR(S_OK, tool.registerServer());
    EXPECT_EQ(ReadFile(root.ClassesFile()), Expected("classes.reg"));
    EXPECT_EQ(ReadFile(root.HostFile()), Expected("host.reg"));

    const std::string classKey = "CLSID\\{4C2698C4-93A5-4D02-8642-B1C2705C538F}";
    RegistrySetValue(REGISTRY_CLASSES_ROOT, (classKey + "\\LocalServer32").c_str(), nullptr, "/old/server");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, classKey.c_str(), "Stale", "x");
    RegistrySetValue(REGISTRY_CLASSES_ROOT, (classKey + "\\InprocServer32").c_str(), nullptr, "/old/module.so");
    ASSERT_HR(S_OK, tool.registerServer());
    EXPECT_EQ(ReadFile(root.ClassesFile()), Expected("classes.reg"));
    EXPECT_EQ(ReadFile(root.HostFile()), Expected("host.reg"));
}

TEST(ModuleRegistration, UnregisteringRemovesItsEntriesOnly)
{
    ScopedRegistryRoot root;
    RegistrationTool tool;
    WriteFile(root.ClassesFile(), "; vantrel registry, version 1\n[CLSID\\{1}]\n@=\"Other\"\n");
    RegistrySetValue(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Other\\CLSID", nullptr, "{1}");
    const std::string hostBefore = ReadFile(root.HostFile());
    ASSERT_HR(S_OK, tool.registerServer());
    ASSERT_HR(S_OK, tool.unregisterServer());
    EXPECT_EQ(ReadFile(root.ClassesFile()), "; vantrel registry, version 1\n; classes root\n\n[CLSID]\n\n"
                                            "[CLSID\\{1}]\n@=\"Other\"\n\n[TypeLib]\n");
    EXPECT_EQ(ReadFile(root.HostFile()), hostBefore);
}

TEST(ModuleRegistration, DamagedRegistryFilesAreReportedAndKept)
{
    RegistrationTool tool;
    const std::string damaged = "; vantrel registry, version 1\n[CLSID\n";
    for (const bool classesDamaged : {true, false}) {
        ScopedRegistryRoot root;
        WriteFile(classesDamaged ? root.ClassesFile() : root.HostFile(), damaged);
        EXPECT_HR(E_UNEXPECTED, tool.registerServer());
        EXPECT_EQ(ReadFile(classesDamaged ? root.ClassesFile() : root.HostFile()), damaged);
        // With the classes root damaged nothing is written; with the host's tree, the classes stay: there is no undo.
        const std::string other = ReadFile(classesDamaged ? root.HostFile() : root.ClassesFile());
        EXPECT_EQ(other, classesDamaged ? "" : Expected("classes.reg"));
    }
}

TEST(VantrelTool, RegistersUnregistersAndCreatesByProgId)
{
    testing_host::TempDir dir;
    const testing_host::RunOptions options{"/dev/null", {"VANTREL_REGISTRY_ROOT=" + dir.File("registry")}};
    const auto run = [&](std::vector<std::string> arguments) {
        const testing_host::ProgramRun ran = testing_host::Vantrel(arguments, options);
        return std::to_string(ran.status) + " " + ran.out + ran.err;
    };
    std::vector<std::string> inspect = {"inspect", dir.File("book.xlsx"), "--spec", "", "--progid", kProgId};
    EXPECT_EQ(run(inspect), "1 vantrel: cannot find the class of " + kProgId + " (0x80040154): the ProgID " + kProgId +
                                " is not registered\n");
    EXPECT_EQ(run({"register", kModule}), "0 registered " + kModule + "\n");
    EXPECT_EQ(ReadFile(dir.File("registry/classes.reg")), Expected("classes.reg"));
    EXPECT_EQ(run(inspect), "1 Specification string is empty!\n") << "the bridge made through the registry runs";
    inspect.back() = "genericexcelvantrel.EXCELVANTREL.1";
    EXPECT_EQ(run(inspect), "1 Specification string is empty!\n") << "a ProgID is found whatever its case";
    EXPECT_EQ(run({"unregister", kModule}), "0 unregistered " + kModule + "\n");
    EXPECT_EQ(run({"unregister", kModule}), "1 vantrel: DllUnregisterServer of " + kModule + " failed with 0x8000FFFF: "
                                            "the key \"ProductAreas\\4\\Bridges\\ExcelVantrel\" doesn't exist\n");
    EXPECT_EQ(run({"register", dir.File("missing.so")}).rfind("1 vantrel: cannot load the module: ", 0), 0u);
    EXPECT_EQ(run({"register", "a", "b"}).substr(0, 2), "2 ");
}

}  // namespace
