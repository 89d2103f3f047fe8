// SPDX-License-Identifier: MIT
// The built module, loaded as a host loads it, with its exports looked up.
#pragma once

#include <dlfcn.h>

#include <stdexcept>
#include <string>

#include "automation/automation.h"

namespace testing_host {

class LoadedModule {
public:
    using GetClassObjectFn = HRESULT (*)(REFCLSID, REFIID, void **);
    using CanUnloadNowFn = HRESULT (*)();

    explicit LoadedModule(const char *path = VANTREL_MODULE_PATH)
        : handle_(dlopen(path, RTLD_NOW | RTLD_LOCAL))
    {
        if (!handle_) throw std::runtime_error(std::string("dlopen: ") + dlerror());
        getClassObject = reinterpret_cast<GetClassObjectFn>(dlsym(handle_, "DllGetClassObject"));
        canUnloadNow = reinterpret_cast<CanUnloadNowFn>(dlsym(handle_, "DllCanUnloadNow"));
    }
    ~LoadedModule() { dlclose(handle_); }
    LoadedModule(const LoadedModule &) = delete;
    LoadedModule &operator=(const LoadedModule &) = delete;

    void *Symbol(const char *name) const { return dlsym(handle_, name); }

    GetClassObjectFn getClassObject = nullptr;
    CanUnloadNowFn canUnloadNow = nullptr;

private:
    void *handle_;
};

// {4C2698C4-93A5-4D02-8642-B1C2705C538F}
inline constexpr CLSID kClsidExcelVantrel = {
    0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};

}  // namespace testing_host
