// SPDX-License-Identifier: MIT
// Calls on the host object that a run can't do without. A host may fail any
// call, or hand out nothing with S_OK; either ends the run with a message
// that names the call, instead of a run on a null pointer or half the data.
#pragma once

#include <cstdio>
#include <string>

#include "automation/com_error.h"
#include "automation/com_ptr.h"

namespace vantrel::bridge {

inline void HostCall(HRESULT hr, const char *call)
{
    if (FAILED(hr)) {
        char code[16];
        std::snprintf(code, sizeof code, "0x%08X", unsigned(hr));
        throw automation::ComError(hr, std::string("The host object failed the call ") + call + " (" + code + ").");
    }
}

// The interface that a getter handed out, when it did.
template <typename T>
T &HostObject(HRESULT hr, const automation::ComPtr<T> &object, const char *call)
{
    HostCall(hr, call);
    if (!object) throw automation::ComError(E_POINTER, std::string("The host object gave nothing for the call ") + call + ".");
    return *object.Get();
}

}  // namespace vantrel::bridge
