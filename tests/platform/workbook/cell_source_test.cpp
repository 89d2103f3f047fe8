// SPDX-License-Identifier: MIT
// The direct cell reads agree with what Value2 gives, cell for cell, over
// every workbook of the corpus, and the used bounds with UsedRange.
#include <gtest/gtest.h>

#include <filesystem>

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
}

}  // namespace
