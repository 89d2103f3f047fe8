// SPDX-License-Identifier: MIT
#include "connection.h"

#include "automation/com_error.h"
#include "bstr_text.h"

namespace hostseries::detail {

using automation::ComBoundary;

HRESULT Connection::GetFilePath(BSTR *path)
{
    return ComBoundary([&] { return HandOutBstr(path_, path); });
}

HRESULT Connection::SetFilePath(BSTR path)
{
    return ComBoundary([&] {
        path_ = CopyBstr(path);
        return S_OK;
    });
}

HRESULT Connection::GetSpecification(BSTR *specification)
{
    return ComBoundary([&] { return HandOutBstr(specification_, specification); });
}

HRESULT Connection::SetSpecification(BSTR specification)
{
    return ComBoundary([&] {
        specification_ = CopyBstr(specification);
        return S_OK;
    });
}

HRESULT Connection::GetSilent(VARIANT_BOOL *silent)
{
    if (!silent) return E_POINTER;
    // S_FALSE tells a caller that looks that its preset stood.
    if (!silent_) return S_FALSE;
    *silent = *silent_;
    return S_OK;
}

void Connection::SetSilentByHost(VARIANT_BOOL silent) noexcept
{
    silent_ = silent ? VARIANT_TRUE : VARIANT_FALSE;
}

}  // namespace hostseries::detail
