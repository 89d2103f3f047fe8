// SPDX-License-Identifier: MIT
// The worksheet's direct number writes store what Value stores, down to the
// saved sheet part; the store's read hint finds what a search finds, in any
// order and after the cells change.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "cells/cell_store.h"
#include "engine_test_support.h"
#include "workbook/cell_source.h"

namespace {

// A new workbook whose sheet starts with a text, a formatted cell, a date
// format and a number in the cells the numbers then go to.
struct Book {
    std::shared_ptr<workbook::Application> app = workbook::CreateApplication();
    std::shared_ptr<workbook::Workbook> book = app->GetWorkbooks()->Add(engine_test::Missing().Raw());
    std::shared_ptr<workbook::Worksheet> sheet = book->GetWorksheets()->Item(1);

    Book()
    {
        sheet->GetRange("A1")->SetValue2(automation::Variant::String("text").Raw());
        sheet->GetRange("B1")->SetNumberFormat("0.00");
        sheet->GetRange("C1")->SetNumberFormat("yyyy-mm-dd hh:mm");
        sheet->GetRange("C1")->SetValue2(automation::Variant::R8(45000.25).Raw());
        sheet->GetRange("D1")->SetValue2(automation::Variant::R8(7).Raw());
    }
    std::string Text(const std::string &address) { return engine_test::Utf8(sheet->GetRange(address)->GetText()); }
};

// Both books saved: the same parts, byte for byte.
void ExpectSameFiles(Book &byRange, Book &bySink)
{
    testing_host::TempDir dir;
    byRange.book->SaveAs(dir.File("range.xlsx"));
    bySink.book->SaveAs(dir.File("sink.xlsx"));
    EXPECT_EQ(engine_test::ZipEntries(dir.File("range.xlsx")), engine_test::ZipEntries(dir.File("sink.xlsx")));
}

TEST(CellSink, PutNumberStoresWhatValueStores)
{
    const double values[] = {1.5, -0.0, std::nan(""), -std::numeric_limits<double>::infinity(),
                             std::numeric_limits<double>::denorm_min(), 45123.75};
    Book byRange, bySink;
    auto &sink = dynamic_cast<workbook::CellSink &>(*bySink.sheet);
    for (int32_t i = 0; i < int32_t(std::size(values)); ++i) {
        // Over the cells made first, and far off, in rows that don't exist yet, out of order.
        for (int32_t row : {1, 1000 - i}) {
            const std::string address = std::string(1, char('A' + i)) + std::to_string(row);
            byRange.sheet->GetRange(address)->SetValue(automation::Variant::R8(values[i]).Raw());
            sink.PutNumber(row, i + 1, values[i]);
            EXPECT_EQ(byRange.Text(address), bySink.Text(address)) << address;
        }
    }
    // The kept style shows (B1 under 0.00), NaN and infinities are #NUM!.
    EXPECT_EQ(bySink.Text("B1"), "0.00");
    EXPECT_EQ(bySink.Text("C1"), "#NUM!");
    EXPECT_EQ(bySink.sheet->GetRange("D1")->GetValue2().Raw().scode, static_cast<SCODE>(0x800A0000 | 2036));
    ExpectSameFiles(byRange, bySink);
}

TEST(CellSink, PutVariantStoresWhatValueAndValue2Store)
{
    using automation::Variant;
    VARIANT money;
    VariantInit(&money);
    money.vt = VT_CY;
    money.cyVal = 12345678;
    std::vector<Variant> values = {Variant::Date(45123.5), Variant::Date(45123), Variant(),
                                   Variant::String("12.5%"), Variant::String("2024-01-02"), Variant::String("hello"),
                                   Variant::String(""), Variant::Bool(true), Variant::I4(-42),
                                   Variant::Error(SCODE(0x800A0000u | 2042)), Variant::Missing(), Variant()};
    VariantCopy(values[2].Out(), &money);
    for (bool asValue : {true, false}) {
        SCOPED_TRACE(asValue ? "Value" : "Value2");
        Book byRange, bySink;
        auto &sink = dynamic_cast<workbook::CellSink &>(*bySink.sheet);
        // Each value onto an empty cell, and onto one given the format 0.00
        // just before, each in a row of its own.
        for (int32_t i = 0; i < int32_t(values.size()); ++i) {
            for (bool formatted : {false, true}) {
                const int32_t row = 10 + 2 * i + formatted, column = formatted ? 2 : 1;
                const std::string address = std::string(1, char('A' + column - 1)) + std::to_string(row);
                auto range = byRange.sheet->GetRange(address);
                if (formatted) {
                    range->SetNumberFormat("0.00");
                    bySink.sheet->GetRange(address)->SetNumberFormat("0.00");
                }
                if (asValue) range->SetValue(values[size_t(i)].Raw());
                else range->SetValue2(values[size_t(i)].Raw());
                sink.PutVariant(row, column, values[size_t(i)].Raw(), asValue);
                EXPECT_EQ(byRange.Text(address), bySink.Text(address)) << address;
            }
        }
        ExpectSameFiles(byRange, bySink);
    }
    // A value no cell takes is refused as Value refuses it.
    Book b;
    VARIANT object;
    VariantInit(&object);
    object.vt = VT_UNKNOWN;
    object.punkVal = nullptr;
    EXPECT_COM_ERROR(dynamic_cast<workbook::CellSink &>(*b.sheet).PutVariant(1, 1, object, true), DISP_E_TYPEMISMATCH,
                     "can't go into a cell");
}

TEST(CellSink, PutNumberRefusesCellsOffTheGridAndClosedBooks)
{
    Book b;
    auto &sink = dynamic_cast<workbook::CellSink &>(*b.sheet);
    for (auto [row, column] : {std::pair{0, 1}, {1, 0}, {-5, 1}, {1048577, 1}, {1, 16385}})
        EXPECT_COM_ERROR(sink.PutNumber(row, column, 1.0), static_cast<HRESULT>(0x800A03EC), "outside the sheet");
    sink.PutNumber(1048576, 16384, 2.0);
    EXPECT_EQ(b.sheet->GetRange("XFD1048576")->GetValue2().Raw().dblVal, 2.0);
    b.book->Close(false);
    EXPECT_COM_ERROR(sink.PutNumber(1, 1, 1.0), static_cast<HRESULT>(0x80010108), "closed");
}

TEST(CellStoreHint, FindsWhatTheSearchFindsInAnyOrder)
{
    workbook::CellStore store;
    std::mt19937 random(7);
    for (uint32_t row = 1; row <= 300; row += 1 + random() % 3)
        for (uint32_t column = 1; column <= 12; column += 1 + random() % 2)
            store.SetValue(row, column, workbook::CellKind::Number, std::bit_cast<uint64_t>(double(row * 100 + column)));
    auto expectSame = [&](workbook::CellStore::FindHint &hint, uint32_t row, uint32_t column) {
        const workbook::Cell *searched = store.Find(row, column);
        const workbook::Cell *hinted = store.Find(row, column, hint);
        ASSERT_EQ(searched, hinted) << row << "," << column;
    };
    workbook::CellStore::FindHint hint;
    // In reading order, as block reads walk, then backwards, then at random.
    for (uint32_t i = 0; i < 310 * 14; ++i) expectSame(hint, 1 + i / 14, 1 + i % 14);
    for (uint32_t i = 310 * 14; i-- > 0;) expectSame(hint, 1 + i / 14, 1 + i % 14);
    for (int i = 0; i < 5000; ++i) expectSame(hint, 1 + random() % 310, 1 + random() % 14);
    // The store changes under the hint: rows go and come, cells are inserted.
    expectSame(hint, 150, 5);
    store.Clear(workbook::Rect{1, 1, 149, 12}, true, true);
    store.SetValue(1, 3, workbook::CellKind::Number, 1);
    store.SetValue(150, 2, workbook::CellKind::Boolean, 1);
    for (uint32_t i = 0; i < 310 * 14; ++i) expectSame(hint, 1 + i / 14, 1 + i % 14);
    EXPECT_EQ(store.Find(0, 0, hint), nullptr);
}

}  // namespace
