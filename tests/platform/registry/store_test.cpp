// SPDX-License-Identifier: MIT
// Keys and values of the store through its C functions.
#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

#include "platform/registry/registry_fixture.h"

namespace {

using namespace testing_registry;

std::vector<std::string> Subkeys(RegistryTree tree, const std::string &key)
{
    std::vector<std::string> names;
    for (DWORD index = 0;; ++index) {
        char name[256];
        DWORD size = sizeof name;
        const LONG result = RegistryEnumKey(tree, key.c_str(), index, name, &size);
        if (result == REGISTRY_NO_MORE_ITEMS) break;
        if (result != REGISTRY_OK) {
            names.push_back("<failure " + std::to_string(result) + ">");
            break;
        }
        names.emplace_back(name);
    }
    return names;
}

TEST(RegistryStore, ValuesAreStoredAndReadBack)
{
    ScopedRegistryRoot root;
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key"), std::nullopt);

    // Setting a value makes its key and the keys above it.
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "Some\\Key", nullptr, "default text"), REGISTRY_OK);
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named", "named text"), REGISTRY_OK);
    EXPECT_TRUE(KeyExists(REGISTRY_CLASSES_ROOT, "Some"));
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key"), "default text");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key", ""), "default text");  // "" is the default too
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named"), "named text");
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some", nullptr), std::nullopt);  // never set

    // The two trees are apart.
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "Some\\Key"));

    // Overwriting, and texts that need escapes in the file.
    const std::string awkward = "quote \" backslash \\ line\nend tab\t é \x01";
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named", awkward.c_str()), REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named"), awkward);
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "Some\\Key", "Empty", ""), REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key", "Empty"), "");

    // An empty key persists.
    ASSERT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "Some\\Bare"), REGISTRY_OK);
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "Some\\Bare"), REGISTRY_OK);  // again: no failure
    EXPECT_TRUE(KeyExists(REGISTRY_CLASSES_ROOT, "Some\\Bare"));

    EXPECT_EQ(RegistryDeleteValue(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named"), REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named"), std::nullopt);
    EXPECT_EQ(RegistryDeleteValue(REGISTRY_CLASSES_ROOT, "Some\\Key", "Named"), REGISTRY_NOT_FOUND);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "Some\\Key"), "default text");
}

TEST(RegistryStore, NamesIgnoreCaseAndKeepTheirFirstSpelling)
{
    ScopedRegistryRoot root;
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\InprocServer32", "ThreadingModel", "Apartment"),
              REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "clsid\\{ABC}\\INPROCSERVER32", "threadingmodel"), "Apartment");
    ASSERT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "Clsid\\{abc}\\inprocserver32", "THREADINGMODEL", "Both"),
              REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "CLSID\\{AbC}\\InprocServer32", "ThreadingModel"), "Both");

    // One key, spelled as first written.
    EXPECT_EQ(Subkeys(REGISTRY_CLASSES_ROOT, ""), std::vector<std::string>{"CLSID"});
    EXPECT_EQ(Subkeys(REGISTRY_CLASSES_ROOT, "CLSID"), std::vector<std::string>{"{AbC}"});
    const std::string file = FileText(root.ClassesFile());
    EXPECT_NE(file.find("[CLSID\\{AbC}\\InprocServer32]\n\"ThreadingModel\"=\"Both\"\n"), std::string::npos) << file;

    // Subkeys come in name order, without regard to case.
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "CLSID\\b");
    RegistryCreateKey(REGISTRY_CLASSES_ROOT, "CLSID\\A");
    EXPECT_EQ(Subkeys(REGISTRY_CLASSES_ROOT, "CLSID"), (std::vector<std::string>{"A", "b", "{AbC}"}));
    char name[2];
    DWORD size = sizeof name;
    EXPECT_EQ(RegistryEnumKey(REGISTRY_CLASSES_ROOT, "CLSID", 2, name, &size), REGISTRY_MORE_DATA);
    EXPECT_EQ(size, 6u);
}

