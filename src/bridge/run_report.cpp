// SPDX-License-Identifier: MIT
#include "bridge/run_report.h"

#include "automation/text.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace vantrel::bridge {

namespace {

// A piece of input as a warning quotes it: short, and escaped.
std::string Quoted(std::string_view text) { return automation::MessageExcerpt(text); }

std::string SheetPlace(int sheet) { return "sheet " + std::to_string(sheet); }

std::string Consequence(const std::string &attribute)
{
    if (attribute == "item type") return "the items of the sheet are read without item type and unit";
    if (attribute == "unit") return "the items of the sheet are read without unit";
    return "the items of the sheet are read without value type";
}

}  // namespace

std::string ColumnName(int column)
{
    std::string name;
    for (; column > 0; column = (column - 1) / 26) name.insert(name.begin(), char('A' + (column - 1) % 26));
    return name;
}

std::string NumberText(double value)
{
    std::array<char, 32> buffer{};
    const auto result = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value);
    return std::string(buffer.data(), result.ptr);
}

void RunReport::Reset() { *this = RunReport(); }

void RunReport::Add(std::string line)
{
    // A run may meet the same cause twice (a sheet named twice): told once.
    if (std::find(m_warnings.begin(), m_warnings.end(), line) == m_warnings.end()) m_warnings.push_back(std::move(line));
}

std::string RunReport::WarningLines() const
{
    std::string lines;
    for (const std::string &warning : m_warnings) lines += warning + "\n";
    return lines;
}

void RunReport::UnknownKey(std::string_view piece)
{
    Add("specification string, " + Quoted(piece) + ": unknown key, ignored; check its spelling");
}

void RunReport::KeyInOtherCase(std::string_view piece, std::string_view key)
{
    Add("specification string, " + Quoted(piece) + ": keys match in case only, so it is ignored; write " +
        std::string(key));
}

void RunReport::KeyWithBlanks(std::string_view piece, std::string_view key)
{
    Add("specification string, " + Quoted(piece) + ": a blank around the key " + std::string(key) +
        ", so it is ignored; remove the blank");
}

void RunReport::TemplateNotLoaded(std::string_view path, std::string_view reason)
{
    std::string line = "template " + automation::MessageExcerpt(path, path.size()) + " did not load";
    if (!reason.empty()) line += " (" + std::string(reason) + ")";
    Add(line + "; its settings are not used; fix the template or name another");
}

void RunReport::FormatCaseSlip(std::string_view key, std::string_view format, std::string_view token,
                               std::string_view neighbour, bool minutesForMonth)
{
    std::string line = std::string(key) + " " + Quoted(format) + ": " + Quoted(token) + " beside " +
                       Quoted(neighbour);
    if (minutesForMonth) {
        std::string month(token);
        std::fill(month.begin(), month.end(), 'M');
        line += " reads minutes, not the month; write " + Quoted(month) + " for the month";
    } else {
        std::string minutes(token);
        std::fill(minutes.begin(), minutes.end(), 'm');
        line += " reads the month, not minutes; write " + Quoted(minutes) + " for minutes";
    }
    Add(line);
}

void RunReport::DeleteValueNotANumber(std::string_view text, float used)
{
    Add("specification string, DeleteValue " + Quoted(text) + ": not a number, so " + NumberText(double(used)) +
        " marks missing values; write a number such as -9999");
}

void RunReport::RowsAfterBlank(int sheet, int blankRow, int dataRow)
{
    Add(SheetPlace(sheet) + ", row " + std::to_string(blankRow) +
        ": the date/time cell is blank, so the rows from here on are not read (row " + std::to_string(dataRow) +
        " holds data); fill the cell or delete the row");
}

void RunReport::ColumnsAfterEmpty(int sheet, int lastRead, int dataColumn)
{
    std::string line = SheetPlace(sheet) + ", column " + ColumnName(dataColumn) +
                       ": holds data but is not read, as the read ends at column " + ColumnName(lastRead);
    if (dataColumn > lastRead + 1) line += " before the empty column " + ColumnName(lastRead + 1);
    Add(line + "; delete the empty column or move the data beside the others");
}

