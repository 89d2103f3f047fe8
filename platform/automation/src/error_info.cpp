// SPDX-License-Identifier: MIT
// Error info objects and the error info slot of each thread.
#include <atomic>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "automation/values.h"

namespace {

using automation::Bstr;

// One object behind both interfaces; its IUnknown is the IErrorInfo face.
class ErrorInfo final : public IErrorInfo, public ICreateErrorInfo {
public:
    HRESULT QueryInterface(REFIID riid, void **ppvObject) override
    {
        if (!ppvObject) return E_POINTER;
        if (riid == IID_IUnknown || riid == IID_IErrorInfo) {
            *ppvObject = static_cast<IErrorInfo *>(this);
        } else if (riid == IID_ICreateErrorInfo) {
            *ppvObject = static_cast<ICreateErrorInfo *>(this);
        } else {
            *ppvObject = nullptr;
            return E_NOINTERFACE;
        }
        AddRef();
        return S_OK;
    }
    ULONG AddRef() override { return ++refs_; }
    ULONG Release() override
    {
        const ULONG left = --refs_;
        if (left == 0) delete this;
        return left;
    }

    HRESULT GetGUID(GUID *pGUID) override
    {
        if (!pGUID) return E_INVALIDARG;
        *pGUID = guid_;
        return S_OK;
    }
    HRESULT GetSource(BSTR *out) override { return CopyOut(source_, out); }
    HRESULT GetDescription(BSTR *out) override { return CopyOut(description_, out); }
    HRESULT GetHelpFile(BSTR *out) override { return CopyOut(helpFile_, out); }
    HRESULT GetHelpContext(DWORD *pdwHelpContext) override
    {
        if (!pdwHelpContext) return E_INVALIDARG;
        *pdwHelpContext = helpContext_;
        return S_OK;
    }

    HRESULT SetGUID(REFGUID rguid) override
    {
        guid_ = rguid;
        return S_OK;
    }
    HRESULT SetSource(LPOLESTR text) override { return Store(text, source_); }
    HRESULT SetDescription(LPOLESTR text) override { return Store(text, description_); }
    HRESULT SetHelpFile(LPOLESTR text) override { return Store(text, helpFile_); }
    HRESULT SetHelpContext(DWORD dwHelpContext) override
    {
        helpContext_ = dwHelpContext;
        return S_OK;
    }

private:
    ~ErrorInfo() = default;

    // A text never set comes out as a null BSTR.
    static HRESULT CopyOut(const Bstr &held, BSTR *out)
    {
        if (!out) return E_INVALIDARG;
        *out = nullptr;
        if (!held.Get()) return S_OK;
        *out = SysAllocStringLen(held.Get(), SysStringLen(held.Get()));
        return *out ? S_OK : E_OUTOFMEMORY;
    }
    // A null text clears the field.
    static HRESULT Store(LPOLESTR text, Bstr &field)
    {
        BSTR copy = SysAllocString(text);
        if (text && !copy) return E_OUTOFMEMORY;
        field = Bstr::Attach(copy);
        return S_OK;
    }

    std::atomic<ULONG> refs_{1};
    GUID guid_{};
    Bstr source_, description_, helpFile_;
    DWORD helpContext_ = 0;
};

// The error info of the calling thread; the library is shared so that a module
// and its host see the same slot.
thread_local automation::ComPtr<IErrorInfo> threadErrorInfo;

}  // namespace

AUTOMATION_API HRESULT CreateErrorInfo(ICreateErrorInfo **pperrinfo)
{
    if (!pperrinfo) return E_INVALIDARG;
    *pperrinfo = nullptr;
    return automation::ComBoundary([&]() -> HRESULT {
        *pperrinfo = new ErrorInfo;
        return S_OK;
    });
}

// Takes a reference to perrinfo (which may be null, to clear the slot) and
// drops the one held before.
AUTOMATION_API HRESULT SetErrorInfo(ULONG dwReserved, IErrorInfo *perrinfo)
{
    if (dwReserved != 0) return E_INVALIDARG;
    threadErrorInfo = automation::ComPtr<IErrorInfo>(perrinfo);
    return S_OK;
}

// Hands the thread's reference to the caller and empties the slot; S_FALSE
// and a null pointer when there is none.
AUTOMATION_API HRESULT GetErrorInfo(ULONG dwReserved, IErrorInfo **pperrinfo)
{
    if (!pperrinfo) return E_INVALIDARG;
    *pperrinfo = nullptr;
    if (dwReserved != 0) return E_INVALIDARG;
    *pperrinfo = threadErrorInfo.Detach();
    return *pperrinfo ? S_OK : S_FALSE;
}
