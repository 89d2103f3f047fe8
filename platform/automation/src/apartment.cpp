// SPDX-License-Identifier: MIT
// The per-thread count of CoInitialize calls and the concurrency model they chose.
#include "automation/automation.h"

namespace {

constexpr DWORD kKnownFlags = COINIT_APARTMENTTHREADED | 0x4 /* no OLE1 DDE */ | 0x8 /* speed */;

struct Apartment {
    ULONG count = 0;
    DWORD model = COINIT_MULTITHREADED;
};

thread_local Apartment threadApartment;

}  // namespace

AUTOMATION_API HRESULT CoInitialize(void *pvReserved)
{
    return CoInitializeEx(pvReserved, COINIT_APARTMENTTHREADED);
}

// The first call on a thread gives S_OK, later calls with the same model
// S_FALSE (each wants its CoUninitialize), a call with the other model
// RPC_E_CHANGED_MODE and no count.
AUTOMATION_API HRESULT CoInitializeEx(void *pvReserved, DWORD dwCoInit)
{
    if (pvReserved || (dwCoInit & ~kKnownFlags)) return E_INVALIDARG;
    const DWORD model = dwCoInit & COINIT_APARTMENTTHREADED;
    Apartment &apartment = threadApartment;
    if (apartment.count == 0) {
        apartment.model = model;
        apartment.count = 1;
        return S_OK;
    }
    if (apartment.model != model) return RPC_E_CHANGED_MODE;
    ++apartment.count;
    return S_FALSE;
}

// The last call of a thread also drops the thread's error info.
AUTOMATION_API void CoUninitialize(void)
{
    Apartment &apartment = threadApartment;
    if (apartment.count == 0) return;
    if (--apartment.count == 0) SetErrorInfo(0, nullptr);
}