void RunReport::Unresolved(int sheet, const UnresolvedAttribute &what)
{
    // No source at all leaves the attribute unset by design: nothing to tell.
    if (what.attribute.empty() || (what.filled == 0 && what.row == 0)) return;
    std::string line = SheetPlace(sheet);
    if (what.filled >= 0 && what.row == 0) {
        Add(line + ", column " + ColumnName(what.column) + ": the template's list gives " +
            std::to_string(what.filled) + " " + what.attribute + "s for " + std::to_string(what.columnCount) +
            " columns; " + Consequence(what.attribute) + "; give one a column");
        return;
    }
    if (what.filled >= 0) {
        line += ", row " + std::to_string(what.row) + ": " + std::to_string(what.filled) + " of " +
                std::to_string(what.columnCount) + " cells from column " + ColumnName(what.column) + " give the " +
                what.attribute + "; " + Consequence(what.attribute) + "; fill one cell for all columns or one a column";
        Add(line);
        return;
    }
    if (what.source.empty() && what.row > 0) line += ", row " + std::to_string(what.row);
    if (what.column > 0) line += ", column " + ColumnName(what.column);
    if (!what.source.empty()) line += ", " + what.source;
    line += ": the " + what.attribute + " " + Quoted(what.text) + " is not known";
    if (what.attribute == "unit") line += " for the column's item type";
    line += "; " + Consequence(what.attribute) + "; write a name from the catalogue";
    Add(line);
}

void RunReport::BeyondFloat(int sheet, int row, int column, double value, int count)
{
    std::string line = SheetPlace(sheet) + ", row " + std::to_string(row) + ", column " + ColumnName(column) + ": " +
                       NumberText(value) + " is beyond the 32-bit float range and reads as infinity";
    if (count > 1) line += " (" + std::to_string(count) + " values of the sheet)";
    Add(line + "; scale the values or mark them missing");
}

namespace {

std::string MoreCells(size_t count)
{
    if (count < 2) return {};
    return " (and " + std::to_string(count - 1) + (count == 2 ? " more cell)" : " more cells)");
}

}  // namespace

void RunReport::UnreadableNumbers(int sheet, int row, int column, std::string_view excerpt, bool underflow,
                                  size_t count)
{
    std::string line = SheetPlace(sheet) + ", cell " + ColumnName(column) + std::to_string(row) + ": the stored number " +
                       std::string(excerpt);
    line += underflow ? " is too small for a cell to tell from 0; it reads as 0"
                      : " is no number a cell can hold; it reads as #NUM! and imports as the delete value";
    Add(line + MoreCells(count));
}

void RunReport::InfinitiesWritten(int row, int column, int item, long step, double value, size_t count)
{
    Add("cell " + ColumnName(column) + std::to_string(row) + " (item " + std::to_string(item) + ", time step " +
        std::to_string(step) + "): the value " + (value < 0 ? "-inf" : "inf") +
        " is beyond what a cell can hold; it is written as #NUM!" + MoreCells(count));
}

void RunReport::DeleteValueCell(int sheet, int row, float value)
{
    if (m_lastDeleteCell && m_lastDeleteCell->value != value && m_lastDeleteCell->sheet != sheet)
        Add(SheetPlace(sheet) + ", row " + std::to_string(row) + ": the delete value " + NumberText(double(value)) +
            " differs from " + NumberText(double(m_lastDeleteCell->value)) + " of sheet " +
            std::to_string(m_lastDeleteCell->sheet) + "; the last sheet's value marks missing values of all sheets;"
            " make the cells equal");
    m_lastDeleteCell = DeleteCell{sheet, value};
}

void RunReport::FailAt(int sheet, int row)
{
    m_failureSheet = sheet;
    m_failureRow = row;
}

void RunReport::Opened()
{
    m_opened = true;
    m_openMessage.clear();
}

void RunReport::OpenFailed(std::string_view message)
{
    m_opened = false;
    m_openMessage = message;
}

}  // namespace vantrel::bridge
