// SPDX-License-Identifier: MIT
// One item of a series: its attributes and its values, one a step.
#pragma once

#include <string>
#include <vector>

#include "com_object.h"
#include "hostseries/hostseries.h"

namespace hostseries::detail {

class Item final : public ComObject<IHostItem> {
public:
    Item() noexcept : ComObject(IID_IHostItem) {}

    HRESULT GetDataType(ItemDataType *type) override;
    HRESULT SetDataType(ItemDataType type) override;
    HRESULT SetItemType(LONG sequence) override;
    HRESULT SetItemUnit(LONG sequence) override;
    HRESULT GetTitle(BSTR *title) override;
    HRESULT SetTitle(BSTR title) override;
    HRESULT GetValueType(LONG *valueType) override;
    HRESULT SetValueType(LONG valueType) override;
    HRESULT GetData(VARIANT *data) override;
    HRESULT SetData(VARIANT data) override;
    HRESULT GetItemType(LONG *ident) override;
    HRESULT GetItemUnit(LONG *ident) override;

private:
    LONG dataType_ = ItemDataTypeFloat;
    std::u16string title_;
    LONG valueType_ = 0;
    // Identifiers of the units catalogue; 0 while unset.
    LONG itemType_ = 0;
    LONG unit_ = 0;
    // Exact for every element type an item can hold.
    std::vector<double> values_;
};

}  // namespace hostseries::detail
