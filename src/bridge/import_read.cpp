// SPDX-License-Identifier: MIT
// The import: the time axis of the host object from the first selected
// sheet, and the data columns of every selected sheet as items. The read
// trusts the workbook: a cell that isn't a number becomes the delete value,
// an attribute that doesn't resolve stays unset, and only a time axis out of
// order stops the run.
#include <algorithm>
#include <charconv>
#include <cmath>
#include <string_view>
#include <new>
#include <optional>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "bridge/host_calls.h"
#include "bridge/sheet_layout.h"
#include "bridge/sheet_times.h"
#include "bridge/spec_warnings.h"
#include "module/string_table.h"
#include "specification/specification.h"
#include "specification/tokenizer.h"

using automation::ComPtr;
using vantrel::bridge::HostCall;
using vantrel::bridge::ColumnName;
using vantrel::bridge::HostObject;
using vantrel::bridge::LeadingFloat;
using vantrel::bridge::SheetLayout;
using vantrel::bridge::TakeLayout;

namespace {

// A one-dimensional array counted from 0 that the host takes over.
automation::SafeArray MakeVector(VARTYPE type, int count)
{
    automation::SafeArray array(SafeArrayCreateVector(type, 0, ULONG(count)));
    if (!array.Get()) throw std::bad_alloc();
    return array;
}

template <typename Element>
Element *DataOf(const automation::SafeArray &array)
{
    void *data = nullptr;
    automation::ThrowIfFailed(SafeArrayAccessData(array.Get(), &data), "array data");
    SafeArrayUnaccessData(array.Get());  // the array stays alive; the pointer with it
    return static_cast<Element *>(data);
}

}  // namespace

bool CExcelVantrel::ReadSheets(const std::string &spec, std::string &message)
{
    CSpecification specification;
    std::vector<int32_t> sheets;
    if (!specification.GetSheetList(spec, m_excel->GetSheetCount(), sheets, &message)) return false;
    if (sheets.empty()) return true;

    const std::string sheetSpec = specification.WithoutSheetList(spec);
    if (!m_excel->SelectSheet(sheets.front(), message)) return false;
    if (!ReadTimeAxis(sheetSpec, message)) {
        if (!message.empty()) ShowMessage(message);
        return false;
    }
    for (const int32_t sheet : sheets) {
        if (!m_excel->SelectSheet(sheet, message)) return false;
        ReadSheetItems(sheetSpec, message);
    }
    return true;
}

bool CExcelVantrel::ReadTimeAxis(const std::string &spec, std::string &message)
{
    const SheetLayout layout = TakeLayout(spec);
    if (!layout.problem.empty()) {
        message = layout.problem;
        return false;
    }
    int firstRow = 1;
    if (!vantrel::bridge::TakeStartRow(spec, firstRow)) {
        message.clear();
        return false;
    }
    int rowCount = 0;
    if (layout.column >= 1 && !m_excel->CountColumnCells(firstRow, rowCount, layout.column)) rowCount = 0;

    ComPtr<IHostTimeAxis> axis;
    HostObject(m_series->GetTimeAxis(axis.Out()), axis, "GetTimeAxis");
    HostCall(axis->SetAxisKind(HOST_AXIS_KIND_EXPLICIT_TIMES), "SetAxisKind");
    HostCall(axis->SetStepCount(rowCount), "SetStepCount");
    if (rowCount < 1) return true;

    automation::SafeArray times = MakeVector(VT_DATE, rowCount);
    DATE *steps = DataOf<DATE>(times);
    // The whole date/time block in one read, true dates as the workbook shows them.
    vantrel::bridge::SheetTimes rowTimes(*m_excel, layout, firstRow, rowCount, true);
    for (int r = 0; r < rowCount; ++r) {
        const std::optional<DATE> time = rowTimes.At(r);
        if (!time) {
            // Never a made-up time: the axis keeps its step count, with no times.
            m_report.FailAt(CurrentSheet(), firstRow + r);
            message = rowTimes.NoTimeMessage(r);
            return false;
        }
        steps[r] = *time;
        // Strictly rising, at the millisecond that the host keeps.
        if (r > 0 && !vantrel::bridge::RisesAtTheMillisecond(steps[r - 1], steps[r])) {
            m_report.FailAt(CurrentSheet(), firstRow + r);
            message = vantrel::FormatMessage(107, r);
            return false;  // the axis keeps its step count, with no times
        }
    }
    HostCall(axis->SetTimes(automation::Variant::Array(VT_DATE, times.Detach()).Detach()), "SetTimes");
    return true;
}

