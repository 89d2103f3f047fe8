// SPDX-License-Identifier: MIT
// Range: addresses, Value2/Value get and put, texts, formats, clearing and
// the used range, on a new workbook.
#include <cmath>
#include <limits>

#include "engine_test_support.h"

namespace {

using automation::Variant;
using engine_test::Missing;
using engine_test::Utf8;

class RangeTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        app = workbook::CreateApplication();
        book = app->GetWorkbooks()->Add(Missing().Raw());
        sheet = book->GetWorksheets()->Item(1);
    }
    void TearDown() override { app->Quit(); }

    Variant At(const std::string &address) { return sheet->GetRange(address)->GetValue2(); }
    std::string Text(const std::string &address) { return Utf8(sheet->GetRange(address)->GetText()); }
    void Put(const std::string &address, const Variant &v) { sheet->GetRange(address)->SetValue2(v.Raw()); }

    // A rows x cols VT_VARIANT array counted from 1, filled by f(row, col).
    template <typename F>
    Variant Array(ULONG rows, ULONG cols, F f)
    {
        SAFEARRAYBOUND b[2] = {{rows, 1}, {cols, 1}};
        SAFEARRAY *sa = SafeArrayCreate(VT_VARIANT, 2, b);
        for (LONG r = 1; r <= static_cast<LONG>(rows); ++r)
            for (LONG c = 1; c <= static_cast<LONG>(cols); ++c) {
                Variant v = f(r, c);
                LONG index[2] = {r, c};
                SafeArrayPutElement(sa, index, v.Ptr());
            }
        return Variant::Array(VT_VARIANT, sa);
    }

    static VARIANT Element(const Variant &array, LONG row, LONG col)
    {
        VARIANT out;
        VariantInit(&out);
        LONG index[2] = {row, col};
        EXPECT_HR(S_OK, SafeArrayGetElement(array.Raw().parray, index, &out));
        return out;
    }

    std::shared_ptr<workbook::Application> app;
    std::shared_ptr<workbook::Workbook> book;
    std::shared_ptr<workbook::Worksheet> sheet;
};

TEST_F(RangeTest, AddressesGiveRowColumnAndCount)
{
    auto r = sheet->GetRange("B3", "D10");
    EXPECT_EQ(r->Row(), 3);
    EXPECT_EQ(r->Column(), 2);
    EXPECT_EQ(r->Count(), 24);
    EXPECT_EQ(r->Columns()->Count(), 3);
    EXPECT_EQ(r->Columns()->Row(), 3);
    auto same = sheet->GetRange("B3:D10");
    EXPECT_EQ(same->Count(), 24);
    EXPECT_EQ(sheet->GetRange("$D$10", "b3")->Count(), 24);  // corners in any order
    EXPECT_EQ(sheet->GetRange("ZZ5")->Column(), 702);
    EXPECT_EQ(sheet->GetRange("XFD1048576")->Row(), 1048576);
    EXPECT_COM_ERROR(sheet->GetRange("A0"), static_cast<HRESULT>(0x800A03EC), "'A0' is not a cell address");
    EXPECT_COM_ERROR(sheet->GetRange("XFE1"), static_cast<HRESULT>(0x800A03EC), "not a cell address");
    EXPECT_COM_ERROR(sheet->GetRange("A1", "1A"), static_cast<HRESULT>(0x800A03EC), "'1A'");
    EXPECT_COM_ERROR(sheet->GetRange("A1:XFD1048576")->Count(), DISP_E_OVERFLOW, "Count");
}

TEST_F(RangeTest, ValuesGoInAndComeBackAsTheyWere)
{
    Put("A1", Variant::R8(0.1));
    Put("A2", Variant::I4(-7));
    Put("A3", Variant::R4(0.5f));
    Put("A4", Variant::I2(3));
    Put("A5", Variant::Bool(true));
    Put("A6", Variant::Error(static_cast<SCODE>(0x800A07E7)));  // #DIV/0!
    Put("A7", Variant::R8(std::numeric_limits<double>::quiet_NaN()));
    Put("A8", Variant::Date(40972.25));
    EXPECT_EQ(At("A1").Raw().dblVal, 0.1);
    EXPECT_EQ(At("A2").Raw().dblVal, -7.0);
    EXPECT_EQ(At("A3").Raw().dblVal, 0.5);
    EXPECT_EQ(At("A4").Raw().dblVal, 3.0);
    ASSERT_EQ(At("A5").Type(), VT_BOOL);
    EXPECT_EQ(At("A5").Raw().boolVal, VARIANT_TRUE);
    ASSERT_EQ(At("A6").Type(), VT_ERROR);
    EXPECT_HR(static_cast<SCODE>(0x800A07E7), At("A6").Raw().scode);
    EXPECT_HR(static_cast<SCODE>(0x800A07F4), At("A7").Raw().scode);  // #NUM!
    ASSERT_EQ(At("A8").Type(), VT_R8);
    EXPECT_EQ(At("A8").Raw().dblVal, 40972.25);
    EXPECT_EQ(Text("A8"), "40972.25");  // Value2 gives no date format

    Put("A1", Variant());  // empty clears
    EXPECT_EQ(At("A1").Type(), VT_EMPTY);
    Variant object;
    object.Out()->vt = VT_UNKNOWN;
    EXPECT_COM_ERROR(Put("A9", object), DISP_E_TYPEMISMATCH, "can't go into a cell");
}

