// SPDX-License-Identifier: MIT
// Workbooks written by other programs (tests/data/workbook: openpyxl and
// LibreOffice) read cell for cell with their values and shown texts, and the
// session's objects once their workbook closed or their application quit.
#include <cmath>
#include <filesystem>
#include <tuple>
#include <variant>

#include "engine_test_support.h"
#include "support/program_run.h"
#include "workbook/cell_source.h"

namespace {

using automation::Variant;
using engine_test::Utf8;

const std::string kFixtures = WORKBOOK_FIXTURE_DIR;
constexpr HRESULT kGone = static_cast<HRESULT>(0x80010108);
constexpr HRESULT kRefused = static_cast<HRESULT>(0x800A03EC);

struct Error {
    uint32_t code;  // 2007 #DIV/0!, 2042 #N/A
};
using Expected = std::variant<std::monostate, double, std::string, bool, Error>;  // monostate: empty

struct CellCase {
    const char *file;
    int32_t sheet;
    const char *address;
    Expected value;
    const char *shown;
};

// 2024-02-29 13:45:30 as openpyxl writes it.
constexpr double kLeapDay = 45351.0 + (13 * 3600 + 45 * 60 + 30) / 86400.0;

const CellCase kCells[] = {
    // openpyxl: texts, a repeated one, booleans, numbers; a used range from C3.
    {"several_sheets.xlsx", 1, "A2", std::string("first"), "first"},
    {"several_sheets.xlsx", 1, "C3", false, "FALSE"},
    {"several_sheets.xlsx", 1, "B4", 1e-300, "1E-300"},
    {"several_sheets.xlsx", 1, "A6", std::string("Grüße, 東京"), "Grüße, 東京"},
    // A moment under a format of openpyxl's own (sheet 2 and the other dates
    // of sheet 3 are read by the cells command's test).
    {"several_sheets.xlsx", 3, "A2", kLeapDay, "29.02.2024 13:45"},
    // The 1904 date system: serials 1462 days less, shown as the same dates.
    {"date1904.xlsx", 1, "A1", 45351.0 - 1462.0, "2024-02-29"},
    {"libreoffice_1904.xlsx", 1, "A1", 43889.2708333333, "2024-02-29 06:30"},
    // LibreOffice: shared strings, a rich text of three runs, markup characters.
    {"libreoffice_kinds.xlsx", 1, "A1", std::string("shared"), "shared"},
    {"libreoffice_kinds.xlsx", 1, "C1", std::string("plain bold end"), "plain bold end"},
    {"libreoffice_kinds.xlsx", 1, "D1", std::string("Grüße & <tags>"), "Grüße & <tags>"},
    // Formulas give their cached values, errors included.
    {"libreoffice_kinds.xlsx", 1, "B2", 42.0, "42"},
    {"libreoffice_kinds.xlsx", 1, "D2", true, "TRUE"},
    {"libreoffice_kinds.xlsx", 1, "A3", Error{2007}, "#DIV/0!"},
    {"libreoffice_kinds.xlsx", 1, "B3", Error{2042}, "#N/A"},
    // Dates and times (to 15 digits, as LibreOffice writes them), number
    // formats and General.
    {"libreoffice_kinds.xlsx", 1, "B4", 45351.5732638889, "29.02.2024 13:45:30"},
    {"libreoffice_kinds.xlsx", 1, "D4", 45351.0, "Feb 29, 2024"},
    {"libreoffice_kinds.xlsx", 1, "E4", 1.52083333333333, "36:30"},
    {"libreoffice_kinds.xlsx", 1, "A5", 0.125, "12.50%"},
    {"libreoffice_kinds.xlsx", 1, "B5", 1234567.5, "1,234,567.500"},
    {"libreoffice_kinds.xlsx", 1, "D5", -1e-300, "-1E-300"},
    {"libreoffice_kinds.xlsx", 1, "E5", std::monostate{}, ""},
    {"libreoffice_kinds.xlsx", 2, "C3", std::string("top left"), "top left"},
};

TEST(FixturesTest, CellsReadWithTheirValuesAndTexts)
{
    auto app = workbook::CreateApplication();
    for (const CellCase &c : kCells) {
        SCOPED_TRACE(std::string(c.file) + " sheet " + std::to_string(c.sheet) + " " + c.address);
        auto range = app->GetWorkbooks()->Open(kFixtures + "/" + c.file)->GetWorksheets()->Item(c.sheet)->GetRange(c.address);
        const Variant v = range->GetValue2();
        if (std::holds_alternative<std::monostate>(c.value)) {
            EXPECT_EQ(v.Type(), VT_EMPTY);
        } else if (auto *number = std::get_if<double>(&c.value)) {
            ASSERT_EQ(v.Type(), VT_R8);
            EXPECT_NEAR(v.Raw().dblVal, *number, std::abs(*number) * 1e-15);
        } else if (auto *text = std::get_if<std::string>(&c.value)) {
            ASSERT_EQ(v.Type(), VT_BSTR);
            EXPECT_EQ(Utf8(v), *text);
        } else if (auto *flag = std::get_if<bool>(&c.value)) {
            ASSERT_EQ(v.Type(), VT_BOOL);
            EXPECT_EQ(v.Raw().boolVal, *flag ? VARIANT_TRUE : VARIANT_FALSE);
        } else if (auto *error = std::get_if<Error>(&c.value)) {
            ASSERT_EQ(v.Type(), VT_ERROR);
            EXPECT_HR(static_cast<HRESULT>(0x800A0000u | error->code), v.Raw().scode);
        }
        EXPECT_EQ(Utf8(range->GetText()), c.shown);
    }
}

TEST(FixturesTest, WorksheetsAndUsedRanges)
{
    const struct {
        const char *file;
        int32_t sheets, sheet, row, column, count;
    } cases[] = {
        {"several_sheets.xlsx", 3, 1, 1, 1, 18},  // A1:C6, beside a chart sheet that is no worksheet
        {"libreoffice_kinds.xlsx", 2, 1, 1, 1, 25},  // A1:E5
        {"libreoffice_kinds.xlsx", 2, 2, 3, 3, 6},  // C3:E4
    };
    auto app = workbook::CreateApplication();
    for (const auto &c : cases) {
        SCOPED_TRACE(std::string(c.file) + " sheet " + std::to_string(c.sheet));
        auto sheets = app->GetWorkbooks()->Open(kFixtures + "/" + c.file)->GetWorksheets();
        EXPECT_EQ(sheets->Count(), c.sheets);
        auto used = sheets->Item(c.sheet)->UsedRange();
        EXPECT_EQ(std::make_tuple(used->Row(), used->Column(), used->Count()), std::make_tuple(c.row, c.column, c.count));
    }
}

// What a cell takes from its number format and its workbook's date system:
// texts stay texts under "@", General is General by its code (LibreOffice's
// id 164), and a date, put or typed, shows the same date in a 1904 workbook.
TEST(FixturesTest, PutsFollowTheCellFormatAndTheDateSystem)
{
    enum class Through { Value, Value2, Sink };
    const struct {
        const char *file;  // nullptr: a new workbook
        const char *address, *format;
        Variant put;
        Through through;
        Expected value;
        const char *shown;
    } cases[] = {
        {nullptr, "A1", "@", Variant::String("0012"), Through::Value, std::string("0012"), "0012"},
        {nullptr, "A2", "@", Variant::String("TRUE"), Through::Value2, std::string("TRUE"), "TRUE"},
        {nullptr, "A3", "@", Variant::String("1e5"), Through::Sink, std::string("1e5"), "1e5"},
        {nullptr, "A4", "@", Variant::String("2024-03-01"), Through::Value, std::string("2024-03-01"), "2024-03-01"},
        {nullptr, "A5", "", Variant::String("0012"), Through::Value, 12.0, "12"},
        {"libreoffice_kinds.xlsx", "F1", "", Variant::Date(45352.0), Through::Value, 45352.0, "3/1/2024"},
        {"libreoffice_1904.xlsx", "C1", "", Variant::Date(45352.5), Through::Value, 45352.5 - 1462, "3/1/2024 12:00"},
        {"libreoffice_1904.xlsx", "C2", "", Variant::Date(45352.5), Through::Sink, 45352.5 - 1462, "43890.5"},
        {"date1904.xlsx", "C3", "", Variant::String("1903-12-31"), Through::Value, std::string("1903-12-31"), "1903-12-31"},
        {"date1904.xlsx", "C1", "", Variant::String("2024-02-29"), Through::Value2, 45351.0 - 1462, "2024-02-29"},
    };
    testing_host::TempDir dir;
    auto app = workbook::CreateApplication();
    for (const auto &c : cases) {
        SCOPED_TRACE(std::string(c.file ? c.file : "new") + " " + c.address);
        auto book = c.file ? app->GetWorkbooks()->Open(kFixtures + "/" + c.file) : app->GetWorkbooks()->Add(engine_test::Missing().Raw());
        auto sheet = book->GetWorksheets()->Item(1);
        auto range = sheet->GetRange(c.address);
        if (*c.format) range->SetNumberFormat(c.format);
        if (c.through == Through::Value) range->SetValue(c.put.Raw());
        if (c.through == Through::Value2) range->SetValue2(c.put.Raw());
        if (c.through == Through::Sink)
            dynamic_cast<workbook::CellSink &>(*sheet).PutVariant(range->Row(), range->Column(), c.put.Raw(), false);
        const Variant v = range->GetValue2();
        if (auto *text = std::get_if<std::string>(&c.value)) {
            ASSERT_EQ(v.Type(), VT_BSTR);
            EXPECT_EQ(Utf8(v), *text);
        } else {
            ASSERT_EQ(v.Type(), VT_R8);
            EXPECT_DOUBLE_EQ(v.Raw().dblVal, std::get<double>(c.value));
        }
        EXPECT_EQ(Utf8(range->GetText()), c.shown);
        if (c.file && std::string(c.file) == "libreoffice_1904.xlsx" && c.through == Through::Value) {
            // openpyxl, which knows the 1904 flag, sees the same moment.
            book->SaveAs(dir.File("1904.xlsx"));
            const auto run = testing_host::RunProgram(
                WORKBOOK_PYTHON, {"-c", "import sys, openpyxl\nprint(openpyxl.load_workbook(sys.argv[1]).active['C1'].value)",
                                  dir.File("1904.xlsx")});
            EXPECT_EQ(run.out, "2024-03-01 12:00:00\n") << run.err;
        }
        book->Close(false);
    }
    // A day the 1904 system has no serial for is refused, not shifted.
    auto mac = app->GetWorkbooks()->Open(kFixtures + "/date1904.xlsx")->GetWorksheets()->Item(1)->GetRange("C4");
    EXPECT_COM_ERROR(mac->SetValue(Variant::Date(1461.0).Raw()), kRefused,
                     "the date 1903-12-31 lies before 1904-01-01, the first day of this workbook's 1904 date system");
    EXPECT_EQ(mac->GetValue2().Type(), VT_EMPTY);
}

TEST(FixturesTest, ObjectsOfAClosedWorkbookOrAQuitApplicationFailCleanly)
{
    auto app = workbook::CreateApplication();
    auto books = app->GetWorkbooks();
    auto book = books->Open(kFixtures + "/several_sheets.xlsx");
    auto sheets = book->GetWorksheets();
    auto sheet = sheets->Item(1);
    auto range = sheet->GetRange("A1", "B2");
    EXPECT_COM_ERROR(sheets->Item(4), DISP_E_BADINDEX, "worksheet 4 does not exist");
    book->Close(false);
    EXPECT_COM_ERROR(sheets->Count(), kGone, "closed");
    EXPECT_COM_ERROR(sheet->UsedRange(), kGone, "closed");
    EXPECT_COM_ERROR(range->SetValue2(Variant::R8(1).Raw()), kGone, "closed");
    EXPECT_COM_ERROR(book->Close(false), kGone, "closed");

    // Workbooks.Close closes every workbook; Quit ends everything.
    auto other = books->Add(engine_test::Missing().Raw())->GetWorksheets()->Item(1)->GetRange("A1");
    books->Close();
    EXPECT_COM_ERROR(other->Count(), kGone, "closed");
    auto last = books->Add(engine_test::Missing().Raw())->GetWorksheets()->Item(1)->GetRange("A1");
    app->Quit();
    app->Quit();  // a second quit is harmless
    EXPECT_COM_ERROR(last->Row(), kGone, "quit");
    EXPECT_COM_ERROR(books->Open(kFixtures + "/several_sheets.xlsx"), kGone, "quit");
    EXPECT_COM_ERROR(app->GetWorkbooks(), kGone, "quit");
}

TEST(FixturesTest, CloseSavesOnlyWhenAsked)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(kFixtures + "/several_sheets.xlsx", path);
    const std::string before = testing_host::ReadFile(path);
    auto app = workbook::CreateApplication();
    for (bool save : {false, true}) {
        auto book = app->GetWorkbooks()->Open(path);
        book->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(99).Raw());
        book->Close(save);
        EXPECT_EQ(testing_host::ReadFile(path) == before, !save) << (save ? "saved" : "not saved");
    }
    const Variant v = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1)->GetRange("A1")->GetValue2();
    ASSERT_EQ(v.Type(), VT_R8);
    EXPECT_EQ(v.Raw().dblVal, 99.0);
    // A new workbook has no file to save to.
    EXPECT_COM_ERROR(app->GetWorkbooks()->Add(engine_test::Missing().Raw())->Save(), static_cast<HRESULT>(0x800A03EC),
                     "SaveAs");
}

}  // namespace
