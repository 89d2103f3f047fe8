// SPDX-License-Identifier: MIT
// Building a specification string out of a record, key by key.
#include <string>

#include "specification/records.h"
#include "specification/specification.h"

namespace {

// What one key of a record gives: nothing, or a text.
bool Give(std::string &value, const std::string &text)
{
    value = text;
    return true;
}

bool Give(std::string &value, int number) { return Give(value, std::to_string(number)); }

}  // namespace

bool CSpecification::GetOpenKeyValue(const OpenSpecification &record, int key,
                                     std::string &value) const
{
    value.clear();
    const OpenSpecification &r = record;
    switch (key) {
    case DateCol:
        return r.DataTimeType == 2 && Give(value, r.DateCol);
    case TimeCol:
        return r.DataTimeType == 1 && Give(value, r.TimeCol);
    case DateTimeCol:
        return r.DataTimeType == 0 && Give(value, r.DateTimeCol);
    case DateFormat:
        return r.DataTimeType == 2 && r.UseDFormat && Give(value, r.DateFormat);
    case TimeFormat:
        return r.DataTimeType == 1 && r.UseTFormat && Give(value, r.TimeFormat);
    case DateTimeFormat:
        return r.DataTimeType == 0 && r.UseDTFormat && Give(value, r.DateTimeFormat);
    case GlobalDate:
        return r.DataTimeType == 1 && Give(value, r.GlobalDate);
    case GlobalTime:
        return r.DataTimeType == 2 && Give(value, r.GlobalTime);
    case StartRow:
        return Give(value, r.StartRow);
    case UnitTypeRow:
        return r.UseUnitTypeRow && r.UseUnitTypeOption != 2 && Give(value, r.UnitTypeRow);
    case UnitRow:
        return r.UseUnitRow && r.UseUnitOption != 2 && Give(value, r.UnitRow);
    case GlobalUnitType:
        return !r.UseUnitTypeRow && r.UseUnitTypeOption != 2 && Give(value, r.GlobalUnitType);
    case GlobalUnit:
        return !r.UseUnitRow && r.UseUnitOption != 2 && Give(value, r.GlobalUnit);
    case ValueTypeRow:
        return r.UseValueTypeRow && r.UseValueTypeOption != 2 && Give(value, r.ValueTypeRow);
    case GlobalValueType:
        return !r.UseValueTypeRow && r.UseValueTypeOption != 2 && Give(value, r.GlobalValueType);
    case ItemDescriptionRow:
        return r.UseItemTitleOption != 1 && Give(value, r.ItemDescriptionRow);
    case DeleteValue:
        return r.UseDelValNotEmpty && !r.UseDeleteValueRow && Give(value, r.DeleteValue);
    case DelValRow:
        return r.UseDelValNotEmpty && r.UseDeleteValueRow && Give(value, r.DeleteValueRow);
    case ExcelSheet:
        return Give(value, r.ExcelSheet);
    default:
        return false;
    }
}

bool CSpecification::GetSaveKeyValue(const SaveSpecification &record, int key,
                                     std::string &value) const
{
    value.clear();
    const SaveSpecification &r = record;
    switch (key) {
    case DateTimeCol:
        return r.DateTimeCol != 0 && Give(value, r.DateTimeCol);
    case DateTimeFormat:
        return r.UseDTFormat && !r.DateTimeFormat.empty() && Give(value, r.DateTimeFormat);
    case StartRow:
        return r.StartRow != 0 && Give(value, r.StartRow);
    case UnitTypeRow:
        return r.UnitTypeRow != 0 && Give(value, r.UnitTypeRow);
    case UnitRow:
        return r.UnitRow != 0 && Give(value, r.UnitRow);
    case ValueTypeRow:
        return r.ValueTypeRow != 0 && Give(value, r.ValueTypeRow);
    case ItemDescriptionRow:
        return r.ItemDescriptionRow != 0 && Give(value, r.ItemDescriptionRow);
    case DelValRow:
        return r.UseDelValNotEmpty && r.DeleteValueRow != 0 && Give(value, r.DeleteValueRow);
    default:
        return false;
    }
}

bool CSpecification::OpenSpecificationToString(const OpenSpecification &record, std::string &spec)
{
    std::string value;
    for (int key = 0; key < kParsingTypeCount; ++key)
        if (GetOpenKeyValue(record, key, value)) KeyValues[PARSINGTYPE(key)] = value;
    return JoinKeyValues(spec);
}

bool CSpecification::SaveSpecificationToString(const SaveSpecification &record, std::string &spec)
{
    std::string value;
    for (int key = 0; key < kParsingTypeCount; ++key)
        if (GetSaveKeyValue(record, key, value)) KeyValues[PARSINGTYPE(key)] = value;
    return JoinKeyValues(spec);
}

bool CSpecification::JoinKeyValues(std::string &spec) const
{
    spec.clear();
    std::string name;
    for (int key = 0; key < kParsingTypeCount; ++key) {
        const auto it = KeyValues.find(PARSINGTYPE(key));
        if (it == KeyValues.end() || !GetKeyName(key, name)) continue;
        spec += name;
        spec += '=';
        spec += it->second;
        spec += ';';
    }
    return !spec.empty();
}
