// SPDX-License-Identifier: MIT
// The export run: lays the host object out on the current sheet. A title
// row, header rows of item type, unit and value type, then one row a time
// step with the date/time cells on the left and one column an item.
#include <cmath>
#include <cstdio>
#include <memory>
#include <new>
#include <span>
#include <stdexcept>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "bridge/export_layout.h"
#include "bridge/export_times.h"
#include "bridge/header_rows.h"
#include "bridge/host_calls.h"
#include "bridge/value_type_names.h"
#include "datetime/date_time_util.h"
#include "specification/specification.h"
#include "units/kvt.h"

using vantrel::bridge::ExportLayout;
using vantrel::bridge::HostCall;

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
        HostCall(item.GetData(m_data.Out()), "GetData");
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
    vantrel::bridge::HostObject(series.GetItem(automation::Variant::I4(number).Raw(), item.Out()), item, "GetItem");
    return item;
}

std::string ItemTypeText(IHostItem &item)
{
    LONG ident = 0;
    HostCall(item.GetItemType(&ident), "GetItemType");
    const char *text = nullptr;
    return kvtGetItemTypeKey(int(ident), &text) ? std::string(text) : NumberText(ident);
}

std::string UnitText(IHostItem &item)
{
    LONG ident = 0;
    HostCall(item.GetItemUnit(&ident), "GetItemUnit");
    const char *text = nullptr;
    return kvtGetUnitKey(int(ident), &text) ? std::string(text) : NumberText(ident);
}

std::string ValueTypeText(IHostItem &item)
{
    LONG valueType = 0;
    HostCall(item.GetValueType(&valueType), "GetValueType");
    if (valueType >= 0 && valueType < LONG(vantrel::ValueTypeNames.size()))
        return vantrel::ValueTypeNames[size_t(valueType)];
    return NumberText(valueType);
}

// A row or column that a key names, when it is a place on a sheet.
bool IsPlace(int number) { return number >= 1; }

// Whether the export gives the first date/time column one number format
// after its rows are written, clearing what the cells had.
bool ReplacesColumnFormat(const ExportLayout &layout)
{
    if (layout.subSecond && layout.format.empty()) return true;
    return CDateTimeUtil::GetFormatColumnCount(layout.format) == 1 &&
           CDateTimeUtil::ClassifyFormat(layout.format) == kFormatDateAndTime;
}

// Writes the rows of an export. The time cells that the check found stored
// as numbers go in as those numbers; a step with another cell, or with a
// number format that the workbook has not yet taken from a typed text, goes
// in as texts that the workbook reads as typed, as does the first. That one
// shows whether the workbook stores the texts as the check found (not under
// a Text format, nor moved otherwise); until it does, every step goes so.
class ExportRows {
public:
    ExportRows(CExcelObj &excel, const ExportLayout &layout, const vantrel::bridge::ExportTimes &times,
               bool newWorkbook)
        : m_excel(excel), m_layout(layout), m_times(times), m_taken(times.formats.size(), false),
          m_runs(size_t(times.columns))
    {
        m_taken[0] = true;
        // Formats that stay on the cells are given along runs of rows, which
        // gives what a typed entry does only where the cells start General:
        // in a new workbook.
        m_formatsStay = !ReplacesColumnFormat(layout);
        m_knownFormats = newWorkbook || !m_formatsStay;
    }
    ExportRows(const ExportRows &) = delete;
    ExportRows &operator=(const ExportRows &) = delete;

    void Write(long step, const std::vector<double> &values, int writeDeleteValues, double deleteValue)
    {
        const int row = m_layout.startRow + int(step);
        const auto cells = m_times.Step(size_t(step));
        if (m_trusted && Known(cells)) {
            m_numbers.clear();
            for (const auto &cell : cells) m_numbers.push_back(cell.Number());
            if (m_excel.WriteKnownRow(row, m_layout.column, m_numbers, values, writeDeleteValues, deleteValue)) {
                ExtendRuns(row, cells);
                return;
            }
        }
        const automation::SafeArray timeCells =
            vantrel::bridge::ExportTimeCells(m_layout, automation::Variant::Date(m_times.times[size_t(step)]).Raw());
        m_excel.WriteDataRow(row, m_layout.column, timeCells.Get(), values, writeDeleteValues, deleteValue);
        EndRuns();
        for (const auto &cell : cells)
            if (cell.known) m_taken[cell.format] = true;
        if (!m_checked) Check(row, cells);
    }

    void Finish() { EndRuns(); }

private:
    struct Run {
        int firstRow = 0;
        int rowCount = 0;
        uint16_t format = 0;
    };

    bool Known(std::span<const vantrel::bridge::TimeCell> cells) const
    {
        for (const auto &cell : cells)
            if (!cell.known || (cell.format != 0 && (!m_taken[cell.format] || !m_knownFormats))) return false;
        return true;
    }

    // Trusts the known numbers once a step's cells that could have been put
    // so hold them; one that doesn't ends the trust for good.
    void Check(int row, std::span<const vantrel::bridge::TimeCell> cells)
    {
        bool any = false;
        for (size_t c = 0; c < cells.size(); ++c) {
            if (!cells[c].known) continue;
            const auto holds = m_excel.HoldsKnownNumber(row, m_layout.column + int(c), cells[c].Number());
            if (!holds) continue;
            if (!*holds) {
                m_checked = true;
                return;
            }
            any = true;
        }
        m_checked = any;
        m_trusted = any;
    }