void CExcelVantrel::ApplyDeleteValue(int dateTimeColumn, const std::string &spec)
{
    std::string text;
    if (CSpecification().GetKeyValue(spec, DeleteValue, text)) {
        HostCall(m_series->SetDeleteValue(double(LeadingFloat(text))), "SetDeleteValue");
    } else if (const auto cell = ReadDeleteValueCell(dateTimeColumn, spec)) {
        HostCall(m_series->SetDeleteValue(double(*cell)), "SetDeleteValue");
    }
}

std::optional<float> CExcelVantrel::ReadDeleteValueCell(int dateTimeColumn, const std::string &spec)
{
    int row = 0;
    if (!CSpecification().GetKeyValueInt(spec, DelValRow, row) || row < 1 || dateTimeColumn < 1) return std::nullopt;
    automation::Variant cell;
    m_excel->ReadCell(row, dateTimeColumn, cell);
    // A number, or a text that reads as one; anything else (an empty
    // cell, a word, an error) keeps the host's delete value.
    automation::Variant number;
    if (cell.Type() == VT_EMPTY || cell.Type() == VT_BOOL ||
        FAILED(VariantChangeType(number.Out(), &cell.Raw(), 0, VT_R8)))
        return std::nullopt;
    const float value = float(number.Raw().dblVal);
    m_report.DeleteValueCell(CurrentSheet(), row, value);
    return value;
}

