// SPDX-License-Identifier: MIT
// The host object: a connection, a time axis and a list of items. The series
// holds one reference to each part; a caller's reference keeps a part alive
// after the series let it go.
#pragma once

#include <vector>

#include "automation/com_ptr.h"
#include "com_object.h"
#include "connection.h"
#include "hostseries/hostseries.h"
#include "item.h"
#include "time_axis.h"

namespace hostseries::detail {

class Series final : public ComObject<IHostSeries> {
public:
    Series();
    ~Series() override;

    HRESULT GetConnection(IHostConnection **connection) override;
    HRESULT GetItemCount(LONG *count) override;
    HRESULT GetDeleteValue(DOUBLE *value) override;
    HRESULT SetDeleteValue(DOUBLE value) override;
    HRESULT GetTimeAxis(IHostTimeAxis **axis) override;
    HRESULT GetItem(VARIANT index, IHostItem **item) override;
    HRESULT AddItem(LONG *index, IHostItem **item) override;
    HRESULT RemoveItem(LONG index) override;
    HRESULT RemoveAllItems() override;

    Connection &HostConnection() noexcept { return *connection_.Get(); }

    // The series made by this library and still alive: only those take a
    // host's settings, whatever else a caller passes in.
    static Series *FromInterface(IHostSeries *series) noexcept;

private:
    // Whether number names an item: 1-based, at most the item count.
    bool IsItemNumber(LONG number) const noexcept;

    automation::ComPtr<Connection> connection_;
    automation::ComPtr<TimeAxis> axis_;
    std::vector<automation::ComPtr<Item>> items_;
    DOUBLE deleteValue_ = -9999.0;
};

}  // namespace hostseries::detail
