// SPDX-License-Identifier: MIT
// Every workbook of the corpus (files written by other programs) opens and
// reads with the values an independent reader found in it, and the direct
// cell reads (cell by cell and in blocks) agree with Value2 over it.
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cmath>
#include <cstdint>
#include <filesystem>
#include <set>
#include <sstream>
#include <stdexcept>

#include "engine_test_support.h"
#include "ooxml/document.h"
#include "workbook/cell_source.h"
#include "workbook/format/builtin_formats.h"
#include "workbook/format/date_format.h"

namespace {

using automation::Variant;
using nlohmann::json;

// A value as text that compares: its kind and what it holds, numbers to
// `digits` significant digits (17 tells every double apart).
std::string Describe(const VARIANT &v, int digits = 17)
{
    std::ostringstream out;
    out.precision(digits);
    if (v.vt == VT_EMPTY) out << "empty";
    else if (v.vt == VT_R8) out << "number " << v.dblVal;
    else if (v.vt == VT_BSTR) out << "text \"" << automation::BstrToUtf8(v.bstrVal) << "\"";
    else if (v.vt == VT_BOOL) out << (v.boolVal ? "TRUE" : "FALSE");
    else if (v.vt == VT_ERROR) out << "error " << (v.scode & 0xFFFF);
    else out << "variant type " << v.vt;
    return out.str();
}

// What the other reader found in a cell: [row, column, kind, value, date serial
// or text, ...], described as Describe describes the engine's value.
std::string Expected(const json &cell, int digits)
{
    static const std::map<std::string, int> errors{{"#NULL!", 2000}, {"#DIV/0!", 2007}, {"#VALUE!", 2015},
                                                   {"#REF!", 2023},  {"#NAME?", 2029},  {"#NUM!", 2036},
                                                   {"#N/A", 2042},   {"#GETTING_DATA", 2043}};
    const std::string kind = cell[2];
    automation::Variant v;
    if (kind == "number" || kind == "date") v = automation::Variant::R8(cell[kind == "date" ? 4 : 3].get<double>());
    else if (kind == "string") v = automation::Variant::String(cell[cell.size() > 4 ? 4 : 3].get<std::string>());
    else if (kind == "bool") v = automation::Variant::Bool(cell[3].get<bool>());
    else if (kind == "error" && errors.count(cell[3])) return "error " + std::to_string(errors.at(cell[3]));
    else return "unknown kind " + kind;
    return Describe(v.Raw(), digits);
}

// Whether ours, written to `digits` significant digits by a program that rounds
// its own way, may have become theirs: a unit of the last digit apart at most.
bool WithinLastDigit(double ours, double theirs, int digits)
{
    const double unit = std::pow(10.0, std::floor(std::log10(std::fabs(theirs))) - (digits - 1));
    return ours == theirs || std::fabs(ours - theirs) <= unit * 1.000001;
}

// The number format the engine gives a cell matches the one the other reader
// saw: the same code, or the same built-in format spelled another way.
bool SameFormat(const std::string &ours, const std::string &theirs)
{
    if (ours == theirs) return true;
    int a = workbook::format::BuiltinFormatId(ours), b = workbook::format::BuiltinFormatId(theirs);
    return a >= 0 && a == b;
}

// A direct read of a cell, described as Describe describes its Value2.
std::string Describe(const workbook::CellContent &cell)
{
    using Kind = workbook::CellContent::Kind;
    automation::Variant v;
    if (cell.kind == Kind::Number) v = automation::Variant::R8(cell.number);
    else if (cell.kind == Kind::Text) v = automation::Variant::String(cell.text);
    else if (cell.kind == Kind::Boolean) v = automation::Variant::Bool(cell.boolean);
    else if (cell.kind == Kind::Error) v = automation::Variant::Error(static_cast<SCODE>(0x800A0000u | uint32_t(cell.error)));
    return Describe(v.Raw());
}

// The block reads give what the cell-by-cell reads give over the rectangle.
void ExpectBlockReadsAgree(workbook::CellSource &cells, int32_t top, int32_t bottom, int32_t left, int32_t right,
                           const std::string &where)
{
    using Kind = workbook::CellContent::Kind;
    const int32_t rows = bottom - top + 1, columns = right - left + 1;
    constexpr double kEmpty = -12345.5;
    std::vector<double> block(size_t(rows) * size_t(columns));
    std::vector<std::pair<int32_t, int32_t>> others, expectedOthers;
    cells.ReadNumbers(top, rows, left, columns, block.data(), kEmpty,
                      [&](int32_t r, int32_t c, const workbook::CellContent &) {
                          others.emplace_back(r, c);
                          return double(r * 1000 + c);  // tells the cell it was asked about
                      });
    for (int32_t r = top; r <= bottom; ++r)
        for (int32_t c = left; c <= right; ++c) {
            const workbook::CellContent cell = cells.GetCell(r, c);
            const double got = block[size_t(c - left) * size_t(rows) + size_t(r - top)];
            const bool other = cell.kind != Kind::Number && cell.kind != Kind::Empty;
            if (other) expectedOthers.emplace_back(r, c);
            EXPECT_EQ(got, other ? double(r * 1000 + c) : cell.kind == Kind::Empty ? kEmpty : cell.number)
                << where << " R" << r << "C" << c;
        }
    EXPECT_EQ(others, expectedOthers) << where << ": the other cells, row by row";
    for (int32_t c = left; c <= right; ++c)
        for (int32_t from : {top, top + 1, (top + bottom) / 2}) {
            int32_t run = 0;
            while (from + run <= bottom && !cells.IsEmpty(from + run, c)) ++run;
            EXPECT_EQ(cells.CountFilledDown(from, c, bottom), run) << where << " C" << c << " from R" << from;
        }
}

// Cells whose reference value no honest reader matches: the file, sheet and
// cell, what the engine reads there instead, and why.
struct KnownDifference {
    const char *file, *sheet;
    uint32_t row, column;
    const char *ours, *why;
};
constexpr const char *kBooleanResult = "the file types the formula's result boolean; the conversion that made the "
                                       "reference wrote it as the number 0";
constexpr KnownDifference kKnownDifferences[] = {
    {"tafia__calamine/issues.ods", "datatypes", 4, 1, "FALSE", kBooleanResult},
    {"tafia__calamine/issues.ods", "issue6", 4, 1, "FALSE", kBooleanResult},
};

const KnownDifference *KnownDifferenceAt(const std::string &file, const std::string &sheet, uint32_t row, uint32_t column)
{
    for (const KnownDifference &d : kKnownDifferences)
        if (file == d.file && sheet == d.sheet && row == d.row && column == d.column) return &d;
    return nullptr;
}

// How a corpus was made: the digits its numbers keep, and whether its date
// formats are the files' own or a conversion's (then only their being dates counts).
struct CorpusRules {
    int digits = 17;
    bool ownFormats = true;
};

// Files of the other corpus that are not read as the reference reads them:
// refused with this reason, or (cell set) read with this one cell more.
struct Departure {
    const char *reason = nullptr;
    uint32_t row = 0, column = 0;
    const char *text = nullptr;
};
const std::map<std::string, Departure> kDepartures{
    // Encrypted with the password every spreadsheet program tries first; the
    // engine doesn't decrypt workbooks, so it says so.
    {"tafia__calamine/issue_385.xls",
     {"the workbook is encrypted (a password protects it): save it without the password to read it"}},
    // A24 holds CELL("filename"): the file stores the result its writer
    // computed, which the engine shows; the reference reader drops the cell,
    // whose formula is cut off on purpose.
    {"tafia__calamine/ptgexp-truncated-operand.xls",
     {nullptr, 24, 1, "H:\\EXCEL\\CONFIDNT\\Investments\\[microsoft.xls]Tab 1"}},
};

void CheckWorkbook(const std::filesystem::path &jsonPath, const CorpusRules &rules)
{
    std::string file = jsonPath.string().substr(0, jsonPath.string().size() - std::string(".expected.json").size());
    std::string shortName = std::filesystem::path(file).parent_path().filename().string() + "/" +
                            std::filesystem::path(file).filename().string();
    json expected = json::parse(testing_host::ReadFile(jsonPath.string()));

    auto app = workbook::CreateApplication();
    std::shared_ptr<workbook::Workbook> book;
    const auto departure = kDepartures.find(shortName);
    const bool refused = departure != kDepartures.end() && departure->second.reason;
    try {
        book = app->GetWorkbooks()->Open(file);
    } catch (const automation::ComError &e) {
        if (refused) EXPECT_EQ(std::string(e.what()), file + ": " + departure->second.reason);
        else ADD_FAILURE() << shortName << ": open failed: " << e.what();
        return;
    }
    EXPECT_FALSE(refused) << shortName << " opened; it is listed as refused";
    std::pair<uint32_t, uint32_t> extraCell;
    if (departure != kDepartures.end()) extraCell = {departure->second.row, departure->second.column};
    auto doc = workbook::Document::Open(file);  // for the number formats of cells
    EXPECT_EQ(doc->Date1904(), expected["date1904"].get<bool>()) << shortName;

    std::vector<json> worksheets;
    for (const auto &s : expected["sheets"])
        if (s["kind"] == "worksheet") worksheets.push_back(s);
    auto sheets = book->GetWorksheets();
    ASSERT_EQ(sheets->Count(), static_cast<int32_t>(worksheets.size())) << shortName;

    for (size_t k = 0; k < worksheets.size(); ++k) {
        const json &s = worksheets[k];
        const std::string where = shortName + " sheet '" + s["name"].get<std::string>() + "'";
        std::set<std::pair<uint32_t, uint32_t>> maybeEmpty;
        if (s.contains("raw_cells_openpyxl_reports_empty"))
            for (const auto &rc : s["raw_cells_openpyxl_reports_empty"])
                maybeEmpty.insert({rc[0].get<uint32_t>(), rc[1].get<uint32_t>()});

        auto used = sheets->Item(static_cast<int32_t>(k + 1))->UsedRange();
        workbook::Rect box{static_cast<uint32_t>(used->Row()), static_cast<uint32_t>(used->Column()), 0, 0};
        Variant values = used->GetValue2();
        auto at = [&](uint32_t row, uint32_t col) -> VARIANT {
            VARIANT empty;
            VariantInit(&empty);
            if (!(values.Type() & VT_ARRAY)) return row == box.top && col == box.left ? values.Raw() : empty;
            SAFEARRAY *sa = values.Raw().parray;
            LONG rows = 0, cols = 0;
            SafeArrayGetUBound(sa, 1, &rows);
            SafeArrayGetUBound(sa, 2, &cols);
            if (row < box.top || col < box.left || row - box.top + 1 > static_cast<uint32_t>(rows) ||
                col - box.left + 1 > static_cast<uint32_t>(cols))
                return empty;
            LONG index[2] = {static_cast<LONG>(row - box.top + 1), static_cast<LONG>(col - box.left + 1)};
            void *p = nullptr;
            SafeArrayPtrOfIndex(sa, index, &p);
            return *static_cast<VARIANT *>(p);
        };

        // The direct reads, over the used range and one row and column past it.
        auto sheet = sheets->Item(static_cast<int32_t>(k + 1));
        auto &cells = dynamic_cast<workbook::CellSource &>(*sheet);
        const workbook::UsedBounds b = cells.GetUsedBounds();
        EXPECT_EQ(used->Row(), b.firstRow) << where;
        EXPECT_EQ(used->Column(), b.firstColumn) << where;
        EXPECT_EQ(used->Count(), (b.lastRow - b.firstRow + 1) * (b.lastColumn - b.firstColumn + 1)) << where;
        const int32_t lastRow = std::min(b.lastRow + 1, 300), lastColumn = std::min(b.lastColumn + 1, 40);
        for (int32_t r = b.firstRow; r <= lastRow; ++r)
            for (int32_t c = b.firstColumn; c <= lastColumn; ++c) {
                const workbook::CellContent cell = cells.GetCell(r, c);
                EXPECT_EQ(Describe(cell), Describe(at(uint32_t(r), uint32_t(c)))) << where << " R" << r << "C" << c;
                EXPECT_EQ(cells.IsEmpty(r, c), cell.kind == workbook::CellContent::Kind::Empty) << where;
            }
        if (lastColumn >= b.firstColumn) ExpectBlockReadsAgree(cells, b.firstRow, lastRow, b.firstColumn, lastColumn, where);

        std::set<std::pair<uint32_t, uint32_t>> listed;
        auto &store = doc->Worksheet(k).model.store;
        for (const auto &cell : s["cells"]) {
            uint32_t row = cell[0], col = cell[1];
            listed.insert({row, col});
            VARIANT v = at(row, col);
            const bool blank = v.vt == VT_EMPTY || (v.vt == VT_BSTR && automation::BstrToUtf8(v.bstrVal).empty());
            const bool numeric = cell[2] == "number" || cell[2] == "date";
            if (const KnownDifference *known = KnownDifferenceAt(shortName, s["name"], row, col)) {
                EXPECT_EQ(Describe(v, rules.digits), known->ours) << where << " row " << row << " column " << col << ": " << known->why;
            } else if (numeric && v.vt == VT_R8 && rules.digits < 17) {
                const double theirs = cell[cell[2] == "date" ? 4 : 3].get<double>();
                EXPECT_TRUE(WithinLastDigit(v.dblVal, theirs, rules.digits))
                    << where << " row " << row << " column " << col << ": " << Describe(v) << ", expected " << theirs;
            } else if (!(blank && maybeEmpty.count({row, col}))) {
                EXPECT_EQ(Describe(v, rules.digits), Expected(cell, rules.digits)) << where << " row " << row << " column " << col;
            }
            if (cell[2] == "date") {
                const workbook::Cell *c = store.Find(row, col);
                std::string ours = c ? doc->CellFormats().NumberFormatOf(c->style) : "";
                EXPECT_TRUE(!rules.ownFormats || SameFormat(ours, cell[5].get<std::string>()))
                    << where << " row " << row << " column " << col << ": number format '" << ours
                    << "', expected '" << cell[5].get<std::string>() << "'";
                EXPECT_TRUE(workbook::format::IsDateFormat(ours))
                    << where << " row " << row << " column " << col << ": '" << ours << "' is no date format";
            }
        }
        // Nothing more than the listed cells holds a value.
        if (values.Type() & VT_ARRAY) {
            LONG rows = 0, cols = 0;
            SafeArrayGetUBound(values.Raw().parray, 1, &rows);
            SafeArrayGetUBound(values.Raw().parray, 2, &cols);
            for (LONG i = 1; i <= rows; ++i)
                for (LONG j = 1; j <= cols; ++j) {
                    uint32_t row = box.top + static_cast<uint32_t>(i) - 1, col = box.left + static_cast<uint32_t>(j) - 1;
                    VARIANT v = at(row, col);
                    bool blank = v.vt == VT_EMPTY ||
                                 (maybeEmpty.count({row, col}) && v.vt == VT_BSTR && automation::BstrToUtf8(v.bstrVal).empty());
                    if (std::make_pair(row, col) == extraCell)
                        EXPECT_EQ(Describe(v), std::string("text \"") + departure->second.text + "\"") << where;
                    else if (!blank && !listed.count({row, col}))
                        ADD_FAILURE() << where << " row " << row << " column " << col << ": unexpected " << Describe(v);
                }
        } else if (values.Type() != VT_EMPTY && !listed.count({box.top, box.left})) {
            ADD_FAILURE() << where << ": unexpected " << Describe(values.Raw());
        }
    }
    book->Close(false);
    app->Quit();
}

// The expected-values files under folder whose workbook ends in extension.
std::vector<std::filesystem::path> ExpectedFiles(const std::string &folder, const std::string &extension)
{
    std::vector<std::filesystem::path> files;
    for (const auto &e : std::filesystem::recursive_directory_iterator(folder)) {
        const std::string name = e.path().filename().string();
        if (name.ends_with(extension + ".expected.json")) files.push_back(e.path());
    }
    std::sort(files.begin(), files.end());
    return files;
}

TEST(CorpusTest, EveryWorkbookReadsAsItsExpectedValues)
{
    const auto files = ExpectedFiles(WORKBOOK_CORPUS_DIR, ".xlsx");
    ASSERT_GE(files.size(), 40u) << "the corpus at " << WORKBOOK_CORPUS_DIR << " is missing";
    for (const auto &f : files) {
        SCOPED_TRACE(f.string());
        CheckWorkbook(f, CorpusRules{});
    }
}

// Binary and OpenDocument workbooks, with what a spreadsheet program read
// from them, converted and read again: numbers to the 15 digits it keeps.
class OtherCorpusTest : public testing::TestWithParam<std::string> {};

TEST_P(OtherCorpusTest, EveryWorkbookReadsAsItsExpectedValues)
{
    const auto files = ExpectedFiles(WORKBOOK_OTHER_CORPUS_DIR, GetParam());
    ASSERT_GE(files.size(), 10u) << "the corpus at " << WORKBOOK_OTHER_CORPUS_DIR << " is missing";
    for (const auto &f : files) {
        SCOPED_TRACE(f.string());
        CheckWorkbook(f, CorpusRules{15, false});
    }
}

INSTANTIATE_TEST_SUITE_P(Kinds, OtherCorpusTest, testing::Values(".xls", ".ods"),
                         [](const testing::TestParamInfo<std::string> &info) { return info.param.substr(1); });

TEST(CorpusTest, DirectReadsOffTheGridAreEmptyOrRefused)
{
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Add(engine_test::Missing().Raw())->GetWorksheets()->Item(1);
    auto &cells = dynamic_cast<workbook::CellSource &>(*sheet);  // the sheet object, held
    EXPECT_TRUE(cells.IsEmpty(0, 0));
    EXPECT_EQ(cells.GetCell(-1, 5).kind, workbook::CellContent::Kind::Empty);
    // A block must start on the grid; what reaches beyond its edge is empty.
    double four[4] = {};
    const auto never = [](int32_t, int32_t, const workbook::CellContent &) -> double {
        throw std::logic_error("no such cell");
    };
    EXPECT_COM_ERROR(cells.ReadNumbers(0, 2, 1, 2, four, 0.0, never), static_cast<HRESULT>(0x800A03EC),
                     "row 0, column 1 lies outside the sheet");
    EXPECT_COM_ERROR(cells.ReadNumbers(1, 2, 16385, 2, four, 0.0, never), static_cast<HRESULT>(0x800A03EC),
                     "row 1, column 16385 lies outside the sheet");
    cells.ReadNumbers(1048576, 2, 16384, 2, four, 7.0, never);
    EXPECT_EQ(four[0] + four[1] + four[2] + four[3], 28.0);
    EXPECT_EQ(cells.CountFilledDown(0, 1, 10), 0);
    EXPECT_EQ(cells.CountFilledDown(5, 1, 4), 0);
}

}  // namespace