TEST_F(RangeTest, TextIsReadAsTyped)
{
    Put("A1", Variant::String("12.5"));
    Put("A2", Variant::String("TRUE"));
    Put("A3", Variant::String("2012-03-04"));
    Put("A4", Variant::String("abc"));
    Put("A5", Variant::String("12%"));
    Put("A6", Variant::String(""));
    ASSERT_EQ(At("A1").Type(), VT_R8);
    EXPECT_EQ(At("A1").Raw().dblVal, 12.5);
    ASSERT_EQ(At("A2").Type(), VT_BOOL);
    ASSERT_EQ(At("A3").Type(), VT_R8);
    EXPECT_EQ(At("A3").Raw().dblVal, 40972.0);
    EXPECT_EQ(Text("A3"), "2012-03-04");
    EXPECT_EQ(Utf8(At("A4")), "abc");
    EXPECT_EQ(At("A5").Raw().dblVal, 0.12);
    EXPECT_EQ(Text("A5"), "12%");
    EXPECT_EQ(At("A6").Type(), VT_EMPTY);
}

TEST_F(RangeTest, ValuePutOfADateGivesADateFormat)
{
    sheet->GetRange("A1")->SetValue(Variant::Date(40972.0).Raw());
    sheet->GetRange("A2")->SetValue(Variant::Date(40972.5).Raw());
    sheet->GetRange("A3")->SetNumberFormat("yyyy");
    sheet->GetRange("A3")->SetValue(Variant::Date(40972.0).Raw());
    EXPECT_EQ(At("A1").Raw().dblVal, 40972.0);
    EXPECT_EQ(Text("A1"), "3/4/2012");
    EXPECT_EQ(Text("A2"), "3/4/2012 12:00");
    EXPECT_EQ(Text("A3"), "2012");  // a format of its own stays
}

TEST_F(RangeTest, ScalarFillsTheRangeAndArraysGoElementByElement)
{
    sheet->GetRange("B2", "C3")->SetValue2(Variant::R8(5).Raw());
    Variant block = sheet->GetRange("A1", "D4")->GetValue2();
    ASSERT_EQ(block.Type(), VT_ARRAY | VT_VARIANT);
    SAFEARRAY *sa = block.Raw().parray;
    ASSERT_EQ(SafeArrayGetDim(sa), 2u);
    LONG lo = 0, hi = 0;
    SafeArrayGetLBound(sa, 1, &lo);
    SafeArrayGetUBound(sa, 1, &hi);
    EXPECT_EQ(lo, 1);
    EXPECT_EQ(hi, 4);
    for (LONG r = 1; r <= 4; ++r)
        for (LONG c = 1; c <= 4; ++c) {
            VARIANT v = Element(block, r, c);
            bool inside = r >= 2 && r <= 3 && c >= 2 && c <= 3;
            EXPECT_EQ(v.vt, inside ? VT_R8 : VT_EMPTY) << r << "," << c;
        }

    // Rows are the first dimension: element (r, c) is cell (row r, column c).
    Variant arr = Array(2, 3, [](LONG r, LONG c) {
        if (c == 3) return Variant::String("t" + std::to_string(r));
        return Variant::R8(r * 10 + c);
    });
    sheet->GetRange("E1", "G2")->SetValue2(arr.Raw());
    EXPECT_EQ(At("F1").Raw().dblVal, 12.0);
    EXPECT_EQ(At("E2").Raw().dblVal, 21.0);
    EXPECT_EQ(Utf8(At("G2")), "t2");
    Variant back = sheet->GetRange("E1:G2")->GetValue2();
    VARIANT f2 = Element(back, 2, 2);
    EXPECT_EQ(f2.dblVal, 22.0);

    // A smaller array: a single row repeats down, the rest is #N/A.
    sheet->GetRange("A10", "C11")->SetValue2(Array(1, 2, [](LONG, LONG c) { return Variant::R8(c); }).Raw());
    EXPECT_EQ(At("B11").Raw().dblVal, 2.0);
    EXPECT_HR(static_cast<SCODE>(0x800A07FA), At("C10").Raw().scode);

    // An array of doubles and a one-dimensional array (one row).
    SAFEARRAYBOUND b[2] = {{1, 0}, {1, 0}};
    SAFEARRAY *doubles = SafeArrayCreate(VT_R8, 2, b);
    LONG zero[2] = {0, 0};
    double d = 2.5;
    SafeArrayPutElement(doubles, zero, &d);
    sheet->GetRange("H1")->SetValue(Variant::Array(VT_R8, doubles).Raw());
    EXPECT_EQ(At("H1").Raw().dblVal, 2.5);
    SAFEARRAY *vec = SafeArrayCreateVector(VT_VARIANT, 0, 2);
    for (LONG i = 0; i < 2; ++i) {
        Variant v = Variant::String(i == 0 ? "x" : "y");
        SafeArrayPutElement(vec, &i, v.Ptr());
    }
    sheet->GetRange("H2", "I2")->SetValue(Variant::Array(VT_VARIANT, vec).Raw());
    EXPECT_EQ(Utf8(At("I2")), "y");
}

