// SPDX-License-Identifier: MIT
// VARIANT lifetime: initialising, clearing and deep copying.
#include "automation/automation.h"
#include "vartypes.h"

AUTOMATION_API void VariantInit(VARIANT *pvarg)
{
    if (!pvarg) return;
    pvarg->vt = VT_EMPTY;
    pvarg->wReserved1 = pvarg->wReserved2 = pvarg->wReserved3 = 0;
    pvarg->brecord = {nullptr, nullptr};
}

// A reference (VT_BYREF) is not owned and is dropped without freeing.
AUTOMATION_API HRESULT VariantClear(VARIANT *pvarg)
{
    if (!pvarg) return E_INVALIDARG;
    if (!automation::detail::IsValidVariantType(pvarg->vt)) return DISP_E_BADVARTYPE;
    if (!(pvarg->vt & VT_BYREF)) {
        if (pvarg->vt & VT_ARRAY) {
            const HRESULT hr = SafeArrayDestroy(pvarg->parray);
            if (FAILED(hr)) return hr;
        } else if (pvarg->vt == VT_BSTR) {
            SysFreeString(pvarg->bstrVal);
        } else if ((pvarg->vt == VT_UNKNOWN || pvarg->vt == VT_DISPATCH) && pvarg->punkVal) {
            pvarg->punkVal->Release();
        }
    }
    VariantInit(pvarg);
    return S_OK;
}

// Text and arrays are copied, interfaces get one more reference, references
// (VT_BYREF) are copied as they are. pvargDest is cleared first.
AUTOMATION_API HRESULT VariantCopy(VARIANT *pvargDest, const VARIANT *pvargSrc)
{
    if (!pvargDest || !pvargSrc) return E_INVALIDARG;
    if (!automation::detail::IsValidVariantType(pvargSrc->vt)) return DISP_E_BADVARTYPE;
    if (pvargDest == pvargSrc) return S_OK;
    HRESULT hr = VariantClear(pvargDest);
    if (FAILED(hr)) return hr;

    VARIANT copy = *pvargSrc;
    if (!(copy.vt & VT_BYREF)) {
        if (copy.vt & VT_ARRAY) {
            hr = SafeArrayCopy(pvargSrc->parray, &copy.parray);
            if (FAILED(hr)) return hr;
        } else if (copy.vt == VT_BSTR && pvargSrc->bstrVal) {
            copy.bstrVal = SysAllocStringByteLen(reinterpret_cast<const char *>(pvargSrc->bstrVal),
                                                 SysStringByteLen(pvargSrc->bstrVal));
            if (!copy.bstrVal) return E_OUTOFMEMORY;
        } else if ((copy.vt == VT_UNKNOWN || copy.vt == VT_DISPATCH) && copy.punkVal) {
            copy.punkVal->AddRef();
        }
    }
    *pvargDest = copy;
    return S_OK;
}
