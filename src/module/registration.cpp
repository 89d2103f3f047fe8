// SPDX-License-Identifier: MIT
#include "module/registration.h"

#include <dlfcn.h>

#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "automation/guid.h"
#include "module/identifiers.h"
#include "module/string_table.h"
#include "registry/registry.h"
#include "registry/type_library.h"
#include "zerinfl/zerin_registry.h"

namespace vantrel {
namespace {

// What happens to a key of the script when it is registered or unregistered.
enum class Removal {
    Normal,       // written on register, removed with all it holds on unregister
    ForceRemove,  // like Normal, but removed first on register, so no leftovers stay
    NoRemove,     // shared with others: written on register, never removed
};

struct ScriptValue {
    const char *name;
    const char *text;
};

// One key of the registry script. Texts may hold the placeholders of
// Placeholders() below.
struct ScriptKey {
    const char *name;
    Removal removal = Removal::Normal;
    const char *defaultValue = nullptr;  // none when null
    std::vector<ScriptValue> values = {};
    std::vector<ScriptKey> subkeys = {};
};

// The class's entries in the classes root.
const std::vector<ScriptKey> &ClassScript()
{
    static const std::vector<ScriptKey> script = {
        {"%PROGID%", Removal::Normal, "%DESCRIPTION%", {}, {{"CLSID", Removal::Normal, "%CLSID%"}}},
        {"%VIPROGID%",
         Removal::Normal,
         "%DESCRIPTION%",
         {},
         {{"CLSID", Removal::Normal, "%CLSID%"}, {"CurVer", Removal::Normal, "%PROGID%"}}},
        {"CLSID",
         Removal::NoRemove,
         nullptr,
         {},
         {{"%CLSID%",
           Removal::ForceRemove,
           "%DESCRIPTION%",
           {{"AppID", "%APPID%"}},
           {{"ProgID", Removal::Normal, "%PROGID%"},
            {"VersionIndependentProgID", Removal::Normal, "%VIPROGID%"},
            {"Programmable", Removal::ForceRemove},
            {"InprocServer32", Removal::Normal, "%MODULE%", {{"ThreadingModel", "Apartment"}}},
            {"TypeLib", Removal::Normal, "%LIBID%"}}}}},
    };
    return script;
}

constexpr WORD kTypeLibMajor = 1;
constexpr WORD kTypeLibMinor = 0;
constexpr const char *kTypeLibHelpString = "Zerin Chronal Excel Bridge";

// Any object of the module does: its address tells dladdr which file it is.
const char g_moduleMarker = 0;

std::string ModulePath()
{
    Dl_info info{};
    if (!dladdr(&g_moduleMarker, &info) || !info.dli_fname) return std::string();
    std::error_code error;
    const auto absolute = std::filesystem::absolute(info.dli_fname, error);
    if (error) return info.dli_fname;
    const auto canonical = std::filesystem::canonical(absolute, error);
    return (error ? absolute : canonical).string();
}

struct Placeholder {
    std::string name;
    std::string text;
};

std::vector<Placeholder> Placeholders()
{
    return {{"%MODULE%", ModulePath()},
            {"%CLSID%", automation::GuidToString(kClsidExcelVantrel)},
            {"%LIBID%", automation::GuidToString(kLibidExcelVantrelLib)},
            {"%APPID%", automation::GuidToString(kAppIdExcelVantrel)},
            {"%PROGID%", kProgId},
            {"%VIPROGID%", kVersionIndependentProgId},
            {"%DESCRIPTION%", kClassDescription}};
}

HRESULT FromRegistry(LONG code) { return code == REGISTRY_OK ? S_OK : static_cast<HRESULT>(0x80070000u | code); }

// Runs the script against the classes root.
class ScriptRunner {
public:
    ScriptRunner() : placeholders_(Placeholders()) {}

