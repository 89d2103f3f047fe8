// SPDX-License-Identifier: MIT
// CExcelObj's cell operations on real workbooks: each sheet is written through
// the engine, saved and opened again (or read from a committed fixture), and
// the operations are held to the cases where a slip would show.
#include <gtest/gtest.h>

#include <cmath>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "automation/com_error.h"
#include "support/temp_dir.h"
#include "workbook/excel_obj.h"

namespace {

using automation::Variant;

const std::string kFixtures = VANTREL_SOURCE_DIR "/tests/data/workbook";

struct Put {
    int row;
    int col;
    Variant value;
    std::string numberFormat;  // empty: General
};

Put At(int row, int col, Variant value, std::string numberFormat = {})
{
    return Put{row, col, std::move(value), std::move(numberFormat)};
}

// A session on a workbook whose first sheet holds the given cells: written
// through Value2 and NumberFormat, saved, closed and opened again, so that
// every read goes through the saved file.
class Book {
public:
    explicit Book(const std::vector<Put> &cells)
    {
        const std::string path = dir_.File("cells.xlsx");
        std::string error;
        if (!excel.StartExcel(error) || !excel.CreateWorkbook(path, error) || !excel.OpenWorkbook(path, error) ||
            !excel.SelectSheet(1, error))
            throw std::runtime_error("no workbook to test on: " + error);
        for (const Put &cell : cells) {
            excel.WriteCell(cell.row, cell.col, cell.value.Raw());
            if (!cell.numberFormat.empty())
                excel.SetColumnNumberFormat(cell.row, 1, cell.col, cell.numberFormat);
        }
        Reopen(true);
    }
    // A committed fixture, opened in place and closed without saving.
    explicit Book(const std::string &fixture, int sheet = 1)
    {
        std::string error;
        if (!excel.StartExcel(error) || !excel.OpenWorkbook(kFixtures + "/" + fixture, error) ||
            !excel.SelectSheet(sheet, error))
            throw std::runtime_error("no fixture " + fixture + ": " + error);
    }
    ~Book()
    {
        excel.CloseWorkbook(0);
        excel.QuitExcel();
    }

    // Saves (or not), closes and opens the file again on sheet 1.
    void Reopen(bool save)
    {
        const std::string path = dir_.File("cells.xlsx");
        std::string error;
        excel.CloseWorkbook(save ? 1 : 0);
        if (!excel.OpenWorkbook(path, error) || !excel.SelectSheet(1, error))
            throw std::runtime_error("the saved workbook doesn't open again: " + error);
    }

    Variant Read(int row, int col)
    {
        Variant v;
        excel.ReadCell(row, col, v);
        return v;
    }

