// SPDX-License-Identifier: MIT
// The store's C functions.
#include <cstring>
#include <optional>
#include <iterator>
#include <string>

#include "api_boundary.h"
#include "root_folder.h"
#include "store.h"

namespace registry {
namespace {

thread_local std::string t_lastFailure;

std::string NotFound(const char *what, const char *keyPath)
{
    return std::string(what) + " \"" + keyPath + "\" doesn't exist";
}

}  // namespace

void SetLastFailure(std::string text) { t_lastFailure = std::move(text); }

LONG CopyOut(std::string_view text, char *buffer, DWORD *size)
{
    if (!size) throw Failure(REGISTRY_BAD_ARGUMENT, "the size argument is null");
    const size_t needed = text.size() + 1;
    if (needed > UINT32_MAX) throw Failure(REGISTRY_BAD_ARGUMENT, "the text is too long");
    const DWORD available = *size;
    *size = static_cast<DWORD>(needed);
    if (!buffer || available < needed) return REGISTRY_MORE_DATA;
    std::memcpy(buffer, text.data(), text.size());
    buffer[text.size()] = '\0';
    return REGISTRY_OK;
}

const char *Required(const char *text, const char *what)
{
    if (!text) throw Failure(REGISTRY_BAD_ARGUMENT, std::string(what) + " is null");
    return text;
}

}  // namespace registry

using namespace registry;

REGISTRY_API LONG RegistrySetRootFolder(const char *folder)
{
    return Boundary([&] {
        SetRootFolder(folder && *folder ? std::optional<std::filesystem::path>(folder) : std::nullopt);
        return REGISTRY_OK;
    });
}

REGISTRY_API LONG RegistryGetRootFolder(char *buffer, DWORD *size)
{
    return Boundary([&] { return CopyOut(RootFolder().string(), buffer, size); });
}

REGISTRY_API LONG RegistryCreateKey(RegistryTree tree, const char *keyPath)
{
    return Boundary([&] {
        const auto path = SplitKeyPath(Required(keyPath, "the key path"));
        if (path.empty()) throw Failure(REGISTRY_BAD_ARGUMENT, "the key path is empty");
        UpdateTree(tree, [&](Key &root) { root.Create(path); });
        return REGISTRY_OK;
    });
}

REGISTRY_API LONG RegistryKeyExists(RegistryTree tree, const char *keyPath)
{
    return Boundary([&] {
        const auto path = SplitKeyPath(Required(keyPath, "the key path"));
        return ReadTree(tree).Find(path) ? REGISTRY_OK : REGISTRY_NOT_FOUND;
    });
}

REGISTRY_API LONG RegistrySetValue(RegistryTree tree, const char *keyPath, const char *valueName,
                                   const char *text)
{
    return Boundary([&] {
        const auto path = SplitKeyPath(Required(keyPath, "the key path"));
        if (path.empty()) throw Failure(REGISTRY_BAD_ARGUMENT, "values can't stand at the root");
        const std::string name = valueName ? valueName : "";
        CheckValueName(name);
        const std::string value = Required(text, "the text");
        UpdateTree(tree, [&](Key &root) { root.Create(path).SetValue(name, value); });
        return REGISTRY_OK;
    });
}

REGISTRY_API LONG RegistryGetValue(RegistryTree tree, const char *keyPath, const char *valueName,
                                   char *buffer, DWORD *size)
{
    return Boundary([&] {
        if (!size) throw Failure(REGISTRY_BAD_ARGUMENT, "the size argument is null");
        const auto path = SplitKeyPath(Required(keyPath, "the key path"));
        const Key root = ReadTree(tree);
        const Key *key = root.Find(path);
        if (!key) throw Failure(REGISTRY_NOT_FOUND, NotFound("the key", keyPath));
        const auto it = key->values.find(std::string_view(valueName ? valueName : ""));
        if (it == key->values.end())
            throw Failure(REGISTRY_NOT_FOUND, std::string("the key \"") + keyPath + "\" has no value \"" +
                                                  (valueName ? valueName : "") + "\"");
        return CopyOut(it->second, buffer, size);
    });
}

REGISTRY_API LONG RegistryDeleteValue(RegistryTree tree, const char *keyPath, const char *valueName)
{
    return Boundary([&] {
        const auto path = SplitKeyPath(Required(keyPath, "the key path"));
        const std::string name = valueName ? valueName : "";
        UpdateTree(tree, [&](Key &root) {
            Key *key = root.Find(path);
            if (!key) throw Failure(REGISTRY_NOT_FOUND, NotFound("the key", keyPath));
            if (key->values.erase(name) == 0)
                throw Failure(REGISTRY_NOT_FOUND, "the key \"" + std::string(keyPath) + "\" has no value \"" + name + "\"");
        });
        return REGISTRY_OK;
    });
}

namespace {

LONG DeleteKey(RegistryTree tree, const char *keyPath, bool withSubkeys)
{
    const auto path = SplitKeyPath(Required(keyPath, "the key path"));
    if (path.empty()) throw Failure(REGISTRY_BAD_ARGUMENT, "the root can't be deleted");
    UpdateTree(tree, [&](Key &root) {
        Key *parent = root.Find({path.begin(), std::prev(path.end())});
        if (!parent) throw Failure(REGISTRY_NOT_FOUND, NotFound("the key", keyPath));
        const auto it = parent->subkeys.find(path.back());
        if (it == parent->subkeys.end()) throw Failure(REGISTRY_NOT_FOUND, NotFound("the key", keyPath));
        if (!withSubkeys && !it->second->subkeys.empty())
            throw Failure(REGISTRY_HAS_SUBKEYS, "the key \"" + std::string(keyPath) + "\" has subkeys");
        parent->subkeys.erase(it);
    });
    return REGISTRY_OK;
}

}  // namespace

REGISTRY_API LONG RegistryDeleteKey(RegistryTree tree, const char *keyPath)
{
    return Boundary([&] { return DeleteKey(tree, keyPath, false); });
}

REGISTRY_API LONG RegistryDeleteTree(RegistryTree tree, const char *keyPath)
{
    return Boundary([&] { return DeleteKey(tree, keyPath, true); });
}

REGISTRY_API LONG RegistryEnumKey(RegistryTree tree, const char *keyPath, DWORD index, char *name, DWORD *size)
{
    return Boundary([&] {
        if (!size) throw Failure(REGISTRY_BAD_ARGUMENT, "the size argument is null");
        const auto path = SplitKeyPath(Required(keyPath, "the key path"));
        const Key root = ReadTree(tree);
        const Key *key = root.Find(path);
        if (!key) throw Failure(REGISTRY_NOT_FOUND, NotFound("the key", keyPath));
        if (index >= key->subkeys.size()) return REGISTRY_NO_MORE_ITEMS;
        return CopyOut(std::next(key->subkeys.begin(), index)->second->name, name, size);
    });
}

REGISTRY_API const char *RegistryLastFailure(void) { return t_lastFailure.c_str(); }
