// SPDX-License-Identifier: MIT
// C++ helpers for hosts and tests over the in-memory series of
// HostSeriesCreate: make a series, fill it, and read it back as plain values.
// They call the objects only through their interfaces, so they work on any
// implementation; failures throw automation::ComError.
#pragma once

#include <span>
#include <string_view>
#include <vector>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"

#define HOSTSERIES_CXX_API __attribute__((visibility("default")))

namespace hostseries {

// A new, empty series.
HOSTSERIES_CXX_API automation::ComPtr<IHostSeries> MakeSeries();

// Appends an item of the given data type holding values; integer types take
// the values rounded to the nearest and held at the type's limits.
HOSTSERIES_CXX_API automation::ComPtr<IHostItem> AddItemWithValues(IHostSeries &series,
                                                                   ItemDataType type,
                                                                   std::span<const double> values,
                                                                   std::string_view title = {});

// The item with the 1-based number, asked for with a VT_I4 index.
HOSTSERIES_CXX_API automation::ComPtr<IHostItem> ItemAt(IHostSeries &series, LONG number);

// An item's values through GetData, each element as a double.
HOSTSERIES_CXX_API std::vector<double> ReadValues(IHostItem &item);

// Lays out the time axis as a bridge does: kind 3, the step count, the times.
HOSTSERIES_CXX_API void SetAxisTimes(IHostSeries &series, std::span<const DATE> times);

// The axis's times, step 1 first.
HOSTSERIES_CXX_API std::vector<DATE> ReadTimes(IHostSeries &series);

// Objects of this library alive now (series, connections, axes, items), for
// tests that check that every reference was given back.
HOSTSERIES_CXX_API long LiveObjectCount() noexcept;

}  // namespace hostseries
