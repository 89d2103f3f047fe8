// SPDX-License-Identifier: MIT
// A tree of keys in memory. Names of keys and values compare without regard
// to ASCII case, as a registry's do, and keep the case they were first
// written in.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace registry {

struct CaseInsensitiveLess {
    using is_transparent = void;
    bool operator()(std::string_view a, std::string_view b) const noexcept;
};

struct Key {
    std::string name;
    // Value name (empty for the default value) to text.
    std::map<std::string, std::string, CaseInsensitiveLess> values;
    std::map<std::string, std::unique_ptr<Key>, CaseInsensitiveLess> subkeys;

    Key *Find(const std::vector<std::string> &path);
    const Key *Find(const std::vector<std::string> &path) const;
    // Finds or makes the key at path, and every key above it.
    Key &Create(const std::vector<std::string> &path);
    // Stores text under name; an existing value keeps the case of its name.
    void SetValue(std::string_view name, std::string text);
};

// The names of a key path; throws Failure(REGISTRY_BAD_ARGUMENT) for an
// empty name between backslashes or a control character in a name. The
// empty path is the root.
std::vector<std::string> SplitKeyPath(std::string_view path);

// Checks one key or value name as SplitKeyPath does; value names may hold a
// backslash, key names may not.
void CheckKeyName(std::string_view name);
void CheckValueName(std::string_view name);

std::string JoinKeyPath(const std::vector<std::string> &names);

}  // namespace registry
