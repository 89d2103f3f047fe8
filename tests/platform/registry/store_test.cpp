// SPDX-License-Identifier: MIT
// Keys and values of the store through its C functions, and where it lives.
#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "platform/registry/registry_fixture.h"

namespace {

using namespace testing_registry;

TEST(RegistryStore, KeysAndValuesIgnoreCaseAndKeepTheirFirstSpelling)
{
    ScopedRegistryRoot root;
    const std::string awkward = "quote \" backslash \\ line\nend tab\t \xC3\xA9 \x01";
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\Inproc", "Threading", awkward.c_str()), REGISTRY_OK);
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "clsid\\{ABC}\\INPROC", nullptr, "default"), REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{abc}\\inproc", "THREADING"), awkward);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{abc}\\inproc", ""), "default");
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "CLSID")) << "the trees are apart";
    EXPECT_NE(testing_host::ReadFile(root.ClassesFile()).find("[CLSID\\{AbC}\\Inproc]"), std::string::npos)
        << "spelled as first written";
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "CLSID\\Sibling");

    EXPECT_EQ(RegistryDeleteKey(REGISTRY_CLASSES_ROOT, "CLSID"), REGISTRY_HAS_SUBKEYS);
    EXPECT_EQ(RegistryDeleteValue(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\Inproc", "threading"), REGISTRY_OK);
    EXPECT_EQ(RegistryDeleteValue(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\Inproc", "threading"), REGISTRY_NOT_FOUND);
    EXPECT_EQ(RegistryDeleteTree(REGISTRY_CLASSES_ROOT, "clsid\\{abc}"), REGISTRY_OK);
    EXPECT_FALSE(KeyExists(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\Inproc"));
    EXPECT_TRUE(KeyExists(REGISTRY_CLASSES_ROOT, "CLSID\\Sibling"));
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\Inproc");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\Inproc"), std::nullopt) << "a re-made key holds nothing old";
}

TEST(RegistryStore, BadArgumentsAreRefusedWithAReason)
{
    ScopedRegistryRoot root;
    const std::pair<const char *, const char *> refused[] = {
        {"A\\\\B", "the key path \"A\\\\B\" has an empty key name"}, {"A\nB", "a key name holds a control character"},
        {nullptr, "the key path is null"}, {"A\\", "the key path \"A\\\" has an empty key name"},
        {"", "the key path is empty"}};
    for (auto [key, reason] : refused) {
        EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, key), REGISTRY_BAD_ARGUMENT) << (key ? key : "null");
        EXPECT_STREQ(RegistryLastFailure(), reason);
    }
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", "bad\tname", "y"), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(testing_host::ReadFile(root.ClassesFile()), "") << "nothing reached the disk";
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", "x\\y", "z"), REGISTRY_OK) << "a value name may hold a \\";
    EXPECT_STREQ(RegistryLastFailure(), "");
}

TEST(RegistryStore, ChangesFromManyThreadsAreAllKept)
{
    ScopedRegistryRoot root;
    std::vector<std::thread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([t] {
            for (int v = t; v < 80; v += 4) RegistrySetValue(REGISTRY_HOST_TREE, "Shared", std::to_string(v).c_str(), "set");
        });
    for (auto &thread : threads) thread.join();
    for (int v = 0; v < 80; ++v) EXPECT_EQ(Value(REGISTRY_HOST_TREE, "Shared", std::to_string(v).c_str()), "set") << v;
    std::string files;
    for (const auto &entry : std::filesystem::directory_iterator(root.Path())) files += entry.path().filename().string() + ";";
    EXPECT_TRUE(files == "host.reg;.lock;" || files == ".lock;host.reg;") << "temporary files left: " << files;
}

std::string RootFolder()
{
    char buffer[4096];
    DWORD size = sizeof buffer;
    return RegistryGetRootFolder(buffer, &size) == REGISTRY_OK ? buffer : RegistryLastFailure();
}

// The setter, then VANTREL_REGISTRY_ROOT, then the user's data folder.
TEST(RegistryRootFolder, IsChosenInItsOrder)
{
    testing_host::TempDir dir;
    const std::string home = dir.File("home"), data = dir.File("data"), variable = dir.File("variable");
    const std::string names[] = {"HOME", "XDG_DATA_HOME", "VANTREL_REGISTRY_ROOT"};
    std::vector<std::pair<std::string, std::optional<std::string>>> saved;
    for (const std::string &name : names) {
        const char *value = std::getenv(name.c_str());
        saved.emplace_back(name, value ? std::optional<std::string>(value) : std::nullopt);
    }
    setenv("HOME", home.c_str(), 1);
    setenv("XDG_DATA_HOME", "relative/data", 1);  // not absolute: ignored
    unsetenv("VANTREL_REGISTRY_ROOT");
    RegistrySetRootFolder(nullptr);
    EXPECT_EQ(RootFolder(), home + "/.local/share/vantrel-registry");
    setenv("XDG_DATA_HOME", data.c_str(), 1);
    EXPECT_EQ(RootFolder(), data + "/vantrel-registry");
    setenv("VANTREL_REGISTRY_ROOT", variable.c_str(), 1);
    ASSERT_EQ(RegistrySetRootFolder("chosen"), REGISTRY_OK);
    EXPECT_EQ(RootFolder(), (std::filesystem::current_path() / "chosen").string());
    RegistrySetRootFolder("");  // the same as none
    RegistrySetValue(REGISTRY_HOST_TREE, "K", nullptr, "v");
    EXPECT_TRUE(std::filesystem::exists(variable + "/host.reg"));
    EXPECT_FALSE(std::filesystem::exists(data + "/vantrel-registry"));
    for (const auto &[name, value] : saved) value ? setenv(name.c_str(), value->c_str(), 1) : unsetenv(name.c_str());
}

}  // namespace
