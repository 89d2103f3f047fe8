// SPDX-License-Identifier: MIT
// Item types, units and value types of a stretch of data columns, from the
// first source that the specification string names: a global text, a header
// row, or the list of a template. Nothing here reports; callers decide.
#include <string>
#include <vector>

#include "bridge/excel_vantrel.h"
#include "bridge/header_cells.h"
#include "bridge/value_type_names.h"
#include "specification/specification.h"
#include "units/kvt.h"

using vantrel::bridge::EqualsIgnoringCase;

namespace {

bool IsInteger(const VARIANT &value) { return value.vt == VT_I4 || value.vt == VT_I2; }
LONG IntegerOf(const VARIANT &value) { return value.vt == VT_I4 ? value.lVal : value.iVal; }
std::string TextOf(const VARIANT &value) { return automation::BstrToUtf8(value.bstrVal); }

// Which source an attribute comes from.
struct AttributeKeys {
    PARSINGTYPE global;
    PARSINGTYPE row;
};
constexpr AttributeKeys kItemTypeKeys{GlobalUnitType, UnitTypeRow};
constexpr AttributeKeys kUnitKeys{GlobalUnit, UnitRow};
constexpr AttributeKeys kValueTypeKeys{GlobalValueType, ValueTypeRow};

// The cells of a header row that serve a stretch of columns: one cell for
// all, or one a column. Empty when the row holds neither.
std::vector<automation::Variant> HeaderCells(CExcelObj &excel, int row, int firstColumn, int columnCount,
                                             automation::Variant (*normalize)(const automation::Variant &),
                                             int &filled)
{
    std::vector<automation::Variant> cells;
    filled = row > 0 ? excel.CountRowCells(row, firstColumn, columnCount) : 0;
    if (filled != 1 && filled != columnCount) return cells;
    for (int i = 0; i < filled; ++i) {
        automation::Variant cell;
        excel.ReadCell(row, firstColumn + i, cell);
        cells.push_back(normalize(cell));
    }
    return cells;
}

}  // namespace

void CExcelVantrel::NoteUnresolved(const char *attribute, const char *source, int row, int column, const VARIANT &value)
{
    m_unresolved = {};
    m_unresolved.attribute = attribute;
    m_unresolved.source = source;
    m_unresolved.row = row;
    m_unresolved.column = column;
    automation::Variant text;
    if (value.vt == VT_BSTR) m_unresolved.text = TextOf(value);
    else if (SUCCEEDED(VariantChangeType(text.Out(), &value, 0, VT_BSTR))) m_unresolved.text = TextOf(text.Raw());
}

void CExcelVantrel::NoteWrongCount(const char *attribute, int row, int column, int filled, int columnCount)
{
    m_unresolved = {};
    m_unresolved.attribute = attribute;
    m_unresolved.row = row;
    m_unresolved.column = column;
    m_unresolved.filled = filled;
    m_unresolved.columnCount = columnCount;
}

int CExcelVantrel::LookupItemType(const VARIANT &value)
{
    // 0 is what an export writes for an item without item type: it reads
    // back as none, which no sequence number matches, so it stays unset.
    if (IsInteger(value) && IntegerOf(value) == 0) return 0;
    if (IsInteger(value)) {
        const char *text = nullptr;
        return kvtGetItemTypeIdent(int(IntegerOf(value)), &text) ? int(IntegerOf(value)) : -1;
    }
    if (value.vt != VT_BSTR) return -1;
    const std::string wanted = TextOf(value);
    const int count = kvtGetItemTypeCount();
    for (int seq = 1; seq <= count; ++seq) {
        int ident = 0;
        const char *name = nullptr;
        if (kvtGetItemTypeSeq(seq, &ident, &name) && name && EqualsIgnoringCase(name, wanted)) return ident;
    }
    return -1;
}

int CExcelVantrel::LookupUnit(int itemType, const VARIANT &value)
{
    if (IsInteger(value) && IntegerOf(value) == 0) return 0;  // none, as for item types
    if (IsInteger(value)) {
        const char *text = nullptr;
        return kvtGetUnitKey(int(IntegerOf(value)), &text) ? int(IntegerOf(value)) : -1;
    }
    if (value.vt != VT_BSTR) return -1;
    const std::string wanted = TextOf(value);
    const int count = kvtGetItemUnitCount(itemType);
    for (int seq = 1; seq <= count; ++seq) {
        int unit = 0;
        const char *name = nullptr;
        if (!kvtGetItemUnitSeq(itemType, seq, &unit, &name)) continue;
        if (name && EqualsIgnoringCase(name, wanted)) return unit;
        const char *abbreviation = nullptr;
        if (kvtGetUnitAbbreviation(unit, &abbreviation) && abbreviation && EqualsIgnoringCase(abbreviation, wanted))
            return unit;
    }
    return -1;
}

