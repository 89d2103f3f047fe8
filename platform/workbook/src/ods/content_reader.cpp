// SPDX-License-Identifier: MIT
#include "ods/content_reader.h"

#include <algorithm>
#include <cmath>

#include "errors.h"
#include "ods/ods_values.h"
#include "ods/ods_xml.h"
#include "workbook/format/date_format.h"
#include "workbook/limits.h"

namespace workbook::ods {
namespace {

constexpr std::string_view kDrawNs = "urn:oasis:names:tc:opendocument:xmlns:drawing:1.0";

// What a cell costs the converted book beside its text: its tag, reference
// and value.
constexpr uint64_t kCellOverhead = 32;

// What repeated cells may add to the converted book, the first copy of each
// not counted: a file of a few bytes may ask for no more than this. Real
// files repeat a value over a column or a block, far below it.
constexpr uint64_t kMaxRepeatedBytes = uint64_t{256} << 20;

// Positions past the sheet's edge are all alike: counting stops there.
constexpr uint64_t kBeyondRows = uint64_t{limits::kMaxRows} + 1;
constexpr uint64_t kBeyondColumns = uint64_t{limits::kMaxColumns} + 1;

uint64_t Advance(uint64_t position, uint64_t count, uint64_t beyond)
{
    return count >= beyond ? beyond : std::min(position + count, beyond);
}

uint64_t TextBytes(const CellValue &value)
{
    const std::string *text = std::get_if<std::string>(&value);
    return text ? text->size() : 0;
}

}  // namespace

[[noreturn]] void ContentReader::FailAt(const std::string &what) const
{
    std::string where = "sheet '" + sheetName_ + "'";
    if (rowDepth_) where += ", row " + std::to_string(row_);
    if (cellDepth_) where += ", column " + std::to_string(column_);
    Fail(kBadFile, where + ": " + what);
}

uint64_t ContentReader::Repeat(const xml::Attributes &attrs, const char *attribute) const
{
    const std::string_view text = Attr(attrs, kTableNs, attribute);
    if (text.empty()) return 1;
    const auto count = ParseCount(text);
    if (!count) FailAt(std::string("table:") + attribute + " '" + std::string(text.substr(0, 40)) + "' is no count");
    return *count;
}

void ContentReader::OnStart(const xml::Name &name, const xml::Attributes &attrs)
{
    ++depth_;
    if (stylesDepth_) return styles_.OnStart(name, attrs);
    if (skipDepth_) return;
    if (cellDepth_) return StartInCell(name, attrs);
    if (!spreadsheetDepth_) {
        if (Is(name, kOfficeNs, "automatic-styles")) stylesDepth_ = depth_;
        else if (Is(name, kOfficeNs, "spreadsheet")) spreadsheetDepth_ = depth_;
        return;
    }
    if (!tableDepth_) {
        if (Is(name, kTableNs, "table") && depth_ == spreadsheetDepth_ + 1) {
            tableDepth_ = depth_;
            StartTable(attrs);
        } else if (Is(name, kTableNs, "null-date")) {
            const std::string_view date = Attr(attrs, kTableNs, "date-value");
            const auto serial = ParseDateValue(date.empty() ? "1899-12-30" : date);
            if (!serial) Fail(kBadFile, "the null date '" + std::string(date.substr(0, 40)) + "' can't be read");
            // Serials before March 1900 count the phantom 29 February.
            nullDateShift_ = *serial < 61 ? *serial + 1 : *serial;
        }
        return;
    }
    if (rowDepth_) {
        if (depth_ == rowDepth_ + 1 && (Is(name, kTableNs, "table-cell") || Is(name, kTableNs, "covered-table-cell"))) {
            cellDepth_ = depth_;
            StartCell(attrs);
        } else {
            skipDepth_ = depth_;
        }
    } else if (Is(name, kTableNs, "table-row")) {
        rowDepth_ = depth_;
        StartRow(attrs);
    } else if (Is(name, kTableNs, "table-column")) {
        StartColumn(attrs);
    } else if (Is(name, kTableNs, "table") || name.ns == kDrawNs || Is(name, kOfficeNs, "forms")) {
        skipDepth_ = depth_;  // a table inside a shape, drawings: not the sheet's cells
    }
}

void ContentReader::OnEnd(const xml::Name &name)
{
    const int depth = depth_--;
    if (stylesDepth_) {
        if (depth == stylesDepth_) stylesDepth_ = 0;
        else styles_.OnEnd(name);
    } else if (skipDepth_) {
        if (depth == skipDepth_) skipDepth_ = 0;
    } else if (depth == paragraphDepth_) {
        paragraphDepth_ = 0;
    } else if (depth == cellDepth_) {
        EndCell();
        cellDepth_ = 0;
    } else if (depth == rowDepth_) {
        EndRow();
        rowDepth_ = 0;
    } else if (depth == tableDepth_) {
        tableDepth_ = 0;
    } else if (depth == spreadsheetDepth_) {
        spreadsheetDepth_ = 0;
    }
}

void ContentReader::OnText(std::string_view text)
{
    if (stylesDepth_) return styles_.OnText(text);
    if (!paragraphDepth_ || skipDepth_) return;
    try {
        text_.AddText(text);
    } catch (const automation::ComError &e) {
        FailAt(e.what());
    }
}

void ContentReader::StartTable(const xml::Attributes &attrs)
{
    sheetName_ = Attr(attrs, kTableNs, "name");
    book_.AddSheet(sheetName_);
    columnStyles_.clear();
    nextColumnDefinition_ = 1;
    row_ = 1;
}

void ContentReader::StartColumn(const xml::Attributes &attrs)
{
    const uint64_t count = Repeat(attrs, "number-columns-repeated");
    const std::string_view style = Attr(attrs, kTableNs, "default-cell-style-name");
    if (!style.empty() && nextColumnDefinition_ < kBeyondColumns)
        columnStyles_.push_back({nextColumnDefinition_, Advance(nextColumnDefinition_, count, kBeyondColumns) - 1,
                                 std::string(style)});
    nextColumnDefinition_ = Advance(nextColumnDefinition_, count, kBeyondColumns);
}

const std::string &ContentReader::DefaultStyleOfColumn(uint64_t column) const
{
    static const std::string none;
    const auto after = std::upper_bound(columnStyles_.begin(), columnStyles_.end(), column,
                                        [](uint64_t c, const ColumnStyle &s) { return c < s.first; });
    if (after == columnStyles_.begin() || std::prev(after)->last < column) return none;
    return std::prev(after)->style;
}

void ContentReader::StartRow(const xml::Attributes &attrs)
{
    rowRepeat_ = Repeat(attrs, "number-rows-repeated");
    rowStyle_ = Attr(attrs, kTableNs, "default-cell-style-name");
    runs_.clear();
    column_ = 1;
}

void ContentReader::StartCell(const xml::Attributes &attrs)
{
    cell_ = CellAttributes{};
    cell_.repeat = Repeat(attrs, "number-columns-repeated");
    cell_.type = Attr(attrs, kOfficeNs, "value-type");
    cell_.value = Attr(attrs, kOfficeNs, "value");
    cell_.dateValue = Attr(attrs, kOfficeNs, "date-value");
    cell_.timeValue = Attr(attrs, kOfficeNs, "time-value");
    cell_.booleanValue = Attr(attrs, kOfficeNs, "boolean-value");
    const char *stringValue = attrs.FindNs("string-value", [](std::string_view uri) { return uri == kOfficeNs; });
    cell_.hasStringValue = stringValue != nullptr;
    if (stringValue) cell_.stringValue = stringValue;
    cell_.style = Attr(attrs, kTableNs, "style-name");
    cell_.resultType = Attr(attrs, kCalcExtNs, "value-type");
    text_.Clear();
}

void ContentReader::StartInCell(const xml::Name &name, const xml::Attributes &attrs)
{
    try {
        if (!paragraphDepth_) {
            // Paragraphs, in lists too; notes, shapes and anything else are no part of the cell's text.
            if (name.ns == kTextNs && (name.local == "p" || name.local == "h")) {
                paragraphDepth_ = depth_;
                text_.StartParagraph();
            } else if (!(name.ns == kTextNs && (name.local == "list" || name.local == "list-item"))) {
                skipDepth_ = depth_;
            }
        } else if (name.ns == kTextNs && name.local == "s") {
            const std::string_view count = Attr(attrs, kTextNs, "c");
            const auto spaces = count.empty() ? std::optional<uint64_t>(1) : ParseCount(count);
            if (!spaces) FailAt("text:c '" + std::string(count.substr(0, 40)) + "' is no count");
            text_.AddSpaces(*spaces);
        } else if (name.ns == kTextNs && name.local == "tab") {
            text_.AddTab();
        } else if (name.ns == kTextNs && name.local == "line-break") {
            text_.AddLineBreak();
        } else if ((name.ns == kTextNs && (name.local == "note" || name.local == "ruby-text")) ||
                   name.ns == kDrawNs || name.ns == kOfficeNs) {
            skipDepth_ = depth_;
        }
    } catch (const automation::ComError &e) {
        FailAt(e.what());
    }
}

CellValue ContentReader::ValueOfCell(std::string &format)
{
    const std::string &type = cell_.type;
    if (type == "float" || type == "percentage" || type == "currency") {
        if (cell_.value.empty()) return text_.Take();  // no value: what the cell shows
        const auto number = ParseNumber(cell_.value);
        // One that doesn't read reads as in any workbook: #NUM!, listed.
        cell_.unreadableNumber = !number || !std::isfinite(*number);
        if (cell_.unreadableNumber) return CellError::Num;
        // A date format shows days from the file's null date.
        if (nullDateShift_ != 0 && format::IsDateFormat(format)) return *number + nullDateShift_;
        return *number;
    }
    if (type == "date") {
        const auto serial = ParseDateValue(cell_.dateValue);
        if (!serial) FailAt("the date '" + cell_.dateValue.substr(0, 40) + "' can't be read");
        if (!format::IsDateFormat(format)) format = *serial == int64_t(*serial) ? "yyyy-mm-dd" : "yyyy-mm-dd hh:mm:ss";
        return *serial;
    }
    if (type == "time") {
        const auto days = ParseDuration(cell_.timeValue);
        if (!days) FailAt("the time '" + cell_.timeValue.substr(0, 40) + "' can't be read");
        if (!format::IsDateFormat(format)) format = *days >= 1 || *days < 0 ? "[h]:mm:ss" : "hh:mm:ss";
        return *days;
    }
    if (type == "boolean") {
        const std::string &flag = cell_.booleanValue;
        if (flag == "true" || flag == "1") return true;
        if (flag == "false" || flag == "0") return false;
        FailAt("the truth value '" + flag.substr(0, 40) + "' can't be read");
    }
    format.clear();  // texts show as they are
    std::string text = cell_.hasStringValue ? cell_.stringValue : text_.Take();
    if (cell_.resultType == "error")
        if (const auto error = ErrorFromText(text)) return *error;
    return text;  // an empty one is an empty cell
}

void ContentReader::EndCell()
{
    const uint64_t first = column_;
    const std::string &style = !cell_.style.empty() ? cell_.style : !rowStyle_.empty() ? rowStyle_ : DefaultStyleOfColumn(first);
    std::string format = style.empty() ? std::string() : styles_.FormatOf(style);
    CellValue value = ValueOfCell(format);
    column_ = Advance(column_, cell_.repeat, kBeyondColumns);
    if (std::holds_alternative<std::monostate>(value)) return;
    if (const std::string *text = std::get_if<std::string>(&value); text && text->empty()) return;
    if (first + cell_.repeat - 1 > limits::kMaxColumns || cell_.repeat > limits::kMaxColumns)
        Fail(kBadFile, "sheet '" + sheetName_ + "', row " + std::to_string(row_) + ": a cell repeated over " + std::to_string(cell_.repeat) + " columns reaches beyond the sheet's last column " +
               std::to_string(limits::kMaxColumns));
    runs_.push_back({uint32_t(first), uint32_t(cell_.repeat), std::move(value), std::move(format),
                     cell_.unreadableNumber ? cell_.value : std::string()});
}

void ContentReader::EndRow()
{
    if (runs_.empty()) {
        row_ = Advance(row_, rowRepeat_, kBeyondRows);
        return;
    }
    if (row_ + rowRepeat_ - 1 > limits::kMaxRows || rowRepeat_ > limits::kMaxRows)
        FailAt("its cells reach beyond the sheet's last row " + std::to_string(limits::kMaxRows) +
               (rowRepeat_ > 1 ? " (the row is repeated " + std::to_string(rowRepeat_) + " times)" : std::string()));
    // Every copy past the first of each cell costs memory the file doesn't
    // spend: a bound keeps a small file from asking for gigabytes.
    uint64_t copies = 0;
    for (const Run &run : runs_) copies += (uint64_t{run.count} * rowRepeat_ - 1) * (kCellOverhead + TextBytes(run.value));
    expandedBytes_ += copies;
    if (expandedBytes_ > kMaxRepeatedBytes)
        FailAt("its repeated cells expand to more than 256 MiB; the file is refused as an allocation bomb");
    for (uint64_t r = 0; r < rowRepeat_; ++r)
        for (const Run &run : runs_)
            for (uint32_t k = 0; k < run.count; ++k)
                book_.Put(uint32_t(row_ + r), run.column + k, run.value, run.format, run.storedNumber);
    row_ += rowRepeat_;
}

}  // namespace workbook::ods
