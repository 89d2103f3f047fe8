// SPDX-License-Identifier: MIT
#include "series.h"

#include <algorithm>
#include <mutex>
#include <unordered_set>

#include "automation/com_error.h"

namespace hostseries::detail {

using automation::ComBoundary;
using automation::ComPtr;

namespace {

std::mutex g_liveLock;
std::unordered_set<const Series *> &LiveSeries()
{
    static std::unordered_set<const Series *> live;
    return live;
}

// Hands out one more reference to an object that the series holds.
template <typename Interface, typename Object>
HRESULT HandOut(const ComPtr<Object> &held, Interface **out)
{
    if (!out) return E_POINTER;
    held->AddRef();
    *out = held.Get();
    return S_OK;
}

}  // namespace

Series::Series()
    : ComObject(IID_IHostSeries),
      connection_(ComPtr<Connection>::Attach(new Connection)),
      axis_(ComPtr<TimeAxis>::Attach(new TimeAxis))
{
    std::lock_guard lock(g_liveLock);
    LiveSeries().insert(this);
}

Series::~Series()
{
    std::lock_guard lock(g_liveLock);
    LiveSeries().erase(this);
}

Series *Series::FromInterface(IHostSeries *series) noexcept
{
    std::lock_guard lock(g_liveLock);
    // Compared as an address only: a foreign object is never touched.
    for (const Series *live : LiveSeries())
        if (static_cast<const IHostSeries *>(live) == series) return const_cast<Series *>(live);
    return nullptr;
}

bool Series::IsItemNumber(LONG number) const noexcept
{
    return number >= 1 && static_cast<std::size_t>(number) <= items_.size();
}

HRESULT Series::GetConnection(IHostConnection **connection)
{
    return HandOut(connection_, connection);
}

HRESULT Series::GetItemCount(LONG *count)
{
    if (!count) return E_POINTER;
    *count = static_cast<LONG>(items_.size());
    return S_OK;
}

HRESULT Series::GetDeleteValue(DOUBLE *value)
{
    if (!value) return E_POINTER;
    *value = deleteValue_;
    return S_OK;
}

HRESULT Series::SetDeleteValue(DOUBLE value)
{
    deleteValue_ = value;
    return S_OK;
}

HRESULT Series::GetTimeAxis(IHostTimeAxis **axis)
{
    return HandOut(axis_, axis);
}

HRESULT Series::GetItem(VARIANT index, IHostItem **item)
{
    if (!item) return E_POINTER;
    *item = nullptr;
    // The index stays the caller's; a copy is converted.
    VARIANT number;
    VariantInit(&number);
    const HRESULT converted = VariantChangeType(&number, &index, 0, VT_I4);
    if (FAILED(converted)) {
        VariantClear(&number);
        return converted;
    }
    const LONG value = number.lVal;
    VariantClear(&number);
    if (!IsItemNumber(value)) return DISP_E_BADINDEX;
    return HandOut(items_[static_cast<std::size_t>(value) - 1], item);
}

HRESULT Series::AddItem(LONG *index, IHostItem **item)
{
    // The number is optional to the caller; the item is not.
    if (!item) return E_POINTER;
    *item = nullptr;
    return ComBoundary([&] {
        items_.push_back(ComPtr<Item>::Attach(new Item));
        if (index) *index = static_cast<LONG>(items_.size());
        return HandOut(items_.back(), item);
    });
}

HRESULT Series::RemoveItem(LONG index)
{
    if (!IsItemNumber(index)) return DISP_E_BADINDEX;
    items_.erase(items_.begin() + (index - 1));
    return S_OK;
}

HRESULT Series::RemoveAllItems()
{
    items_.clear();
    return S_OK;
}

}  // namespace hostseries::detail