int CExcelVantrel::LookupValueType(const VARIANT &value)
{
    if (IsInteger(value)) {
        const LONG number = IntegerOf(value);
        // Any value type a host holds: beyond the named ones an export
        // writes the number, and it must read back.
        return number >= 0 ? int(number) : -1;
    }
    if (value.vt != VT_BSTR) return -1;
    const std::string wanted = TextOf(value);
    for (size_t i = 0; i < vantrel::ValueTypeNames.size(); ++i)
        if (EqualsIgnoringCase(vantrel::ValueTypeNames[i], wanted)) return int(i);
    return -1;
}

bool CExcelVantrel::ResolveItemTypes(const std::string &spec, int firstColumn, int columnCount,
                                     std::vector<int> &itemTypes)
{
    if (columnCount < 1) return true;
    CSpecification specification;
    std::string global;
    int row = 0;
    if (specification.GetKeyValue(spec, kItemTypeKeys.global, global)) {
        const automation::Variant text = automation::Variant::String(global);
        const int ident = LookupItemType(text.Raw());
        if (ident == -1) {
            NoteUnresolved("item type", "GlobalUnitType", 0, 0, text.Raw());
            return false;
        }
        itemTypes.insert(itemTypes.end(), size_t(columnCount), ident);
        return true;
    }
    if (specification.GetKeyValueInt(spec, kItemTypeKeys.row, row)) {
        int filled = 0;
        const auto cells = HeaderCells(*m_excel, row, firstColumn, columnCount, vantrel::bridge::NormalizeTypeCell, filled);
        if (cells.empty()) {
            NoteWrongCount("item type", row, firstColumn, filled, columnCount);
            return false;
        }
        for (int i = 0; i < columnCount; ++i) {
            const size_t cell = cells.size() == 1 ? 0 : size_t(i);
            const int ident = LookupItemType(cells[cell].Raw());
            if (ident == -1) {
                NoteUnresolved("item type", "", row, firstColumn + int(cell), cells[cell].Raw());
                return false;
            }
            itemTypes.push_back(ident);
        }
        return true;
    }
    if (m_itemTypes.size() != size_t(columnCount)) {
        NoteWrongCount("item type", 0, firstColumn, int(m_itemTypes.size()), columnCount);
        return false;
    }
    for (size_t i = 0; i < m_itemTypes.size(); ++i) {
        const automation::Variant text = automation::Variant::String(m_itemTypes[i]);
        const int ident = LookupItemType(text.Raw());
        if (ident == -1) {
            NoteUnresolved("item type", "the template's list", 0, firstColumn + int(i), text.Raw());
            return false;
        }
        itemTypes.push_back(ident);
    }
    return true;
}

bool CExcelVantrel::ResolveUnits(const std::string &spec, int firstColumn, int columnCount,
                                 const std::vector<int> &itemTypes, std::vector<int> &units)
{
    if (columnCount < 1) return true;
    const auto typeOf = [&](int column) { return size_t(column) < itemTypes.size() ? itemTypes[size_t(column)] : -1; };
    CSpecification specification;
    std::string global;
    int row = 0;
    // Each column looks its unit up within its own item type.
    const char *source = "";
    int sourceRow = 0;
    const auto appendAll = [&](const auto &valueOfColumn) {
        for (int i = 0; i < columnCount; ++i) {
            const int unit = LookupUnit(typeOf(i), valueOfColumn(i));
            if (unit == -1) {
                NoteUnresolved("unit", source, sourceRow, std::string(source) == "GlobalUnit" ? 0 : firstColumn + i,
                               valueOfColumn(i));
                return false;
            }
            units.push_back(unit);
        }
        return true;
    };
    if (specification.GetKeyValue(spec, kUnitKeys.global, global)) {
        source = "GlobalUnit";
        const automation::Variant text = automation::Variant::String(global);
        return appendAll([&](int) -> const VARIANT & { return text.Raw(); });
    }
    if (specification.GetKeyValueInt(spec, kUnitKeys.row, row)) {
        int filled = 0;
        const auto cells = HeaderCells(*m_excel, row, firstColumn, columnCount, vantrel::bridge::NormalizeUnitCell, filled);
        if (cells.empty()) {
            NoteWrongCount("unit", row, firstColumn, filled, columnCount);
            return false;
        }
        sourceRow = row;
        return appendAll([&](int i) -> const VARIANT & { return cells[cells.size() == 1 ? 0 : size_t(i)].Raw(); });
    }
    // A template list of another length leaves the units unset without failing.
    if (m_itemUnits.size() != size_t(columnCount)) return true;
    std::vector<automation::Variant> texts;
    for (const std::string &name : m_itemUnits) texts.push_back(automation::Variant::String(name));
    source = "the template's list";
    return appendAll([&](int i) -> const VARIANT & { return texts[size_t(i)].Raw(); });
}

