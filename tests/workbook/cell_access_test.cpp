// SPDX-License-Identifier: MIT
// CExcelObj's cell operations on real workbooks: each sheet is written through
// the engine, saved and opened again (or read from a committed fixture), and
// the operations are held to the cases where a slip would show.
#include <gtest/gtest.h>

#include <cmath>
#include <stdexcept>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "support/files.h"
#include "support/temp_dir.h"
#include "workbook/excel_obj.h"

namespace {

using automation::Variant;

struct Put {
    int row, col;
    Variant value;
    std::string numberFormat = {};  // empty: General
};

// A session on a workbook whose first sheet holds the given cells (written
// through Value2 and NumberFormat), saved and opened again on the same
// session, so that every read goes through the saved file; or on a committed
// fixture, closed without saving.
class Book {
public:
    explicit Book(const std::vector<Put> &cells)
    {
        std::string error;
        if (!excel.StartExcel(error) || !excel.CreateWorkbook(path, error)) throw std::runtime_error("no workbook: " + error);
        Open(path);
        for (const Put &cell : cells) {
            excel.WriteCell(cell.row, cell.col, cell.value.Raw());
            if (!cell.numberFormat.empty()) excel.SetColumnNumberFormat(cell.row, 1, cell.col, cell.numberFormat);
        }
        Reopen();
    }
    explicit Book(const std::string &fixture)
    {
        std::string error;
        excel.StartExcel(error);
        Open(VANTREL_SOURCE_DIR "/tests/data/workbook/" + fixture);
    }
    ~Book()
    {
        excel.CloseWorkbook(0);
        excel.QuitExcel();
    }
    void Reopen()
    {
        excel.CloseWorkbook(1);
        Open(path);
    }
    Variant Read(int row, int col)
    {
        Variant v;
        excel.ReadCell(row, col, v);
        return v;
    }

