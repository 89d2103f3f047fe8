// SPDX-License-Identifier: MIT
// A host object to export: a time axis of seconds and items with their
// catalogue attributes, handed to an in-process bridge's WriteData.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "hostseries/memory_series.h"
#include "support/bridge_factory.h"
#include "support/test_host.h"

namespace bridge_testing {

// 2020-01-02 03:04:05, the first step.
constexpr DATE kFirstTime = 43832.0 + (3 * 3600 + 4 * 60 + 5) / 86400.0;

inline automation::ComPtr<IHostSeries> MakeHost(const std::string &path, const std::string &spec, int steps,
                                                std::optional<bool> silent = std::nullopt)
{
    auto series = testing_host::MakeSeries(path, spec, silent);
    std::vector<DATE> times;
    for (int t = 0; t < steps; ++t) times.push_back(kFirstTime + t / 86400.0);
    hostseries::SetAxisTimes(*series.Get(), times);
    return series;
}

using testing_host::AddItem;

inline HRESULT Export(IHostSeries &series)
{
    auto bridge = testing_host::MakeBridge();
    bridge->SetHostSeries(&series);
    return bridge->WriteData();
}

}  // namespace bridge_testing
