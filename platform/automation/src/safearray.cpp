// SPDX-License-Identifier: MIT
// SAFEARRAY: the first dimension varies fastest in memory; the bounds are kept
// last dimension first; the element type lives in the four bytes before the
// descriptor.
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>

#include "automation/automation.h"
#include "vartypes.h"

namespace {

using automation::detail::ElementSize;

// Room before the descriptor for the element type; 16 keeps it aligned.
constexpr size_t kHeader = 16;
constexpr ULONG kMaxLocks = 0xFFFF;

VARTYPE &StoredVartype(SAFEARRAY *psa)
{
    // The type is a 32-bit word, of which the low 16 bits hold the VARTYPE.
    return *reinterpret_cast<VARTYPE *>(reinterpret_cast<char *>(psa) - sizeof(uint32_t));
}

USHORT FeaturesOf(VARTYPE vt)
{
    switch (vt) {
    case VT_BSTR: return FADF_HAVEVARTYPE | FADF_BSTR;
    case VT_UNKNOWN: return FADF_HAVEVARTYPE | FADF_UNKNOWN;
    case VT_DISPATCH: return FADF_HAVEVARTYPE | FADF_DISPATCH;
    case VT_VARIANT: return FADF_HAVEVARTYPE | FADF_VARIANT;
    default: return FADF_HAVEVARTYPE;
    }
}

// Bound of dimension dim, 0 being the first dimension.
SAFEARRAYBOUND &Bound(SAFEARRAY *psa, UINT dim) { return psa->rgsabound[psa->cDims - 1 - dim]; }

bool ElementCount(const SAFEARRAY *psa, size_t &count)
{
    count = 1;
    for (UINT d = 0; d < psa->cDims; ++d)
        if (__builtin_mul_overflow(count, size_t{psa->rgsabound[d].cElements}, &count))
            return false;
    return true;
}

// A descriptor with no data yet.
SAFEARRAY *AllocDescriptor(UINT cDims)
{
    const size_t bytes = kHeader + sizeof(SAFEARRAY) + (cDims - 1) * sizeof(SAFEARRAYBOUND);
    char *block = static_cast<char *>(std::calloc(1, bytes));
    if (!block) return nullptr;
    auto *psa = reinterpret_cast<SAFEARRAY *>(block + kHeader);
    psa->cDims = static_cast<USHORT>(cDims);
    return psa;
}

void FreeDescriptor(SAFEARRAY *psa) { std::free(reinterpret_cast<char *>(psa) - kHeader); }

// Zeroed data for all elements; false when it cannot be had.
bool AllocData(SAFEARRAY *psa)
{
    size_t count, bytes;
    if (!ElementCount(psa, count) || __builtin_mul_overflow(count, size_t{psa->cbElements}, &bytes))
        return false;
    if (bytes == 0) return true;
    psa->pvData = std::calloc(1, bytes);
    return psa->pvData != nullptr;
}

// Frees the BSTRs, variants and references that the elements hold.
void ReleaseElements(SAFEARRAY *psa)
{
    // Numbers and dates own nothing: a block of a million of them is freed
    // without a look at each.
    if (!(psa->fFeatures & (FADF_BSTR | FADF_VARIANT | FADF_UNKNOWN | FADF_DISPATCH))) return;
    size_t count;
    if (!psa->pvData || !ElementCount(psa, count)) return;
    for (size_t i = 0; i < count; ++i) {
        void *slot = static_cast<char *>(psa->pvData) + i * psa->cbElements;
        if (psa->fFeatures & FADF_BSTR) {
            SysFreeString(*static_cast<BSTR *>(slot));
        } else if (psa->fFeatures & FADF_VARIANT) {
            VariantClear(static_cast<VARIANT *>(slot));
        } else if (psa->fFeatures & (FADF_UNKNOWN | FADF_DISPATCH)) {
            if (auto *unk = *static_cast<IUnknown **>(slot)) unk->Release();
        }
    }
}

// Copies one element into an empty (zeroed or uninitialised) slot.
HRESULT CopyElement(USHORT features, ULONG size, const void *from, void *to)
{
    if (features & FADF_BSTR) {
        const BSTR source = *static_cast<const BSTR *>(from);
        BSTR copy = nullptr;
        if (source) {
            copy = SysAllocStringByteLen(reinterpret_cast<const char *>(source),
                                         SysStringByteLen(source));
            if (!copy) return E_OUTOFMEMORY;
        }
        *static_cast<BSTR *>(to) = copy;
    } else if (features & FADF_VARIANT) {
        VariantInit(static_cast<VARIANT *>(to));
        return VariantCopy(static_cast<VARIANT *>(to), static_cast<const VARIANT *>(from));
    } else if (features & (FADF_UNKNOWN | FADF_DISPATCH)) {
        IUnknown *unk = *static_cast<IUnknown *const *>(from);
        if (unk) unk->AddRef();
        *static_cast<IUnknown **>(to) = unk;
    } else {
        std::memcpy(to, from, size);
    }
    return S_OK;
}

// The address of the element at rgIndices (first dimension first).
HRESULT ElementAddress(SAFEARRAY *psa, const LONG *rgIndices, void **address)
{
    if (!psa || !rgIndices || !address) return E_INVALIDARG;
    size_t offset = 0, stride = 1;
    for (UINT d = 0; d < psa->cDims; ++d) {
        const SAFEARRAYBOUND &b = Bound(psa, d);
        const int64_t position = int64_t{rgIndices[d]} - b.lLbound;
        if (position < 0 || position >= int64_t{b.cElements}) return DISP_E_BADINDEX;
        offset += static_cast<size_t>(position) * stride;
        stride *= b.cElements;
    }
    if (!psa->pvData) return E_UNEXPECTED;
    *address = static_cast<char *>(psa->pvData) + offset * psa->cbElements;
    return S_OK;
}

// Holds a lock on the array for the time of one element access.
class ScopedLock {
public:
    explicit ScopedLock(SAFEARRAY *psa) : psa_(psa), hr_(SafeArrayLock(psa)) {}
    ~ScopedLock()
    {
        if (SUCCEEDED(hr_)) SafeArrayUnlock(psa_);
    }
    ScopedLock(const ScopedLock &) = delete;
    ScopedLock &operator=(const ScopedLock &) = delete;
    HRESULT Result() const { return hr_; }

private:
    SAFEARRAY *psa_;
    HRESULT hr_;
};

}  // namespace

