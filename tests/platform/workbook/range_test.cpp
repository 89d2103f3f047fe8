// SPDX-License-Identifier: MIT
// Range on a new workbook: Value2/Value get and put, texts read as typed,
// arrays, and the used range as the cells change.
#include <limits>
#include <sstream>
#include <tuple>

#include "engine_test_support.h"

namespace {

using automation::Variant;
using engine_test::Utf8;

constexpr SCODE kNotAvailable = static_cast<SCODE>(0x800A07FA);  // #N/A

// A value as text that compares: its kind and what it holds.
std::string Shown(const Variant &v)
{
    const VARIANT &r = v.Raw();
    std::ostringstream out;
    out.precision(17);
    if (r.vt == VT_R8) out << "number " << r.dblVal;
    else if (r.vt == VT_BOOL) out << "boolean " << (r.boolVal == VARIANT_TRUE);
    else if (r.vt == VT_ERROR) out << "error " << (r.scode & 0xFFFF);
    else if (r.vt == VT_BSTR) out << "text " << Utf8(v);
    else out << "type " << r.vt;
    return out.str();
}

class RangeTest : public ::testing::Test {
protected:
    Variant At(const std::string &address) { return sheet->GetRange(address)->GetValue2(); }
    std::string Text(const std::string &address) { return Utf8(sheet->GetRange(address)->GetText()); }
    void Put(const std::string &address, const Variant &v) { sheet->GetRange(address)->SetValue2(v.Raw()); }
    // Row, column and cell count of the used range.
    std::tuple<int32_t, int32_t, int32_t> Used()
    {
        auto used = sheet->UsedRange();
        return {used->Row(), used->Column(), used->Count()};
    }

