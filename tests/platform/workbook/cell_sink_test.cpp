// SPDX-License-Identifier: MIT
// The worksheet's direct number writes store what Value stores, down to the
// saved sheet part; the store's read hint finds what a search finds, in any
// order and after the cells change.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "cell_store.h"
#include "engine_test_support.h"
#include "workbook/cell_source.h"

namespace {

using engine_test::Missing;

// A new workbook whose sheet starts with a text, a formatted cell, a date
// format and a number in the cells the numbers then go to.
struct Book {
    std::shared_ptr<workbook::Application> app = workbook::CreateApplication();
    std::shared_ptr<workbook::Workbook> book = app->GetWorkbooks()->Add(Missing().Raw());
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

TEST(CellSink, PutNumberStoresWhatValueStores)
{
    const double values[] = {1.5,
                             -0.0,
                             std::nan(""),
                             std::numeric_limits<double>::infinity(),
                             -std::numeric_limits<double>::infinity(),
                             1e308,
                             std::numeric_limits<double>::denorm_min(),
                             -123456.789,
                             45123.75};
    Book byRange, bySink;
    auto *sink = dynamic_cast<workbook::CellSink *>(bySink.sheet.get());
    ASSERT_NE(sink, nullptr);
    const std::string columns = "ABCDEFGHI";
    for (size_t i = 0; i < std::size(values); ++i) {
        const std::string address = std::string(1, columns[i]) + "1";
        byRange.sheet->GetRange(address)->SetValue(automation::Variant::R8(values[i]).Raw());
        sink->PutNumber(1, int32_t(i + 1), values[i]);
        // Far cells, in rows that don't exist yet and out of order.
        byRange.sheet->GetRange(std::string(1, columns[i]) + std::to_string(1000 - i))
            ->SetValue(automation::Variant::R8(values[i]).Raw());
        sink->PutNumber(int32_t(1000 - i), int32_t(i + 1), values[i]);
    }
    for (size_t i = 0; i < std::size(values); ++i) {
        for (const std::string &row : {std::string("1"), std::to_string(1000 - i)}) {
            const std::string address = std::string(1, columns[i]) + row;
            SCOPED_TRACE(address);
            const automation::Variant a = byRange.sheet->GetRange(address)->GetValue2();
            const automation::Variant b = bySink.sheet->GetRange(address)->GetValue2();
            ASSERT_EQ(a.Type(), b.Type());
            if (a.Type() == VT_R8) {
                EXPECT_EQ(std::bit_cast<uint64_t>(a.Raw().dblVal), std::bit_cast<uint64_t>(b.Raw().dblVal));
            }
            if (a.Type() == VT_ERROR) {
                EXPECT_EQ(a.Raw().scode, b.Raw().scode);
            }
            EXPECT_EQ(byRange.Text(address), bySink.Text(address));
        }
    }
    // The kept style shows (B1 under 0.00), NaN and infinities are #NUM!.
    EXPECT_EQ(bySink.Text("A1"), "1.5");
    EXPECT_EQ(bySink.Text("B1"), "0.00");
    EXPECT_EQ(bySink.Text("C1"), "#NUM!");
    EXPECT_EQ(bySink.sheet->GetRange("D1")->GetValue2().Raw().scode, static_cast<SCODE>(0x800A0000 | 2036));
    EXPECT_EQ(bySink.Text("I1"), "45123.75");

    // Saved, both sheets are the same bytes.
    testing_host::TempDir dir;
    byRange.book->SaveAs(dir.File("range.xlsx"));
    bySink.book->SaveAs(dir.File("sink.xlsx"));
    const auto a = engine_test::ZipEntries(dir.File("range.xlsx"));
    const auto b = engine_test::ZipEntries(dir.File("sink.xlsx"));
    ASSERT_TRUE(a.count("xl/worksheets/sheet1.xml"));
    EXPECT_EQ(a, b);
}

TEST(CellSink, PutVariantStoresWhatValueAndValue2Store)
{
    using automation::Variant;
    VARIANT date;
    VariantInit(&date);
    date.vt = VT_DATE;
    date.date = 45123.5;
    VARIANT wholeDate = date;
    wholeDate.date = 45123;
    VARIANT money;
    VariantInit(&money);
    money.vt = VT_CY;
    money.cyVal = 12345678;
    const std::vector<std::pair<std::string, automation::Variant>> values = [&] {
        std::vector<std::pair<std::string, automation::Variant>> v;
        v.emplace_back("date", Variant());
        VariantCopy(v.back().second.Out(), &date);
        v.emplace_back("whole date", Variant());
        VariantCopy(v.back().second.Out(), &wholeDate);
        v.emplace_back("currency", Variant());
        VariantCopy(v.back().second.Out(), &money);
        v.emplace_back("percent text", Variant::String("12.5%"));
        v.emplace_back("date text", Variant::String("2024-01-02"));
        v.emplace_back("plain text", Variant::String("hello"));
        v.emplace_back("empty text", Variant::String(""));
        v.emplace_back("true", Variant::Bool(true));
        v.emplace_back("integer", Variant::I4(-42));
        v.emplace_back("error", Variant::Error(SCODE(0x800A0000u | 2042)));
        v.emplace_back("missing", Variant::Missing());
        v.emplace_back("empty", Variant());
        return v;
    }();
    for (bool asValue : {true, false}) {
        Book byRange, bySink;
        auto &sink = dynamic_cast<workbook::CellSink &>(*bySink.sheet);
        // Each value onto an empty cell, and onto one given the format 0.00
        // just before (in column B or D), each in a row of its own.
        int32_t column = 1;
        for (const auto &[label, value] : values) {
            SCOPED_TRACE(label);
            for (int32_t row : {5, 1}) {
                const int32_t target = row == 1 ? (column % 2 ? 2 : 4) : column;
                const std::string address = std::string(1, char('A' + target - 1)) + std::to_string(row + column * 10);
                auto range = byRange.sheet->GetRange(address);
                auto sinkRange = bySink.sheet->GetRange(address);
                if (row == 1) {
                    range->SetNumberFormat("0.00");
                    sinkRange->SetNumberFormat("0.00");
                }
                if (asValue) range->SetValue(value.Raw());
                else range->SetValue2(value.Raw());
                const int32_t sheetRow = row + column * 10;
                sink.PutVariant(sheetRow, target, value.Raw(), asValue);
                EXPECT_EQ(byRange.Text(address), bySink.Text(address)) << address;
            }
            ++column;
        }
        testing_host::TempDir dir;
        byRange.book->SaveAs(dir.File("range.xlsx"));
        bySink.book->SaveAs(dir.File("sink.xlsx"));
        EXPECT_EQ(engine_test::ZipEntries(dir.File("range.xlsx")), engine_test::ZipEntries(dir.File("sink.xlsx")))
            << (asValue ? "Value" : "Value2");
    }
    // A value no cell takes is refused as Value refuses it.
    Book b;
    VARIANT object;
    VariantInit(&object);
    object.vt = VT_UNKNOWN;
    object.punkVal = nullptr;
    EXPECT_COM_ERROR(dynamic_cast<workbook::CellSink &>(*b.sheet).PutVariant(1, 1, object, true), DISP_E_TYPEMISMATCH,
                     "can't go into a cell");
    EXPECT_COM_ERROR(b.sheet->GetRange("A1")->SetValue(object), DISP_E_TYPEMISMATCH, "can't go into a cell");
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
    for (uint32_t row = 1; row <= 310; ++row)
        for (uint32_t column = 1; column <= 14; ++column) expectSame(hint, row, column);
    for (uint32_t row = 310; row >= 1; --row)
        for (uint32_t column = 14; column >= 1; --column) expectSame(hint, row, column);
    for (int i = 0; i < 5000; ++i) expectSame(hint, 1 + random() % 310, 1 + random() % 14);
    // The store changes under the hint: rows go and come, cells are inserted.
    expectSame(hint, 150, 5);
    store.Clear(workbook::Rect{1, 1, 149, 12}, true, true);
    store.SetValue(1, 3, workbook::CellKind::Number, 1);
    store.SetValue(150, 2, workbook::CellKind::Boolean, 1);
    for (uint32_t row = 1; row <= 310; ++row)
        for (uint32_t column = 1; column <= 14; ++column) expectSame(hint, row, column);
    workbook::CellStore empty;
    workbook::CellStore::FindHint other;
    EXPECT_EQ(empty.Find(1, 1, other), nullptr);
    EXPECT_EQ(store.Find(0, 0, hint), nullptr);
}

}  // namespace
