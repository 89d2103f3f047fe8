// SPDX-License-Identifier: MIT
// CExcelObj: the one way the system reaches a workbook. One object is one
// engine instance, at most one open workbook and one current worksheet; all
// cell traffic acts on the current worksheet.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "automation/values.h"
#include "workbook/cell_source.h"
#include "workbook/engine.h"
#include "workbook/save_lock.h"

// Columns with content in the used range (see GetUsedColumns).
struct UsedColumns {
    int32_t columnCount = 0;
    int32_t firstColumn = 1;
};

class CExcelObj {
public:
    // Makes the engine instance that StartExcel holds. Tests replace it to
    // see a start that fails.
    using ApplicationFactory = std::function<std::shared_ptr<workbook::Application>()>;
    static void SetApplicationFactory(ApplicationFactory factory);
    static void ResetApplicationFactory();

    CExcelObj() = default;
    virtual ~CExcelObj();
    CExcelObj(const CExcelObj &) = delete;
    CExcelObj &operator=(const CExcelObj &) = delete;

    bool StartExcel(std::string &error);
    bool OpenWorkbook(const std::string &path, std::string &error);
    bool CreateWorkbook(const std::string &path, std::string &error);
    // A new workbook of one empty sheet in memory only; SaveNewWorkbook puts
    // it on disk at path, so that a run that fails before leaves no file.
    bool NewWorkbook(std::string &error);
    void SaveNewWorkbook(const std::string &path);
    // Waits until no other writer holds the workbook at path, then holds it
    // until QuitExcel: taken before the workbook is read for a save, so that
    // two saves end one after the other. False with the reason when the
    // workbook is in use by another program or can't be locked.
    bool LockWorkbook(const std::string &path, std::string &error);
    // Only save == 1 saves before closing.
    bool CloseWorkbook(int save);
    bool QuitExcel();

    std::string GetExcelVersionText();
    int GetExcelVersion();
    int GetSheetCount();
    // True when the open workbook counts its dates from 1904: the serial of a
    // date cell is then 1462 days smaller than the date's automation serial.
    bool Date1904();
    bool SelectSheet(int number, std::string &error);
    int GetSelectedSheet() const { return m_sheetIndex; }
    // Why a sheet of the open workbook could not be read ("Excel Workbook
    // could not open file." and the reason), empty while every sheet asked for was.
    const std::string &SheetReadFailure() const { return m_sheetReadFailure; }
    bool ClearSheet();
    bool AutoFitColumns();

    // ---- Cells of the current worksheet (1-based rows and columns) -------

