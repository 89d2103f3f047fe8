// SPDX-License-Identifier: MIT
// The export run: lays the host object out on the current sheet. A title
// row, header rows of item type, unit and value type, then one row a time
// step with the date/time cells on the left and one column an item.
#include <cstdio>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "bridge/header_rows.h"
#include "bridge/value_type_names.h"
#include "datetime/date_time_util.h"
#include "specification/specification.h"
#include "units/kvt.h"

namespace {

std::string NumberText(long number)
{
    char buffer[24];
    std::snprintf(buffer, sizeof buffer, "%d", int(number));
    return buffer;
}

bool IsHandledDataType(ItemDataType type)
{
    switch (type) {
    case ItemDataTypeFloat:
    case ItemDataTypeDouble:
    case ItemDataTypeInt32:
    case ItemDataTypeUInt32:
    case ItemDataTypeInt16:
    case ItemDataTypeUInt16:
        return true;
    default:
        return false;
    }
}

// One item's data array, held open for the run. Elements are read by the
// array's own element type, so that a host whose array disagrees with the
// item's declared type can't make the run read past the array.
class ItemColumn {
public:
    ItemColumn(IHostItem &item, ItemDataType declared) : m_handled(IsHandledDataType(declared))
    {
        item.GetData(m_data.Out());
        const VARIANT &raw = m_data.Raw();
        if (!(raw.vt & VT_ARRAY) || !raw.parray || SafeArrayGetDim(raw.parray) != 1) return;
        LONG lower = 0, upper = -1;
        if (FAILED(SafeArrayGetLBound(raw.parray, 1, &lower)) ||
            FAILED(SafeArrayGetUBound(raw.parray, 1, &upper)) ||
            FAILED(SafeArrayGetVartype(raw.parray, &m_type)) ||
            FAILED(SafeArrayAccessData(raw.parray, &m_elements)))
            return;
        m_count = upper >= lower ? long(upper) - long(lower) + 1 : 0;
        m_array = raw.parray;
    }
    ~ItemColumn()
    {
        if (m_array) SafeArrayUnaccessData(m_array);
    }
    ItemColumn(const ItemColumn &) = delete;
    ItemColumn &operator=(const ItemColumn &) = delete;

    // Element step as a double. False for a data type that the export doesn't
    // convert. A step beyond the array's end reads as the delete value.
    bool Read(long step, double missing, double &value) const
    {
        if (!m_handled) return false;
        if (step >= m_count) {
            value = missing;
            return true;
        }
        switch (m_type) {
        case VT_R4:
            value = static_cast<const float *>(m_elements)[step];
            return true;
        case VT_R8:
            value = static_cast<const double *>(m_elements)[step];
            return true;
        case VT_I4:
            value = static_cast<const int32_t *>(m_elements)[step];
            return true;
        case VT_UI4:
            value = static_cast<const uint32_t *>(m_elements)[step];
            return true;
        case VT_I2:
            value = static_cast<const int16_t *>(m_elements)[step];
            return true;
        case VT_UI2:
            value = static_cast<const uint16_t *>(m_elements)[step];
            return true;
        default:
            return false;
        }
    }

private:
    automation::Variant m_data;
    SAFEARRAY *m_array = nullptr;
    void *m_elements = nullptr;
    VARTYPE m_type = VT_EMPTY;
    long m_count = 0;
    bool m_handled;
};

automation::ComPtr<IHostItem> ItemByNumber(IHostSeries &series, int number)
{
    automation::ComPtr<IHostItem> item;
    automation::ThrowIfFailed(series.GetItem(automation::Variant::I4(number).Raw(), item.Out()), "item");
    return item;
}

std::string ItemTypeText(IHostItem &item)
{
    LONG ident = 0;
    item.GetItemType(&ident);
    const char *text = nullptr;
    return kvtGetItemTypeKey(int(ident), &text) ? std::string(text) : NumberText(ident);
}

std::string UnitText(IHostItem &item)
{
    LONG ident = 0;
    item.GetItemUnit(&ident);
    const char *text = nullptr;
    return kvtGetUnitKey(int(ident), &text) ? std::string(text) : NumberText(ident);
}

std::string ValueTypeText(IHostItem &item)
{
    LONG valueType = 0;
    item.GetValueType(&valueType);
    if (valueType >= 0 && valueType < LONG(vantrel::ValueTypeNames.size()))
        return vantrel::ValueTypeNames[size_t(valueType)];
    return NumberText(valueType);
}

// A row or column that a key names, when it is a place on a sheet.
bool IsPlace(int number) { return number >= 1; }

}  // namespace

