// SPDX-License-Identifier: MIT
// The store keeps its bounds between calls: each change of its cells must
// show in the next answer, whatever asked before.
#include <gtest/gtest.h>

#include "cell_store.h"

namespace {

using workbook::CellKind;
using workbook::CellStore;
using workbook::Rect;

void ExpectBounds(const CellStore &store, uint32_t top, uint32_t left, uint32_t bottom, uint32_t right)
{
    const auto r = store.Bounds();
    ASSERT_TRUE(r.has_value());
    EXPECT_EQ(r->top, top);
    EXPECT_EQ(r->left, left);
    EXPECT_EQ(r->bottom, bottom);
    EXPECT_EQ(r->right, right);
}

TEST(CellStoreBounds, FollowEveryChange)
{
    CellStore store;
    EXPECT_FALSE(store.Bounds().has_value());
    workbook::Cell cell;
    cell.kind = CellKind::Number;
    cell.column = 3;
    store.AppendCell(store.AppendRow(5), cell);
    ExpectBounds(store, 5, 3, 5, 3);
    cell.column = 2;
    store.AppendCell(store.AppendRow(2), cell);  // out of order until FinishLoad
    store.FinishLoad();
    ExpectBounds(store, 2, 2, 5, 3);

    store.SetValue(9, 7, CellKind::Number, 1);
    ExpectBounds(store, 2, 2, 9, 7);
    store.SetStyle(1, 1, 4);  // a formatted empty cell counts
    ExpectBounds(store, 1, 1, 9, 7);
    store.SetStyle(1, 1, 0);
    ExpectBounds(store, 2, 2, 9, 7);
    store.SetValue(9, 7, CellKind::Empty, 0);
    ExpectBounds(store, 2, 2, 5, 3);
    store.Clear(Rect{1, 1, 4, 10}, true, true);
    ExpectBounds(store, 5, 3, 5, 3);
    store.Clear(Rect{5, 3, 5, 3}, true, false);  // the value goes, the cell has no style
    EXPECT_FALSE(store.Bounds().has_value());
}

}  // namespace
