// SPDX-License-Identifier: MIT
#include "bridge/header_cells.h"

#include <charconv>
#include <cmath>
#include <climits>
#include <string>

namespace vantrel::bridge {

namespace {

std::string_view TrimBlanks(std::string_view text)
{
    const auto first = text.find_first_not_of(" \t\r\n");
    if (first == std::string_view::npos) return {};
    const auto last = text.find_last_not_of(" \t\r\n");
    return text.substr(first, last - first + 1);
}

// A cut part of a text: as an integer when it reads as one, else as text.
// Blanks around the part are dropped, so "Water Level [meter]" names the
// type "Water Level".
automation::Variant PartAsValue(std::string_view part)
{
    const std::string_view trimmed = TrimBlanks(part);
    if (const auto number = TextAsInteger(trimmed)) return automation::Variant::I4(*number);
    return automation::Variant::String(trimmed);
}

std::string CellText(const automation::Variant &cell) { return automation::BstrToUtf8(cell.Raw().bstrVal); }

}  // namespace

std::optional<int> TextAsInteger(std::string_view text)
{
    text = TrimBlanks(text);
    if (!text.empty() && text.front() == '+') text.remove_prefix(1);
    if (text.empty()) return std::nullopt;
    int value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
    return value;
}

bool EqualsIgnoringCase(std::string_view a, std::string_view b)
{
    if (a.size() != b.size()) return false;
    for (size_t i = 0; i < a.size(); ++i) {
        const auto lower = [](char c) { return (c >= 'A' && c <= 'Z') ? char(c - 'A' + 'a') : c; };
        if (lower(a[i]) != lower(b[i])) return false;
    }
    return true;
}

automation::Variant NormalizeTypeCell(const automation::Variant &cell)
{
    if (cell.Type() != VT_BSTR) return cell;
    std::string_view text;
    const std::string whole = CellText(cell);
    text = whole;
    text = text.substr(0, text.find('['));
    text = text.substr(0, text.find(':'));
    return PartAsValue(text);
}

// A whole number in a cell that isn't text, as an integer; the cell as it is otherwise.
automation::Variant WholeNumberCell(const automation::Variant &cell)
{
    automation::Variant number;
    if (SUCCEEDED(VariantChangeType(number.Out(), &cell.Raw(), 0, VT_R8)) && cell.Type() != VT_EMPTY &&
        cell.Type() != VT_BOOL) {
        const double value = number.Raw().dblVal;
        if (std::floor(value) == value && value >= INT_MIN && value <= INT_MAX)
            return automation::Variant::I4(LONG(value));
    }
    return cell;
}

automation::Variant NormalizeUnitCell(const automation::Variant &cell)
{
    // A whole number in a cell of another kind is a unit identifier.
    if (cell.Type() != VT_BSTR) return WholeNumberCell(cell);
    const std::string whole = CellText(cell);
    std::string_view text = whole;
    const auto open = text.find('[');
    if (open != std::string_view::npos) {
        text = text.substr(open + 1);
        text = text.substr(0, text.find(']'));
    } else {
        // "unit:value type", as an export writes a row that the unit and the
        // value type share.
        text = text.substr(0, text.find(':'));
    }
    return PartAsValue(text);
}

automation::Variant NormalizeValueTypeCell(const automation::Variant &cell)
{
    // A value type beyond the named ones is written as its number.
    if (cell.Type() != VT_BSTR) return WholeNumberCell(cell);
    const std::string whole = CellText(cell);
    std::string_view text = whole;
    const auto colon = text.find(':');
    if (colon != std::string_view::npos) text = text.substr(colon + 1);
    return PartAsValue(text);
}

}  // namespace vantrel::bridge