    HRESULT Register(const std::vector<ScriptKey> &keys, const std::string &parent = std::string()) const
    {
        for (const auto &key : keys) {
            const std::string path = Child(parent, key.name);
            if (key.removal == Removal::ForceRemove) {
                const LONG removed = RegistryDeleteTree(REGISTRY_CLASSES_ROOT, path.c_str());
                if (removed != REGISTRY_OK && removed != REGISTRY_NOT_FOUND) return FromRegistry(removed);
            }
            LONG result = RegistryCreateKey(REGISTRY_CLASSES_ROOT, path.c_str());
            if (result == REGISTRY_OK && key.defaultValue)
                result = SetValue(path, "", key.defaultValue);
            for (const auto &value : key.values)
                if (result == REGISTRY_OK) result = SetValue(path, value.name, value.text);
            if (result != REGISTRY_OK) return FromRegistry(result);
            if (const HRESULT hr = Register(key.subkeys, path); FAILED(hr)) return hr;
        }
        return S_OK;
    }

    HRESULT Unregister(const std::vector<ScriptKey> &keys, const std::string &parent = std::string()) const
    {
        for (const auto &key : keys) {
            const std::string path = Child(parent, key.name);
            if (key.removal == Removal::NoRemove) {
                if (RegistryKeyExists(REGISTRY_CLASSES_ROOT, path.c_str()) == REGISTRY_NOT_FOUND) continue;
                if (const HRESULT hr = Unregister(key.subkeys, path); FAILED(hr)) return hr;
                continue;
            }
            const LONG removed = RegistryDeleteTree(REGISTRY_CLASSES_ROOT, path.c_str());
            if (removed != REGISTRY_OK && removed != REGISTRY_NOT_FOUND) return FromRegistry(removed);
        }
        return S_OK;
    }

private:
    std::string Expand(std::string text) const
    {
        for (const auto &placeholder : placeholders_)
            for (size_t at = text.find(placeholder.name); at != std::string::npos;
                 at = text.find(placeholder.name, at + placeholder.text.size()))
                text.replace(at, placeholder.name.size(), placeholder.text);
        return text;
    }

    std::string Child(const std::string &parent, const char *name) const
    {
        const std::string expanded = Expand(name);
        return parent.empty() ? expanded : parent + "\\" + expanded;
    }

    LONG SetValue(const std::string &path, const char *name, const char *text) const
    {
        return RegistrySetValue(REGISTRY_CLASSES_ROOT, path.c_str(), name, Expand(text).c_str());
    }

    std::vector<Placeholder> placeholders_;
};

std::string BridgeKeyPath() { return "Bridges\\" + LoadMessage(kStringBridgeKeyName); }

}  // namespace

HRESULT RegisterModule()
{
    const std::string classId = automation::GuidToString(kClsidExcelVantrel);
    const HRESULT script = ScriptRunner().Register(ClassScript());
    const std::string module = ModulePath();
    const HRESULT typeLib =
        SUCCEEDED(script) ? RegistryRegisterTypeLib(kLibidExcelVantrelLib, kTypeLibMajor, kTypeLibMinor,
                                                    module.c_str(), kTypeLibHelpString)
                          : script;
    if (script != S_OK || typeLib != S_OK) return E_UNEXPECTED;

    CZerinRegistry host(ZerinAreaBridges, 0);
    const std::string base = BridgeKeyPath();
    if (!host.Open((base + "\\CLSID").c_str(), 1)) return E_UNEXPECTED;
    host.Write("", classId.c_str());
    if (!host.Open((base + "\\Name").c_str(), 1)) return E_UNEXPECTED;
    host.Write("", LoadMessage(kStringApplicationTitle).c_str());
    return S_OK;
}

HRESULT UnregisterModule()
{
    const HRESULT script = ScriptRunner().Unregister(ClassScript());
    const HRESULT typeLib = RegistryUnRegisterTypeLib(kLibidExcelVantrelLib, kTypeLibMajor, kTypeLibMinor);
    if (script != S_OK || typeLib != S_OK) return E_UNEXPECTED;

    CZerinRegistry host(ZerinAreaBridges, 0);
    const bool removed =
        host.Open("Bridges", 0) && host.DeleteKey(LoadMessage(kStringBridgeKeyName).c_str(), 1);
    return removed ? S_OK : E_UNEXPECTED;
}

}  // namespace vantrel
