// SPDX-License-Identifier: MIT
// The failure codes of the engine and one place that raises them.
#pragma once

#include <string>

#include "automation/com_error.h"

namespace workbook {

// A file the engine can't read: missing, not a package, damaged or hostile.
inline constexpr HRESULT kBadFile = E_FAIL;
// An object whose workbook was closed or whose application quit.
inline constexpr HRESULT kObjectGone = static_cast<HRESULT>(0x80010108);
// A request the object model refuses (bad address, AutoFit on a plain range).
inline constexpr HRESULT kRequestRefused = static_cast<HRESULT>(0x800A03EC);

[[noreturn]] inline void Fail(HRESULT hr, const std::string &text)
{
    throw automation::ComError(hr, text);
}

}  // namespace workbook
