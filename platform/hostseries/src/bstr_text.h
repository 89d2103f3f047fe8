// SPDX-License-Identifier: MIT
// Copies between BSTRs and kept UTF-16 text, with no conversion on the way.
#pragma once

#include <string>

#include "automation/automation.h"

namespace hostseries::detail {

// The whole text of a BSTR, its length taken from the BSTR; null is empty.
inline std::u16string CopyBstr(BSTR text)
{
    return text ? std::u16string(text, SysStringLen(text)) : std::u16string();
}

// A new BSTR for an out argument. E_POINTER for a null out, E_OUTOFMEMORY
// with *out null when it can't be made.
inline HRESULT HandOutBstr(const std::u16string &text, BSTR *out)
{
    if (!out) return E_POINTER;
    *out = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
    return *out ? S_OK : E_OUTOFMEMORY;
}

}  // namespace hostseries::detail
