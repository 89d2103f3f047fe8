// SPDX-License-Identifier: MIT
#include "zerinfl/zerin_registry.h"

#include <vector>

#include "registry/registry.h"

namespace {

// No exception leaves the library: a failure of memory is a failed call.
template <typename Body>
BOOL Guarded(Body &&body) noexcept
{
    try {
        return body();
    } catch (...) {
        return FALSE;
    }
}

}  // namespace

CZerinRegistry::CZerinRegistry(ZerinProductAreas area, int /*options*/)
    : areaPath_("ProductAreas\\" + std::to_string(static_cast<int>(area)))
{
}

CZerinRegistry::~CZerinRegistry() = default;

BOOL CZerinRegistry::Open(const char *keyPath, int create)
{
    return Guarded([&]() -> BOOL {
        openKey_.clear();
        if (!keyPath) return FALSE;
        std::string path = areaPath_;
        if (*keyPath) path += std::string("\\") + keyPath;
        const LONG result = create == 1 ? RegistryCreateKey(REGISTRY_HOST_TREE, path.c_str())
                                        : RegistryKeyExists(REGISTRY_HOST_TREE, path.c_str());
        if (result != REGISTRY_OK) return FALSE;
        openKey_ = std::move(path);
        return TRUE;
    });
}

BOOL CZerinRegistry::Write(const char *valueName, const char *text)
{
    return Guarded([&]() -> BOOL {
        if (openKey_.empty() || !text) return FALSE;
        return RegistrySetValue(REGISTRY_HOST_TREE, openKey_.c_str(), valueName, text) == REGISTRY_OK;
    });
}

BOOL CZerinRegistry::Read(const char *valueName, std::string &text) const
{
    return Guarded([&]() -> BOOL {
        if (openKey_.empty()) return FALSE;
        DWORD size = 0;
        if (RegistryGetValue(REGISTRY_HOST_TREE, openKey_.c_str(), valueName, nullptr, &size) != REGISTRY_MORE_DATA)
            return FALSE;
        std::vector<char> buffer(size);
        if (RegistryGetValue(REGISTRY_HOST_TREE, openKey_.c_str(), valueName, buffer.data(), &size) != REGISTRY_OK)
            return FALSE;
        text.assign(buffer.data(), size - 1);
        return TRUE;
    });
}

BOOL CZerinRegistry::DeleteKey(const char *name, int recursive)
{
    return Guarded([&]() -> BOOL {
        if (openKey_.empty() || !name || !*name) return FALSE;
        const std::string path = openKey_ + "\\" + name;
        const LONG result = recursive == 1 ? RegistryDeleteTree(REGISTRY_HOST_TREE, path.c_str())
                                           : RegistryDeleteKey(REGISTRY_HOST_TREE, path.c_str());
        return result == REGISTRY_OK;
    });
}
