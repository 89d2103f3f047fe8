// SPDX-License-Identifier: MIT
#include "styles/format_bridge.h"

#include "workbook/format/builtin_formats.h"
#include "workbook/format/column_width.h"
#include "workbook/format/display_text.h"
#include "workbook/format/format_code.h"
#include "workbook/format/typed_text.h"

namespace workbook::format_bridge {
namespace {

format::CellContent ContentOf(const CellValue &value)
{
    struct Visit {
        format::CellContent operator()(std::monostate) const { return std::monostate{}; }
        format::CellContent operator()(double d) const { return d; }
        format::CellContent operator()(const std::string &s) const { return s; }
        format::CellContent operator()(bool b) const { return b; }
        format::CellContent operator()(CellError e) const { return format::ErrorValue{std::string(ErrorText(e))}; }
    };
    return std::visit(Visit{}, value);
}

}  // namespace

std::optional<std::string> BuiltinFormatCode(uint32_t id)
{
    if (id > 49) return std::nullopt;
    std::string code = format::BuiltinFormatCode(static_cast<int>(id));
    if (code.empty()) return std::nullopt;
    return code;
}

std::optional<uint32_t> BuiltinFormatId(std::string_view code)
{
    int id = format::BuiltinFormatId(code);
    if (id < 0) return std::nullopt;
    return static_cast<uint32_t>(id);
}

std::string DisplayText(const CellValue &value, std::string_view code, bool date1904)
{
    try {
        return format::DisplayText(ContentOf(value), code, date1904);
    } catch (const format::FormatCodeError &) {
        // A code the renderer can't read: the cell shows as General does.
        return format::DisplayText(ContentOf(value), "General", date1904);
    }
}

TypedEntry ReadTyped(std::string_view text, bool date1904)
{
    format::TypedValue typed = format::ParseTypedText(text);
    TypedEntry entry;
    entry.numberFormat = typed.numberFormat;
    switch (typed.kind) {
    case format::TypedKind::Number: entry.value = typed.value; break;
    case format::TypedKind::Date:
        if (!date1904 || typed.value < 1.0) {
            entry.value = typed.value;  // a time of day alone is the same in both systems
        } else if (typed.value >= kDays1900To1904) {
            entry.value = typed.value - kDays1900To1904;
        } else {
            entry.value = std::string(text);
            entry.numberFormat.clear();
        }
        break;
    case format::TypedKind::Boolean: entry.value = typed.value != 0.0; break;
    case format::TypedKind::Text: entry.value = std::string(text); break;
    }
    return entry;
}

double FittingWidth(const std::vector<std::string> &texts)
{
    return format::AutoFitWidth(std::span<const std::string>(texts.data(), texts.size()));
}

double TextFittingWidth(std::string_view text) { return format::TextWidth(text); }

double GeneralNumberFittingWidth(double value) { return format::GeneralNumberWidth(value); }

}  // namespace workbook::format_bridge
