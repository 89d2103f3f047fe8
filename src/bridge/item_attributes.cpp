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
                                             automation::Variant (*normalize)(const automation::Variant &))
{
    std::vector<automation::Variant> cells;
    const int filled = row > 0 ? excel.CountRowCells(row, firstColumn, columnCount) : 0;
    if (filled != 1 && filled != columnCount) return cells;
    for (int i = 0; i < filled; ++i) {
        automation::Variant cell;
        excel.ReadCell(row, firstColumn + i, cell);
        cells.push_back(normalize(cell));
    }
    return cells;
}

}  // namespace

int CExcelVantrel::LookupItemType(const VARIANT &value)
{
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
        const int ident = LookupItemType(automation::Variant::String(global).Raw());
        if (ident == -1) return false;
        itemTypes.insert(itemTypes.end(), size_t(columnCount), ident);
        return true;
    }
    if (specification.GetKeyValueInt(spec, kItemTypeKeys.row, row)) {
        const auto cells = HeaderCells(*m_excel, row, firstColumn, columnCount, vantrel::bridge::NormalizeTypeCell);
        if (cells.empty()) return false;
        for (int i = 0; i < columnCount; ++i) {
            const int ident = LookupItemType(cells[cells.size() == 1 ? 0 : size_t(i)].Raw());
            if (ident == -1) return false;
            itemTypes.push_back(ident);
        }
        return true;
    }
    if (m_itemTypes.size() != size_t(columnCount)) return false;
    for (const std::string &name : m_itemTypes) {
        const int ident = LookupItemType(automation::Variant::String(name).Raw());
        if (ident == -1) return false;
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
    const auto appendAll = [&](const auto &valueOfColumn) {
        for (int i = 0; i < columnCount; ++i) {
            const int unit = LookupUnit(typeOf(i), valueOfColumn(i));
            if (unit == -1) return false;
            units.push_back(unit);
        }
        return true;
    };
    if (specification.GetKeyValue(spec, kUnitKeys.global, global)) {
        const automation::Variant text = automation::Variant::String(global);
        return appendAll([&](int) -> const VARIANT & { return text.Raw(); });
    }
    if (specification.GetKeyValueInt(spec, kUnitKeys.row, row)) {
        const auto cells = HeaderCells(*m_excel, row, firstColumn, columnCount, vantrel::bridge::NormalizeUnitCell);
        if (cells.empty()) return false;
        return appendAll([&](int i) -> const VARIANT & { return cells[cells.size() == 1 ? 0 : size_t(i)].Raw(); });
    }
    // A template list of another length leaves the units unset without failing.
    if (m_itemUnits.size() != size_t(columnCount)) return true;
    std::vector<automation::Variant> texts;
    for (const std::string &name : m_itemUnits) texts.push_back(automation::Variant::String(name));
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
        const int number = LookupValueType(automation::Variant::String(global).Raw());
        if (number == -1) return false;
        valueTypes.insert(valueTypes.end(), size_t(columnCount), number);
        return true;
    }
    if (specification.GetKeyValueInt(spec, kValueTypeKeys.row, row)) {
        const auto cells = HeaderCells(*m_excel, row, firstColumn, columnCount, vantrel::bridge::NormalizeValueTypeCell);
        if (cells.empty()) return false;
        for (int i = 0; i < columnCount; ++i) {
            const int number = LookupValueType(cells[cells.size() == 1 ? 0 : size_t(i)].Raw());
            if (number == -1) return false;
            valueTypes.push_back(number);
        }
        return true;
    }
    if (m_valueTypes.size() != size_t(columnCount)) return false;
    for (const std::string &name : m_valueTypes) {
        const int number = LookupValueType(automation::Variant::String(name).Raw());
        if (number == -1) return false;
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
