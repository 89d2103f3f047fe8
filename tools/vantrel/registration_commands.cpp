// SPDX-License-Identifier: MIT
#include "registration_commands.h"

#include <dlfcn.h>

#include <cstdio>
#include <filesystem>
#include <iostream>
#include <stdexcept>
#include <vector>

#include "automation/automation.h"
#include "automation/guid.h"
#include "module_loader.h"
#include "registry/classes.h"

namespace vantrel_cli {
namespace {

// {4C2698C4-93A5-4D02-8642-B1C2705C538F}: the only class this host drives.
constexpr CLSID kClsidExcelVantrel = {
    0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};

std::string HexCode(HRESULT hr)
{
    char text[16];
    std::snprintf(text, sizeof text, "0x%08X", static_cast<unsigned>(hr));
    return text;
}

std::string RegistryReason()
{
    const std::string reason = RegistryLastFailure();
    return reason.empty() ? std::string() : ": " + reason;
}

// Loads the module and calls one of its registration exports.
int CallRegistrationExport(const std::string &path, const char *exportName, const char *done)
{
    void *module = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (!module) {
        std::cerr << "vantrel: cannot load the module: " << dlerror() << "\n";
        return 1;
    }
    using RegistrationFn = HRESULT (*)();
    const auto function = reinterpret_cast<RegistrationFn>(dlsym(module, exportName));
    int status = 1;
    if (!function) {
        std::cerr << "vantrel: " << path << " has no " << exportName << "\n";
    } else if (const HRESULT hr = function(); hr != S_OK) {
        std::cerr << "vantrel: " << exportName << " of " << path << " failed with " << HexCode(hr)
                  << RegistryReason() << "\n";
    } else {
        std::cout << done << " " << path << "\n";
        status = 0;
    }
    dlclose(module);
    return status;
}

}  // namespace

int RunRegistration(bool registering, const std::string &module)
{
    // An absolute path, so that dlopen doesn't search the library folders and
    // the registry gets the path of the file meant.
    const std::string path = std::filesystem::absolute(module.empty() ? DefaultModulePath() : module).string();
    CoInitialize(nullptr);
    const int status = registering ? CallRegistrationExport(path, "DllRegisterServer", "registered")
                                   : CallRegistrationExport(path, "DllUnregisterServer", "unregistered");
    CoUninitialize();
    return status;
}

std::string ModuleOfProgId(const std::string &progId)
{
    CLSID clsid{};
    HRESULT hr = RegistryCLSIDFromProgID(progId.c_str(), &clsid);
    if (FAILED(hr))
        throw std::runtime_error("cannot find the class of " + progId + " (" + HexCode(hr) + ")" + RegistryReason());
    if (!(clsid == kClsidExcelVantrel))
        throw std::runtime_error(progId + " names the class " + automation::GuidToString(clsid) +
                                 ", which is not the bridge class " + automation::GuidToString(kClsidExcelVantrel));
    DWORD size = 0;
    hr = RegistryGetInprocServer(clsid, nullptr, &size);
    std::vector<char> path(size);
    if (hr == REGISTRY_E_MORE_DATA) hr = RegistryGetInprocServer(clsid, path.data(), &size);
    if (hr != S_OK)
        throw std::runtime_error("cannot find the module of " + progId + " (" + HexCode(hr) + ")" + RegistryReason());
    return std::string(path.data(), size - 1);
}

}  // namespace vantrel_cli
