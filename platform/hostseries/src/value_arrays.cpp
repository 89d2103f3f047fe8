// SPDX-License-Identifier: MIT
#include "value_arrays.h"

#include <cmath>
#include <cstdint>
#include <limits>

#include "hostseries/hostseries.h"

namespace hostseries::detail {
namespace {

template <typename T>
void AppendElements(const void *data, std::size_t count, std::vector<double> &values)
{
    const T *elements = static_cast<const T *>(data);
    for (std::size_t i = 0; i < count; ++i) values.push_back(static_cast<double>(elements[i]));
}

template <typename T>
T ToInteger(double v) noexcept
{
    if (std::isnan(v)) return 0;
    const double rounded = std::nearbyint(v);
    if (rounded <= static_cast<double>(std::numeric_limits<T>::min()))
        return std::numeric_limits<T>::min();
    if (rounded >= static_cast<double>(std::numeric_limits<T>::max()))
        return std::numeric_limits<T>::max();
    return static_cast<T>(rounded);
}

float ToFloat(double v) noexcept
{
    // Beyond the float range a value becomes the infinity of its sign.
    constexpr double kMax = std::numeric_limits<float>::max();
    if (v > kMax) return std::numeric_limits<float>::infinity();
    if (v < -kMax) return -std::numeric_limits<float>::infinity();
    return static_cast<float>(v);
}

template <typename T, typename Convert>
void StoreElements(void *data, std::span<const double> values, Convert convert)
{
    T *elements = static_cast<T *>(data);
    for (std::size_t i = 0; i < values.size(); ++i) elements[i] = convert(values[i]);
}

// Size of one element, or 0 for a type that isn't a number.
std::size_t NumberElementSize(VARTYPE vt) noexcept
{
    switch (vt) {
    case VT_I1:
    case VT_UI1: return 1;
    case VT_I2:
    case VT_UI2: return 2;
    case VT_R4:
    case VT_I4:
    case VT_UI4:
    case VT_INT:
    case VT_UINT: return 4;
    case VT_R8:
    case VT_DATE: return 8;
    default: return 0;
    }
}

// Holds SafeArrayAccessData for a scope.
class ArrayAccess {
public:
    explicit ArrayAccess(SAFEARRAY *psa) noexcept : psa_(psa), hr_(SafeArrayAccessData(psa, &data_)) {}
    ~ArrayAccess()
    {
        if (SUCCEEDED(hr_)) SafeArrayUnaccessData(psa_);
    }
    ArrayAccess(const ArrayAccess &) = delete;
    ArrayAccess &operator=(const ArrayAccess &) = delete;
    HRESULT Result() const noexcept { return hr_; }
    void *Data() const noexcept { return data_; }

private:
    SAFEARRAY *psa_;
    void *data_ = nullptr;
    HRESULT hr_;
};

}  // namespace

VARTYPE ElementTypeOfDataType(LONG dataType) noexcept
{
    switch (dataType) {
    case ItemDataTypeFloat: return VT_R4;
    case ItemDataTypeDouble: return VT_R8;
    case ItemDataTypeInt32: return VT_I4;
    case ItemDataTypeUInt32: return VT_UI4;
    case ItemDataTypeInt16: return VT_I2;
    case ItemDataTypeUInt16: return VT_UI2;
    default: return VT_I1;
    }
}

HRESULT ReadNumberArray(const VARIANT &v, std::vector<double> &values)
{
    if ((v.vt & ~VT_TYPEMASK) != VT_ARRAY || !v.parray) return DISP_E_TYPEMISMATCH;
    const VARTYPE elementType = v.vt & VT_TYPEMASK;
    const std::size_t size = NumberElementSize(elementType);
    SAFEARRAY *psa = v.parray;
    // The element size guards against a variant whose type misnames its array.
    if (size == 0 || SafeArrayGetElemsize(psa) != size) return DISP_E_TYPEMISMATCH;
    if (SafeArrayGetDim(psa) != 1) return E_INVALIDARG;
    LONG lower = 0;
    LONG upper = -1;
    HRESULT hr = SafeArrayGetLBound(psa, 1, &lower);
    if (SUCCEEDED(hr)) hr = SafeArrayGetUBound(psa, 1, &upper);
    if (FAILED(hr)) return hr;
    const std::size_t count =
        upper >= lower ? static_cast<std::size_t>(static_cast<int64_t>(upper) - lower + 1) : 0;

    ArrayAccess access(psa);
    if (FAILED(access.Result())) return access.Result();
    std::vector<double> read;
    read.reserve(count);
    const void *data = access.Data();
    switch (elementType) {
    case VT_I1: AppendElements<int8_t>(data, count, read); break;
    case VT_UI1: AppendElements<uint8_t>(data, count, read); break;
    case VT_I2: AppendElements<int16_t>(data, count, read); break;
    case VT_UI2: AppendElements<uint16_t>(data, count, read); break;
    case VT_I4:
    case VT_INT: AppendElements<int32_t>(data, count, read); break;
    case VT_UI4:
    case VT_UINT: AppendElements<uint32_t>(data, count, read); break;
    case VT_R4: AppendElements<float>(data, count, read); break;
    default: AppendElements<double>(data, count, read); break;  // R8, DATE
    }
    values = std::move(read);
    return S_OK;
}

HRESULT MakeNumberArray(VARTYPE elementType, std::span<const double> values, VARIANT &out)
{
    if (NumberElementSize(elementType) == 0) return DISP_E_BADVARTYPE;
    if (values.size() > static_cast<std::size_t>(std::numeric_limits<LONG>::max()))
        return E_OUTOFMEMORY;
    SAFEARRAY *psa = SafeArrayCreateVector(elementType, 0, static_cast<ULONG>(values.size()));
    if (!psa) return E_OUTOFMEMORY;
    {
        ArrayAccess access(psa);
        if (FAILED(access.Result())) {
            const HRESULT hr = access.Result();
            SafeArrayDestroy(psa);
            return hr;
        }
        void *data = access.Data();
        switch (elementType) {
        case VT_I1: StoreElements<int8_t>(data, values, ToInteger<int8_t>); break;
        case VT_UI1: StoreElements<uint8_t>(data, values, ToInteger<uint8_t>); break;
        case VT_I2: StoreElements<int16_t>(data, values, ToInteger<int16_t>); break;
        case VT_UI2: StoreElements<uint16_t>(data, values, ToInteger<uint16_t>); break;
        case VT_I4:
        case VT_INT: StoreElements<int32_t>(data, values, ToInteger<int32_t>); break;
        case VT_UI4:
        case VT_UINT: StoreElements<uint32_t>(data, values, ToInteger<uint32_t>); break;
        case VT_R4: StoreElements<float>(data, values, ToFloat); break;
        default: StoreElements<double>(data, values, [](double v) { return v; }); break;
        }
    }
    VariantInit(&out);
    out.vt = VT_ARRAY | elementType;
    out.parray = psa;
    return S_OK;
}

}  // namespace hostseries::detail
