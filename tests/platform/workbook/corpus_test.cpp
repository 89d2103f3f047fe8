// SPDX-License-Identifier: MIT
// Every workbook of the corpus (files written by other programs) opens and
// reads with the values an independent reader found in it.
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cstdint>
#include <filesystem>
#include <set>

#include "cell_ref.h"
#include "document.h"
#include "engine_test_support.h"
#include "workbook/format/builtin_formats.h"
#include "workbook/format/date_format.h"

namespace {

using automation::Variant;
using nlohmann::json;

// The spreadsheet's error codes, as VT_ERROR scodes.
SCODE ExpectedScode(const std::string &text)
{
    static const std::map<std::string, uint32_t> numbers{{"#NULL!", 2000}, {"#DIV/0!", 2007}, {"#VALUE!", 2015},
                                                         {"#REF!", 2023},  {"#NAME?", 2029},  {"#NUM!", 2036},
                                                         {"#N/A", 2042},   {"#GETTING_DATA", 2043}};
    auto it = numbers.find(text);
    return it == numbers.end() ? 0 : static_cast<SCODE>(0x800A0000u | it->second);
}

std::string Describe(const VARIANT &v)
{
    switch (v.vt) {
    case VT_EMPTY: return "empty";
    case VT_R8: return "number " + std::to_string(v.dblVal);
    case VT_BSTR: return "text \"" + automation::BstrToUtf8(v.bstrVal) + "\"";
    case VT_BOOL: return v.boolVal ? "TRUE" : "FALSE";
    case VT_ERROR: return "error " + std::to_string(v.scode & 0xFFFF);
    default: return "variant type " + std::to_string(v.vt);
    }
}

// The text of a mismatch against one expected cell, or empty when it matches.
std::string Mismatch(const json &cell, const VARIANT &v)
{
    const std::string kind = cell[2];
    if (kind == "number" || kind == "date") {
        double want = kind == "date" ? cell[4].get<double>() : cell[3].get<double>();
        if (v.vt == VT_R8 && v.dblVal == want) return {};
        return "expected number " + std::to_string(want) + ", got " + Describe(v);
    }
    if (kind == "string") {
        std::string want = cell.size() > 4 ? cell[4].get<std::string>() : cell[3].get<std::string>();
        if (v.vt == VT_BSTR && automation::BstrToUtf8(v.bstrVal) == want) return {};
        return "expected text \"" + want + "\", got " + Describe(v);
    }
    if (kind == "bool") {
        bool want = cell[3];
        if (v.vt == VT_BOOL && (v.boolVal != VARIANT_FALSE) == want) return {};
        return std::string("expected ") + (want ? "TRUE" : "FALSE") + ", got " + Describe(v);
    }
    if (kind == "error") {
        SCODE want = ExpectedScode(cell[3]);
        if (want != 0 && v.vt == VT_ERROR && v.scode == want) return {};
        return "expected error " + cell[3].get<std::string>() + ", got " + Describe(v);
    }
    return "unknown expected kind " + kind;
}

// The number format the engine gives a cell matches the one the other reader
// saw: the same code, or the same built-in format spelled another way.
bool SameFormat(const std::string &ours, const std::string &theirs)
{
    if (ours == theirs) return true;
    int a = workbook::format::BuiltinFormatId(ours), b = workbook::format::BuiltinFormatId(theirs);
    return a >= 0 && a == b;
}

void CheckWorkbook(const std::filesystem::path &jsonPath)
{
    std::string file = jsonPath.string().substr(0, jsonPath.string().size() - std::string(".expected.json").size());
    std::string shortName = std::filesystem::path(file).parent_path().filename().string() + "/" +
                            std::filesystem::path(file).filename().string();
    json expected = json::parse(engine_test::ReadBytes(jsonPath.string()));

    auto app = workbook::CreateApplication();
    std::shared_ptr<workbook::Workbook> book;
    try {
        book = app->GetWorkbooks()->Open(file);
    } catch (const automation::ComError &e) {
        ADD_FAILURE() << shortName << ": open failed: " << e.what();
        return;
    }
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
            for (const auto &rc : s["raw_cells_openpyxl_reports_empty"]) maybeEmpty.insert({rc[0], rc[1]});

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

        std::set<std::pair<uint32_t, uint32_t>> listed;
        auto &store = doc->Worksheet(k).model.store;
        for (const auto &cell : s["cells"]) {
            uint32_t row = cell[0], col = cell[1];
            listed.insert({row, col});
            VARIANT v = at(row, col);
            std::string problem = Mismatch(cell, v);
            if (!problem.empty() && maybeEmpty.count({row, col}) &&
                (v.vt == VT_EMPTY || (v.vt == VT_BSTR && automation::BstrToUtf8(v.bstrVal).empty())))
                problem.clear();
            if (!problem.empty())
                ADD_FAILURE() << where << " row " << row << " column " << col << ": " << problem;
            if (cell[2] == "date") {
                const workbook::Cell *c = store.Find(row, col);
                std::string ours = c ? doc->CellFormats().NumberFormatOf(c->style) : "";
                EXPECT_TRUE(SameFormat(ours, cell[5].get<std::string>()))
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
                    if (!blank && !listed.count({row, col}))
                        ADD_FAILURE() << where << " row " << row << " column " << col << ": unexpected " << Describe(v);
                }
        } else if (values.Type() != VT_EMPTY && !listed.count({box.top, box.left})) {
            ADD_FAILURE() << where << ": unexpected " << Describe(values.Raw());
        }
    }
    book->Close(false);
    app->Quit();
}

TEST(CorpusTest, EveryWorkbookReadsAsItsExpectedValues)
{
    std::vector<std::filesystem::path> files;
    for (const auto &e : std::filesystem::recursive_directory_iterator(WORKBOOK_CORPUS_DIR)) {
        std::string name = e.path().filename().string();
        if (name.size() > 14 && name.ends_with(".expected.json")) files.push_back(e.path());
    }
    std::sort(files.begin(), files.end());
    ASSERT_GE(files.size(), 40u) << "the corpus at " << WORKBOOK_CORPUS_DIR << " is missing";
    for (const auto &f : files) {
        SCOPED_TRACE(f.string());
        CheckWorkbook(f);
    }
}

}  // namespace
