// SPDX-License-Identifier: MIT
#include "module/class_factory.h"

#include "bridge/excel_vantrel.h"
#include "module/module_lock.h"

namespace vantrel {
namespace {

// Lives as long as the module: its own count doesn't hold the module, only
// LockServer does.
class ExcelVantrelFactory final : public IClassFactory {
public:
    HRESULT QueryInterface(REFIID riid, void **object) override
    {
        if (!object) return E_POINTER;
        if (riid == IID_IUnknown || riid == IID_IClassFactory) {
            *object = static_cast<IClassFactory *>(this);
            AddRef();
            return S_OK;
        }
        *object = nullptr;
        return E_NOINTERFACE;
    }
    ULONG AddRef() override { return 2; }
    ULONG Release() override { return 1; }

    HRESULT CreateInstance(IUnknown *outer, REFIID riid, void **object) override
    {
        return CExcelVantrel::CreateInstance(outer, riid, object);
    }

    HRESULT LockServer(BOOL lock) override
    {
        if (lock)
            LockModule();
        else
            UnlockModule();
        return S_OK;
    }
};

}  // namespace

IClassFactory &ExcelVantrelClassObject()
{
    // A function-local static is made once, under the runtime's lock.
    static ExcelVantrelFactory factory;
    return factory;
}

}  // namespace vantrel