TEST_F(RangeTest, UsedRangeFollowsContentAndFormats)
{
    EXPECT_EQ(sheet->UsedRange()->Count(), 1);
    Put("C3", Variant::R8(1));
    Put("E4", Variant::String("x"));
    auto used = sheet->UsedRange();
    EXPECT_EQ(used->Row(), 3);
    EXPECT_EQ(used->Column(), 3);
    EXPECT_EQ(used->Count(), 6);
    sheet->GetRange("F8")->SetNumberFormat("0.00");  // a format alone counts
    EXPECT_EQ(sheet->UsedRange()->Count(), 24);
    sheet->GetRange("F8")->ClearFormats();
    EXPECT_EQ(sheet->UsedRange()->Count(), 6);
    sheet->UsedRange()->Clear();
    EXPECT_EQ(sheet->UsedRange()->Count(), 1);
    EXPECT_EQ(sheet->UsedRange()->Row(), 1);
}

TEST_F(RangeTest, NumberFormatsTextsAndClearing)
{
    Put("A1", Variant::R8(1234.5678));
    auto a1 = sheet->GetRange("A1");
    EXPECT_EQ(Text("A1"), "1234.5678");
    a1->SetNumberFormat("0.00");  // a built-in code
    EXPECT_EQ(Text("A1"), "1234.57");
    a1->SetNumberFormat("#,##0.0 \"kg\"");  // a custom one
    EXPECT_EQ(Text("A1"), "1,234.6 kg");
    a1->ClearFormats();
    EXPECT_EQ(Text("A1"), "1234.5678");
    EXPECT_EQ(At("A1").Raw().dblVal, 1234.5678);
    Put("A2", Variant::R8(1234.5678));
    EXPECT_EQ(Utf8(sheet->GetRange("A1", "A2")->GetText()), "1234.5678");  // all show the same
    Put("A2", Variant::R8(2));
    EXPECT_EQ(sheet->GetRange("A1", "A2")->GetText().Type(), VT_NULL);
    a1->SetNumberFormat("0.0");
    a1->Clear();
    EXPECT_EQ(At("A1").Type(), VT_EMPTY);
    Put("A1", Variant::R8(3));
    EXPECT_EQ(Text("A1"), "3");  // Clear took the format too
}

TEST_F(RangeTest, AutoFitWorksOnColumnsOnly)
{
    Put("A1", Variant::String("a rather long heading"));
    Put("A2", Variant::R8(1));
    EXPECT_COM_ERROR(sheet->UsedRange()->AutoFit(), static_cast<HRESULT>(0x800A03EC), "Columns");
    sheet->UsedRange()->Columns()->AutoFit();  // the width shows in the saved sheet
    testing_host::TempDir dir;
    book->SaveAs(dir.File("fit.xlsx"));
    std::string xml = engine_test::ZipEntries(dir.File("fit.xlsx"))["xl/worksheets/sheet1.xml"];
    size_t col = xml.find("<col min=\"1\" max=\"1\" width=\"");
    ASSERT_NE(col, std::string::npos) << xml;
    EXPECT_NE(xml.find("customWidth=\"1\" bestFit=\"1\"", col), std::string::npos);
    double width = std::stod(xml.substr(col + 28));
    EXPECT_GT(width, 15.0);
    EXPECT_LT(xml.find("<cols>"), xml.find("<sheetData>"));
}

}  // namespace
