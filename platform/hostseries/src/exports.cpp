// SPDX-License-Identifier: MIT
// The C functions by which a host makes and sets up its in-memory series.
#include "automation/com_error.h"
#include "com_object.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"
#include "series.h"

namespace hostseries::detail {

std::atomic<long> &LiveObjects() noexcept
{
    static std::atomic<long> count{0};
    return count;
}

}  // namespace hostseries::detail

HRESULT HostSeriesCreate(IHostSeries **series)
{
    if (!series) return E_POINTER;
    *series = nullptr;
    return automation::ComBoundary([&] {
        *series = new hostseries::detail::Series;
        return S_OK;
    });
}

HRESULT HostSeriesSetSilent(IHostSeries *series, VARIANT_BOOL silent)
{
    if (!series) return E_POINTER;
    hostseries::detail::Series *own = hostseries::detail::Series::FromInterface(series);
    // A series of another implementation has no such setting here.
    if (!own) return E_INVALIDARG;
    own->HostConnection().SetSilentByHost(silent);
    return S_OK;
}

long hostseries::LiveObjectCount() noexcept
{
    return detail::LiveObjects().load();
}
