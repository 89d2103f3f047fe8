// SPDX-License-Identifier: MIT
#include "hostseries/memory_series.h"

#include "automation/com_error.h"
#include "automation/values.h"
#include "value_arrays.h"

namespace hostseries {

using automation::ComPtr;
using automation::ThrowIfFailed;

ComPtr<IHostSeries> MakeSeries()
{
    IHostSeries *series = nullptr;
    ThrowIfFailed(HostSeriesCreate(&series), "HostSeriesCreate");
    return ComPtr<IHostSeries>::Attach(series);
}

ComPtr<IHostItem> AddItemWithValues(IHostSeries &series, ItemDataType type,
                                    std::span<const double> values, std::string_view title)
{
    LONG index = 0;
    ComPtr<IHostItem> item;
    ThrowIfFailed(series.AddItem(&index, item.Out()), "AddItem");
    ThrowIfFailed(item->SetDataType(type), "SetDataType");
    if (!title.empty()) {
        automation::Bstr text(title);
        ThrowIfFailed(item->SetTitle(text.Get()), "SetTitle");
    }
    VARIANT data;
    ThrowIfFailed(detail::MakeNumberArray(VT_R8, values, data), "MakeNumberArray");
    // The array passes to the item, which converts it to its data type.
    ThrowIfFailed(item->SetData(data), "SetData");
    return item;
}

ComPtr<IHostItem> ItemAt(IHostSeries &series, LONG number)
{
    VARIANT index;
    VariantInit(&index);
    index.vt = VT_I4;
    index.lVal = number;
    ComPtr<IHostItem> item;
    ThrowIfFailed(series.GetItem(index, item.Out()), "GetItem");
    return item;
}

std::vector<double> ReadValues(IHostItem &item)
{
    automation::Variant data;
    ThrowIfFailed(item.GetData(data.Out()), "GetData");
    std::vector<double> values;
    ThrowIfFailed(detail::ReadNumberArray(data.Raw(), values), "GetData gave no number array");
    return values;
}

void SetAxisTimes(IHostSeries &series, std::span<const DATE> times)
{
    ComPtr<IHostTimeAxis> axis;
    ThrowIfFailed(series.GetTimeAxis(axis.Out()), "GetTimeAxis");
    ThrowIfFailed(axis->SetAxisKind(HOST_AXIS_KIND_EXPLICIT_TIMES), "SetAxisKind");
    ThrowIfFailed(axis->SetStepCount(static_cast<LONG>(times.size())), "SetStepCount");
    VARIANT array;
    ThrowIfFailed(detail::MakeNumberArray(VT_DATE, std::vector<double>(times.begin(), times.end()),
                                          array),
                  "MakeNumberArray");
    ThrowIfFailed(axis->SetTimes(array), "SetTimes");
}

std::vector<DATE> ReadTimes(IHostSeries &series)
{
    ComPtr<IHostTimeAxis> axis;
    ThrowIfFailed(series.GetTimeAxis(axis.Out()), "GetTimeAxis");
    LONG count = 0;
    ThrowIfFailed(axis->GetStepCount(&count), "GetStepCount");
    std::vector<DATE> times;
    times.reserve(size_t(count > 0 ? count : 0));
    for (LONG step = 1; step <= count; ++step) {
        automation::Variant time;
        ThrowIfFailed(axis->GetTime(step, time.Out()), "GetTime");
        if (time.Type() == VT_DATE) {
            times.push_back(time.Raw().date);
            continue;
        }
        automation::Variant date;
        ThrowIfFailed(VariantChangeType(date.Out(), &time.Raw(), 0, VT_DATE), "GetTime gave no date");
        times.push_back(date.Raw().date);
    }
    return times;
}

}  // namespace hostseries