    std::shared_ptr<workbook::Application> app = workbook::CreateApplication();
    std::shared_ptr<workbook::Worksheet> sheet = app->GetWorkbooks()->Add(engine_test::Missing().Raw())->GetWorksheets()->Item(1);
};

TEST_F(RangeTest, ValuesGoInAndComeBackAsTheyWere)
{
    const struct {
        Variant put, got;
        const char *shown;
    } cases[] = {
        {Variant::R8(0.1), Variant::R8(0.1), "0.1"},
        {Variant::I4(-7), Variant::R8(-7), "-7"},
        {Variant::R4(0.5f), Variant::R8(0.5), "0.5"},
        {Variant::I2(3), Variant::R8(3), "3"},
        {Variant::Date(40972.25), Variant::R8(40972.25), "40972.25"},  // Value2 gives no date format
        {Variant::Bool(true), Variant::Bool(true), "TRUE"},
        {Variant::Error(static_cast<SCODE>(0x800A07D7)), Variant::Error(static_cast<SCODE>(0x800A07D7)), "#DIV/0!"},
        {Variant::R8(std::numeric_limits<double>::quiet_NaN()), Variant::Error(static_cast<SCODE>(0x800A07F4)), "#NUM!"},
        // Text is read as typed.
        {Variant::String("12.5"), Variant::R8(12.5), "12.5"},
        {Variant::String("TRUE"), Variant::Bool(true), "TRUE"},
        {Variant::String("2012-03-04"), Variant::R8(40972), "2012-03-04"},
        {Variant::String("12%"), Variant::R8(0.12), "12%"},
        {Variant::String("abc"), Variant::String("abc"), "abc"},
        {Variant::String(""), Variant(), ""},
    };
    int row = 0;
    for (const auto &c : cases) {
        const std::string address = "A" + std::to_string(++row);
        Put(address, c.put);
        EXPECT_EQ(Shown(At(address)), Shown(c.got)) << "put " << Shown(c.put);
        EXPECT_EQ(Text(address), c.shown) << "put " << Shown(c.put);
    }
    Put("A1", Variant());  // empty clears
    EXPECT_EQ(At("A1").Type(), VT_EMPTY);
    Variant object;
    object.Out()->vt = VT_UNKNOWN;
    EXPECT_COM_ERROR(Put("A9", object), DISP_E_TYPEMISMATCH, "can't go into a cell");
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
    const Variant block = sheet->GetRange("A1", "D4")->GetValue2();
    ASSERT_EQ(block.Type(), VT_ARRAY | VT_VARIANT);
    for (LONG r = 1; r <= 4; ++r)
        for (LONG c = 1; c <= 4; ++c) {
            Variant v;
            LONG index[2] = {r, c};
            ASSERT_HR(S_OK, SafeArrayGetElement(block.Raw().parray, index, v.Out()));
            EXPECT_EQ(v.Type(), r >= 2 && r <= 3 && c >= 2 && c <= 3 ? VT_R8 : VT_EMPTY) << r << "," << c;
        }

    // Rows are the first dimension: element (r, c) is cell (row r, column c).
    // A smaller array: a single row repeats down, the rest is #N/A.
    SAFEARRAYBOUND bounds[2] = {{1, 1}, {3, 1}};
    SAFEARRAY *row = SafeArrayCreate(VT_VARIANT, 2, bounds);
    for (LONG c = 1; c <= 3; ++c) {
        LONG index[2] = {1, c};
        Variant v = c == 3 ? Variant::String("t") : Variant::R8(10 + c);
        SafeArrayPutElement(row, index, v.Ptr());
    }
    sheet->GetRange("E1", "H2")->SetValue2(Variant::Array(VT_VARIANT, row).Raw());
    EXPECT_EQ(At("F1").Raw().dblVal, 12.0);
    EXPECT_EQ(At("F2").Raw().dblVal, 12.0);
    EXPECT_EQ(Utf8(At("G2")), "t");
    EXPECT_HR(kNotAvailable, At("H1").Raw().scode);

    // An array of doubles counted from 0, and a one-dimensional array (one row).
    SAFEARRAYBOUND one[2] = {{1, 0}, {1, 0}};
    SAFEARRAY *doubles = SafeArrayCreate(VT_R8, 2, one);
    LONG zero[2] = {0, 0};
    double d = 2.5;
    SafeArrayPutElement(doubles, zero, &d);
    sheet->GetRange("J1")->SetValue(Variant::Array(VT_R8, doubles).Raw());
    EXPECT_EQ(At("J1").Raw().dblVal, 2.5);
    SAFEARRAY *vector = SafeArrayCreateVector(VT_VARIANT, 0, 2);
    for (LONG i = 0; i < 2; ++i) {
        Variant v = Variant::String(i == 0 ? "x" : "y");
        SafeArrayPutElement(vector, &i, v.Ptr());
    }
    sheet->GetRange("J2", "K2")->SetValue(Variant::Array(VT_VARIANT, vector).Raw());
    EXPECT_EQ(Utf8(At("K2")), "y");
}

TEST_F(RangeTest, UsedRangeFollowsEveryChange)
{
    using Box = std::tuple<int32_t, int32_t, int32_t>;
    EXPECT_EQ(Used(), Box(1, 1, 1));
    Put("C3", Variant::R8(1));
    Put("E4", Variant::String("x"));
    EXPECT_EQ(Used(), Box(3, 3, 6));
    sheet->GetRange("F8")->SetNumberFormat("0.00");  // a format alone counts
    EXPECT_EQ(Used(), Box(3, 3, 24));
    sheet->GetRange("F8")->ClearFormats();
    EXPECT_EQ(Used(), Box(3, 3, 6));
    Put("G9", Variant::R8(2));
    Put("G9", Variant());  // the cell emptied again
    EXPECT_EQ(Used(), Box(3, 3, 6));
    Put("E4", Variant::R8(3));
    EXPECT_EQ(sheet->GetRange("C3", "E4")->GetText().Type(), VT_NULL);  // not all show the same
    sheet->GetRange("C3")->SetNumberFormat("0.0");
    sheet->UsedRange()->Clear();  // values and formats
    EXPECT_EQ(Used(), Box(1, 1, 1));
    Put("C3", Variant::R8(3));
    EXPECT_EQ(Text("C3"), "3");
    // A count beyond what an int32 holds is refused, not wrapped.
    EXPECT_COM_ERROR(sheet->GetRange("A1:XFD1048576")->Count(), DISP_E_OVERFLOW, "Count");
}

}  // namespace
