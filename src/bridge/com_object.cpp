// SPDX-License-Identifier: MIT
// The object side of CExcelVantrel: creation, identity, reference counts,
// aggregation and late-bound calls.
#include <cstring>
#include <new>
#include <string_view>

#include "automation/text.h"
#include "bridge/excel_vantrel.h"
#include "module/module_lock.h"

namespace {

// Late-bound numbers of the eight operations, in interface order.
constexpr std::string_view kOperationNames[] = {
    "SetHostSeries", "FileExists", "InspectWorkbook", "NoOperation",
    "ReadData",      "WriteData",  "OpenDialog",      "SaveDialog",
};

bool EqualsIgnoringCase(std::string_view a, std::string_view b)
{
    if (a.size() != b.size()) return false;
    for (size_t i = 0; i < a.size(); ++i) {
        auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? char(c - 'A' + 'a') : c; };
        if (lower(a[i]) != lower(b[i])) return false;
    }
    return true;
}

}  // namespace

CExcelVantrel::CExcelVantrel(IUnknown *outer) : m_outer(outer ? outer : &m_inner)
{
    m_inner.self = this;
    vantrel::LockModule();
}

CExcelVantrel::~CExcelVantrel()
{
    EndSession();
    vantrel::UnlockModule();
}

HRESULT CExcelVantrel::CreateInstance(IUnknown *outer, REFIID riid, void **object)
{
    if (!object) return E_POINTER;
    *object = nullptr;
    // An aggregated object hands its outer object the inner unknown only.
    if (outer && !(riid == IID_IUnknown)) return CLASS_E_NOAGGREGATION;
    auto *created = new (std::nothrow) CExcelVantrel(outer);
    if (!created) return E_OUTOFMEMORY;
    created->m_inner.AddRef();
    const HRESULT hr = created->m_inner.QueryInterface(riid, object);
    created->m_inner.Release();  // leaves the object alive only if QI succeeded
    return hr;
}

HRESULT CExcelVantrel::InnerUnknown::QueryInterface(REFIID riid, void **object)
{
    if (!object) return E_POINTER;
    if (riid == IID_IUnknown) {
        *object = static_cast<IUnknown *>(this);
    } else if (riid == IID_IDispatch || riid == IID_IVantrel) {
        *object = static_cast<IVantrel *>(self);
    } else if (riid == IID_ISupportErrorInfo) {
        *object = static_cast<ISupportErrorInfo *>(self);
    } else if (riid == IID_IVantrelReport) {
        *object = static_cast<IVantrelReport *>(self);
    } else {
        *object = nullptr;
        return E_NOINTERFACE;
    }
    static_cast<IUnknown *>(*object)->AddRef();
    return S_OK;
}

ULONG CExcelVantrel::InnerUnknown::AddRef() { return ++self->m_refs; }

ULONG CExcelVantrel::InnerUnknown::Release()
{
    const ULONG left = --self->m_refs;
    if (left == 0) delete self;
    return left;
}

HRESULT CExcelVantrel::QueryInterface(REFIID riid, void **object)
{
    return m_outer->QueryInterface(riid, object);
}

ULONG CExcelVantrel::AddRef() { return m_outer->AddRef(); }

ULONG CExcelVantrel::Release() { return m_outer->Release(); }

HRESULT CExcelVantrel::GetTypeInfoCount(UINT *count)
{
    if (!count) return E_POINTER;
    *count = 0;
    return S_OK;
}

HRESULT CExcelVantrel::GetTypeInfo(UINT, LCID, ITypeInfo **info)
{
    if (info) *info = nullptr;
    return E_NOTIMPL;
}

HRESULT CExcelVantrel::GetIDsOfNames(REFIID, LPOLESTR *names, UINT count, LCID, DISPID *ids)
{
    if (!names || !ids) return E_POINTER;
    HRESULT hr = S_OK;
    for (UINT i = 0; i < count; ++i) {
        ids[i] = -1;  // DISPID_UNKNOWN
        if (i > 0 || !names[i]) {  // operations have no named arguments
            hr = DISP_E_UNKNOWNNAME;
            continue;
        }
        const std::string name = automation::Utf16ToUtf8(names[i]);
        for (DISPID id = 0; id < DISPID(std::size(kOperationNames)); ++id)
            if (EqualsIgnoringCase(name, kOperationNames[id])) ids[i] = id + 1;
        if (ids[i] == -1) hr = DISP_E_UNKNOWNNAME;
    }
    return hr;
}

HRESULT CExcelVantrel::Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS *params,
                              VARIANT *result, EXCEPINFO *, UINT *argError)
{
    if (!(flags & DISPATCH_METHOD)) return DISP_E_MEMBERNOTFOUND;
    const UINT argCount = params ? params->cArgs : 0;
    if (params && params->cNamedArgs != 0) return DISP_E_PARAMNOTFOUND;
    const UINT wanted = id == 1 ? 1 : 0;
    if (id < 1 || id > 8) return DISP_E_MEMBERNOTFOUND;
    if (argCount != wanted) return DISP_E_BADPARAMCOUNT;

    if (result) VariantInit(result);
    SHORT out = 0;
    HRESULT hr;
    switch (id) {
    case 1: {
        const VARIANT &arg = params->rgvarg[0];
        IUnknown *unknown = nullptr;
        if (arg.vt == VT_UNKNOWN || arg.vt == VT_DISPATCH) unknown = arg.punkVal;
        if (!unknown && arg.vt != VT_EMPTY && arg.vt != VT_NULL) {
            if (argError) *argError = 0;
            return DISP_E_TYPEMISMATCH;
        }
        IHostSeries *series = nullptr;
        if (unknown && FAILED(unknown->QueryInterface(IID_IHostSeries, reinterpret_cast<void **>(&series)))) {
            if (argError) *argError = 0;
            return DISP_E_TYPEMISMATCH;
        }
        hr = SetHostSeries(series);
        // The bridge keeps a plain pointer; the caller's variant keeps it alive.
        if (series) series->Release();
        return hr;
    }
    case 2: hr = FileExists(&out); break;
    case 3: hr = InspectWorkbook(&out); break;
    case 4: return NoOperation();
    case 5: return ReadData();
    case 6: return WriteData();
    case 7: return OpenDialog();
    default: return SaveDialog();
    }
    if (SUCCEEDED(hr) && result) {
        result->vt = VT_I2;
        result->iVal = out;
    }
    return hr;
}

HRESULT CExcelVantrel::InterfaceSupportsErrorInfo(REFIID riid)
{
    return riid == IID_IVantrel ? S_OK : S_FALSE;
}
