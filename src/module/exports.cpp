// SPDX-License-Identifier: MIT
// The module's exported functions and its start and end on the loading thread.
#include "automation/automation.h"
#include "automation/com_error.h"
#include "module/class_factory.h"
#include "module/identifiers.h"
#include "module/module_lock.h"
#include "module/registration.h"

#define VANTREL_EXPORT extern "C" __attribute__((visibility("default")))

namespace {

// Starts the apartment on the thread that loads the module and ends it when
// the module is unloaded.
struct ModuleApplication {
    ModuleApplication() { CoInitialize(nullptr); }
    ~ModuleApplication() { CoUninitialize(); }
};
const ModuleApplication g_application;

}  // namespace

VANTREL_EXPORT HRESULT DllGetClassObject(REFCLSID rclsid, REFIID riid, void **ppv)
{
    return automation::ComBoundary([&]() -> HRESULT {
        if (!ppv) return E_POINTER;
        *ppv = nullptr;
        if (!(rclsid == vantrel::kClsidExcelVantrel)) return CLASS_E_CLASSNOTAVAILABLE;
        return vantrel::ExcelVantrelClassObject().QueryInterface(riid, ppv);
    });
}

VANTREL_EXPORT HRESULT DllCanUnloadNow()
{
    return vantrel::ModuleLockCount() == 0 ? S_OK : S_FALSE;
}

VANTREL_EXPORT HRESULT DllRegisterServer()
{
    return automation::ComBoundary([] { return vantrel::RegisterModule(); });
}

VANTREL_EXPORT HRESULT DllUnregisterServer()
{
    return automation::ComBoundary([] { return vantrel::UnregisterModule(); });
}
