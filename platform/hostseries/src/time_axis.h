// SPDX-License-Identifier: MIT
// The time axis of a series: its kind and one time a step.
#pragma once

#include <vector>

#include "com_object.h"
#include "hostseries/hostseries.h"

namespace hostseries::detail {

class TimeAxis final : public ComObject<IHostTimeAxis> {
public:
    TimeAxis() noexcept : ComObject(IID_IHostTimeAxis) {}

    HRESULT GetStepCount(LONG *count) override;
    HRESULT SetStepCount(LONG count) override;
    HRESULT SetAxisKind(LONG kind) override;
    HRESULT SetTimes(VARIANT times) override;
    HRESULT GetTime(LONG step, VARIANT *time) override;

    LONG Kind() const noexcept { return kind_; }

private:
    LONG kind_ = 0;
    // One time a step; the step count is its size.
    std::vector<DATE> times_;
};

}  // namespace hostseries::detail
