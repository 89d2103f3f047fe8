// SPDX-License-Identifier: MIT
// The host object of the save dialog's tests: hourly steps from 2024-03-01
// 00:00 and three gauges with catalogue attributes.
#pragma once

#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "support/test_host.h"

namespace save_testing {

// Three gauges over steps hours, the delete value -999: a level (double,
// meter), a flow (float, liter/sec, accumulated), a rain (32-bit integers,
// millimeter, step accumulated) whose third step is the delete value.
inline automation::ComPtr<IHostSeries> ThreeGauges(int steps = 25, const std::string &spec = "", const std::string &path = "")
{
    auto series = testing_host::MakeSeries(path, spec);
    std::vector<DATE> times;
    std::vector<std::vector<double>> values(3);
    for (int t = 0; t < steps; ++t) {
        times.push_back(45352.0 + t / 24.0);
        values[0].push_back(1.25 + t * 0.5);
        values[1].push_back(15.5 + t * 0.25);
        values[2].push_back(t == 2 ? -999 : t);
    }
    hostseries::SetAxisTimes(*series.Get(), times);
    series->SetDeleteValue(-999.0);
    const struct { ItemDataType type; const char *title; LONG itemType, unit, valueType; } items[] = {
                 {ItemDataTypeDouble, "Ardmore level", 2, 1, 0},
                 {ItemDataTypeFloat, "Ardmore flow", 3, 2, 1},
                 {ItemDataTypeInt32, "Ardmore rain", 4, 1, 2}};
    for (size_t i = 0; i < 3; ++i)
        testing_host::AddItem(*series.Get(), items[i].type, values[i], items[i].title, items[i].itemType, items[i].unit,
                              items[i].valueType);
    return series;
}

}  // namespace save_testing
