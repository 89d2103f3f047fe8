// SPDX-License-Identifier: MIT
// Workbooks written by another program (openpyxl, by make_fixtures.py):
// several sheets around a chart sheet, a used range from C3, dates under
// several number formats and the 1904 date system.
#include "engine_test_support.h"

namespace {

using automation::Variant;
using engine_test::Utf8;

const std::string kFixtures = WORKBOOK_FIXTURE_DIR;

VARIANT Element(const Variant &array, LONG row, LONG col)
{
    VARIANT out;
    VariantInit(&out);
    LONG index[2] = {row, col};
    EXPECT_HR(S_OK, SafeArrayGetElement(array.Raw().parray, index, &out));
    return out;
}

TEST(FixturesTest, SeveralSheetsReadAsWritten)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(kFixtures + "/several_sheets.xlsx");
    auto sheets = book->GetWorksheets();
    ASSERT_EQ(sheets->Count(), 3);

    auto alpha = sheets->Item(1);
    auto used = alpha->UsedRange();
    EXPECT_EQ(used->Row(), 1);
    EXPECT_EQ(used->Column(), 1);
    EXPECT_EQ(used->Count(), 18);  // A1:C6
    Variant values = alpha->GetRange("A1", "C4")->GetValue2();
    ASSERT_EQ(values.Type(), VT_ARRAY | VT_VARIANT);
    VARIANT first = Element(values, 2, 1), flag = Element(values, 3, 3), tiny = Element(values, 4, 2);
    ASSERT_EQ(first.vt, VT_BSTR);
    EXPECT_EQ(automation::BstrToUtf8(first.bstrVal), "first");
    VariantClear(&first);
    ASSERT_EQ(flag.vt, VT_BOOL);
    EXPECT_EQ(flag.boolVal, VARIANT_FALSE);
    ASSERT_EQ(tiny.vt, VT_R8);
    EXPECT_EQ(tiny.dblVal, 1e-300);
    EXPECT_EQ(Utf8(alpha->GetRange("A6")->GetValue2()), "Grüße, 東京");
    EXPECT_EQ(alpha->GetRange("B2")->GetValue2().Raw().dblVal, 1.5);

    auto beta = sheets->Item(2);
    used = beta->UsedRange();
    EXPECT_EQ(used->Row(), 3);
    EXPECT_EQ(used->Column(), 3);
    EXPECT_EQ(used->Count(), 15);  // C3:E7
    EXPECT_EQ(beta->GetRange("D5")->GetValue2().Raw().dblVal, 0.1);
    EXPECT_EQ(beta->GetRange("E7")->GetValue2().Raw().dblVal, 42.0);

    // 2024-02-29 13:45:30 under five formats, and 1900-01-01 (serial 1).
    auto gamma = sheets->Item(3);
    const double serial = 45351.0 + (13 * 3600 + 45 * 60 + 30) / 86400.0;
    for (int row = 1; row <= 5; ++row) {
        Variant v = gamma->GetRange("A" + std::to_string(row))->GetValue2();
        ASSERT_EQ(v.Type(), VT_R8) << row;
        EXPECT_NEAR(v.Raw().dblVal, serial, 1e-9) << row;
    }
    EXPECT_EQ(Utf8(gamma->GetRange("A1")->GetText()), "2024-02-29");
    EXPECT_EQ(Utf8(gamma->GetRange("A2")->GetText()), "29.02.2024 13:45");
    EXPECT_EQ(Utf8(gamma->GetRange("A3")->GetText()), "13:45:30");
    EXPECT_EQ(Utf8(gamma->GetRange("A4")->GetText()), "2/29/2024");
    EXPECT_EQ(Utf8(gamma->GetRange("A5")->GetText()), "1088437:45");
    EXPECT_EQ(gamma->GetRange("A7")->GetValue2().Raw().dblVal, 1.0);
    EXPECT_EQ(Utf8(gamma->GetRange("A7")->GetText()), "1900-01-01");
    book->Close(false);
    app->Quit();
}

TEST(FixturesTest, Date1904WorkbookKeepsItsSerials)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(kFixtures + "/date1904.xlsx");
    auto sheet = book->GetWorksheets()->Item(1);
    Variant date = sheet->GetRange("A1")->GetValue2();
    ASSERT_EQ(date.Type(), VT_R8);
    EXPECT_EQ(date.Raw().dblVal, 45351.0 - 1462.0);
    EXPECT_EQ(Utf8(sheet->GetRange("A1")->GetText()), "2024-02-29");
    EXPECT_EQ(sheet->GetRange("B1")->GetValue2().Raw().dblVal, 7.0);
    // A date typed into the workbook lands in its own date system.
    sheet->GetRange("C1")->SetValue2(Variant::String("2024-02-29").Raw());
    EXPECT_EQ(sheet->GetRange("C1")->GetValue2().Raw().dblVal, 45351.0 - 1462.0);
    book->Close(false);
    app->Quit();
}

}  // namespace