bool CExcelVantrel::ResolveValueTypes(const std::string &spec, int firstColumn, int columnCount,
                                      std::vector<int> &valueTypes)
{
    if (columnCount < 1) return true;
    CSpecification specification;
    std::string global;
    int row = 0;
    if (specification.GetKeyValue(spec, kValueTypeKeys.global, global)) {
        const automation::Variant text = automation::Variant::String(global);
        const int number = LookupValueType(text.Raw());
        if (number == -1) {
            NoteUnresolved("value type", "GlobalValueType", 0, 0, text.Raw());
            return false;
        }
        valueTypes.insert(valueTypes.end(), size_t(columnCount), number);
        return true;
    }
    if (specification.GetKeyValueInt(spec, kValueTypeKeys.row, row)) {
        int filled = 0;
        const auto cells = HeaderCells(*m_excel, row, firstColumn, columnCount, vantrel::bridge::NormalizeValueTypeCell, filled);
        if (cells.empty()) {
            NoteWrongCount("value type", row, firstColumn, filled, columnCount);
            return false;
        }
        for (int i = 0; i < columnCount; ++i) {
            const size_t cell = cells.size() == 1 ? 0 : size_t(i);
            const int number = LookupValueType(cells[cell].Raw());
            if (number == -1) {
                NoteUnresolved("value type", "", row, firstColumn + int(cell), cells[cell].Raw());
                return false;
            }
            valueTypes.push_back(number);
        }
        return true;
    }
    if (m_valueTypes.size() != size_t(columnCount)) {
        NoteWrongCount("value type", 0, firstColumn, int(m_valueTypes.size()), columnCount);
        return false;
    }
    for (size_t i = 0; i < m_valueTypes.size(); ++i) {
        const automation::Variant text = automation::Variant::String(m_valueTypes[i]);
        const int number = LookupValueType(text.Raw());
        if (number == -1) {
            NoteUnresolved("value type", "the template's list", 0, firstColumn + int(i), text.Raw());
            return false;
        }
        valueTypes.push_back(number);
    }
    return true;
}

bool CExcelVantrel::ResolveTypesAndUnits(const std::string &spec, int firstColumn, int columnCount,
                                         std::vector<int> &typeSequences, std::vector<int> &unitSequences)
{
    std::vector<int> types;
    if (!ResolveItemTypes(spec, firstColumn, columnCount, types)) return false;
    for (const int ident : types) {
        int sequence = -1;
        const int count = kvtGetItemTypeCount();
        for (int seq = 1; seq <= count && sequence == -1; ++seq) {
            int found = 0;
            const char *name = nullptr;
            if (kvtGetItemTypeSeq(seq, &found, &name) && found == ident) sequence = seq;
        }
        typeSequences.push_back(sequence);
    }
    std::vector<int> units;
    if (!ResolveUnits(spec, firstColumn, columnCount, types, units)) return false;
    for (size_t i = 0; i < types.size(); ++i) {
        int sequence = -1;
        if (i < units.size()) {
            const int count = kvtGetItemUnitCount(types[i]);
            for (int seq = 1; seq <= count && sequence == -1; ++seq) {
                int found = 0;
                const char *name = nullptr;
                if (kvtGetItemUnitSeq(types[i], seq, &found, &name) && found == units[i]) sequence = seq;
            }
        }
        unitSequences.push_back(sequence);
    }
    return true;
}
