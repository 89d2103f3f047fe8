// SPDX-License-Identifier: MIT
// The workbook engine: reads and writes Office Open XML workbooks (.xlsx,
// .xlsm) under the object model's member names. Only the members a spreadsheet
// bridge needs are offered. Every failure raises automation::ComError, as a
// failed automation call does.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "automation/values.h"

namespace workbook {

class Workbooks;
class Workbook;
class Worksheets;
class Worksheet;
class Range;

// The engine's version text: the format it writes is the one of version 12.0 on.
inline constexpr const char *kEngineVersion = "16.0";

class Application {
public:
    virtual ~Application() = default;
    virtual std::shared_ptr<Workbooks> GetWorkbooks() = 0;
    virtual std::string Version() = 0;
    // Closes every open workbook without saving; later calls fail.
    virtual void Quit() = 0;
};

// A new engine instance with no workbook open.
std::shared_ptr<Application> CreateApplication();

class Workbooks {
public:
    virtual ~Workbooks() = default;
    // A new workbook with one empty worksheet, not yet on disk. Template must be
    // the missing marker.
    virtual std::shared_ptr<Workbook> Add(const VARIANT &templ) = 0;
    // Opens an existing .xlsx or .xlsm package read-write.
    virtual std::shared_ptr<Workbook> Open(const std::string &filename) = 0;
    // Closes every workbook of this instance without saving.
    virtual void Close() = 0;
};

// One sheet as the workbook's tabs list it, chart sheets and hidden ones too.
struct SheetTab {
    std::string name;
    std::string kind;        // worksheet, chartsheet, dialogsheet or macrosheet
    std::string visibility;  // visible, hidden or veryHidden
    // The sheet's number among the worksheets, as Worksheets::Item counts
    // them; 0 for a sheet of another kind.
    int32_t worksheetNumber = 0;
};

class Workbook {
public:
    virtual ~Workbook() = default;
    virtual std::shared_ptr<Worksheets> GetWorksheets() = 0;
    // True when the workbook counts its dates from 1904-01-01 rather than
    // from 1899-12-30: a date cell's serial is then 1462 days smaller.
    virtual bool Date1904() = 0;
    // Every sheet in the workbook's order.
    virtual std::vector<SheetTab> Tabs() = 0;
    // Writes the package back to the file it came from, atomically (see
    // SaveAs for what a save keeps and refuses).
    virtual void Save() = 0;
    // Writes the package to filename in the xlsx format, whatever the
    // extension, and makes that the workbook's file. A file there is
    // replaced atomically and keeps its mode (and owner and group where this
    // process may set them); a symbolic link is written through to its
    // target and stays a link; a read-only file is refused (ComError) and
    // left as it is. When cells changed, the workbook asks spreadsheet
    // programs to compute every formula again on opening it.
    virtual void SaveAs(const std::string &filename) = 0;
    // Closes the workbook; saves first when saveChanges is true.
    virtual void Close(bool saveChanges) = 0;
};

class Worksheets {
public:
    virtual ~Worksheets() = default;
    // Worksheets only; chart sheets don't count.
    virtual int32_t Count() = 0;
    // 1-based; fails (DISP_E_BADINDEX) outside 1..Count().
    virtual std::shared_ptr<Worksheet> Item(int32_t index) = 0;
};

// A cell whose stored number is no finite number a cell can hold (1e400,
// NaN, INF, hex, ...): it reads as the error #NUM!, or as 0 when the number
// is too small to tell from it (1e-400).
struct UnreadableNumber {
    int32_t row = 0, column = 0;
    std::string excerpt;     // the stored text, short and quoted
    bool underflow = false;  // read as 0, not as #NUM!
};

class Worksheet {
public:
    virtual ~Worksheet() = default;
    // The cells of the sheet as read from its file whose stored numbers
    // didn't read, in the file's order (a sheet not read from a file has none).
    virtual std::vector<UnreadableNumber> UnreadableNumbers() { return {}; }
    // The smallest rectangle holding every cell with content or a format; A1
    // on an empty sheet.
    virtual std::shared_ptr<Range> UsedRange() = 0;
    // An address such as "B3" or "B3:D10"; cell2, when given, is the opposite corner.
    virtual std::shared_ptr<Range> GetRange(const std::string &cell1,
                                            const std::string &cell2 = std::string()) = 0;
    // Clears the whole sheet: its cells with their formats, row and column
    // settings, merged ranges, notes and comments, hyperlinks, tables,
    // conditional formats, data validation, filters, and the drawings,
    // charts and controls anchored on it. The next save leaves out the parts
    // that only these used (a table's part, a comment's drawing, a chart);
    // other sheets and their parts stay as they are. A protected sheet is
    // refused (ComError naming the sheet) and stays as it was.
    virtual void Clear() = 0;
};

class Range {
public:
    virtual ~Range() = default;
    virtual std::shared_ptr<Range> Columns() = 0;
    virtual void AutoFit() = 0;
    virtual void Clear() = 0;
    virtual void ClearFormats() = 0;
    virtual void SetNumberFormat(const std::string &format) = 0;
    // One cell: a plain value (VT_EMPTY, VT_R8, VT_BSTR, VT_BOOL, VT_ERROR).
    // Several: a two-dimensional VT_ARRAY|VT_VARIANT counted from 1, rows first.
    virtual automation::Variant GetValue2() = 0;
    // A scalar goes into every cell, a 2-D array element by element (a single
    // row or column repeats; cells past the array's edge get #N/A). Numbers of
    // any width and dates become numbers, VT_BOOL a boolean, VT_EMPTY clears,
    // and a text is read as typed (number, date or time with a matching
    // format, TRUE/FALSE, else text), except in a cell whose format is Text
    // ("@"), where it stays the text it is. A date becomes the serial of the
    // workbook's date system, so that it shows the same date in a 1904
    // workbook; a day before 1904-01-01 is refused there.
    virtual void SetValue2(const VARIANT &value) = 0;
    // As SetValue2; besides, a VT_DATE gives a cell whose format is General
    // (id 0, or a custom format with that code) the built-in date format 14
    // (m/d/yyyy), or 22 (m/d/yyyy h:mm) when the date has a time of day.
    virtual void SetValue(const VARIANT &value) = 0;
    virtual automation::Variant GetText() = 0;
    virtual int32_t Count() = 0;
    virtual int32_t Row() = 0;
    virtual int32_t Column() = 0;
};

}  // namespace workbook