// rgsabound names the dimensions first one first; the descriptor keeps them
// the other way round.
AUTOMATION_API SAFEARRAY *SafeArrayCreate(VARTYPE vt, UINT cDims, SAFEARRAYBOUND *rgsabound)
{
    const size_t size = ElementSize(vt);
    if (size == 0 || cDims == 0 || cDims > 0xFFFF || !rgsabound) return nullptr;
    SAFEARRAY *psa = AllocDescriptor(cDims);
    if (!psa) return nullptr;
    psa->fFeatures = FeaturesOf(vt);
    psa->cbElements = static_cast<ULONG>(size);
    StoredVartype(psa) = vt;
    for (UINT d = 0; d < cDims; ++d) Bound(psa, d) = rgsabound[d];
    if (!AllocData(psa)) {
        FreeDescriptor(psa);
        return nullptr;
    }
    return psa;
}

AUTOMATION_API SAFEARRAY *SafeArrayCreateVector(VARTYPE vt, LONG lLbound, ULONG cElements)
{
    SAFEARRAYBOUND bound{cElements, lLbound};
    return SafeArrayCreate(vt, 1, &bound);
}

AUTOMATION_API HRESULT SafeArrayDestroy(SAFEARRAY *psa)
{
    if (!psa) return S_OK;
    if (psa->cLocks > 0) return DISP_E_ARRAYISLOCKED;
    ReleaseElements(psa);
    std::free(psa->pvData);
    FreeDescriptor(psa);
    return S_OK;
}

// A null psa copies as a null array.
AUTOMATION_API HRESULT SafeArrayCopy(SAFEARRAY *psa, SAFEARRAY **ppsaOut)
{
    if (!ppsaOut) return E_INVALIDARG;
    *ppsaOut = nullptr;
    if (!psa) return S_OK;
    if (psa->cDims == 0 || psa->cbElements == 0) return E_INVALIDARG;
    SAFEARRAY *copy = AllocDescriptor(psa->cDims);
    if (!copy) return E_OUTOFMEMORY;
    copy->fFeatures = psa->fFeatures & (FADF_HAVEVARTYPE | FADF_BSTR | FADF_UNKNOWN |
                                        FADF_DISPATCH | FADF_VARIANT);
    copy->cbElements = psa->cbElements;
    if (psa->fFeatures & FADF_HAVEVARTYPE) StoredVartype(copy) = StoredVartype(psa);
    std::memcpy(copy->rgsabound, psa->rgsabound, psa->cDims * sizeof(SAFEARRAYBOUND));
    if (!AllocData(copy)) {
        FreeDescriptor(copy);
        return E_OUTOFMEMORY;
    }
    size_t count;
    ElementCount(copy, count);
    for (size_t i = 0; psa->pvData && i < count; ++i) {
        const size_t offset = i * psa->cbElements;
        const HRESULT hr = CopyElement(psa->fFeatures, psa->cbElements,
                                       static_cast<char *>(psa->pvData) + offset,
                                       static_cast<char *>(copy->pvData) + offset);
        if (FAILED(hr)) {
            SafeArrayDestroy(copy);
            return hr;
        }
    }
    *ppsaOut = copy;
    return S_OK;
}

AUTOMATION_API UINT SafeArrayGetDim(SAFEARRAY *psa) { return psa ? psa->cDims : 0; }

AUTOMATION_API UINT SafeArrayGetElemsize(SAFEARRAY *psa) { return psa ? psa->cbElements : 0; }

// nDim counts from 1, the first dimension being 1.
AUTOMATION_API HRESULT SafeArrayGetLBound(SAFEARRAY *psa, UINT nDim, LONG *plLbound)
{
    if (!psa || !plLbound) return E_INVALIDARG;
    if (nDim == 0 || nDim > psa->cDims) return DISP_E_BADINDEX;
    *plLbound = Bound(psa, nDim - 1).lLbound;
    return S_OK;
}

