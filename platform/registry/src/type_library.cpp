// SPDX-License-Identifier: MIT
// Type library records in the classes root.
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "api_boundary.h"
#include "automation/guid.h"
#include "registry/type_library.h"
#include "store.h"

namespace registry {
namespace {

std::vector<std::string> LibraryPath(REFGUID libid)
{
    return {"TypeLib", automation::GuidToString(libid)};
}

// "<major>.<minor>" in hex, as type library versions are written.
std::string VersionName(WORD major, WORD minor)
{
    char text[16];
    std::snprintf(text, sizeof text, "%x.%x", major, minor);
    return text;
}

template <typename Body>
HRESULT TypeLibBoundary(Body &&body) noexcept
{
    HRESULT result = S_OK;
    const LONG code = Boundary([&] {
        result = body();
        return REGISTRY_OK;
    });
    if (code == REGISTRY_BAD_ARGUMENT) return E_INVALIDARG;
    return code == REGISTRY_OK ? result : TYPE_E_REGISTRYACCESS;
}

}  // namespace
}  // namespace registry

using namespace registry;

REGISTRY_API HRESULT RegistryRegisterTypeLib(REFGUID libid, WORD verMajor, WORD verMinor, const char *file,
                                             const char *helpString)
{
    return TypeLibBoundary([&]() -> HRESULT {
        if (!file || !*file) return E_INVALIDARG;
        const std::string folder = std::filesystem::path(file).parent_path().string();
        const std::string version = VersionName(verMajor, verMinor);
        UpdateTree(REGISTRY_CLASSES_ROOT, [&](Key &root) {
            Key &library = root.Create(LibraryPath(libid));
            library.subkeys.erase(version);  // what an older record held goes
            Key &record = library.Create({version});
            record.SetValue("", helpString ? helpString : "");
            record.Create({"0", "linux64"}).SetValue("", file);
            record.Create({"FLAGS"}).SetValue("", "0");
            record.Create({"HELPDIR"}).SetValue("", folder);
        });
        return S_OK;
    });
}

REGISTRY_API HRESULT RegistryUnRegisterTypeLib(REFGUID libid, WORD verMajor, WORD verMinor)
{
    return TypeLibBoundary([&]() -> HRESULT {
        UpdateTree(REGISTRY_CLASSES_ROOT, [&](Key &root) {
            Key *typeLibs = root.Find({"TypeLib"});
            Key *library = root.Find(LibraryPath(libid));
            if (!library) return;
            library->subkeys.erase(VersionName(verMajor, verMinor));
            if (library->subkeys.empty()) typeLibs->subkeys.erase(library->name);
        });
        return S_OK;
    });
}

REGISTRY_API HRESULT RegistryQueryPathOfTypeLib(REFGUID libid, WORD verMajor, WORD verMinor, char *path,
                                                DWORD *size)
{
    return TypeLibBoundary([&]() -> HRESULT {
        if (!size) return E_POINTER;
        auto keyPath = LibraryPath(libid);
        keyPath.insert(keyPath.end(), {VersionName(verMajor, verMinor), "0", "linux64"});
        const Key root = ReadTree(REGISTRY_CLASSES_ROOT);
        const Key *key = root.Find(keyPath);
        if (!key || !key->values.count(std::string_view())) {
            SetLastFailure("the type library " + automation::GuidToString(libid) + " " +
                           VersionName(verMajor, verMinor) + " is not registered");
            return TYPE_E_LIBNOTREGISTERED;
        }
        const std::string &file = key->values.find(std::string_view())->second;
        return CopyOut(file, path, size) == REGISTRY_OK ? S_OK : REGISTRY_E_MORE_DATA;
    });
}
