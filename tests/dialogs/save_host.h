// SPDX-License-Identifier: MIT
// Host objects for the save dialog's tests: a time axis of hourly steps from
// 2024-03-01 00:00 and items with catalogue attributes.
#pragma once

#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "hostseries/memory_series.h"
#include "support/test_host.h"

namespace save_testing {

// 2024-03-01 00:00 as a date serial, and one hour.
constexpr DATE kFirstTime = 45352.0;
constexpr double kHour = 1.0 / 24.0;

struct ItemSpec {
    ItemDataType type;
    std::string title;
    LONG typeSeq, unitSeq, valueType;
    std::vector<double> values;
};

inline automation::ComPtr<IHostSeries> MakeHost(int steps, const std::vector<ItemSpec> &items,
                                                double deleteValue = -999.0)
{
    auto series = testing_host::MakeSeries("", "");
    std::vector<DATE> times;
    for (int t = 0; t < steps; ++t) times.push_back(kFirstTime + t * kHour);
    hostseries::SetAxisTimes(*series.Get(), times);
    series->SetDeleteValue(deleteValue);
    for (const ItemSpec &spec : items) {
        auto item = hostseries::AddItemWithValues(*series.Get(), spec.type, spec.values, spec.title);
        if (spec.typeSeq) item->SetItemType(spec.typeSeq);
        if (spec.unitSeq) item->SetItemUnit(spec.unitSeq);
        item->SetValueType(spec.valueType);
    }
    return series;
}

// Values v0, v0 + step, ... for steps steps.
inline std::vector<double> Ramp(int steps, double first, double step)
{
    std::vector<double> values;
    for (int t = 0; t < steps; ++t) values.push_back(first + t * step);
    return values;
}

// Three gauges over 25 hours: a level (double, meter), a flow (float,
// liter/sec, accumulated), a rain (32-bit integers, millimeter, step
// accumulated) whose third step is the delete value.
inline automation::ComPtr<IHostSeries> ThreeGauges(int steps = 25)
{
    std::vector<double> rain = Ramp(steps, 0, 1);
    if (steps > 2) rain[2] = -999;
    return MakeHost(steps, {{ItemDataTypeDouble, "Ardmore level", 2, 1, 0, Ramp(steps, 1.25, 0.5)},
                            {ItemDataTypeFloat, "Ardmore flow", 3, 2, 1, Ramp(steps, 15.5, 0.25)},
                            {ItemDataTypeInt32, "Ardmore rain", 4, 1, 2, rain}});
}

}  // namespace save_testing
