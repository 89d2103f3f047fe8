// SPDX-License-Identifier: MIT
#include "time_axis.h"

#include "automation/com_error.h"
#include "value_arrays.h"

namespace hostseries::detail {

using automation::ComBoundary;

HRESULT TimeAxis::GetStepCount(LONG *count)
{
    if (!count) return E_POINTER;
    *count = static_cast<LONG>(times_.size());
    return S_OK;
}

HRESULT TimeAxis::SetStepCount(LONG count)
{
    if (count < 0) return E_INVALIDARG;
    // Kept times stay; new steps start at time 0 until SetTimes fills them.
    return ComBoundary([&] {
        times_.resize(static_cast<std::size_t>(count), 0.0);
        return S_OK;
    });
}

HRESULT TimeAxis::SetAxisKind(LONG kind)
{
    kind_ = kind;
    return S_OK;
}

HRESULT TimeAxis::SetTimes(VARIANT times)
{
    TakeOwnership owned(times);
    return ComBoundary([&] {
        const VARTYPE elementType = times.vt & VT_TYPEMASK;
        if ((times.vt & VT_ARRAY) == 0 || (elementType != VT_DATE && elementType != VT_R8))
            return DISP_E_TYPEMISMATCH;
        std::vector<double> read;
        const HRESULT hr = ReadNumberArray(times, read);
        if (FAILED(hr)) return hr;
        // The array decides the step count, whatever SetStepCount said before.
        times_ = std::move(read);
        return S_OK;
    });
}

HRESULT TimeAxis::GetTime(LONG step, VARIANT *time)
{
    if (!time) return E_POINTER;
    VariantInit(time);
    if (step < 1 || static_cast<std::size_t>(step) > times_.size()) return E_INVALIDARG;
    time->vt = VT_DATE;
    time->date = times_[static_cast<std::size_t>(step) - 1];
    return S_OK;
}

}  // namespace hostseries::detail
