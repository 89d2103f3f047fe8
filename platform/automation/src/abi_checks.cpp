// SPDX-License-Identifier: MIT
// The byte layout that modules and hosts built elsewhere rely on.
#include <cstddef>

#include "automation/automation.h"

static_assert(sizeof(OLECHAR) == 2, "text at automation calls is UTF-16");
static_assert(sizeof(HRESULT) == 4 && sizeof(LONG) == 4 && sizeof(ULONG) == 4);
static_assert(sizeof(VARIANT_BOOL) == 2 && sizeof(VARTYPE) == 2 && sizeof(DATE) == 8);
static_assert(sizeof(GUID) == 16);
static_assert(offsetof(GUID, Data2) == 4 && offsetof(GUID, Data3) == 6 &&
              offsetof(GUID, Data4) == 8);
static_assert(sizeof(void *) == 8, "the layout below is that of a 64-bit target");
static_assert(sizeof(VARIANT) == 24);
static_assert(offsetof(VARIANT, vt) == 0 && offsetof(VARIANT, lVal) == 8 &&
              offsetof(VARIANT, dblVal) == 8 && offsetof(VARIANT, bstrVal) == 8);
static_assert(sizeof(SAFEARRAYBOUND) == 8);
static_assert(offsetof(SAFEARRAY, cbElements) == 4 && offsetof(SAFEARRAY, cLocks) == 8 &&
              offsetof(SAFEARRAY, pvData) == 16 && offsetof(SAFEARRAY, rgsabound) == 24);
static_assert(sizeof(SAFEARRAY) == 32);
static_assert(sizeof(SYSTEMTIME) == 16 && sizeof(UDATE) == 18);
static_assert(sizeof(DISPPARAMS) == 24);
