// SPDX-License-Identifier: MIT
#include "dialogs/preview_reader.h"

#include <algorithm>
#include <optional>

#include "automation/com_error.h"
#include "bridge/run_report.h"
#include "bridge/sheet_layout.h"
#include "bridge/sheet_times.h"
#include "bridge/value_type_names.h"
#include "datetime/date_time_util.h"
#include "dialogs/bridge_preview_access.h"
#include "dialogs/field_parsing.h"
#include "module/string_table.h"
#include "shell/shell.h"
#include "specification/specification.h"
#include "units/kvt.h"

namespace vantrel::dialogs {
namespace {

constexpr double kQuarterWidth = 0.25;

// The plain box of the preview, whatever the host's silent flag says.
void ShowPlainMessage(const std::string &text)
{
    MessageBoxA(nullptr, text.c_str(), LoadMessage(kStringApplicationTitle).c_str(), MB_OK);
}

// Blank exactly where the import keeps the host's marker: the values go to
// the host as 32-bit floats, and a float equal to the marker is missing.
std::string ValueText(double value, double deleteValue)
{
    if (float(value) == float(deleteValue)) return {};
    return ShortNumberText(value);
}

int StartRowOf(const std::string &spec)
{
    int row = 1;
    CSpecification().GetKeyValueInt(spec, StartRow, row);
    return row;
}

}  // namespace

void PreviewList::Clear()
{
    columns.clear();
    lines.clear();
}

void PreviewList::InsertColumn(size_t place, const std::string &heading, double widthShare)
{
    place = std::min(place, columns.size());
    columns.insert(columns.begin() + std::ptrdiff_t(place), Column{heading, widthShare});
    for (auto &line : lines) line.insert(line.begin() + std::ptrdiff_t(std::min(place, line.size())), std::string());
}

void PreviewList::InsertLine(size_t place)
{
    place = std::min(place, lines.size());
    lines.insert(lines.begin() + std::ptrdiff_t(place), std::vector<std::string>(columns.size()));
}

void PreviewList::SetText(size_t line, size_t column, const std::string &text)
{
    if (line >= lines.size() || column >= columns.size()) return;
    lines[line].resize(columns.size());
    lines[line][column] = text;
}

void COpenPreview::SetPreviewSource(CExcelVantrel &bridge, const std::string &specification)
{
    m_bridge = &bridge;
    m_specification = specification;
}

void COpenPreview::SetPreviewFile(const std::string &path, int32_t sheet)
{
    if (path == m_filePathShown && sheet == m_sheetShown) return;
    m_filePathShown = path;
    m_sheetShown = sheet;
    m_sheetListDone = 0;
}

bool COpenPreview::RefreshPreview()
{
    m_resultList.Clear();
    if (!m_bridge) return false;
    SHORT fits = 0;
    const HRESULT inspection = m_bridge->InspectWorkbook(&fits);
    if (m_sheetListDone == 0) FillSheetList(kRowLimit);
    if (inspection != S_OK || fits != SHORT(VARIANT_TRUE)) return false;
    return FillResultList(kRowLimit);
}

bool COpenPreview::FillSheetList(int limit)
{
    const auto fail = [](const std::string &text) {
        ShowPlainMessage(text);
        return false;
    };
    CExcelObj *session = m_bridge ? CBridgePreviewAccess::Session(*m_bridge) : nullptr;
    if (!session) return false;
    std::string error;
    if (!session->OpenWorkbook(m_filePathShown, error)) return fail(LoadMessage(121));
    if (!session->SelectSheet(m_sheetShown, error)) return fail(FormatMessage(141, int(m_sheetShown)));
    m_sheetList.Clear();
    const UsedColumns used = session->GetUsedColumns();
    if (used.columnCount < 1) return fail(LoadMessage(142));
    // A column of the list is a column of the sheet, from column 1.
    const int listColumns = used.firstColumn - 1 + used.columnCount;
    for (int i = 0; i < listColumns; ++i) m_sheetList.InsertColumn(size_t(i), "", 1.0 / listColumns);
    const int rows = std::min(session->GetUsedRowCount(), limit);
    for (int row = 1; row <= rows; ++row) {
        std::vector<std::string> texts;
        session->ReadRowTexts(row, used.firstColumn, used.columnCount, texts);
        m_sheetList.InsertLine(m_sheetList.lines.size());
        for (size_t i = 0; i < texts.size(); ++i)
            m_sheetList.SetText(size_t(row - 1), size_t(used.firstColumn - 1) + i, texts[i]);
    }
    session->CloseWorkbook(0);
    m_sheetListDone = 1;
    return true;
}

bool COpenPreview::FillResultList(int limit)
{
    CExcelObj *session = m_bridge ? CBridgePreviewAccess::Session(*m_bridge) : nullptr;
    if (!session) return false;
    std::string error;
    if (!session->OpenWorkbook(m_filePathShown, error)) {
        ShowPlainMessage(LoadMessage(121));
        return false;
    }
    FillResultColumns(error, limit);
    session->CloseWorkbook(0);
    m_sheetListDone = 1;
    return true;
}

bool COpenPreview::FillResultColumns(std::string &error, int limit)
{
    CExcelObj &session = *CBridgePreviewAccess::Session(*m_bridge);
    std::vector<int32_t> sheets;
    if (!CSpecification().GetSheetList(m_specification, session.GetSheetCount(), sheets) || sheets.empty())
        return true;
    // Only the first sheet of a selection is shown.
    if (session.SelectSheet(sheets.front(), error)) FillTimeColumn(error, limit);
    if (session.SelectSheet(sheets.front(), error)) FillItemColumns(error, limit);
    return true;
}

bool COpenPreview::FillTimeColumn(std::string &, int limit)
{
    CExcelObj &session = *CBridgePreviewAccess::Session(*m_bridge);
    const vantrel::bridge::SheetLayout layout = vantrel::bridge::TakeLayout(m_specification);
    m_resultList.InsertColumn(0, "DateTime", kQuarterWidth);
    const int startRow = StartRowOf(m_specification);
    int rowCount = 0;
    if (!session.CountColumnCells(startRow, rowCount, layout.column)) rowCount = 0;
    if (rowCount < 1) return true;

    // The header lines: item type, unit, value type.
    for (int i = 0; i < 3; ++i) m_resultList.InsertLine(0);
    const int rows = std::min(rowCount, limit);
    // The times as the import reads them.
    vantrel::bridge::SheetTimes times(session, layout, startRow, rows, true);
    for (int row = 0; row < rows; ++row) {
        const std::optional<DATE> time = times.At(row);
        if (!time) continue;
        const size_t line = size_t(row) + 3;
        m_resultList.InsertLine(line);
        m_resultList.SetText(std::min(line, m_resultList.lines.size() - 1), 0,
                             CDateTimeUtil::FormatDate(DateValue{*time, kDateValid}, "%Y/%m/%d %H:%M:%S"));
    }
    return true;
}

bool COpenPreview::FillItemColumns(std::string &, int limit)
{
    CExcelObj &session = *CBridgePreviewAccess::Session(*m_bridge);
    const vantrel::bridge::SheetLayout layout = vantrel::bridge::TakeLayout(m_specification);
    const int c = layout.column;
    const int k = layout.AllColumnCount();
    // As an import does, this sets the host's delete value.
    CBridgePreviewAccess::ApplyDeleteValue(*m_bridge, c, m_specification);
    const UsedColumns used = session.GetUsedColumns();
    const int f = used.firstColumn;
    const int u = used.columnCount;
    const int n = u - k;
    if (n < 0) return false;

    const int startRow = StartRowOf(m_specification);
    int rowCount = 0;
    if (!session.CountColumnCells(startRow, rowCount, c)) rowCount = 0;
    int titleRow = 0;
    CSpecification().GetKeyValueInt(m_specification, ItemDescriptionRow, titleRow);
    std::vector<std::string> titles;
    if (titleRow >= 1) session.ReadRowTexts(titleRow, f, u, titles);

    // The runs of data columns between the date/time columns.
    std::vector<int> typeSequences, unitSequences, valueTypes;
    bool typesUsable = true;
    bool valueTypesUsable = true;
    for (const auto &run : vantrel::bridge::DataRuns(used, layout)) {
        if (typesUsable && !CBridgePreviewAccess::ResolveTypesAndUnits(*m_bridge, m_specification, run.first,
                                                                       run.count, typeSequences, unitSequences))
            typesUsable = false;
        if (valueTypesUsable && !CBridgePreviewAccess::ResolveValueTypes(*m_bridge, m_specification, run.first,
                                                                         run.count, valueTypes))
            valueTypesUsable = false;
    }

    // One list column an item, headed by its title; the header lines name
    // its item type, unit and value type.
    // Without a title row the import names an item by its column letters.
    int item = 0;
    for (int t = 0; t < u && item < n; ++t) {
        if (layout.Holds(f + t)) continue;
        const size_t column = m_resultList.columns.size();
        const std::string title = size_t(t) < titles.size() ? titles[size_t(t)] : vantrel::bridge::ColumnName(f + t);
        m_resultList.InsertColumn(column, title, kQuarterWidth);
        if (typesUsable && size_t(item) < typeSequences.size() && size_t(item) < unitSequences.size()) {
            int typeIdent = 0;
            const char *typeName = nullptr;
            const bool typeFound = kvtGetItemTypeSeq(typeSequences[size_t(item)], &typeIdent, &typeName) != 0;
            m_resultList.SetText(0, column, typeFound && typeName ? typeName : "");
            int unitIdent = 0;
            const char *unitName = nullptr;
            const bool unitFound =
                typeFound && kvtGetItemUnitSeq(typeIdent, unitSequences[size_t(item)], &unitIdent, &unitName) != 0;
            if (unitFound && unitName) m_resultList.SetText(1, column, unitName);
            else m_resultList.SetText(1, column, m_resultList.lines.empty() ? "" : m_resultList.lines[0][column]);
        }
        if (valueTypesUsable && size_t(item) < valueTypes.size()) {
            const int valueType = valueTypes[size_t(item)];
            const bool named = valueType >= 0 && valueType < int(ValueTypeNames.size());
            m_resultList.SetText(2, column, named ? ValueTypeNames[size_t(valueType)] : "");
        }
        ++item;
    }
    if (rowCount < 1) return true;

    DOUBLE deleteValue = 0.0;
    CBridgePreviewAccess::Series(*m_bridge)->GetDeleteValue(&deleteValue);
    const int rows = std::min(rowCount, limit);
    automation::SafeArray block;
    std::string errors;
    session.ReadValueBlock(startRow, rows, f, u, block, deleteValue, errors);
    void *data = nullptr;
    if (FAILED(SafeArrayAccessData(block.Get(), &data))) return true;
    const double *values = static_cast<const double *>(data);
    for (int row = 0; row < rows; ++row) {
        size_t listColumn = 1;
        for (int col = 0; col < u; ++col) {
            if (layout.Holds(f + col)) continue;
            // The block holds each column in one stretch.
            const double value = values[size_t(col) * size_t(rows) + size_t(row)];
            m_resultList.SetText(size_t(row) + 3, listColumn++, ValueText(value, deleteValue));
        }
    }
    SafeArrayUnaccessData(block.Get());
    return true;
}

}  // namespace vantrel::dialogs
