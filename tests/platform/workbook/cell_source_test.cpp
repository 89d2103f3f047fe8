// SPDX-License-Identifier: MIT
// The direct cell reads agree with what Value2 gives, cell for cell, over
// every workbook of the corpus, and the used bounds with UsedRange.
#include <gtest/gtest.h>

#include <filesystem>
#include <stdexcept>
#include <vector>

#include "automation/com_error.h"
#include "automation/values.h"
#include "workbook/cell_source.h"
#include "workbook/engine.h"

namespace {

using workbook::CellContent;

void ExpectSame(const CellContent &cell, const VARIANT &v, const std::string &where)
{
    switch (cell.kind) {
    case CellContent::Kind::Empty: EXPECT_EQ(v.vt, VT_EMPTY) << where; break;
    case CellContent::Kind::Number:
        ASSERT_EQ(v.vt, VT_R8) << where;
        EXPECT_EQ(cell.number, v.dblVal) << where;
        break;
    case CellContent::Kind::Text:
        ASSERT_EQ(v.vt, VT_BSTR) << where;
        EXPECT_EQ(cell.text, automation::BstrToUtf8(v.bstrVal)) << where;
        break;
    case CellContent::Kind::Boolean:
        ASSERT_EQ(v.vt, VT_BOOL) << where;
        EXPECT_EQ(cell.boolean, v.boolVal == VARIANT_TRUE) << where;
        break;
    case CellContent::Kind::Error:
        ASSERT_EQ(v.vt, VT_ERROR) << where;
        EXPECT_EQ(uint32_t(0x800A0000u | uint32_t(cell.error)), uint32_t(v.scode)) << where;
        EXPECT_GE(cell.error, 2000);
        EXPECT_LE(cell.error, 2043);
        break;
    }
}

// The block reads give what the cell-by-cell reads give over the rectangle.
void ExpectBlockReadsAgree(workbook::CellSource &cells, int32_t top, int32_t bottom, int32_t left, int32_t right,
                           const std::string &where)
{
    const int32_t rows = bottom - top + 1, columns = right - left + 1;
    if (rows < 1 || columns < 1) return;  // a used range beyond the columns read here
    constexpr double kEmpty = -12345.5;
    std::vector<double> block(size_t(rows) * size_t(columns));
    std::vector<std::pair<int32_t, int32_t>> others;
    cells.ReadNumbers(top, rows, left, columns, block.data(), kEmpty,
                      [&](int32_t r, int32_t c, const CellContent &cell) {
                          EXPECT_NE(cell.kind, CellContent::Kind::Number);
                          EXPECT_NE(cell.kind, CellContent::Kind::Empty);
                          others.emplace_back(r, c);
                          return double(r * 1000 + c);  // tells the cell it was asked about
                      });
    std::vector<std::pair<int32_t, int32_t>> expectedOthers;
    for (int32_t r = top; r <= bottom; ++r) {
        for (int32_t c = left; c <= right; ++c) {
            const CellContent cell = cells.GetCell(r, c);
            const double got = block[size_t(c - left) * size_t(rows) + size_t(r - top)];
            const std::string at = where + " R" + std::to_string(r) + "C" + std::to_string(c);
            if (cell.kind == CellContent::Kind::Number) {
                EXPECT_EQ(got, cell.number) << at;
            } else if (cell.kind == CellContent::Kind::Empty) {
                EXPECT_EQ(got, kEmpty) << at;
            } else {
                EXPECT_EQ(got, double(r * 1000 + c)) << at;
                expectedOthers.emplace_back(r, c);
            }
        }
    }
    EXPECT_EQ(others, expectedOthers) << where << ": the other cells, row by row";
    for (int32_t c = left; c <= right; ++c) {
        for (int32_t from : {top, top + 1, (top + bottom) / 2}) {
            int32_t run = 0;
            while (from + run <= bottom && !cells.IsEmpty(from + run, c)) ++run;
            EXPECT_EQ(cells.CountFilledDown(from, c, bottom), run) << where << " C" << c << " from R" << from;
        }
    }
}

TEST(CellSource, AgreesWithValue2OverTheCorpus)
{
    int sheetsSeen = 0;
    for (const auto &entry : std::filesystem::recursive_directory_iterator(WORKBOOK_CORPUS_DIR)) {
        const auto ext = entry.path().extension();
        if (ext != ".xlsx" && ext != ".xlsm") continue;
        auto app = workbook::CreateApplication();
        auto book = app->GetWorkbooks()->Open(entry.path().string());
        auto sheets = book->GetWorksheets();
        for (int32_t s = 1; s <= sheets->Count(); ++s) {
            auto sheet = sheets->Item(s);
            auto *cells = dynamic_cast<workbook::CellSource *>(sheet.get());
            ASSERT_NE(cells, nullptr);
            const workbook::UsedBounds b = cells->GetUsedBounds();
            auto used = sheet->UsedRange();
            EXPECT_EQ(used->Row(), b.firstRow);
            EXPECT_EQ(used->Column(), b.firstColumn);
            EXPECT_EQ(used->Count(), (b.lastRow - b.firstRow + 1) * (b.lastColumn - b.firstColumn + 1));
            // One column past the used range on each side, so empty cells are read too.
            const int32_t lastColumn = std::min(b.lastColumn + 1, 40);
            const int32_t lastRow = std::min(b.lastRow + 1, 300);
            for (int32_t r = b.firstRow; r <= lastRow; ++r) {
                // The address below names columns A to Z only.
                for (int32_t c = b.firstColumn; c <= std::min(lastColumn, 26); ++c) {
                    const std::string where = entry.path().filename().string() + " sheet " +
                                              std::to_string(s) + " R" + std::to_string(r) + "C" +
                                              std::to_string(c);
                    automation::Variant v = sheet->GetRange(std::string(1, char('A' + (c - 1) % 26)) +
                                                            std::to_string(r))->GetValue2();
                    const CellContent cell = cells->GetCell(r, c);
                    ExpectSame(cell, v.Raw(), where);
                    EXPECT_EQ(cells->IsEmpty(r, c), cell.kind == CellContent::Kind::Empty) << where;
                }
            }
            ExpectBlockReadsAgree(*cells, b.firstRow, lastRow, b.firstColumn, lastColumn,
                                  entry.path().filename().string() + " sheet " + std::to_string(s));
            ++sheetsSeen;
        }
        book->Close(false);
        app->Quit();
    }
    EXPECT_GT(sheetsSeen, 50);
    // Outside the sheet's grid there is nothing, and asking is no fault.
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(automation::Variant::Missing().Raw());
    auto sheet = book->GetWorksheets()->Item(1);  // held: the cell source is the sheet object
    auto *cells = dynamic_cast<workbook::CellSource *>(sheet.get());
    ASSERT_NE(cells, nullptr);
    EXPECT_TRUE(cells->IsEmpty(0, 0));
    EXPECT_EQ(cells->GetCell(-1, 5).kind, CellContent::Kind::Empty);
    const auto b = cells->GetUsedBounds();
    EXPECT_EQ(b.firstRow, 1);
    EXPECT_EQ(b.lastColumn, 1);
    // A block must start on the grid; what reaches beyond its edge is empty.
    double four[4] = {};
    const auto never = [](int32_t, int32_t, const CellContent &) -> double { throw std::logic_error("no such cell"); };
    EXPECT_THROW(cells->ReadNumbers(0, 2, 1, 2, four, 0.0, never), automation::ComError);
    EXPECT_THROW(cells->ReadNumbers(1, 2, 16385, 2, four, 0.0, never), automation::ComError);
    cells->ReadNumbers(1048576, 2, 16384, 2, four, 7.0, never);
    EXPECT_EQ(four[0] + four[1] + four[2] + four[3], 28.0);
    EXPECT_EQ(cells->CountFilledDown(0, 1, 10), 0);
    EXPECT_EQ(cells->CountFilledDown(5, 1, 4), 0);
}

}  // namespace
