// SPDX-License-Identifier: MIT
#include "dialogs/save_preview.h"

#include <algorithm>
#include <cfloat>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <memory>
#include <new>
#include <optional>
#include <type_traits>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/header_rows.h"
#include "bridge/value_type_names.h"
#include "datetime/date_time_util.h"
#include "dialogs/field_parsing.h"
#include "units/kvt.h"

namespace vantrel::dialogs {
namespace {

std::string PrintedInt(long long value)
{
    char buffer[32];
    std::snprintf(buffer, sizeof buffer, "%d", int(value));
    return buffer;
}

// The whole-number part of d, when a 64-bit integer holds it.
std::optional<int64_t> CutToInt64(double d)
{
    if (!std::isfinite(d)) return std::nullopt;
    const double whole = std::trunc(d);
    if (whole < -9223372036854775808.0 || whole >= 9223372036854775808.0) return std::nullopt;
    return static_cast<int64_t>(whole);
}

std::optional<int32_t> CutToInt32(double d)
{
    const auto whole = CutToInt64(d);
    if (!whole || *whole < INT32_MIN || *whole > INT32_MAX) return std::nullopt;
    return static_cast<int32_t>(*whole);
}

// d in single precision; none when a float can't hold its size.
std::optional<float> NarrowToFloat(double d)
{
    if (std::isfinite(d) && std::fabs(d) > double(FLT_MAX)) return std::nullopt;
    return static_cast<float>(d);
}

// An element held in a wider type, brought to the item's own type; out of
// range values are held at the type's limits.
template <typename T>
T Held(double element)
{
    if constexpr (std::is_floating_point_v<T>) {
        if (!std::isfinite(element)) return static_cast<T>(element);
    }
    if (std::isnan(element)) return T(0);
    if (element <= double(std::numeric_limits<T>::lowest())) return std::numeric_limits<T>::lowest();
    if (element >= double(std::numeric_limits<T>::max())) return std::numeric_limits<T>::max();
    return static_cast<T>(element);
}

std::string TextOfKey(int (*lookup)(int, const char **), LONG ident)
{
    const char *text = nullptr;
    return lookup(int(ident), &text) && text ? std::string(text) : PrintedInt(ident);
}

std::string ValueTypeText(LONG valueType)
{
    if (valueType >= 0 && valueType < LONG(ValueTypeNames.size())) return ValueTypeNames[size_t(valueType)];
    return PrintedInt(valueType);
}

// One item's data, each element as a double (every handled element type
// widens to a double exactly).
class ItemData {
public:
    explicit ItemData(IHostItem &item)
    {
        item.GetData(m_data.Out());
        const VARIANT &raw = m_data.Raw();
        if (!(raw.vt & VT_ARRAY) || !raw.parray || SafeArrayGetDim(raw.parray) != 1) return;
        LONG lower = 0, upper = -1;
        if (FAILED(SafeArrayGetLBound(raw.parray, 1, &lower)) || FAILED(SafeArrayGetUBound(raw.parray, 1, &upper)) ||
            FAILED(SafeArrayGetVartype(raw.parray, &m_type)) || FAILED(SafeArrayAccessData(raw.parray, &m_elements)))
            return;
        m_count = upper >= lower ? long(upper) - long(lower) + 1 : 0;
        m_array = raw.parray;
    }
    ~ItemData()
    {
        if (m_array) SafeArrayUnaccessData(m_array);
    }
    ItemData(const ItemData &) = delete;
    ItemData &operator=(const ItemData &) = delete;

