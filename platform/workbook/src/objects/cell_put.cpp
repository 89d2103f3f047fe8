// SPDX-License-Identifier: MIT
#include "objects/cell_put.h"

#include <bit>
#include <string>

#include "errors.h"
#include "styles/format_bridge.h"

namespace workbook {
namespace {

// Number formats a date put through Value gives a cell that has none.
constexpr uint32_t kDateFormatId = 14;      // the short date
constexpr uint32_t kDateTimeFormatId = 22;  // the short date with hours and minutes

// A date value (days since 1899-12-30) as the serial of the workbook's date
// system, so that the cell shows the same date in either. A time of day alone
// (under one day) is the same fraction in both; a day before 1904-01-01 has
// no serial in the 1904 system and is refused.
double SerialOfDate(double date, bool date1904)
{
    if (!date1904 || date < 1.0) return date;
    if (date >= format_bridge::kDays1900To1904) return date - format_bridge::kDays1900To1904;
    Fail(kRequestRefused, "the date " + format_bridge::DisplayText(date, "yyyy-mm-dd", false) +
                              " lies before 1904-01-01, the first day of this workbook's 1904 date system: "
                              "it can't go into a cell of this workbook");
}

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
        } else if (!styles.IsText(store.StyleOf(row, column))) {
            // Under the Text format an entry stays the text it is.
            format_bridge::TypedEntry typed = format_bridge::ReadTyped(text, doc.Date1904());
            value = std::move(typed.value);
            typedFormat = std::move(typed.numberFormat);
        }
    }
    const bool dateIn = in.wasDate && std::holds_alternative<double>(value);
    if (dateIn) value = SerialOfDate(std::get<double>(value), doc.Date1904());
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
    const bool dateFormatWanted = asValue && dateIn;
    if (!dateFormatWanted && typedFormat.empty()) return;
    if (!styles.IsGeneral(store.StyleOf(row, column))) return;
    if (dateFormatWanted) {
        double serial = std::get<double>(value);
        uint32_t id = serial == static_cast<double>(static_cast<int64_t>(serial)) ? kDateFormatId : kDateTimeFormatId;
        store.SetStyle(row, column, styles.WithNumberFormatId(store.StyleOf(row, column), id));
    } else {
        store.SetStyle(row, column, styles.WithNumberFormat(store.StyleOf(row, column), typedFormat));
    }
}

}  // namespace workbook