AUTOMATION_API HRESULT SafeArrayGetUBound(SAFEARRAY *psa, UINT nDim, LONG *plUbound)
{
    if (!psa || !plUbound) return E_INVALIDARG;
    if (nDim == 0 || nDim > psa->cDims) return DISP_E_BADINDEX;
    const SAFEARRAYBOUND &b = Bound(psa, nDim - 1);
    *plUbound = static_cast<LONG>(int64_t{b.lLbound} + b.cElements - 1);
    return S_OK;
}

// An array made elsewhere without a stored type is known by its features.
AUTOMATION_API HRESULT SafeArrayGetVartype(SAFEARRAY *psa, VARTYPE *pvt)
{
    if (!psa || !pvt) return E_INVALIDARG;
    if (psa->fFeatures & FADF_HAVEVARTYPE) *pvt = StoredVartype(psa);
    else if (psa->fFeatures & FADF_BSTR) *pvt = VT_BSTR;
    else if (psa->fFeatures & FADF_UNKNOWN) *pvt = VT_UNKNOWN;
    else if (psa->fFeatures & FADF_DISPATCH) *pvt = VT_DISPATCH;
    else if (psa->fFeatures & FADF_VARIANT) *pvt = VT_VARIANT;
    else return E_INVALIDARG;
    return S_OK;
}

AUTOMATION_API HRESULT SafeArrayLock(SAFEARRAY *psa)
{
    if (!psa) return E_INVALIDARG;
    if (psa->cLocks >= kMaxLocks) return E_UNEXPECTED;
    ++psa->cLocks;
    return S_OK;
}

AUTOMATION_API HRESULT SafeArrayUnlock(SAFEARRAY *psa)
{
    if (!psa) return E_INVALIDARG;
    if (psa->cLocks == 0) return E_UNEXPECTED;
    --psa->cLocks;
    return S_OK;
}

AUTOMATION_API HRESULT SafeArrayAccessData(SAFEARRAY *psa, void **ppvData)
{
    if (!psa || !ppvData) return E_INVALIDARG;
    const HRESULT hr = SafeArrayLock(psa);
    *ppvData = SUCCEEDED(hr) ? psa->pvData : nullptr;
    return hr;
}

AUTOMATION_API HRESULT SafeArrayUnaccessData(SAFEARRAY *psa) { return SafeArrayUnlock(psa); }

AUTOMATION_API HRESULT SafeArrayPtrOfIndex(SAFEARRAY *psa, LONG *rgIndices, void **ppvData)
{
    return ElementAddress(psa, rgIndices, ppvData);
}

// pv receives a copy: a new BSTR, a copied variant (pv is taken as
// uninitialised), or a new reference. The caller frees it.
AUTOMATION_API HRESULT SafeArrayGetElement(SAFEARRAY *psa, LONG *rgIndices, void *pv)
{
    if (!pv) return E_INVALIDARG;
    void *slot = nullptr;
    HRESULT hr = ElementAddress(psa, rgIndices, &slot);
    if (FAILED(hr)) return hr;
    ScopedLock lock(psa);
    if (FAILED(lock.Result())) return lock.Result();
    return CopyElement(psa->fFeatures, psa->cbElements, slot, pv);
}

// pv is the BSTR itself for a BSTR array, the interface pointer itself for an
// interface array, and points at the value otherwise. The array keeps a copy.
AUTOMATION_API HRESULT SafeArrayPutElement(SAFEARRAY *psa, LONG *rgIndices, void *pv)
{
    void *slot = nullptr;
    HRESULT hr = ElementAddress(psa, rgIndices, &slot);
    if (FAILED(hr)) return hr;
    const bool byValue = psa->fFeatures & (FADF_BSTR | FADF_UNKNOWN | FADF_DISPATCH);
    if (!pv && !byValue) return E_INVALIDARG;
    ScopedLock lock(psa);
    if (FAILED(lock.Result())) return lock.Result();

    if (psa->fFeatures & FADF_VARIANT)
        return VariantCopy(static_cast<VARIANT *>(slot), static_cast<const VARIANT *>(pv));
    if (!byValue) {
        std::memcpy(slot, pv, psa->cbElements);
        return S_OK;
    }
    // Copy first, so that a failure leaves the element as it was.
    if (psa->fFeatures & FADF_BSTR) {
        const auto source = static_cast<BSTR>(pv);
        BSTR copy = nullptr;
        if (source) {
            copy = SysAllocStringByteLen(reinterpret_cast<const char *>(source),
                                         SysStringByteLen(source));
            if (!copy) return E_OUTOFMEMORY;
        }
        BSTR &target = *static_cast<BSTR *>(slot);
        SysFreeString(target);
        target = copy;
    } else {
        auto *unk = static_cast<IUnknown *>(pv);
        if (unk) unk->AddRef();
        IUnknown *&target = *static_cast<IUnknown **>(slot);
        if (target) target->Release();
        target = unk;
    }
    return S_OK;
}