    // False for a step beyond the array or an element type that is no number.
    bool Read(long step, double &value) const
    {
        if (!m_array || step < 0 || step >= m_count) return false;
        switch (m_type) {
        case VT_R4: value = static_cast<const float *>(m_elements)[step]; return true;
        case VT_R8: value = static_cast<const double *>(m_elements)[step]; return true;
        case VT_I4: value = static_cast<const int32_t *>(m_elements)[step]; return true;
        case VT_UI4: value = static_cast<const uint32_t *>(m_elements)[step]; return true;
        case VT_I2: value = static_cast<const int16_t *>(m_elements)[step]; return true;
        case VT_UI2: value = static_cast<const uint16_t *>(m_elements)[step]; return true;
        default: return false;
        }
    }

private:
    automation::Variant m_data;
    SAFEARRAY *m_array = nullptr;
    void *m_elements = nullptr;
    VARTYPE m_type = VT_EMPTY;
    long m_count = 0;
};

struct PreviewItem {
    ItemDataType type = ItemDataType(0);
    std::unique_ptr<ItemData> data;
};

// The k cells of one time step as texts, the way a cell turns into text.
std::vector<std::string> TimeTexts(IHostTimeAxis &axis, long step, const std::string &format, int k)
{
    std::vector<std::string> texts;
    automation::SafeArray cells(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(k)));
    if (!cells.Get()) throw std::bad_alloc();
    automation::Variant time;
    axis.GetTime(LONG(step + 1), time.Out());
    CDateTimeUtil::FormatTimeCells(time.Raw(), format, cells.Get());
    for (LONG i = 0; i < LONG(k); ++i) {
        automation::Variant cell, text;
        SafeArrayGetElement(cells.Get(), &i, cell.Out());
        texts.push_back(SUCCEEDED(VariantChangeType(text.Out(), &cell.Raw(), 0, VT_BSTR)) && text.Type() == VT_BSTR
                            ? automation::BstrToUtf8(text.Raw().bstrVal)
                            : std::string());
    }
    return texts;
}

}  // namespace

void SetPreviewRow(PreviewList &list, int row, int firstColumn, int count, const std::vector<std::string> &texts)
{
    if (row < 1) return;
    for (int i = 0; i < count && size_t(i) < texts.size(); ++i)
        if (firstColumn + i >= 0) list.SetText(size_t(row - 1), size_t(firstColumn + i), texts[size_t(i)]);
}

bool PreviewValueText(ItemDataType type, double element, double deleteValue, bool deleteRowWritten,
                      std::string &text)
{
    text.clear();
    const bool hideDeleteValue = !deleteRowWritten;
    switch (type) {
    case ItemDataTypeFloat: {
        const float value = Held<float>(element);
        const auto narrowed = NarrowToFloat(deleteValue);
        if (!(hideDeleteValue && narrowed && value == *narrowed)) text = ShortNumberText(double(value));
        return true;
    }
    case ItemDataTypeDouble:
        if (!(hideDeleteValue && element == deleteValue)) text = ShortNumberText(element);
        return true;
    case ItemDataTypeInt32: {
        const int32_t value = Held<int32_t>(element);
        const auto cut = CutToInt32(deleteValue);
        if (!(hideDeleteValue && cut && *cut == value)) text = PrintedInt(value);
        return true;
    }
    case ItemDataTypeUInt32: {
        const uint32_t value = Held<uint32_t>(element);
        const auto cut = CutToInt64(deleteValue);
        // The same 32 bits, printed as a signed number.
        if (!(hideDeleteValue && cut && uint32_t(uint64_t(*cut)) == value)) text = PrintedInt(int32_t(value));
        return true;
    }
    case ItemDataTypeInt16:
    case ItemDataTypeUInt16: {
        const auto cut = CutToInt64(deleteValue);
        const uint16_t bits = type == ItemDataTypeInt16 ? uint16_t(Held<int16_t>(element)) : Held<uint16_t>(element);
        if (hideDeleteValue && cut && uint16_t(uint64_t(*cut)) == bits) return true;
        text = type == ItemDataTypeInt16 ? PrintedInt(int16_t(bits)) : PrintedInt(bits);
        return true;
    }
    default:
        return false;
    }
}

