// SPDX-License-Identifier: MIT
#include "key_tree.h"

#include <algorithm>

#include "failure.h"

namespace registry {
namespace {

constexpr size_t kMaxNameLength = 255;

char FoldAscii(char c) noexcept { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

bool HasControlCharacter(std::string_view text)
{
    return std::any_of(text.begin(), text.end(),
                       [](char c) { return static_cast<unsigned char>(c) < 0x20 || c == 0x7F; });
}

}  // namespace

bool CaseInsensitiveLess::operator()(std::string_view a, std::string_view b) const noexcept
{
    return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(),
                                        [](char x, char y) { return FoldAscii(x) < FoldAscii(y); });
}

Key *Key::Find(const std::vector<std::string> &path)
{
    Key *key = this;
    for (const auto &name : path) {
        const auto it = key->subkeys.find(name);
        if (it == key->subkeys.end()) return nullptr;
        key = it->second.get();
    }
    return key;
}

const Key *Key::Find(const std::vector<std::string> &path) const
{
    return const_cast<Key *>(this)->Find(path);
}

Key &Key::Create(const std::vector<std::string> &path)
{
    Key *key = this;
    for (const auto &name : path) {
        auto &slot = key->subkeys[name];
        if (!slot) {
            slot = std::make_unique<Key>();
            slot->name = name;
        }
        key = slot.get();
    }
    return *key;
}

void Key::SetValue(std::string_view name, std::string text)
{
    const auto it = values.find(name);
    if (it != values.end())
        it->second = std::move(text);
    else
        values.emplace(std::string(name), std::move(text));
}

void CheckKeyName(std::string_view name)
{
    if (name.empty()) throw Failure(REGISTRY_BAD_ARGUMENT, "a key name is empty");
    if (name.size() > kMaxNameLength)
        throw Failure(REGISTRY_BAD_ARGUMENT, "a key name is longer than 255 bytes");
    if (name.find('\\') != std::string_view::npos)
        throw Failure(REGISTRY_BAD_ARGUMENT, "a key name holds a backslash");
    if (HasControlCharacter(name))
        throw Failure(REGISTRY_BAD_ARGUMENT, "a key name holds a control character");
}

void CheckValueName(std::string_view name)
{
    if (name.size() > kMaxNameLength)
        throw Failure(REGISTRY_BAD_ARGUMENT, "a value name is longer than 255 bytes");
    if (HasControlCharacter(name))
        throw Failure(REGISTRY_BAD_ARGUMENT, "a value name holds a control character");
}

std::vector<std::string> SplitKeyPath(std::string_view path)
{
    std::vector<std::string> names;
    if (path.empty()) return names;
    size_t start = 0;
    while (true) {
        const size_t end = path.find('\\', start);
        const auto name = path.substr(start, end == std::string_view::npos ? path.npos : end - start);
        if (name.empty())
            throw Failure(REGISTRY_BAD_ARGUMENT,
                          "the key path \"" + std::string(path) + "\" has an empty key name");
        CheckKeyName(name);
        names.emplace_back(name);
        if (end == std::string_view::npos) break;
        start = end + 1;
    }
    return names;
}

std::string JoinKeyPath(const std::vector<std::string> &names)
{
    std::string path;
    for (const auto &name : names) {
        if (!path.empty()) path += '\\';
        path += name;
    }
    return path;
}

}  // namespace registry
