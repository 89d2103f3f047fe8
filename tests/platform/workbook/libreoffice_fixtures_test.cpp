// SPDX-License-Identifier: MIT
// Workbooks written by LibreOffice (make_libreoffice_fixtures.sh): shared
// strings, rich text, formulas by their cached values, error cells, booleans,
// a used range from C3, the 1904 flag and dates under several number formats.
// Each cell is held to its value and to the text it shows.
#include <cmath>
#include <variant>

#include "engine_test_support.h"

namespace {

using automation::Variant;

const std::string kFixtures = WORKBOOK_FIXTURE_DIR;

struct Bool {
    bool value;
};
struct Error {
    uint32_t code;  // 2007 #DIV/0!, 2042 #N/A
};
using Expected = std::variant<double, std::string, Bool, Error>;

struct CellCase {
    const char *address;
    Expected value;
    const char *text;
};

void ExpectCell(workbook::Worksheet &sheet, const CellCase &c)
{
    SCOPED_TRACE(c.address);
    auto range = sheet.GetRange(c.address);
    const Variant v = range->GetValue2();
    if (auto *number = std::get_if<double>(&c.value)) {
        ASSERT_EQ(v.Type(), VT_R8);
        EXPECT_EQ(v.Raw().dblVal, *number);
    } else if (auto *text = std::get_if<std::string>(&c.value)) {
        ASSERT_EQ(v.Type(), VT_BSTR);
        EXPECT_EQ(engine_test::Utf8(v), *text);
    } else if (auto *flag = std::get_if<Bool>(&c.value)) {
        ASSERT_EQ(v.Type(), VT_BOOL);
        EXPECT_EQ(v.Raw().boolVal, flag->value ? VARIANT_TRUE : VARIANT_FALSE);
    } else if (auto *error = std::get_if<Error>(&c.value)) {
        ASSERT_EQ(v.Type(), VT_ERROR);
        EXPECT_HR(static_cast<HRESULT>(0x800A0000u | error->code), v.Raw().scode);
    }
    const Variant shown = range->GetText();
    ASSERT_EQ(shown.Type(), VT_BSTR);
    EXPECT_EQ(engine_test::Utf8(shown), c.text);
}

TEST(LibreOfficeFixtures, KindsValuesAndTexts)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(kFixtures + "/libreoffice_kinds.xlsx");
    auto sheets = book->GetWorksheets();
    ASSERT_EQ(sheets->Count(), 2);
    auto kinds = sheets->Item(1);
    const CellCase cases[] = {
        // Shared strings, one of them used twice, a rich text of three runs,
        // and markup characters.
        {"A1", std::string("shared"), "shared"},
        {"B1", std::string("shared"), "shared"},
        {"C1", std::string("plain bold end"), "plain bold end"},
        {"D1", std::string("Grüße & <tags>"), "Grüße & <tags>"},
        // Formulas give their cached values: a number, a text, a boolean.
        {"A2", 21.0, "21"},
        {"B2", 42.0, "42"},
        {"C2", std::string("ab"), "ab"},
        {"D2", Bool{true}, "TRUE"},
        // Errors of formulas, and booleans as values.
        {"A3", Error{2007}, "#DIV/0!"},
        {"B3", Error{2042}, "#N/A"},
        {"C3", Bool{true}, "TRUE"},
        {"D3", Bool{false}, "FALSE"},
        // 2024-02-29 13:45:30 (as LibreOffice writes it, to 15 digits) under
        // several date and time formats.
        {"A4", 45351.5732638889, "2024-02-29"},
        {"B4", 45351.5732638889, "29.02.2024 13:45:30"},
        {"C4", 0.573263888888889, "13:45"},
        {"D4", 45351.0, "Feb 29, 2024"},
        {"E4", 1.52083333333333, "36:30"},
        // Number formats and General.
        {"A5", 0.125, "12.50%"},
        {"B5", 1234567.5, "1,234,567.500"},
        {"C5", 0.1, "0.1"},
        {"D5", -1e-300, "-1E-300"},
    };
    for (const auto &c : cases) ExpectCell(*kinds, c);
    auto used = kinds->UsedRange();
    EXPECT_EQ(used->Row(), 1);
    EXPECT_EQ(used->Column(), 1);
    EXPECT_EQ(used->Count(), 25);  // A1:E5
    // An empty cell shows nothing.
    EXPECT_EQ(engine_test::Utf8(kinds->GetRange("E5")->GetText()), "");

    auto fromC3 = sheets->Item(2);
    used = fromC3->UsedRange();
    EXPECT_EQ(used->Row(), 3);
    EXPECT_EQ(used->Column(), 3);
    EXPECT_EQ(used->Count(), 6);  // C3:E4
    ExpectCell(*fromC3, {"C3", std::string("top left"), "top left"});
    ExpectCell(*fromC3, {"E4", 7.0, "7"});
    book->Close(false);
}

TEST(LibreOfficeFixtures, Date1904)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(kFixtures + "/libreoffice_1904.xlsx");
    auto mac = book->GetWorksheets()->Item(1);
    // The serial counts from 1904: 2024-02-29 06:30 is 1462 days less than
    // from 1900, and it shows as the same date.
    ExpectCell(*mac, {"A1", 43889.2708333333, "2024-02-29 06:30"});
    ExpectCell(*mac, {"B1", 7.0, "7"});
    book->Close(false);
}

}  // namespace
