// SPDX-License-Identifier: MIT
#include "cell_put.h"

#include <bit>
#include <string>

#include "format_bridge.h"

namespace workbook {
namespace {

// Number formats a date put through Value gives a cell that has none.
constexpr uint32_t kDateFormatId = 14;      // the short date
constexpr uint32_t kDateTimeFormatId = 22;  // the short date with hours and minutes

}  // namespace

void PutCell(Document &doc, CellStore &store, uint32_t row, uint32_t column, const PutValue &in, bool asValue)
{
    Styles &styles = doc.CellFormats();
    CellValue value = in.value;
    std::string typedFormat;
    if (in.typedText) {
        const std::string &text = std::get<std::string>(value);
        if (text.empty()) {
            value = std::monostate{};
        } else {
            format_bridge::TypedEntry typed = format_bridge::ReadTyped(text, doc.Date1904());
            value = std::move(typed.value);
            typedFormat = std::move(typed.numberFormat);
        }
    }
    if (std::holds_alternative<std::monostate>(value)) {
        store.SetValue(row, column, CellKind::Empty, 0);
    } else if (auto *d = std::get_if<double>(&value)) {
        store.SetValue(row, column, CellKind::Number, std::bit_cast<uint64_t>(*d));
    } else if (auto *s = std::get_if<std::string>(&value)) {
        store.SetValue(row, column, CellKind::String, doc.Strings().Intern(*s));
    } else if (auto *b = std::get_if<bool>(&value)) {
        store.SetValue(row, column, CellKind::Boolean, *b ? 1 : 0);
    } else if (auto *e = std::get_if<CellError>(&value)) {
        store.SetValue(row, column, CellKind::Error, static_cast<uint64_t>(*e));
    }
    // Only a date or a typed text can change the cell's format: a plain value
    // skips the look-up of its style.
    const bool dateIn = asValue && in.wasDate && std::holds_alternative<double>(value);
    if (!dateIn && typedFormat.empty()) return;
    const bool general = styles.NumberFormatIdOf(store.StyleOf(row, column)) == 0;
    if (!general) return;
    if (dateIn) {
        double serial = std::get<double>(value);
        uint32_t id = serial == static_cast<double>(static_cast<int64_t>(serial)) ? kDateFormatId : kDateTimeFormatId;
        store.SetStyle(row, column, styles.WithNumberFormatId(store.StyleOf(row, column), id));
    } else {
        store.SetStyle(row, column, styles.WithNumberFormat(store.StyleOf(row, column), typedFormat));
    }
}

}  // namespace workbook
