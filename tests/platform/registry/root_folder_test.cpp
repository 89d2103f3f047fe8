// SPDX-License-Identifier: MIT
// Where the registry lives: the setter, then VANTREL_REGISTRY_ROOT, then the
// user's data folder.
#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>

#include "platform/registry/registry_fixture.h"

namespace {

using namespace testing_registry;

// Sets or clears an environment variable for one scope.
class ScopedEnvironment {
public:
    ScopedEnvironment(const char *name, const char *value) : name_(name)
    {
        if (const char *old = std::getenv(name)) old_ = old;
        if (value)
            setenv(name, value, 1);
        else
            unsetenv(name);
    }
    ~ScopedEnvironment()
    {
        if (old_)
            setenv(name_, old_->c_str(), 1);
        else
            unsetenv(name_);
    }
    ScopedEnvironment(const ScopedEnvironment &) = delete;
    ScopedEnvironment &operator=(const ScopedEnvironment &) = delete;

private:
    const char *name_;
    std::optional<std::string> old_;
};

std::string RootFolder()
{
    char buffer[4096];
    DWORD size = sizeof buffer;
    if (RegistryGetRootFolder(buffer, &size) != REGISTRY_OK) return std::string("<failure> ") + RegistryLastFailure();
    return buffer;
}

TEST(RegistryRootFolder, IsChosenInItsOrder)
{
    testing_host::TempDir dir;
    const std::string home = (dir.Path() / "home").string();
    const std::string data = (dir.Path() / "data").string();
    const std::string chosen = (dir.Path() / "chosen").string();
    const std::string fromVariable = (dir.Path() / "variable").string();

    ScopedEnvironment homeVariable("HOME", home.c_str());
    ScopedEnvironment noData("XDG_DATA_HOME", nullptr);
    ScopedEnvironment noRoot("VANTREL_REGISTRY_ROOT", nullptr);
    RegistrySetRootFolder(nullptr);
    EXPECT_EQ(RootFolder(), home + "/.local/share/vantrel-registry");
    {
        ScopedEnvironment relativeData("XDG_DATA_HOME", "relative/data");  // not absolute: ignored
        EXPECT_EQ(RootFolder(), home + "/.local/share/vantrel-registry");
    }
    ScopedEnvironment dataVariable("XDG_DATA_HOME", data.c_str());
    EXPECT_EQ(RootFolder(), data + "/vantrel-registry");
    ScopedEnvironment rootVariable("VANTREL_REGISTRY_ROOT", fromVariable.c_str());
    EXPECT_EQ(RootFolder(), fromVariable);

    ASSERT_EQ(RegistrySetRootFolder(chosen.c_str()), REGISTRY_OK);
    EXPECT_EQ(RootFolder(), chosen);
    RegistrySetValue(REGISTRY_HOST_TREE, "K", nullptr, "v");
    EXPECT_EQ(FileText(std::filesystem::path(chosen) / "host.reg").find("; vantrel registry"), 0u);
    EXPECT_FALSE(std::filesystem::exists(fromVariable));

    RegistrySetRootFolder("");
    EXPECT_EQ(RootFolder(), fromVariable);
    RegistrySetValue(REGISTRY_HOST_TREE, "K", nullptr, "v");
    EXPECT_TRUE(std::filesystem::exists(std::filesystem::path(fromVariable) / "host.reg"));
    EXPECT_FALSE(std::filesystem::exists(std::filesystem::path(data) / "vantrel-registry"));

    // A relative folder is taken from the current folder when it is set.
    RegistrySetRootFolder("relative/root");
    EXPECT_EQ(RootFolder(), (std::filesystem::current_path() / "relative/root").string());
    RegistrySetRootFolder(nullptr);

    char small[4];
    DWORD size = sizeof small;
    EXPECT_EQ(RegistryGetRootFolder(small, &size), REGISTRY_MORE_DATA);
    EXPECT_EQ(size, fromVariable.size() + 1);
}

}  // namespace
