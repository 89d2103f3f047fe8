// SPDX-License-Identifier: MIT
// A stub object that counts its references, to check who AddRefs and Releases.
#pragma once

#include "automation/automation.h"

namespace automation::testing {

class CountingUnknown final : public IDispatch {
public:
    HRESULT QueryInterface(REFIID riid, void **ppv) override
    {
        if (!ppv) return E_POINTER;
        *ppv = nullptr;
        if (!(riid == IID_IUnknown || riid == IID_IDispatch)) return E_NOINTERFACE;
        *ppv = this;
        AddRef();
        return S_OK;
    }
    ULONG AddRef() override { return ++refs; }
    ULONG Release() override { return --refs; }
    // Not reached by the runtime: it never calls into a value it copies.
    HRESULT GetTypeInfoCount(UINT *) override { return E_NOTIMPL; }
    HRESULT GetTypeInfo(UINT, LCID, ITypeInfo **) override { return E_NOTIMPL; }
    HRESULT GetIDsOfNames(REFIID, LPOLESTR *, UINT, LCID, DISPID *) override { return E_NOTIMPL; }
    HRESULT Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS *, VARIANT *, EXCEPINFO *,
                   UINT *) override
    {
        return E_NOTIMPL;
    }

    ULONG refs = 1;  // the test's own reference
};

}  // namespace automation::testing
