// SPDX-License-Identifier: MIT
// What one InspectWorkbook, ReadData or WriteData has to tell beyond its verdict: the
// warnings about what it read other than the workbook shows it, where a time
// step failed, and whether the workbook opened. Every warning's words are
// made here, so that they read alike and name the place and what to do.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace vantrel::bridge {

// An item attribute that didn't resolve, as the resolver found it.
struct UnresolvedAttribute {
    std::string attribute;  // "item type", "unit" or "value type"
    std::string source;     // the global key's name, "the template", or "" for a header row
    int row = 0;            // the header row, when the attribute comes from one
    int column = 0;         // the sheet column, 0 for a global text or a list
    std::string text;       // what doesn't resolve
    int filled = -1;        // with a header row of the wrong count: its filled cells
    int columnCount = 0;    // the columns that the row serves
};

class RunReport {
public:
    // A new run: nothing to tell yet.
    void Reset();

    // ---- The specification string ----
    void UnknownKey(std::string_view piece);
    void KeyInOtherCase(std::string_view piece, std::string_view key);
    void KeyWithBlanks(std::string_view piece, std::string_view key);
    void TemplateNotLoaded(std::string_view path, std::string_view reason);
    void FormatCaseSlip(std::string_view key, std::string_view format, std::string_view token,
                        std::string_view neighbour, bool minutesForMonth);
    void DeleteValueNotANumber(std::string_view text, float used);

    // ---- Cells of a sheet ----
    // The date/time column is blank at blankRow while dataRow below holds a value.
    void RowsAfterBlank(int sheet, int blankRow, int dataRow);
    // Column dataColumn holds a value but the read ends before it, at lastRead.
    void ColumnsAfterEmpty(int sheet, int lastRead, int dataColumn);
    void Unresolved(int sheet, const UnresolvedAttribute &what);
    void BeyondFloat(int sheet, int row, int column, double value, int count);
    // Cells whose stored numbers didn't read, told with the first of them.
    void UnreadableNumbers(int sheet, int row, int column, std::string_view excerpt, bool underflow, size_t count);
    // ---- An export ----
    // Infinite values, written as #NUM!, told with the first of them.
    void InfinitiesWritten(int row, int column, int item, long step, double value, size_t count);
    // The delete value cell of a sheet; a value that differs from the
    // previous sheet's is told (the last one wins).
    void DeleteValueCell(int sheet, int row, float value);

    // ---- Failures and the workbook ----
    void FailAt(int sheet, int row);
    void Opened();
    void OpenFailed(std::string_view message);

    const std::vector<std::string> &Warnings() const { return m_warnings; }
    std::string WarningLines() const;
    int FailureSheet() const { return m_failureSheet; }
    int FailureRow() const { return m_failureRow; }
    bool WorkbookOpened() const { return m_opened; }
    const std::string &OpenMessage() const { return m_openMessage; }

private:
    void Add(std::string line);

    std::vector<std::string> m_warnings;
    int m_failureSheet = 0;
    int m_failureRow = 0;
    bool m_opened = false;
    std::string m_openMessage;
    struct DeleteCell {
        int sheet;
        float value;
    };
    std::optional<DeleteCell> m_lastDeleteCell;
};

// The name of a column as the sheet shows it: C for column 3, AA for 27.
std::string ColumnName(int column);

// The shortest text that reads back as the same number.
std::string NumberText(double value);

}  // namespace vantrel::bridge