TEST(RegistryStore, DeletingKeys)
{
    ScopedRegistryRoot root;
    RegistrySetValue(REGISTRY_HOST_TREE, "Bridges\\One\\CLSID", nullptr, "{1}");
    RegistrySetValue(REGISTRY_HOST_TREE, "Bridges\\One\\Name", nullptr, "One");
    RegistrySetValue(REGISTRY_HOST_TREE, "Bridges\\Two", "Kept", "yes");

    EXPECT_EQ(RegistryDeleteKey(REGISTRY_HOST_TREE, "Bridges\\One"), REGISTRY_HAS_SUBKEYS);
    EXPECT_TRUE(KeyExists(REGISTRY_HOST_TREE, "Bridges\\One\\Name"));
    EXPECT_EQ(RegistryDeleteKey(REGISTRY_HOST_TREE, "Bridges\\One\\Name"), REGISTRY_OK);
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "Bridges\\One\\Name"));

    EXPECT_EQ(RegistryDeleteTree(REGISTRY_HOST_TREE, "BRIDGES\\one"), REGISTRY_OK);
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "Bridges\\One"));
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "Bridges\\One\\CLSID"));
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "Bridges\\Two", "Kept"), "yes");

    EXPECT_EQ(RegistryDeleteTree(REGISTRY_HOST_TREE, "Bridges\\One"), REGISTRY_NOT_FOUND);
    EXPECT_EQ(RegistryDeleteKey(REGISTRY_HOST_TREE, "Missing\\Deeper"), REGISTRY_NOT_FOUND);
    EXPECT_EQ(RegistryDeleteTree(REGISTRY_HOST_TREE, ""), REGISTRY_BAD_ARGUMENT);

    // A re-made key holds nothing of the old one.
    RegistryCreateKey(REGISTRY_HOST_TREE, "Bridges\\One");
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "Bridges\\One\\CLSID"), std::nullopt);
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "Bridges\\One\\CLSID"));
}

TEST(RegistryStore, BadArgumentsAreRefusedWithAReason)
{
    ScopedRegistryRoot root;
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "A\\\\B"), REGISTRY_BAD_ARGUMENT);
    EXPECT_STREQ(RegistryLastFailure(), "the key path \"A\\\\B\" has an empty key name");
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "A\\"), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "\\A"), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "A\nB"), REGISTRY_BAD_ARGUMENT);
    EXPECT_STREQ(RegistryLastFailure(), "a key name holds a control character");
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, std::string(256, 'k').c_str()), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, nullptr), REGISTRY_BAD_ARGUMENT);
    EXPECT_STREQ(RegistryLastFailure(), "the key path is null");
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, ""), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "", "x", "y"), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", "bad\tname", "y"), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", "x", nullptr), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistryCreateKey(static_cast<RegistryTree>(7), "A"), REGISTRY_BAD_ARGUMENT);
    EXPECT_EQ(RegistryGetValue(REGISTRY_CLASSES_ROOT, "A", nullptr, nullptr, nullptr), REGISTRY_BAD_ARGUMENT);

    // Nothing of that reached the disk; a good call clears the reason.
    EXPECT_EQ(FileText(root.ClassesFile()), "<missing>");
    EXPECT_EQ(RegistryCreateKey(REGISTRY_CLASSES_ROOT, "A"), REGISTRY_OK);
    EXPECT_STREQ(RegistryLastFailure(), "");

    // A value name may hold a backslash, a key name may not.
    EXPECT_EQ(RegistrySetValue(REGISTRY_CLASSES_ROOT, "A", "x\\y", "z"), REGISTRY_OK);
    EXPECT_EQ(Value(REGISTRY_CLASSES_ROOT, "A", "x\\y"), "z");
}

TEST(RegistryStore, BuffersThatAreTooSmallGetTheSizeNeeded)
{
    ScopedRegistryRoot root;
    RegistrySetValue(REGISTRY_CLASSES_ROOT, "K", nullptr, "12345");
    char buffer[6] = "xxxxx";
    DWORD size = 5;
    EXPECT_EQ(RegistryGetValue(REGISTRY_CLASSES_ROOT, "K", nullptr, buffer, &size), REGISTRY_MORE_DATA);
    EXPECT_EQ(size, 6u);
    EXPECT_STREQ(buffer, "xxxxx");  // untouched
    EXPECT_EQ(RegistryGetValue(REGISTRY_CLASSES_ROOT, "K", nullptr, buffer, &size), REGISTRY_OK);
    EXPECT_STREQ(buffer, "12345");
}

TEST(RegistryStore, ChangesFromManyThreadsAreAllKept)
{
    ScopedRegistryRoot root;
    constexpr int kThreads = 4;
    constexpr int kValues = 20;
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t)
        threads.emplace_back([t] {
            for (int v = 0; v < kValues; ++v) {
                const std::string name = std::to_string(t) + "-" + std::to_string(v);
                RegistrySetValue(REGISTRY_HOST_TREE, "Shared", name.c_str(), name.c_str());
            }
        });
    for (auto &thread : threads) thread.join();
    for (int t = 0; t < kThreads; ++t)
        for (int v = 0; v < kValues; ++v) {
            const std::string name = std::to_string(t) + "-" + std::to_string(v);
            EXPECT_EQ(Value(REGISTRY_HOST_TREE, "Shared", name.c_str()), name);
        }
    // The temporary files were all renamed away.
    int files = 0;
    for (const auto &entry : std::filesystem::directory_iterator(root.Path())) {
        ++files;
        EXPECT_TRUE(entry.path().filename() == "host.reg" || entry.path().filename() == ".lock") << entry.path();
    }
    EXPECT_EQ(files, 2);
}

}  // namespace
