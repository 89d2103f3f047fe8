// SPDX-License-Identifier: MIT
// CZerinRegistry over the store's host tree.
#include <gtest/gtest.h>

#include "platform/registry/registry_fixture.h"
#include "zerinfl/zerin_registry.h"

namespace {

using namespace testing_registry;

TEST(ZerinRegistry, OpensWritesAndReadsKeysOfItsArea)
{
    ScopedRegistryRoot root;
    CZerinRegistry registry(ZerinAreaBridges, 0);
    EXPECT_FALSE(registry.Open("Bridges", 0));  // opens only what exists
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges"));

    ASSERT_TRUE(registry.Open("Bridges\\Mine\\CLSID", 1));
    EXPECT_TRUE(registry.Write("", "{1}"));
    EXPECT_TRUE(registry.Write("Extra", "more"));
    std::string text;
    EXPECT_TRUE(registry.Read(nullptr, text));
    EXPECT_EQ(text, "{1}");
    EXPECT_TRUE(registry.Read("extra", text));
    EXPECT_EQ(text, "more");
    EXPECT_FALSE(registry.Read("Missing", text));

    // The area is a subtree of the host tree.
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Mine\\CLSID"), "{1}");
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Mine\\CLSID", "Extra"), "more");

    // Another object of the same area sees it; one of another area doesn't.
    CZerinRegistry again(ZerinAreaBridges, 0);
    EXPECT_TRUE(again.Open("bridges\\MINE\\clsid", 0));
    EXPECT_TRUE(again.Read("", text));
    EXPECT_EQ(text, "{1}");
    CZerinRegistry other(static_cast<ZerinProductAreas>(2), 0);
    EXPECT_FALSE(other.Open("Bridges\\Mine\\CLSID", 0));
}

TEST(ZerinRegistry, DeletesSubkeysOfTheOpenKey)
{
    ScopedRegistryRoot root;
    CZerinRegistry registry(ZerinAreaBridges, 0);
    ASSERT_TRUE(registry.Open("Bridges\\Mine\\CLSID", 1));
    ASSERT_TRUE(registry.Open("Bridges\\Mine\\Name", 1));
    ASSERT_TRUE(registry.Open("Bridges\\Others", 1));

    ASSERT_TRUE(registry.Open("Bridges", 0));
    EXPECT_FALSE(registry.DeleteKey("Mine", 0));  // it has subkeys
    EXPECT_TRUE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Mine\\Name"));
    EXPECT_TRUE(registry.DeleteKey("Mine", 1));
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Mine"));
    EXPECT_TRUE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Others"));
    EXPECT_FALSE(registry.DeleteKey("Mine", 1));  // gone already
    EXPECT_TRUE(registry.DeleteKey("Others", 0));
    EXPECT_TRUE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges"));
    EXPECT_FALSE(registry.DeleteKey("", 1));  // never the open key itself
    EXPECT_FALSE(registry.DeleteKey(nullptr, 1));
}

TEST(ZerinRegistry, NothingWorksWithoutAnOpenKey)
{
    ScopedRegistryRoot root;
    CZerinRegistry registry(ZerinAreaBridges, 0);
    std::string text;
    EXPECT_FALSE(registry.Write("", "x"));
    EXPECT_FALSE(registry.Read("", text));
    EXPECT_FALSE(registry.DeleteKey("Bridges", 1));

    // A failed Open closes the key that was open.
    ASSERT_TRUE(registry.Open("Bridges", 1));
    EXPECT_FALSE(registry.Open("Bridges\\\\Bad", 1));
    EXPECT_FALSE(registry.Write("", "x"));
    EXPECT_FALSE(registry.Open(nullptr, 1));
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges"), std::nullopt);

    // A damaged host file makes every Open fail and stays as it was.
    WriteFile(root.HostFile(), "not a registry\n");
    EXPECT_FALSE(registry.Open("Bridges", 1));
    EXPECT_FALSE(registry.Open("Bridges", 0));
    EXPECT_EQ(FileText(root.HostFile()), "not a registry\n");
}

}  // namespace
