// SPDX-License-Identifier: MIT
// CZerinRegistry: keys of a product area, a subtree of the store's host tree.
#include <gtest/gtest.h>

#include "platform/registry/registry_fixture.h"
#include "zerinfl/zerin_registry.h"

namespace {

using namespace testing_registry;

TEST(ZerinRegistry, WorksWithinItsAreaOnly)
{
    ScopedRegistryRoot root;
    CZerinRegistry registry(ZerinAreaBridges, 0), other(static_cast<ZerinProductAreas>(2), 0);
    std::string text;
    EXPECT_FALSE(registry.Write("", "x")) << "nothing works without an open key";
    EXPECT_FALSE(registry.Open("Bridges", 0)) << "opens only what exists";
    ASSERT_TRUE(registry.Open("Bridges\\Mine\\CLSID", 1));
    EXPECT_TRUE(registry.Write("", "{1}"));
    EXPECT_EQ(Value(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Mine\\CLSID"), "{1}");
    ASSERT_TRUE(registry.Open("bridges\\MINE\\clsid", 0));
    EXPECT_TRUE(registry.Read(nullptr, text));
    EXPECT_EQ(text, "{1}");
    EXPECT_FALSE(other.Open("Bridges\\Mine\\CLSID", 0));

    ASSERT_TRUE(registry.Open("Bridges\\Others", 1));
    ASSERT_TRUE(registry.Open("Bridges", 0));
    EXPECT_FALSE(registry.DeleteKey("Mine", 0)) << "it has subkeys";
    EXPECT_TRUE(registry.DeleteKey("Mine", 1));
    EXPECT_FALSE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Mine"));
    EXPECT_TRUE(KeyExists(REGISTRY_HOST_TREE, "ProductAreas\\4\\Bridges\\Others")) << "its sibling stays";
    EXPECT_FALSE(registry.DeleteKey("", 1)) << "never the open key itself";

    EXPECT_FALSE(registry.Open("Bridges\\\\Bad", 1));
    EXPECT_FALSE(registry.Write("", "x")) << "a failed Open closes the key that was open";
    testing_host::WriteFile(root.HostFile(), "not a registry\n");
    EXPECT_FALSE(registry.Open("Bridges", 1));
    EXPECT_EQ(testing_host::ReadFile(root.HostFile()), "not a registry\n");
}

}  // namespace
