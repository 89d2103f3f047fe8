// SPDX-License-Identifier: MIT
#include "module_loader.h"

#include <dlfcn.h>

#include <filesystem>
#include <stdexcept>

#include "automation/guid.h"

namespace vantrel_cli {
namespace {

// {4C2698C4-93A5-4D02-8642-B1C2705C538F}
constexpr CLSID kClsidExcelVantrel = {
    0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};

std::string HexCode(HRESULT hr)
{
    char text[16];
    std::snprintf(text, sizeof text, "0x%08X", static_cast<unsigned>(hr));
    return text;
}

}  // namespace

BridgeModule::BridgeModule(const std::string &path) : handle_(dlopen(path.c_str(), RTLD_NOW))
{
    if (!handle_) throw std::runtime_error(std::string("cannot load the bridge module: ") + dlerror());
    getClassObject_ = reinterpret_cast<decltype(getClassObject_)>(dlsym(handle_, "DllGetClassObject"));
    canUnloadNow_ = reinterpret_cast<decltype(canUnloadNow_)>(dlsym(handle_, "DllCanUnloadNow"));
    if (!getClassObject_ || !canUnloadNow_) {
        dlclose(handle_);
        throw std::runtime_error(path + " is not a bridge module: its entry points are missing");
    }
}

BridgeModule::~BridgeModule() { dlclose(handle_); }

automation::ComPtr<IVantrel> BridgeModule::CreateBridge() const
{
    automation::ComPtr<IClassFactory> factory;
    HRESULT hr = getClassObject_(kClsidExcelVantrel, IID_IClassFactory, factory.OutVoid());
    if (FAILED(hr)) throw std::runtime_error("the module has no class " + automation::GuidToString(kClsidExcelVantrel) + ": " + HexCode(hr));
    automation::ComPtr<IVantrel> bridge;
    hr = factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid());
    if (FAILED(hr)) throw std::runtime_error("the bridge could not be created: " + HexCode(hr));
    return bridge;
}

bool BridgeModule::CanUnload() const { return canUnloadNow_() == S_OK; }

std::string DefaultModulePath()
{
    std::error_code error;
    const auto self = std::filesystem::read_symlink("/proc/self/exe", error);
    const auto folder = error ? std::filesystem::current_path() : self.parent_path();
    return (folder / "GenericExcelVantrel.so").string();
}

}  // namespace vantrel_cli
