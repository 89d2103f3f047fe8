// SPDX-License-Identifier: MIT
#include "item.h"

#include "automation/com_error.h"
#include "bstr_text.h"
#include "units/catalogue.h"
#include "value_arrays.h"

namespace hostseries::detail {

using automation::ComBoundary;

HRESULT Item::GetDataType(ItemDataType *type)
{
    if (!type) return E_POINTER;
    *type = static_cast<ItemDataType>(dataType_);
    return S_OK;
}

HRESULT Item::SetDataType(ItemDataType type)
{
    // 3 is a data type that a host may hold though a bridge can't handle it.
    const LONG value = type;
    if (value < 1 || value > 7) return E_INVALIDARG;
    dataType_ = value;
    return S_OK;
}

HRESULT Item::SetItemType(LONG sequence)
{
    const std::optional<int> ident = units::ItemTypeIdentFromSeq(sequence);
    const LONG newType = ident.value_or(0);
    // A unit belongs to its item type: a new type drops it.
    if (newType != itemType_) unit_ = 0;
    itemType_ = newType;
    return ident ? S_OK : E_INVALIDARG;
}

HRESULT Item::SetItemUnit(LONG sequence)
{
    const std::optional<int> ident = units::UnitIdentFromSeq(itemType_, sequence);
    unit_ = ident.value_or(0);
    return ident ? S_OK : E_INVALIDARG;
}

HRESULT Item::GetTitle(BSTR *title)
{
    return ComBoundary([&] { return HandOutBstr(title_, title); });
}

HRESULT Item::SetTitle(BSTR title)
{
    return ComBoundary([&] {
        title_ = CopyBstr(title);
        return S_OK;
    });
}

HRESULT Item::GetValueType(LONG *valueType)
{
    if (!valueType) return E_POINTER;
    *valueType = valueType_;
    return S_OK;
}

HRESULT Item::SetValueType(LONG valueType)
{
    valueType_ = valueType;
    return S_OK;
}

HRESULT Item::GetData(VARIANT *data)
{
    if (!data) return E_POINTER;
    VariantInit(data);
    return ComBoundary([&] { return MakeNumberArray(ElementTypeOfDataType(dataType_), values_, *data); });
}

HRESULT Item::SetData(VARIANT data)
{
    TakeOwnership owned(data);
    return ComBoundary([&] {
        // An empty variant clears the values.
        if (data.vt == VT_EMPTY) {
            values_.clear();
            return S_OK;
        }
        std::vector<double> read;
        const HRESULT hr = ReadNumberArray(data, read);
        if (FAILED(hr)) return hr;
        values_ = std::move(read);
        return S_OK;
    });
}

HRESULT Item::GetItemType(LONG *ident)
{
    if (!ident) return E_POINTER;
    *ident = itemType_;
    return S_OK;
}

HRESULT Item::GetItemUnit(LONG *ident)
{
    if (!ident) return E_POINTER;
    *ident = unit_;
    return S_OK;
}

}  // namespace hostseries::detail
