// SPDX-License-Identifier: MIT
// A host object for tests: an in-memory series with path, specification and,
// optionally, the silent flag set as a host would.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "automation/values.h"
#include "hostseries/hostseries.h"
#include "hostseries/memory_series.h"

namespace testing_host {

inline automation::ComPtr<IHostSeries> MakeSeries(const std::string &path, const std::string &spec,
                                                  std::optional<bool> silent = std::nullopt)
{
    automation::ComPtr<IHostSeries> series;
    HostSeriesCreate(series.Out());
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    connection->SetFilePath(automation::Bstr(path).Get());
    connection->SetSpecification(automation::Bstr(spec).Get());
    if (silent) HostSeriesSetSilent(series.Get(), *silent ? VARIANT_TRUE : VARIANT_FALSE);
    return series;
}

inline std::string Specification(IHostSeries *series)
{
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    automation::Bstr spec;
    connection->GetSpecification(spec.Out());
    return spec.Utf8();
}

inline LONG ItemCount(IHostSeries *series)
{
    LONG count = -1;
    series->GetItemCount(&count);
    return count;
}

// An item with its values, its item type and unit by catalogue sequence
// numbers (0: none) and its value type.
inline automation::ComPtr<IHostItem> AddItem(IHostSeries &series, ItemDataType type, const std::vector<double> &values,
                                             const std::string &title, LONG typeSeq = 0, LONG unitSeq = 0, LONG valueType = 0)
{
    auto item = hostseries::AddItemWithValues(series, type, values, title);
    if (typeSeq) item->SetItemType(typeSeq);
    if (unitSeq) item->SetItemUnit(unitSeq);
    item->SetValueType(valueType);
    return item;
}

// The thread's error info: its description, or "<none>" when there is none.
inline std::string TakeErrorDescription(GUID *guid = nullptr, std::string *source = nullptr)
{
    automation::ComPtr<IErrorInfo> info;
    if (GetErrorInfo(0, info.Out()) != S_OK || !info) return "<none>";
    automation::Bstr description;
    info->GetDescription(description.Out());
    if (guid) info->GetGUID(guid);
    if (source) {
        automation::Bstr s;
        info->GetSource(s.Out());
        *source = s.Utf8();
    }
    return description.Utf8();
}

}  // namespace testing_host