bool CExcelVantrel::WriteSeries(const std::string &spec)
{
    m_excel->ClearSheet();
    CSpecification specification;
    int startRow = 0;
    if (!specification.GetKeyValueInt(spec, StartRow, startRow)) return false;

    LONG itemCount = 0;
    m_series->GetItemCount(&itemCount);
    const int n = int(itemCount);
    int c = 0, columnCountOfLayout = 0, mode = 0;
    std::string format;
    specification.GetDateTimeLayout(spec, c, columnCountOfLayout, mode, format);
    const int k = CDateTimeUtil::GetFormatColumnCount(format);
    // Without a place for the first row or the date/time there is nothing to
    // lay out; the cleared sheet is what gets saved.
    if (!IsPlace(startRow) || !IsPlace(c) || k < 1) return false;

    automation::ComPtr<IHostTimeAxis> axis;
    automation::ThrowIfFailed(m_series->GetTimeAxis(axis.Out()), "time axis");
    LONG stepCount = 0;
    axis->GetStepCount(&stepCount);
    const long steps = stepCount > 0 ? long(stepCount) : 0;

    int delValRow = 0;
    const bool writeDeleteValues = specification.GetKeyValueInt(spec, DelValRow, delValRow);
    if (writeDeleteValues && IsPlace(delValRow)) WriteDeleteValueCell(delValRow, c);

    std::vector<ItemDataType> dataTypes;
    CollectDataTypes(n, dataTypes);

    // After the delete value, so that a shared row keeps the title in column c.
    std::vector<std::string> titles;
    CollectTitles(format, n, titles);
    int titleRow = -1;
    specification.GetKeyValueInt(spec, ItemDescriptionRow, titleRow);
    if (IsPlace(titleRow)) m_excel->WriteRowTexts(titleRow, c, titles);

    std::vector<std::unique_ptr<ItemColumn>> columns;
    std::vector<std::string> itemTypes, units, valueTypes;
    for (int i = 0; i < n; ++i) {
        auto item = ItemByNumber(*m_series, i + 1);
        columns.push_back(std::make_unique<ItemColumn>(*item.Get(), dataTypes[size_t(i)]));
        itemTypes.push_back(ItemTypeText(*item.Get()));
        units.push_back(UnitText(*item.Get()));
        valueTypes.push_back(ValueTypeText(*item.Get()));
    }

    int typeRow = -1, unitRow = -1, valueTypeRow = -1;
    specification.GetKeyValueInt(spec, UnitTypeRow, typeRow);
    specification.GetKeyValueInt(spec, UnitRow, unitRow);
    specification.GetKeyValueInt(spec, ValueTypeRow, valueTypeRow);
    std::vector<std::vector<std::string>> headers;
    const int headerCount = ComposeHeaderRows(itemTypes, units, valueTypes, headers, typeRow, unitRow,
                                              valueTypeRow);
    std::vector<int> headerRows;
    if (headerCount == 1) headerRows = {typeRow};
    if (headerCount == 2) headerRows = {typeRow, typeRow == unitRow ? valueTypeRow : unitRow};
    if (headerCount == 3) headerRows = {typeRow, unitRow, valueTypeRow};
    for (size_t h = 0; h < headerRows.size(); ++h)
        if (IsPlace(headerRows[h])) m_excel->WriteRowTexts(headerRows[h], c + k, headers[h]);

    DOUBLE deleteValue = 0;
    m_series->GetDeleteValue(&deleteValue);

    std::vector<double> values;
    values.reserve(size_t(n));
    for (long t = 0; t < steps; ++t) {
        automation::SafeArray cells(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(k)));
        if (!cells.Get()) throw std::bad_alloc();
        automation::Variant time;
        axis->GetTime(LONG(t + 1), time.Out());
        CDateTimeUtil::FormatTimeCells(time.Raw(), format, cells.Get());

        values.clear();
        bool stopped = false;
        for (const auto &column : columns) {
            double value = 0;
            if (!column->Read(t, deleteValue, value)) {
                stopped = true;
                break;
            }
            values.push_back(value);
        }
        m_excel->WriteDataRow(startRow + int(t), c, cells.Get(), values, writeDeleteValues ? 1 : 0,
                              deleteValue);
        // An unhandled data type ends the export here; the row stands with
        // the values it has.
        if (stopped) break;
    }

    if (steps > 0) {
        m_excel->SetDateTimeColumnFormat(startRow, int(steps), c, format);
        if (!values.empty()) m_excel->ClearColumnFormats(startRow, int(steps), c + k, int(values.size()));
    }
    m_excel->AutoFitColumns();
    return true;
}

bool CExcelVantrel::WriteDeleteValueCell(int row, int col)
{
    DOUBLE deleteValue = 0;
    m_series->GetDeleteValue(&deleteValue);
    m_excel->WriteCell(row, col, automation::Variant::R8(deleteValue).Raw());
    return true;
}

bool CExcelVantrel::CollectDataTypes(int itemCount, std::vector<ItemDataType> &types)
{
    for (int i = 0; i < itemCount; ++i) {
        auto item = ItemByNumber(*m_series, i + 1);
        ItemDataType type = ItemDataType(0);
        item->GetDataType(&type);
        types.push_back(type);
    }
    return true;
}

bool CExcelVantrel::CollectTitles(const std::string &format, int itemCount, std::vector<std::string> &titles)
{
    const int k = CDateTimeUtil::GetFormatColumnCount(format);
    for (int i = 0; i < k; ++i) {
        std::string columnFormat, title;
        CDateTimeUtil::GetColumnFormat(i, format, columnFormat);
        CDateTimeUtil::GetColumnTitle(columnFormat, title);
        titles.push_back(title);
    }
    for (int i = 0; i < itemCount; ++i) {
        auto item = ItemByNumber(*m_series, i + 1);
        automation::Bstr title;
        item->GetTitle(title.Out());
        titles.push_back(title.Utf8());
    }
    return true;
}