bool CExcelVantrel::ReadSheetItems(const std::string &spec, std::string &)
{
    LONG before = 0;
    HostCall(m_series->GetItemCount(&before), "GetItemCount");
    const SheetLayout layout = TakeLayout(spec);
    const UsedColumns used = m_excel->GetUsedColumns();
    const int d = layout.column;
    const int k = layout.AllColumnCount();
    const int f = used.firstColumn;
    const int u = used.columnCount;
    const int n = std::max(0, u - k);

    int firstRow = 1;
    vantrel::bridge::TakeStartRow(spec, firstRow);
    int rowCount = 0;
    if (d >= 1 && !m_excel->CountColumnCells(firstRow, rowCount, d)) rowCount = 0;
    WarnAboutUnreadCells(firstRow, rowCount, used);
    ApplyDeleteValue(d, spec);

    // Titles: one a used column from the title row, or the template's list.
    CSpecification specification;
    int titleRow = 0;
    const bool titlesFromRow = specification.GetKeyValueInt(spec, ItemDescriptionRow, titleRow) && titleRow >= 1;
    std::vector<std::string> titles;
    if (titlesFromRow) m_excel->ReadRowTexts(titleRow, f, u, titles);
    else titles = m_itemTitles;

    // The runs of data columns between the date/time columns.
    const std::vector<vantrel::bridge::ColumnRun> runs = vantrel::bridge::DataRuns(used, layout);

    // Item types stand by themselves: a unit that doesn't resolve leaves the
    // units unset, not the item types.
    std::vector<int> typeSequences, unitSequences, valueTypes;
    bool typesUsable = true;
    bool unitsUsable = true;
    bool valueTypesUsable = true;
    for (const auto &run : runs) {
        if (run.count < 1) continue;
        const size_t typesBefore = typeSequences.size();
        if (typesUsable && !ResolveTypesAndUnits(spec, run.first, run.count, typeSequences, unitSequences)) {
            m_report.Unresolved(CurrentSheet(), m_unresolved);
            unitsUsable = false;
            typesUsable = typeSequences.size() == typesBefore + size_t(run.count);
        }
        if (valueTypesUsable && !ResolveValueTypes(spec, run.first, run.count, valueTypes)) {
            m_report.Unresolved(CurrentSheet(), m_unresolved);
            valueTypesUsable = false;
        }
    }

    // One item a data column, in column order. A column without a title
    // (no title row and a short template list) is named as the sheet names it.
    std::vector<int> dataColumns;
    for (int c = f; c < f + u && int(dataColumns.size()) < n; ++c)
        if (!layout.Holds(c)) dataColumns.push_back(c);
    for (int j = 0; j < int(dataColumns.size()); ++j) {
        const int column = dataColumns[size_t(j)];
        const size_t titleIndex = titlesFromRow ? size_t(column - f) : size_t(j);
        const std::string title = titleIndex < titles.size() ? titles[titleIndex] : ColumnName(column);
        LONG index = 0;
        ComPtr<IHostItem> item;
        HostObject(m_series->AddItem(&index, item.Out()), item, "AddItem");
        HostCall(item->SetTitle(automation::Bstr(title).Get()), "SetTitle");
        HostCall(item->SetDataType(ItemDataTypeFloat), "SetDataType");
        if (typesUsable && size_t(j) < typeSequences.size() && typeSequences[size_t(j)] >= 1)
            HostCall(item->SetItemType(typeSequences[size_t(j)]), "SetItemType");
        if (unitsUsable && size_t(j) < unitSequences.size() && unitSequences[size_t(j)] >= 1)
            HostCall(item->SetItemUnit(unitSequences[size_t(j)]), "SetItemUnit");
        if (valueTypesUsable && size_t(j) < valueTypes.size())
            HostCall(item->SetValueType(valueTypes[size_t(j)]), "SetValueType");
    }
    const int items = int(dataColumns.size());
    if (rowCount < 1) return true;

    // The whole data block in one read; empty cells and cells that are no
    // number come back as the delete value.
    DOUBLE deleteValue = 0.0;
    HostCall(m_series->GetDeleteValue(&deleteValue), "GetDeleteValue");
    automation::SafeArray block;
    std::string errors;
    m_excel->ReadValueBlock(firstRow, rowCount, f, u, block, deleteValue, errors);
    const double *values = DataOf<double>(block);

    std::vector<int32_t> selection;
    const bool selected = ParseSelectedItems(selection);
    const auto isSelected = [&](int i) {
        return !selected || std::find(selection.begin(), selection.end(), int32_t(before + i)) != selection.end();
    };
    // Numbers beyond the float range become infinities: told with the first.
    int beyondCount = 0, beyondRow = 0, beyondColumn = 0;
    double beyondValue = 0.0;
    for (int i = 0; i < items; ++i) {
        if (!isSelected(i)) continue;
        // The block holds each column in one stretch.
        const double *source = values + size_t(dataColumns[size_t(i)] - f) * size_t(rowCount);
        automation::SafeArray column = MakeVector(VT_R4, rowCount);
        float *target = DataOf<float>(column);
        for (int r = 0; r < rowCount; ++r) {
            target[r] = float(source[r]);
            if (std::isfinite(target[r]) || !std::isfinite(source[r])) continue;
            if (beyondCount++ == 0) {
                beyondRow = firstRow + r;
                beyondColumn = dataColumns[size_t(i)];
                beyondValue = source[r];
            }
        }
        ComPtr<IHostItem> item;
        HostObject(m_series->GetItem(automation::Variant::I4(before + i + 1).Raw(), item.Out()), item, "GetItem");
        HostCall(item->SetData(automation::Variant::Array(VT_R4, column.Detach()).Detach()), "SetData");
    }
    if (beyondCount > 0) m_report.BeyondFloat(CurrentSheet(), beyondRow, beyondColumn, beyondValue, beyondCount);
    WarnAboutUnreadableNumbers();
    if (selected)
        for (int i = items - 1; i >= 0; --i)
            if (!isSelected(i)) HostCall(m_series->RemoveItem(before + i + 1), "RemoveItem");
    return true;
}

bool CExcelVantrel::ParseSelectedItems(std::vector<int32_t> &items) const
{
    items.clear();
    if (m_selectedItems.empty()) return false;
    const auto tokens = vantrel::SplitPieces(m_selectedItems, "=");
    if (tokens.size() < 2 || tokens[0] != "SelItems") return false;
    for (const std::string_view piece : vantrel::SplitPieces(tokens[1], ","))
        items.push_back(vantrel::LeadingInt(piece));
    return !items.empty();
}