    void ExtendRuns(int row, std::span<const vantrel::bridge::TimeCell> cells)
    {
        if (!m_formatsStay) return;
        for (size_t c = 0; c < cells.size(); ++c) {
            Run &run = m_runs[c];
            if (run.rowCount > 0 && run.format == cells[c].format && run.firstRow + run.rowCount == row) {
                ++run.rowCount;
                continue;
            }
            EndRun(c);
            if (cells[c].format != 0) run = Run{row, 1, cells[c].format};
        }
    }

    void EndRuns()
    {
        for (size_t c = 0; c < m_runs.size(); ++c) EndRun(c);
    }

    void EndRun(size_t c)
    {
        Run &run = m_runs[c];
        if (run.rowCount > 0)
            m_excel.ApplyNumberFormat(run.firstRow, run.rowCount, m_layout.column + int(c),
                                      m_times.formats[run.format]);
        run = Run();
    }

    CExcelObj &m_excel;
    const ExportLayout &m_layout;
    const vantrel::bridge::ExportTimes &m_times;
    std::vector<bool> m_taken;  // by format: a typed text has given it a cell
    std::vector<Run> m_runs;    // by date/time column
    std::vector<CExcelObj::KnownNumber> m_numbers;
    bool m_formatsStay = true;
    bool m_knownFormats = false;
    bool m_checked = false;
    bool m_trusted = false;
};

}  // namespace

void CExcelVantrel::WriteSeries(const ExportLayout &layout, const vantrel::bridge::ExportTimes &times,
                                bool newWorkbook)
{
    const long steps = long(times.times.size());
    m_excel->ClearSheet();
    LONG itemCount = 0;
    HostCall(m_series->GetItemCount(&itemCount), "GetItemCount");
    const int n = int(itemCount);
    const int c = layout.column;
    const int k = layout.timeColumns;

    if (layout.deleteValueKey && IsPlace(layout.deleteValueRow)) WriteDeleteValueCell(layout.deleteValueRow, c);

    std::vector<ItemDataType> dataTypes;
    CollectDataTypes(n, dataTypes);
    std::vector<std::string> titles;
    CollectTitles(layout.format, n, titles);
    if (IsPlace(layout.titleRow)) m_excel->WriteRowTexts(layout.titleRow, c, titles);

    std::vector<std::unique_ptr<ItemColumn>> columns;
    std::vector<std::string> itemTypes, units, valueTypes;
    for (int i = 0; i < n; ++i) {
        auto item = ItemByNumber(*m_series, i + 1);
        columns.push_back(std::make_unique<ItemColumn>(*item.Get(), dataTypes[size_t(i)]));
        itemTypes.push_back(ItemTypeText(*item.Get()));
        units.push_back(UnitText(*item.Get()));
        valueTypes.push_back(ValueTypeText(*item.Get()));
    }

    const int typeRow = layout.typeRow, unitRow = layout.unitRow, valueTypeRow = layout.valueTypeRow;
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
    HostCall(m_series->GetDeleteValue(&deleteValue), "GetDeleteValue");

    std::vector<double> values;
    values.reserve(size_t(n));
    // A cell holds no infinity: the engine writes #NUM!, told with the first.
    size_t infinities = 0;
    int infinityItem = 0;
    long infinityStep = 0;
    double infinity = 0;
    ExportRows rows(*m_excel, layout, times, newWorkbook);
    for (long t = 0; t < steps; ++t) {
        values.clear();
        bool stopped = false;
        for (const auto &column : columns) {
            double value = 0;
            if (!column->Read(t, deleteValue, value)) {
                stopped = true;
                break;
            }
            if (std::isnan(value)) {
                const std::string refusal = "Item " + std::to_string(values.size() + 1) + " holds no number (NaN) at time step " +
                                            std::to_string(t + 1) + ", which no cell can hold. Nothing was written.";
                ShowMessage(refusal);
                throw std::runtime_error(refusal);  // before the save: the workbook stays as it was
            }
            if (std::isinf(value) && (layout.deleteValueKey || float(value) != float(deleteValue)) && infinities++ == 0) {
                infinityItem = int(values.size()) + 1;
                infinityStep = t + 1;
                infinity = value;
            }
            values.push_back(value);
        }
        rows.Write(t, values, layout.deleteValueKey ? 1 : 0, deleteValue);
        // An unhandled data type ends the export here; the row stands with
        // the values it has.
        if (stopped) break;
    }
    rows.Finish();

    if (infinities > 0)
        m_report.InfinitiesWritten(layout.startRow + int(infinityStep) - 1, c + k + infinityItem - 1, infinityItem,
                                   infinityStep, infinity, infinities);
    if (steps > 0) {
        if (layout.subSecond && layout.format.empty())
            m_excel->SetColumnNumberFormat(layout.startRow, int(steps), c, vantrel::bridge::kSubSecondNumberFormat);
        else
            m_excel->SetDateTimeColumnFormat(layout.startRow, int(steps), c, layout.format);
        if (!values.empty()) m_excel->ClearColumnFormats(layout.startRow, int(steps), c + k, int(values.size()));
    }
    m_excel->AutoFitColumns();
}

bool CExcelVantrel::WriteDeleteValueCell(int row, int col)
{
    DOUBLE deleteValue = 0;
    HostCall(m_series->GetDeleteValue(&deleteValue), "GetDeleteValue");
    m_excel->WriteCell(row, col, automation::Variant::R8(deleteValue).Raw());
    return true;
}

bool CExcelVantrel::CollectDataTypes(int itemCount, std::vector<ItemDataType> &types)
{
    for (int i = 0; i < itemCount; ++i) {
        auto item = ItemByNumber(*m_series, i + 1);
        ItemDataType type = ItemDataType(0);
        HostCall(item->GetDataType(&type), "GetDataType");
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
        HostCall(item->GetTitle(title.Out()), "GetTitle");
        titles.push_back(title.Utf8());
    }
    return true;
}