    testing_host::TempDir dir;
    const std::string path = dir.File("cells.xlsx");
    CExcelObj excel;

private:
    void Open(const std::string &file)
    {
        std::string error;
        if (!excel.OpenWorkbook(file, error) || !excel.SelectSheet(1, error))
            throw std::runtime_error(file + " doesn't open: " + error);
    }
};

// Element (r, c) of a two-dimensional array counted from 0.
double Element(const automation::SafeArray &block, LONG r, LONG c)
{
    double out = -12345;
    LONG index[2] = {r, c};
    EXPECT_EQ(SafeArrayGetElement(block.Get(), index, &out), S_OK) << r << "," << c;
    return out;
}

constexpr double kSecond = 1.0 / 86400.0;
constexpr double kNoon = 45000.5;  // 2023-03-15 12:00:00

TEST(CellAccess, ReadValueBlock)
{
    // Columns of different lengths: the block's layout must keep rows and columns apart.
    std::vector<Put> cells;
    for (int r = 1; r <= 4; ++r)
        for (int c = 1; c <= 3; ++c) cells.push_back({r, c, Variant::R8(r * 10 + c)});
    Book written(cells);
    automation::SafeArray block;
    std::string errors;
    EXPECT_TRUE(written.excel.ReadValueBlock(2, 3, 2, 3, block, -1.0, errors));
    EXPECT_EQ(errors, "");
    for (LONG r = 0; r < 3; ++r)
        for (LONG c = 0; c < 3; ++c)
            EXPECT_EQ(Element(block, r, c), r + 2 <= 4 && c + 2 <= 3 ? (r + 2) * 10 + (c + 2) : -1.0) << r << "," << c;

    // Row 1: 1.5, abc, "12.5" as text, TRUE, #N/A, xyz. Row 2: FALSE, empty, #DIV/0!.
    // Cells that are no number give the delete value and a message in reading
    // order, joined to what the caller already holds.
    Book kinds(std::string("cell_kinds.xlsx"));
    const double del = -999.0;
    errors = "earlier";
    EXPECT_TRUE(kinds.excel.ReadValueBlock(1, 2, 1, 6, block, del, errors));
    const double expected[2][6] = {{1.5, del, 12.5, -1.0, del, del}, {0.0, del, del, del, del, del}};
    for (LONG r = 0; r < 2; ++r)
        for (LONG c = 0; c < 6; ++c) EXPECT_EQ(Element(block, r, c), expected[r][c]) << r << "," << c;
    EXPECT_EQ(errors,
              "earlier\r\n"
              "Line 1, Column 2 - Only double values are allowed as item data.\r\n"
              "Line 1, Column 5 - Only double values are allowed as item data.\r\n"
              "Line 1, Column 6 - Only double values are allowed as item data.\r\n"
              "Line 2, Column 3 - Only double values are allowed as item data.");
    errors.clear();
    EXPECT_TRUE(kinds.excel.ReadValueBlock(1, 1, 5, 1, block, del, errors));
    EXPECT_EQ(errors, "Line 1, Column 5 - Only double values are allowed as item data.");  // no separator first
}

TEST(CellAccess, ReadDateColumnAsEachCellConverts)
{
    const std::vector<Variant> cells = {
        Variant::R8(kNoon), Variant::Date(kNoon + 1), Variant::String("2024-03-01 10:30:00"), Variant::String("abc"),
        Variant(), Variant::Bool(true), Variant::R8(-1.5), Variant::R8(0.0), Variant::R8(2958465.75),
        Variant::R8(2958466.5), Variant::R8(1e10), Variant::R8(-1e10)};
    std::vector<Put> puts;
    for (size_t i = 0; i < cells.size(); ++i) puts.push_back({int(i) + 2, 3, cells[i]});
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

// A row of cells as WriteDataRow takes its time cells.
automation::SafeArray Row(std::vector<Variant> values)
{
    automation::SafeArray row(SafeArrayCreateVector(VT_VARIANT, 0, ULONG(values.size())));
    for (LONG i = 0; i < LONG(values.size()); ++i) EXPECT_EQ(SafeArrayPutElement(row.Get(), &i, values[size_t(i)].Ptr()), S_OK);
    return row;
}

TEST(CellAccess, WriteDataRowAndDeleteValues)
{
    const double deleteValue = 0.1;
    const double beyondSingle = 0.1 + 1e-12;  // another double, the same float
    ASSERT_NE(beyondSingle, deleteValue);
    ASSERT_EQ(static_cast<float>(beyondSingle), static_cast<float>(deleteValue));
    Book book(std::vector<Put>{});
    auto time = Row({Variant::String("2012/03/04"), Variant::String("05:06:07")});
    for (int writeDeleteValues : {0, 1})
        EXPECT_TRUE(book.excel.WriteDataRow(1 + writeDeleteValues, 1, time.Get(),
                                            {1.25, deleteValue, beyondSingle, 0.1000001}, writeDeleteValues, deleteValue));
    // A NaN delete value never equals anything, so nothing is skipped.
    EXPECT_TRUE(book.excel.WriteDataRow(3, 1, Row({Variant::R8(40972.5)}).Get(), {2.5}, 0, std::nan("")));
    book.Reopen();
    EXPECT_EQ(testing_host::ReadFile(book.path).substr(0, 2), "PK");  // the engine's format, not the extension's
    const double sixPastFive = (5 * 3600 + 6 * 60 + 7) * kSecond;
    // The time cells went in as typed: a date and a time of day. Delete values are
    // skipped without writeDeleteValues, even beyond single precision.
    const std::vector<std::vector<double>> rows = {{40972.0, sixPastFive, 1.25, NAN, NAN, 0.1000001},
                                                   {40972.0, sixPastFive, 1.25, deleteValue, beyondSingle, 0.1000001},
                                                   {40972.5, 2.5}};
    for (size_t r = 0; r < rows.size(); ++r)
        for (size_t c = 0; c < rows[r].size(); ++c) {
            const Variant v = book.Read(int(r) + 1, int(c) + 1);
            if (std::isnan(rows[r][c])) {
                EXPECT_EQ(v.Type(), VT_EMPTY) << r << "," << c;
            } else {
                ASSERT_EQ(v.Type(), VT_R8) << r << "," << c;
                EXPECT_NEAR(v.Raw().dblVal, rows[r][c], 1e-12) << r << "," << c;
            }
        }
    EXPECT_EQ(book.Read(2, 5).Raw().dblVal, beyondSingle);  // exactly, not as a float
}

TEST(CellAccess, RowTexts)
{
    Book book({{1, 2, Variant::R8(0.5), "0.00%"}, {1, 3, Variant::Date(kNoon), "yyyy-mm-dd hh:mm"},
               {1, 4, Variant::R8(1234.5678)}, {1, 5, Variant::String("plain")}, {1, 6, Variant::Bool(true)},
               {1, 7, Variant::R8(1.0 / 3.0)}});
    std::vector<std::string> texts{"kept"};
    EXPECT_TRUE(book.excel.ReadRowTexts(1, 1, 8, texts));
    EXPECT_EQ(texts, (std::vector<std::string>{"kept", "", "50.00%", "2023-03-15 12:00", "1234.5678", "plain", "TRUE",
                                               "0.333333333", ""}));

    // Written texts stay texts, whatever they look like; nothing to write is no call.
    const std::vector<std::string> written{"0012", "abc", "TRUE", "2024-03-01", "", "1e5"};
    EXPECT_TRUE(book.excel.WriteRowTexts(3, 2, written));
    EXPECT_TRUE(book.excel.WriteRowTexts(4, 1, {}));
    book.Reopen();
    for (int c = 0; c < 6; ++c) EXPECT_EQ(book.Read(3, c + 2).Type(), c == 4 ? VT_EMPTY : VT_BSTR) << c;
    texts.clear();
    EXPECT_TRUE(book.excel.ReadRowTexts(3, 2, 6, texts));
    EXPECT_EQ(texts, written);
}

TEST(CellAccess, CellsOffTheSheetAreRefused)
{
    // The block reads answer from the store without building an address;
    // they must still refuse what an addressed range refuses, instead of
    // answering with delete values for rows that don't exist.
    Book book({{1, 1, Variant::R8(1)}});
    automation::SafeArray block;
    std::string errors, error;
    Variant v;
    EXPECT_THROW(book.excel.ReadCell(0, 1, v), automation::ComError);  // the addressed route
    EXPECT_THROW(book.excel.ReadValueBlock(0, 2, 1, 1, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadValueBlock(1, 1, 16384, 2, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadValueBlock(1048576, 2, 1, 1, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadValueBlock(1, -1, 1, 1, block, -1.0, errors), automation::ComError);
    EXPECT_THROW(book.excel.ReadCellBlock(1, 1, 0, 1, block, true), automation::ComError);
    EXPECT_THROW(book.excel.ValidateColumn(0, 1, 1, 5, error), automation::ComError);
    EXPECT_THROW(book.excel.ValidateColumn(1, 1, 16385, 7, error), automation::ComError);
    EXPECT_THROW(book.excel.CountRowCells(0, 1, 2), automation::ComError);
    EXPECT_THROW(book.excel.CountRowCells(1, 16384, 1), automation::ComError);  // two cells are read
    EXPECT_EQ(errors, "");
    // The last addressable cells and an empty block are fine.
    EXPECT_TRUE(book.excel.ReadValueBlock(1048576, 1, 16384, 1, block, -1.0, errors));
    EXPECT_EQ(Element(block, 0, 0), -1.0);
    EXPECT_TRUE(book.excel.ReadValueBlock(1, 0, 1, 3, block, -1.0, errors));
    EXPECT_EQ(errors, "");
    EXPECT_EQ(book.excel.CountRowCells(1, 701, 1), 0);
}

}  // namespace