    CExcelObj excel;

private:
    testing_host::TempDir dir_;
};

std::string Text(const VARIANT &v) { return v.vt == VT_BSTR ? automation::BstrToUtf8(v.bstrVal) : "<not text>"; }

// Element (r, c) of a two-dimensional array counted from 0.
template <typename T>
T Element(const automation::SafeArray &block, LONG r, LONG c)
{
    T out{};
    LONG index[2] = {r, c};
    EXPECT_EQ(SafeArrayGetElement(block.Get(), index, &out), S_OK) << r << "," << c;
    return out;
}

LONG Bound(const automation::SafeArray &block, UINT dim)
{
    LONG lower = -1, upper = -1;
    SafeArrayGetLBound(block.Get(), dim, &lower);
    SafeArrayGetUBound(block.Get(), dim, &upper);
    EXPECT_EQ(lower, 0) << "blocks are counted from 0";
    return upper + 1;
}

constexpr double kSecond = 1.0 / 86400.0;

TEST(CellAccess, BuildCellAddress)
{
    const std::pair<int, const char *> columns[] = {{1, "A1"},   {26, "Z1"},   {27, "AA1"},
                                                    {52, "AZ1"}, {53, "BA1"},  {702, "ZZ1"}};
    for (const auto &[col, address] : columns) EXPECT_EQ(CExcelObj::BuildCellAddress(1, col), address) << col;
    EXPECT_EQ(CExcelObj::BuildCellAddress(1048576, 28), "AB1048576");
}

TEST(CellAccess, SheetsWithOneUsedCellOrNone)
{
    for (bool oneCell : {false, true}) {
        Book book(oneCell ? std::vector<Put>{At(4, 3, Variant::R8(7))} : std::vector<Put>{});
        SCOPED_TRACE(oneCell ? "one used cell" : "no used cell");
        const UsedColumns used = book.excel.GetUsedColumns();
        EXPECT_EQ(used.columnCount, 0);
        EXPECT_EQ(used.firstColumn, 1);
        EXPECT_EQ(book.excel.GetUsedRowCount(), 1);
        int cellCount = -5;
        EXPECT_FALSE(book.excel.CountColumnCells(1, cellCount, 1));
        EXPECT_FALSE(book.excel.CountColumnCells(4, cellCount, 3));
        EXPECT_EQ(cellCount, -5);  // untouched
    }
}

// C3:E7 with C3, C4, C5 and C7 filled, and E7.
std::vector<Put> RangeFromC3()
{
    return {At(3, 3, Variant::R8(1)), At(4, 3, Variant::String("two")), At(5, 3, Variant::Bool(true)),
            At(7, 3, Variant::R8(4)), At(7, 5, Variant::R8(5))};
}

TEST(CellAccess, UsedRangeFromColumnC)
{
    Book book(RangeFromC3());
    const UsedColumns used = book.excel.GetUsedColumns();
    EXPECT_EQ(used.firstColumn, 3);
    // C has a hit at row 3; D is searched to the bottom and ends the count.
    EXPECT_EQ(used.columnCount, 1);
    EXPECT_EQ(book.excel.GetUsedRowCount(), 5);

    int cellCount = -1;
    // Above the used range: counted from its first row, down to the gap.
    EXPECT_TRUE(book.excel.CountColumnCells(1, cellCount, 3));
    EXPECT_EQ(cellCount, 3);
    // Left of it: its first column.
    EXPECT_TRUE(book.excel.CountColumnCells(1, cellCount, 1));
    EXPECT_EQ(cellCount, 3);
    EXPECT_TRUE(book.excel.CountColumnCells(4, cellCount, 3));
    EXPECT_EQ(cellCount, 2);
    EXPECT_TRUE(book.excel.CountColumnCells(6, cellCount, 3));
    EXPECT_EQ(cellCount, 0);  // starts on the gap
    EXPECT_TRUE(book.excel.CountColumnCells(7, cellCount, 3));
    EXPECT_EQ(cellCount, 1);  // stops at the last used row
    EXPECT_TRUE(book.excel.CountColumnCells(1, cellCount, 4));
    EXPECT_EQ(cellCount, 0);
    // Right of the used range or below it: false, and the count stays.
    cellCount = 99;
    EXPECT_FALSE(book.excel.CountColumnCells(3, cellCount, 6));
    EXPECT_FALSE(book.excel.CountColumnCells(8, cellCount, 3));
    EXPECT_EQ(cellCount, 99);
    // The last used column and row are inside.
    EXPECT_TRUE(book.excel.CountColumnCells(7, cellCount, 5));
    EXPECT_EQ(cellCount, 1);
}

TEST(CellAccess, UsedColumnsCursorIsNotReset)
{
    // A1:D5. A hits at row 1, B at row 3; C holds only C2, above the cursor,
    // so its search runs past the bottom, and D1 can't count any more.
    Book book({At(1, 1, Variant::R8(1)), At(5, 1, Variant::R8(1)), At(3, 2, Variant::R8(1)),
               At(2, 3, Variant::R8(1)), At(1, 4, Variant::R8(1))});
    UsedColumns used = book.excel.GetUsedColumns();
    EXPECT_EQ(used.firstColumn, 1);
    EXPECT_EQ(used.columnCount, 2);
    EXPECT_EQ(book.excel.GetUsedRowCount(), 5);

    // A first row filled across the used range counts every column.
    Book across({At(2, 2, Variant::R8(1)), At(2, 3, Variant::String("x")), At(2, 4, Variant::Bool(false)),
                 At(9, 2, Variant::R8(3))});
    used = across.excel.GetUsedColumns();
    EXPECT_EQ(used.firstColumn, 2);
    EXPECT_EQ(used.columnCount, 3);
    EXPECT_EQ(across.excel.GetUsedRowCount(), 8);
}

TEST(CellAccess, CountRowCells)
{
    Book book({At(1, 1, Variant::R8(1)), At(1, 2, Variant::R8(2)), At(1, 3, Variant::R8(3)),
               At(1, 4, Variant::R8(4)), At(2, 1, Variant::String("only")), At(3, 2, Variant::R8(1))});
    EXPECT_EQ(book.excel.CountRowCells(1, 1, 1), 2);  // at least two cells are asked for
    EXPECT_EQ(book.excel.CountRowCells(1, 1, 0), 2);
    EXPECT_EQ(book.excel.CountRowCells(2, 1, 1), 1);  // filled, then empty
    EXPECT_EQ(book.excel.CountRowCells(1, 1, 3), 3);  // stops at the m-th cell
    EXPECT_EQ(book.excel.CountRowCells(1, 2, 10), 3);
    EXPECT_EQ(book.excel.CountRowCells(3, 1, 5), 0);  // the first cell is empty
    EXPECT_EQ(book.excel.CountRowCells(1, 4, 1), 1);
}

TEST(CellAccess, ReadValueBlockMessages)
{
    // Row 1: 1.5, abc, "12.5" as text, TRUE, #N/A, xyz. Row 2: FALSE, empty, #DIV/0!.
    Book book(std::string("cell_kinds.xlsx"));
    const double deleteValue = -999.0;
    const std::string line2 = "Line 1, Column 2 - Only double values are allowed as item data.";

    automation::SafeArray block;
    std::string errors;
    EXPECT_TRUE(book.excel.ReadValueBlock(1, 1, 2, 1, block, deleteValue, errors));
    ASSERT_EQ(Bound(block, 1), 1);
    ASSERT_EQ(Bound(block, 2), 1);
    EXPECT_EQ(Element<double>(block, 0, 0), deleteValue);
    EXPECT_EQ(errors, line2);  // no separator before the first message

    // A message joins what the caller already holds by "\r\n".
    errors = "earlier";
    EXPECT_TRUE(book.excel.ReadValueBlock(1, 1, 2, 1, block, deleteValue, errors));
    EXPECT_EQ(errors, "earlier\r\n" + line2);

    // The whole rectangle: complete, messages in reading order.
    errors.clear();
    EXPECT_TRUE(book.excel.ReadValueBlock(1, 2, 1, 6, block, deleteValue, errors));
    ASSERT_EQ(Bound(block, 1), 2);
    ASSERT_EQ(Bound(block, 2), 6);
    const double expected[2][6] = {{1.5, deleteValue, 12.5, -1.0, deleteValue, deleteValue},
                                   {0.0, deleteValue, deleteValue, deleteValue, deleteValue, deleteValue}};
    for (LONG r = 0; r < 2; ++r)
        for (LONG c = 0; c < 6; ++c) EXPECT_EQ(Element<double>(block, r, c), expected[r][c]) << r << "," << c;
    EXPECT_EQ(errors,
              "Line 1, Column 2 - Only double values are allowed as item data.\r\n"
              "Line 1, Column 5 - Only double values are allowed as item data.\r\n"
              "Line 1, Column 6 - Only double values are allowed as item data.\r\n"
              "Line 2, Column 3 - Only double values are allowed as item data.");

    // Two cells with text give two lines; the row and column are the sheet's.
    errors.clear();
    EXPECT_TRUE(book.excel.ReadValueBlock(1, 1, 5, 2, block, deleteValue, errors));
    EXPECT_EQ(errors,
              "Line 1, Column 5 - Only double values are allowed as item data.\r\n"
              "Line 1, Column 6 - Only double values are allowed as item data.");
    // Empty cells give the delete value and no message.
    errors.clear();
    EXPECT_TRUE(book.excel.ReadValueBlock(3, 2, 8, 2, block, 7.25, errors));
    EXPECT_EQ(errors, "");
    for (LONG r = 0; r < 2; ++r)
        for (LONG c = 0; c < 2; ++c) EXPECT_EQ(Element<double>(block, r, c), 7.25);
}

TEST(CellAccess, ReadValueBlockOnWrittenNumbers)
{
    // Columns of different lengths: the block's layout must keep rows and
    // columns apart.
    std::vector<Put> cells;
    for (int r = 1; r <= 4; ++r)
        for (int c = 1; c <= 3; ++c) cells.push_back(At(r, c, Variant::R8(r * 10 + c)));
    Book book(cells);
    automation::SafeArray block;
    std::string errors;
    EXPECT_TRUE(book.excel.ReadValueBlock(2, 3, 2, 3, block, -1.0, errors));
    EXPECT_EQ(errors, "");
    for (LONG r = 0; r < 3; ++r)
        for (LONG c = 0; c < 3; ++c) {
            const double want = r + 2 <= 4 && c + 2 <= 3 ? (r + 2) * 10 + (c + 2) : -1.0;
            EXPECT_EQ(Element<double>(block, r, c), want) << r << "," << c;
        }
}

TEST(CellAccess, ReadCellBlockTextChange)
{
    Book book(std::string("cell_kinds.xlsx"));
    automation::SafeArray block;
    // Several columns: every cell changes to text, except the error cells,
    // which keep their value; an empty cell becomes the empty text.
    EXPECT_TRUE(book.excel.ReadCellBlock(1, 2, 1, 6, block, false));
    ASSERT_EQ(Bound(block, 1), 2);
    ASSERT_EQ(Bound(block, 2), 6);
    const char *texts[2][6] = {{"1.5", "abc", "12.5", nullptr, nullptr, "xyz"},
                               {nullptr, "", nullptr, "", "", ""}};
    for (LONG r = 0; r < 2; ++r)
        for (LONG c = 0; c < 6; ++c) {
            if (!texts[r][c]) continue;
            Variant v;
            LONG index[2] = {r, c};
            ASSERT_EQ(SafeArrayGetElement(block.Get(), index, v.Out()), S_OK);
            EXPECT_EQ(Text(v.Raw()), texts[r][c]) << r << "," << c;
        }
    Variant error;
    LONG at[2] = {0, 4};
    ASSERT_EQ(SafeArrayGetElement(block.Get(), at, error.Out()), S_OK);
    ASSERT_EQ(error.Type(), VT_ERROR);
    EXPECT_EQ(uint32_t(error.Raw().scode), 0x800A0000u | 2042u);  // #N/A
    LONG at2[2] = {1, 2};
    ASSERT_EQ(SafeArrayGetElement(block.Get(), at2, error.Out()), S_OK);
    ASSERT_EQ(error.Type(), VT_ERROR);
    EXPECT_EQ(uint32_t(error.Raw().scode), 0x800A0000u | 2007u);  // #DIV/0!
    // The booleans change as the runtime changes them.
    for (LONG r : {0, 1}) {
        Variant flag;
        LONG index[2] = {r, r == 0 ? 3 : 0};
        ASSERT_EQ(SafeArrayGetElement(block.Get(), index, flag.Out()), S_OK);
        Variant boolean = Variant::Bool(r == 0), expected;
        ASSERT_EQ(VariantChangeType(expected.Out(), &boolean.Raw(), 0, VT_BSTR), S_OK);
        EXPECT_EQ(Text(flag.Raw()), Text(expected.Raw()));
    }

    // One column, not as text: values stay as Value2 gives them, empty stays empty.
    EXPECT_TRUE(book.excel.ReadCellBlock(1, 3, 1, 1, block, false));
    ASSERT_EQ(Bound(block, 1), 3);
    ASSERT_EQ(Bound(block, 2), 1);
    Variant v;
    LONG i0[2] = {0, 0}, i1[2] = {1, 0}, i2[2] = {2, 0};
    ASSERT_EQ(SafeArrayGetElement(block.Get(), i0, v.Out()), S_OK);
    ASSERT_EQ(v.Type(), VT_R8);
    EXPECT_EQ(v.Raw().dblVal, 1.5);
    ASSERT_EQ(SafeArrayGetElement(block.Get(), i1, v.Out()), S_OK);
    EXPECT_EQ(v.Type(), VT_BOOL);
    ASSERT_EQ(SafeArrayGetElement(block.Get(), i2, v.Out()), S_OK);
    EXPECT_EQ(v.Type(), VT_EMPTY);
    // One column as text: changed, empty becomes "".
    EXPECT_TRUE(book.excel.ReadCellBlock(1, 3, 1, 1, block, true));
    ASSERT_EQ(SafeArrayGetElement(block.Get(), i0, v.Out()), S_OK);
    EXPECT_EQ(Text(v.Raw()), "1.5");
    ASSERT_EQ(SafeArrayGetElement(block.Get(), i2, v.Out()), S_OK);
    EXPECT_EQ(Text(v.Raw()), "");
    // A single cell is a block of one.
    EXPECT_TRUE(book.excel.ReadCellBlock(1, 1, 3, 1, block, false));
    ASSERT_EQ(SafeArrayGetElement(block.Get(), i0, v.Out()), S_OK);
    EXPECT_EQ(Text(v.Raw()), "12.5");
}

// Serial of 2023-03-15 12:00:00.
constexpr double kNoon = 45000.5;

TEST(CellAccess, ReadDateColumnAsEachCellConverts)
{
    const std::vector<Variant> cells = {Variant::R8(kNoon),        Variant::Date(kNoon + 1),
                                        Variant::String("2024-03-01 10:30:00"), Variant::String("abc"),
                                        Variant(),                 Variant::Bool(true),
                                        Variant::R8(-1.5),         Variant::R8(0.0),
                                        Variant::R8(2958465.75),   Variant::R8(2958466.5),
                                        Variant::R8(1e10),         Variant::R8(-1e10)};
    std::vector<Put> puts;
    for (size_t i = 0; i < cells.size(); ++i) puts.push_back(At(int(i) + 2, 3, cells[i]));
    Book book(puts);
    std::vector<DATE> dates(cells.size() + 1, -99.0);
    EXPECT_TRUE(book.excel.ReadDateColumn(2, int(cells.size()) + 1, 3, dates.data()));
    // Each as its value converts to a date one cell at a time, 0.0 where it gives none.
    for (size_t i = 0; i <= cells.size(); ++i) {
        Variant value, date;
        EXPECT_TRUE(book.excel.ReadCell(int(i) + 2, 3, value));
        const DATE expected =
            SUCCEEDED(VariantChangeType(date.Out(), &value.Raw(), 0, VT_DATE)) ? date.Raw().date : 0.0;
        EXPECT_EQ(dates[i], expected) << "row " << i + 2;
    }
    EXPECT_NE(dates[2], 0.0);  // the text date is read as one
    EXPECT_EQ(dates[10], 0.0);
}

TEST(CellAccess, ValidateDateColumn)
{
    Book book({At(1, 1, Variant::R8(kNoon)), At(2, 1, Variant::R8(kNoon + 0.4 * kSecond)),  // too close
               At(1, 2, Variant::R8(kNoon)), At(2, 2, Variant::R8(kNoon + 0.6 * kSecond)),  // far enough
               At(3, 2, Variant::Date(kNoon + 1)),                                          // a date put
               At(1, 3, Variant::R8(kNoon)), At(2, 3, Variant::String("abc")),              // text
               At(1, 4, Variant::R8(0.0)),                                                  // not after 0.0
               At(2, 4, Variant::R8(-1.0)),                                                 // before serial 0
               At(3, 4, Variant::R8(1e10)),                                                 // no date
               At(4, 4, Variant::Bool(true)), At(5, 4, Variant::R8(0.6 * kSecond)),
               At(1, 5, Variant::R8(kNoon + 1)), At(2, 5, Variant::R8(kNoon))});            // falls
    std::string error;
    EXPECT_FALSE(book.excel.ValidateColumn(1, 2, 1, 7, error));
    // The previous date as the runtime's locale prints it.
    EXPECT_EQ(error, "There is an error in the date/time at: (2023-03-15 12:00:00). Dates and times must always increase.");

    error.clear();
    EXPECT_TRUE(book.excel.ValidateColumn(1, 3, 2, 7, error));
    EXPECT_EQ(error, "");

    EXPECT_FALSE(book.excel.ValidateColumn(1, 2, 3, 7, error));
    EXPECT_EQ(error, "Date/Time Field needs to be of type DATE in row 2, column 3.");
    // A single-row range is checked like any other.
    EXPECT_FALSE(book.excel.ValidateColumn(2, 1, 3, 7, error));
    EXPECT_EQ(error, "Date/Time Field needs to be of type DATE in row 2, column 3.");
    error.clear();
    EXPECT_TRUE(book.excel.ValidateColumn(1, 1, 3, 7, error));
    EXPECT_EQ(error, "");
    // An empty cell is no date.
    EXPECT_FALSE(book.excel.ValidateColumn(1, 3, 3, 7, error));
    EXPECT_EQ(error, "Date/Time Field needs to be of type DATE in row 2, column 3.");
    EXPECT_FALSE(book.excel.ValidateColumn(3, 1, 3, 7, error));
    EXPECT_EQ(error, "Date/Time Field needs to be of type DATE in row 3, column 3.");

    // The first date has to be later than 0.0 by half a second at least.
    EXPECT_FALSE(book.excel.ValidateColumn(1, 1, 4, 7, error));
    EXPECT_EQ(error, "There is an error in the date/time at: (00:00:00). Dates and times must always increase.");
    EXPECT_FALSE(book.excel.ValidateColumn(2, 1, 4, 7, error));
    EXPECT_EQ(error, "There is an error in the date/time at: (00:00:00). Dates and times must always increase.");
    error.clear();
    EXPECT_TRUE(book.excel.ValidateColumn(5, 1, 4, 7, error)) << error;
    EXPECT_FALSE(book.excel.ValidateColumn(3, 1, 4, 7, error));
    EXPECT_EQ(error, "The Date/Time value (starting at Row 3)  is invalid.");
    EXPECT_FALSE(book.excel.ValidateColumn(4, 1, 4, 7, error));
    EXPECT_EQ(error, "Date/Time Field needs to be of type DATE in row 4, column 4.");

    EXPECT_FALSE(book.excel.ValidateColumn(1, 2, 5, 7, error));
    EXPECT_EQ(error, "There is an error in the date/time at: (2023-03-16 12:00:00). Dates and times must always increase.");
}

TEST(CellAccess, ValidateValueColumn)
{
    Book book({At(1, 1, Variant::R8(1.5)), At(3, 1, Variant::R8(-2)),  // a gap at row 2
               At(4, 1, Variant::Date(kNoon)),
               At(1, 2, Variant::R8(1)), At(2, 2, Variant::String("abc")),
               At(1, 3, Variant::Bool(false)),
               At(1, 4, Variant::Error(SCODE(0x800A0000u | 2042u)))});
    std::string error;
    // Empty cells pass. Value2 gives a date as its serial, a double: a cell
    // with a date format passes as a number, since no read here gives a
    // VT_DATE.
    EXPECT_TRUE(book.excel.ValidateColumn(1, 6, 1, 5, error)) << error;
    EXPECT_EQ(error, "");
    EXPECT_FALSE(book.excel.ValidateColumn(1, 3, 2, 5, error));
    EXPECT_EQ(error, "TS Import error: incorrect data format detected in line 2.");
    EXPECT_FALSE(book.excel.ValidateColumn(1, 1, 3, 5, error));
    EXPECT_EQ(error, "TS Import error: incorrect data format detected in line 1.");
    EXPECT_FALSE(book.excel.ValidateColumn(1, 1, 4, 5, error));
    EXPECT_EQ(error, "TS Import error: incorrect data format detected in line 1.");
}

TEST(CellAccess, WriteDataRowAndDeleteValues)
{
    const double deleteValue = 0.1;
    const double beyondSingle = 0.1 + 1e-12;  // another double, the same float
    ASSERT_NE(beyondSingle, deleteValue);
    ASSERT_EQ(static_cast<float>(beyondSingle), static_cast<float>(deleteValue));
    Book book(std::vector<Put>{});
    for (int writeDeleteValues : {0, 1}) {
        const int row = 1 + writeDeleteValues;
        automation::SafeArray timeCells(SafeArrayCreateVector(VT_VARIANT, 0, 2));
        Variant date = Variant::String("2012/03/04"), time = Variant::String("05:06:07");
        LONG i0 = 0, i1 = 1;
        ASSERT_EQ(SafeArrayPutElement(timeCells.Get(), &i0, date.Ptr()), S_OK);
        ASSERT_EQ(SafeArrayPutElement(timeCells.Get(), &i1, time.Ptr()), S_OK);
        EXPECT_TRUE(book.excel.WriteDataRow(row, 1, timeCells.Get(), {1.25, deleteValue, beyondSingle, 0.1000001},
                                            writeDeleteValues, deleteValue));
    }
    book.Reopen(true);
    // The time cells went in as typed: a date and a time of day.
    for (int row : {1, 2}) {
        Variant date = book.Read(row, 1), time = book.Read(row, 2);
        ASSERT_EQ(date.Type(), VT_R8);
        EXPECT_EQ(date.Raw().dblVal, 40972.0);
        ASSERT_EQ(time.Type(), VT_R8);
        EXPECT_NEAR(time.Raw().dblVal, (5 * 3600 + 6 * 60 + 7) * kSecond, 1e-12);
        EXPECT_EQ(book.Read(row, 3).Raw().dblVal, 1.25);
        EXPECT_EQ(book.Read(row, 6).Raw().dblVal, 0.1000001);  // differs in single precision
    }
    // Skipped without writeDeleteValues, even beyond single precision.
    EXPECT_EQ(book.Read(1, 4).Type(), VT_EMPTY);
    EXPECT_EQ(book.Read(1, 5).Type(), VT_EMPTY);
    EXPECT_EQ(book.Read(2, 4).Raw().dblVal, deleteValue);
    EXPECT_EQ(book.Read(2, 5).Raw().dblVal, beyondSingle);

    // A NaN delete value never equals anything, so nothing is skipped.
    automation::SafeArray none(SafeArrayCreateVector(VT_VARIANT, 0, 1));
    Variant stamp = Variant::R8(40972.5);
    LONG i0 = 0;
    ASSERT_EQ(SafeArrayPutElement(none.Get(), &i0, stamp.Ptr()), S_OK);
    EXPECT_TRUE(book.excel.WriteDataRow(3, 1, none.Get(), {2.5}, 0, std::nan("")));
    EXPECT_EQ(book.Read(3, 1).Raw().dblVal, 40972.5);
    EXPECT_EQ(book.Read(3, 2).Raw().dblVal, 2.5);
}

TEST(CellAccess, RowTexts)
{
    Book book({At(1, 2, Variant::R8(0.5), "0.00%"), At(1, 3, Variant::Date(kNoon), "yyyy-mm-dd hh:mm"),
               At(1, 4, Variant::R8(1234.5678)), At(1, 5, Variant::String("plain")), At(1, 6, Variant::Bool(true)),
               At(1, 7, Variant::R8(1.0 / 3.0))});
    std::vector<std::string> texts{"kept"};
    EXPECT_TRUE(book.excel.ReadRowTexts(1, 1, 8, texts));
    const std::vector<std::string> shown{"kept", "", "50.00%", "2023-03-15 12:00", "1234.5678", "plain", "TRUE",
                                         "0.333333333", ""};
    EXPECT_EQ(texts, shown);

    // Written texts are taken as typed.
    EXPECT_TRUE(book.excel.WriteRowTexts(3, 2, {"12.5", "abc", "TRUE", "2012/03/04 05:06:07", "", "1e3"}));
    book.Reopen(true);
    Variant number = book.Read(3, 2), word = book.Read(3, 3), flag = book.Read(3, 4), when = book.Read(3, 5);
    ASSERT_EQ(number.Type(), VT_R8);
    EXPECT_EQ(number.Raw().dblVal, 12.5);
    EXPECT_EQ(Text(word.Raw()), "abc");
    ASSERT_EQ(flag.Type(), VT_BOOL);
    EXPECT_NE(flag.Raw().boolVal, VARIANT_FALSE);
    ASSERT_EQ(when.Type(), VT_R8);
    EXPECT_NEAR(when.Raw().dblVal, 40972.0 + (5 * 3600 + 6 * 60 + 7) * kSecond, 1e-9);
    EXPECT_EQ(book.Read(3, 6).Type(), VT_EMPTY);
    EXPECT_EQ(book.Read(3, 7).Raw().dblVal, 1000.0);
    texts.clear();
    EXPECT_TRUE(book.excel.ReadRowTexts(3, 5, 1, texts));
    ASSERT_EQ(texts.size(), 1u);
    EXPECT_NE(texts[0].find("2012"), std::string::npos) << texts[0];  // shown as a date, not a serial
    // Nothing to write is no call.
    EXPECT_TRUE(book.excel.WriteRowTexts(4, 1, {}));
}

TEST(CellAccess, NumberFormatOperations)
{
    Book book({At(1, 1, Variant::R8(0.25), "0.0%"), At(2, 1, Variant::R8(0.5), "0.0%"),
               At(1, 2, Variant::R8(kNoon), "0.000"), At(2, 2, Variant::R8(kNoon), "0.000"),
               At(1, 3, Variant::R8(kNoon)), At(1, 4, Variant::R8(kNoon)), At(1, 5, Variant::R8(kNoon))});
    std::vector<std::string> texts;
    book.excel.ReadRowTexts(1, 1, 1, texts);
    ASSERT_EQ(texts.back(), "25.0%");

    // "0" clears the formats and sets none: General.
    EXPECT_TRUE(book.excel.SetColumnNumberFormat(1, 2, 1, "0"));
    // Another format replaces what was there.
    EXPECT_TRUE(book.excel.SetColumnNumberFormat(1, 1, 2, "0.0"));
    // A one-column full date and time is set as it stands.
    EXPECT_TRUE(book.excel.SetDateTimeColumnFormat(1, 1, 3, "YYYY/MM/DD HH:mm:ss"));
    // Two columns, or a date alone, leave the cells as they are.
    EXPECT_TRUE(book.excel.SetDateTimeColumnFormat(1, 1, 4, "YYYY/MM/DD|HH:mm:ss"));
    EXPECT_TRUE(book.excel.SetDateTimeColumnFormat(1, 1, 5, "YYYY/MM/DD"));
    book.Reopen(true);

    texts.clear();
    book.excel.ReadRowTexts(1, 1, 5, texts);
    book.excel.ReadRowTexts(2, 1, 2, texts);
    const std::vector<std::string> shown{"0.25", "45000.5", "2023/03/15 12:00:00", "45000.5", "45000.5",
                                         "0.5", "45000.500"};
    EXPECT_EQ(texts, shown);

    // ClearColumnFormats: nothing for no columns, else each column's rows.
    Book cleared({At(1, 1, Variant::R8(0.25), "0.0%"), At(1, 2, Variant::R8(0.25), "0.0%"),
                  At(1, 3, Variant::R8(0.25), "0.0%")});
    EXPECT_TRUE(cleared.excel.ClearColumnFormats(1, 1, 1, 0));
    EXPECT_TRUE(cleared.excel.ClearColumnFormats(1, 1, 1, 2));
    texts.clear();
    cleared.excel.ReadRowTexts(1, 1, 3, texts);
    EXPECT_EQ(texts, (std::vector<std::string>{"0.25", "0.25", "25.0%"}));
}

TEST(CellAccess, ReadAndWriteSingleCells)
{
    Book book({At(2, 28, Variant::R8(3.5)), At(2, 702, Variant::String("last column"))});
    Variant v = book.Read(2, 28);
    ASSERT_EQ(v.Type(), VT_R8);
    EXPECT_EQ(v.Raw().dblVal, 3.5);
    EXPECT_EQ(Text(book.Read(2, 702).Raw()), "last column");
    EXPECT_EQ(book.Read(1, 1).Type(), VT_EMPTY);
    // Writing an empty value clears the cell.
    EXPECT_TRUE(book.excel.WriteCell(2, 28, Variant().Raw()));
    book.Reopen(true);
    EXPECT_EQ(book.Read(2, 28).Type(), VT_EMPTY);
}

TEST(CellAccess, CellsOffTheSheetAreRefused)
{
    // The block reads answer from the store without building an address;
    // they must still refuse what an addressed range refuses, instead of
    // answering with delete values for rows that don't exist.
    Book book({At(1, 1, Variant::R8(1))});
    automation::SafeArray block;
    std::string errors, error;
    Variant v;
    EXPECT_THROW(book.excel.ReadCell(0, 1, v), automation::ComError);  // the addressed route
    EXPECT_THROW(book.excel.ReadValueBlock(0, 2, 1, 1, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadValueBlock(1, 1, 702, 2, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadValueBlock(1048576, 2, 1, 1, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadValueBlock(1, -1, 1, 1, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadCellBlock(1, 1, 0, 1, block, true), automation::ComError);
    EXPECT_THROW(book.excel.ValidateColumn(0, 1, 1, 5, error), automation::ComError);
    EXPECT_THROW(book.excel.ValidateColumn(1, 1, 703, 7, error), automation::ComError);
    EXPECT_THROW(book.excel.CountRowCells(0, 1, 2), automation::ComError);
    EXPECT_THROW(book.excel.CountRowCells(1, 702, 1), automation::ComError);  // two cells are read
    EXPECT_EQ(errors, "");
    // The last addressable cells and an empty block are fine.
    EXPECT_TRUE(book.excel.ReadValueBlock(1048576, 1, 702, 1, block, -1.0, errors));
    EXPECT_EQ(Element<double>(block, 0, 0), -1.0);
    EXPECT_TRUE(book.excel.ReadValueBlock(1, 0, 1, 3, block, -1.0, errors));
    EXPECT_EQ(errors, "");
    EXPECT_EQ(book.excel.CountRowCells(1, 701, 1), 0);
}

TEST(CellAccess, OperationsNeedASelectedSheet)
{
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error));
    Variant v;
    EXPECT_THROW(excel.ReadCell(1, 1, v), automation::ComError);
    EXPECT_THROW(excel.GetUsedColumns(), automation::ComError);
    int count = 0;
    EXPECT_THROW(excel.CountColumnCells(1, count, 1), automation::ComError);
    excel.QuitExcel();
}

}  // namespace