void BuildSavePreview(const SaveDialogFields &fields, IHostSeries &series, PreviewList &list)
{
    using automation::ThrowIfFailed;
    const int c = fields.m_dateTimeColumn;
    const int s = fields.m_dataStartRow;
    LONG itemCount = 0;
    ThrowIfFailed(series.GetItemCount(&itemCount), "item count");
    const int n = itemCount > 0 ? int(itemCount) : 0;
    automation::ComPtr<IHostTimeAxis> axis;
    ThrowIfFailed(series.GetTimeAxis(axis.Out()), "time axis");
    LONG stepCount = 0;
    axis->GetStepCount(&stepCount);
    const long shown = std::min<long>(stepCount > 0 ? stepCount : 0, kSavePreviewSteps);

    const std::string format = PreviewFormat(fields);
    const int k = CDateTimeUtil::GetFormatColumnCount(format);

    list.Clear();
    const long long columnCount = (long long)(c) - 1 + k + n;
    // A layout with no column has no place for anything.
    if (columnCount <= 0) return;
    for (long long i = 0; i < columnCount; ++i) list.InsertColumn(size_t(i), std::string(), 1.0 / double(columnCount));
    for (long long line = 0; line < shown - 1 + (long long)(s); ++line) list.InsertLine(size_t(line));

    DOUBLE deleteValue = 0;
    series.GetDeleteValue(&deleteValue);
    const bool deleteRowWritten = fields.m_useDeleteRow == 1;
    if (deleteRowWritten && fields.m_saveDeleteValueRow >= 1)
        SetPreviewRow(list, fields.m_saveDeleteValueRow, 0, 1, {ShortNumberText(deleteValue)});

    std::vector<std::string> titles;
    CDateTimeUtil::GetColumnTitles(format, titles);
    titles.resize(size_t(k));
    std::vector<PreviewItem> items;
    std::vector<std::string> itemTypes, units, valueTypes;
    for (int i = 0; i < n; ++i) {
        automation::ComPtr<IHostItem> item;
        ThrowIfFailed(series.GetItem(automation::Variant::I4(i + 1).Raw(), item.Out()), "item");
        PreviewItem preview;
        item->GetDataType(&preview.type);
        automation::Bstr title;
        item->GetTitle(title.Out());
        titles.push_back(title.Utf8());
        preview.data = std::make_unique<ItemData>(*item.Get());
        items.push_back(std::move(preview));
        LONG ident = 0;
        item->GetItemType(&ident);
        itemTypes.push_back(TextOfKey(kvtGetItemTypeKey, ident));
        item->GetItemUnit(&ident);
        units.push_back(TextOfKey(kvtGetUnitKey, ident));
        LONG valueType = 0;
        item->GetValueType(&valueType);
        valueTypes.push_back(ValueTypeText(valueType));
    }

    const int typeRow = fields.m_unitTypeRow, unitRow = fields.m_saveUnitRow, valueRow = fields.m_saveValueTypeRow;
    std::vector<std::vector<std::string>> headers;
    const int headerCount = ComposeHeaderRows(itemTypes, units, valueTypes, headers, typeRow, unitRow, valueRow);
    std::vector<int> headerRows;
    if (headerCount == 1) headerRows = {typeRow};
    if (headerCount == 2) headerRows = {typeRow, typeRow == unitRow ? valueRow : unitRow};
    if (headerCount == 3) headerRows = {typeRow, unitRow, valueRow};
    const int dateTimeColumn = c - 1;  // the list column of sheet column c
    for (size_t h = 0; h < headerRows.size(); ++h)
        SetPreviewRow(list, headerRows[h], dateTimeColumn + k, n, headers[h]);

    // After the delete value, so that a shared cell shows the title.
    SetPreviewRow(list, fields.m_saveItemDescriptionRow, dateTimeColumn, k + n, titles);

    for (long t = 0; t < shown; ++t) {
        std::vector<std::string> texts = TimeTexts(*axis.Get(), t, format, k);
        for (const PreviewItem &item : items) {
            double element = 0;
            std::string text;
            // A step the item's data doesn't reach shows as an empty cell.
            if (!item.data->Read(t, element)) {
                if (PreviewValueText(item.type, 0.0, deleteValue, true, text)) texts.emplace_back();
                continue;
            }
            if (PreviewValueText(item.type, element, deleteValue, deleteRowWritten, text)) texts.push_back(text);
        }
        SetPreviewRow(list, s + int(t), dateTimeColumn, k + n, texts);
    }
}

}  // namespace vantrel::dialogs
