// SPDX-License-Identifier: MIT
// The checks a loaded template must pass before its record is used.
#include <string>

#include "automation/automation.h"
#include "automation/values.h"
#include "module/string_table.h"
#include "specification/specification.h"

namespace {

constexpr int kMessageNegativeRows = 137;
constexpr int kMessageStartRowNotBelow = 115;
constexpr int kMessageTitleRowShared = 116;

// Both global texts are tried as dates alone in the user's locale; the value
// itself is not used.
bool ParsesAsDate(const std::string &text)
{
    const automation::Bstr wide(text);
    DATE ignored = 0;
    return SUCCEEDED(VarDateFromStr(wide.Get(), LOCALE_USER_DEFAULT, VAR_DATEVALUEONLY, &ignored));
}

}  // namespace

bool CSpecification::CheckOpenRows(const OpenSpecification &r) const
{
    if (r.UseUnitTypeRow == 1 && r.UnitTypeRow >= r.StartRow) return false;
    if (r.UseUnitRow == 1 && r.UnitRow >= r.StartRow) return false;
    if (r.UseValueTypeRow == 1 && r.ValueTypeRow >= r.StartRow) return false;
    if (r.UseItemTitleOption == 1) return true;
    if (r.ItemDescriptionRow >= r.StartRow) return false;
    if (r.UseUnitTypeRow == 1 && r.ItemDescriptionRow == r.UnitTypeRow) return false;
    if (r.UseUnitRow == 1 && r.ItemDescriptionRow == r.UnitRow) return false;
    if (r.UseValueTypeRow == 1 && r.ItemDescriptionRow == r.ValueTypeRow) return false;
    return true;
}

bool CSpecification::CheckOpenSpecification(const OpenSpecification &r) const
{
    return ParsesAsDate(r.GlobalTime) && ParsesAsDate(r.GlobalDate) && CheckOpenRows(r);
}

bool CSpecification::CheckSaveRows(const SaveSpecification &r, std::string &error) const
{
    bool ok = true;
    const bool negative = r.UnitTypeRow < 1 || r.UnitRow < 1 || r.ValueTypeRow < 1 ||
                          r.ItemDescriptionRow < 1 || r.StartRow < 1;
    if (negative) {
        error = vantrel::LoadMessage(kMessageNegativeRows);
        ok = false;
    }
    if (r.UnitTypeRow >= r.StartRow || r.UnitRow >= r.StartRow || r.ValueTypeRow >= r.StartRow ||
        r.ItemDescriptionRow >= r.StartRow) {
        error = vantrel::LoadMessage(kMessageStartRowNotBelow);
        ok = false;
    }
    if (!negative && (r.ItemDescriptionRow == r.UnitTypeRow || r.ItemDescriptionRow == r.UnitRow ||
                      r.ItemDescriptionRow == r.ValueTypeRow)) {
        error = vantrel::LoadMessage(kMessageTitleRowShared);
        ok = false;
    }
    return ok;
}
