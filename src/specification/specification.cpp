// SPDX-License-Identifier: MIT
#include "specification/specification.h"

#include <array>

#include "specification/tokenizer.h"

namespace {

constexpr std::array<const char *, kParsingTypeCount> kKeyNames = {
    "DateCol",        "TimeCol",      "DateTimeCol",        "DateFormat",
    "TimeFormat",     "DateTimeFormat", "GlobalDate",       "GlobalTime",
    "StartRow",       "UnitTypeRow",  "UnitRow",            "GlobalUnitType",
    "GlobalUnit",     "ValueTypeRow", "GlobalValueType",    "ItemDescriptionRow",
    "DeleteValue",    "DelValRow",    "ExcelSheet",         "TemplateFilePath",
    "SaveTemplateFilePath", "FilePath",
};

// Keys that may be read as numbers. GlobalUnitType and GlobalUnit pass this
// test although their users read them as text.
bool IsNumericKey(int key)
{
    switch (key) {
    case DateCol:
    case TimeCol:
    case DateTimeCol:
    case StartRow:
    case UnitTypeRow:
    case UnitRow:
    case GlobalUnitType:
    case GlobalUnit:
    case ValueTypeRow:
    case ItemDescriptionRow:
    case DelValRow:
        return true;
    default:
        return false;
    }
}

}  // namespace

bool CSpecification::GetKeyName(int key, std::string &name) const
{
    if (key < 0 || key >= kParsingTypeCount) {
        name.clear();
        return false;
    }
    name = kKeyNames[key];
    return true;
}

bool CSpecification::GetKeyValue(const std::string &spec, int key, std::string &value) const
{
    std::string name;
    if (!GetKeyName(key, name)) return false;
    // Piece by piece, stopping at the first match: splitting the whole string
    // first would cost its full length on every read.
    const std::string_view text(spec);
    size_t pos = 0;
    while (pos < text.size()) {
        size_t end = text.find(';', pos);
        if (end == std::string_view::npos) end = text.size();
        const auto tokens = vantrel::SplitPieces(text.substr(pos, end - pos), "=");
        pos = end + 1;
        if (tokens.empty() || tokens[0] != name) continue;
        value = tokens.size() > 1 ? std::string(tokens[1]) : std::string();
        return true;
    }
    return false;
}

bool CSpecification::GetKeyValueInt(const std::string &spec, int key, int &value) const
{
    if (!IsNumericKey(key)) return false;
    std::string text;
    if (!GetKeyValue(spec, key, text)) return false;
    value = vantrel::LeadingInt(text);
    return true;
}
