// SPDX-License-Identifier: MIT
// Lookups in the classes root for a host that creates a class by name.
#include <optional>
#include <string>

#include "api_boundary.h"
#include "automation/guid.h"
#include "automation/text.h"
#include "registry/classes.h"
#include "store.h"

namespace registry {
namespace {

// The default value of the key at path in the classes root, or nullopt when
// the key or its default value is missing.
std::optional<std::string> DefaultValue(const std::string &path)
{
    const Key root = ReadTree(REGISTRY_CLASSES_ROOT);
    const Key *key = root.Find(SplitKeyPath(path));
    if (!key) return std::nullopt;
    const auto it = key->values.find(std::string_view());
    if (it == key->values.end()) return std::nullopt;
    return it->second;
}

// A store failure is a failed read of the registry; the text stays for
// RegistryLastFailure.
template <typename Body>
HRESULT ClassesBoundary(Body &&body) noexcept
{
    HRESULT result = S_OK;
    const LONG code = Boundary([&] {
        result = body();
        return REGISTRY_OK;
    });
    if (code == REGISTRY_BAD_ARGUMENT) return E_INVALIDARG;
    return code == REGISTRY_OK ? result : REGDB_E_READREGDB;
}

}  // namespace
}  // namespace registry

using namespace registry;

REGISTRY_API HRESULT RegistryCLSIDFromProgID(const char *progId, CLSID *clsid)
{
    return ClassesBoundary([&]() -> HRESULT {
        if (!clsid) return E_POINTER;
        *clsid = CLSID{};
        if (!progId || !*progId) return E_INVALIDARG;
        CheckKeyName(progId);
        const auto text = DefaultValue(std::string(progId) + "\\CLSID");
        if (!text) {
            SetLastFailure(std::string("the ProgID ") + progId + " is not registered");
            return REGDB_E_CLASSNOTREG;
        }
        const HRESULT hr = CLSIDFromString(automation::Utf8ToUtf16(*text).c_str(), clsid);
        if (FAILED(hr)) {
            *clsid = CLSID{};
            SetLastFailure(std::string("the ProgID ") + progId + " names no class id: \"" + *text + "\"");
            return CO_E_CLASSSTRING;
        }
        return S_OK;
    });
}

REGISTRY_API HRESULT RegistryGetInprocServer(REFCLSID clsid, char *path, DWORD *size)
{
    return ClassesBoundary([&]() -> HRESULT {
        if (!size) return E_POINTER;
        const std::string classId = automation::GuidToString(clsid);
        const auto module = DefaultValue("CLSID\\" + classId + "\\InprocServer32");
        if (!module || module->empty()) {
            SetLastFailure("the class " + classId + " has no module registered");
            return REGDB_E_CLASSNOTREG;
        }
        return CopyOut(*module, path, size) == REGISTRY_OK ? S_OK : REGISTRY_E_MORE_DATA;
    });
}