    // "A1"-style address, columns up to 16384 (XFD); a place off the sheet
    // grid raises ComError rather than give a wrong address.
    static std::string BuildCellAddress(int row, int col);
    // What a cell holds once WriteDataRow has put a text into it: the text
    // read as typed (a number, a date serial, a boolean or the text), with the
    // number format that its typed entry gives a cell of the General format
    // (empty for none). date: value is a date's serial, which a workbook of
    // the 1904 date system stores moved.
    struct TypedText {
        automation::Variant value;
        std::string numberFormat;
        bool date = false;
    };
    static TypedText StoredText(std::string_view text);
    bool ReadCell(int row, int col, automation::Variant &value);
    bool WriteCell(int row, int col, const VARIANT &value);
    // Appends the displayed text of count cells from (row, col) rightward.
    bool ReadRowTexts(int row, int col, int count, std::vector<std::string> &texts);
    // Writes the texts into cells from (row, col) rightward, in one call.
    bool WriteRowTexts(int row, int col, const std::vector<std::string> &texts);
    // A rectangle into a rowCount x colCount array of variants counted from 0;
    // cells become text when colCount > 1 or asText.
    bool ReadCellBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block,
                       bool asText);
    // The same rectangle with each cell as stored: numbers (dates as serials)
    // stay numbers whatever the column count.
    bool ReadStoredBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block);
    // A rectangle into a rowCount x colCount array of doubles counted from 0
    // (column-major, so each column is contiguous). Cells that are no number
    // become deleteValue, and each adds message 127 to errors.
    bool ReadValueBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block,
                        double deleteValue, std::string &errors);
    // A column of true dates, rowCount cells from (row, col), into dates: each
    // cell as it converts to a date, 0.0 for one that gives none.
    bool ReadDateColumn(int row, int rowCount, int col, DATE *dates);
    // One time step of an export: the time cells in one call, then each value
    // that isn't the delete value (compared in single precision) unless
    // writeDeleteValues.
    bool WriteDataRow(int row, int col, SAFEARRAY *timeCells, const std::vector<double> &values,
                      int writeDeleteValues, double deleteValue);
    // A number that a time cell of an export stores, known beforehand: a date
    // (value counted from 1899-12-30) is moved to the workbook's date system.
    struct KnownNumber {
        double value = 0.0;
        bool date = false;
    };
    // One time step of an export whose time cells are known numbers, put
    // without their texts and with no format: what WriteDataRow stores for
    // those cells' texts or dates otherwise. False, with nothing written,
    // when the sheet takes no direct writes or a date has no serial in this
    // workbook (a day before 1904 in one of the 1904 date system).
    bool WriteKnownRow(int row, int col, std::span<const KnownNumber> timeCells, const std::vector<double> &values,
                       int writeDeleteValues, double deleteValue);
    // Whether the cell holds number as WriteKnownRow would have put it;
    // nothing for a number that it would not put.
    std::optional<bool> HoldsKnownNumber(int row, int col, KnownNumber number);
    // Gives rowCount cells from (row, col) down the number format, keeping
    // the rest of their style.
    bool ApplyNumberFormat(int firstRow, int rowCount, int col, const std::string &format);
    // expectedType 5: item values (empty or numbers); 7: true dates that rise.
    bool ValidateColumn(int firstRow, int rowCount, int col, int expectedType, std::string &error);
    // The cells of the current worksheet whose stored numbers didn't read.
    std::vector<workbook::UnreadableNumber> UnreadableNumbers();
    int CountRowCells(int row, int col, int count);
    bool CountColumnCells(int row, int &cellCount, int col);
    UsedColumns GetUsedColumns();
    int GetUsedRowCount();
    // The used range's corners; the leftmost column and the topmost row among
    // the cells that hold a value within rows and columns from the given ones
    // (cost: the cells stored), nothing when none does.
    workbook::UsedBounds GetUsedBounds();
    struct ValueCorner {
        int row;
        int column;
    };
    std::optional<ValueCorner> ValuesFrom(int firstRow, int firstColumn);
    bool SetColumnNumberFormat(int firstRow, int rowCount, int col, const std::string &format);
    bool ClearColumnFormats(int firstRow, int rowCount, int firstCol, int colCount);
    bool SetDateTimeColumnFormat(int firstRow, int rowCount, int col, const std::string &format);

private:
    // The data values of an export row, from column col on.
    void WriteRowValues(workbook::CellSink *sink, int row, int col, const std::vector<double> &values,
                        int writeDeleteValues, double deleteValue);
    std::optional<double> SerialInWorkbook(KnownNumber number);
    bool ReadBlock(int row, int rowCount, int col, int colCount, automation::SafeArray &block, bool changeToText);
    std::shared_ptr<workbook::Range> CellRange(int row1, int col1, int row2, int col2);
    workbook::CellSource &Cells();

    std::shared_ptr<workbook::Application> m_app;
    std::unique_ptr<workbook::SaveLock> m_saveLock;
    std::shared_ptr<workbook::Workbook> m_workbook;
    std::shared_ptr<workbook::Workbooks> m_workbooks;
    std::shared_ptr<workbook::Worksheets> m_sheets;
    std::shared_ptr<workbook::Worksheet> m_sheet;
    int32_t m_sheetIndex = 0;  // set by StartExcel; 0 until a sheet is selected
    std::string m_sheetReadFailure;
};
