// SPDX-License-Identifier: MIT
// The rows of a worksheet read by the hand-written scanner give the same
// model, and the same errors, as the same part read by expat alone: over
// every workbook of the corpus and the fixtures, and over parts made to sit
// on the edges of what the scanner takes, fed whole and cut at every byte.
#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

#include "automation/com_error.h"
#include "cells/string_pool.h"
#include "ooxml/sheet_reader.h"
#include "package/zip_source.h"

namespace {

using workbook::SheetScan;

constexpr uint32_t kSharedCount = 1000;  // shared strings the crafted parts may name
// Shared strings a corpus sheet may name: more than any of them has, so that
// no read fails for want of the workbook's real list.
constexpr uint32_t kCorpusSharedCount = 100000;

// Everything the reader keeps of a part, as text, so that two reads compare
// in one EXPECT_EQ that shows where they differ.
std::string Describe(const workbook::SheetModel &m, const workbook::StringPool &pool, uint32_t sharedCount)
{
    std::ostringstream out;
    const auto &l = m.layout;
    out << "root " << l.root.ns << " " << l.root.prefix << ":" << l.root.local << " " << l.root.start.begin << "-"
        << l.root.start.end << " " << l.root.end.begin << "-" << l.root.end.end << "\n";
    out << "dimension " << l.dimension.begin << "-" << l.dimension.end << " cols " << l.cols.begin << "-"
        << l.cols.end << " sheetData " << l.sheetData.begin << "-" << l.sheetData.end << " at " << l.dimensionAt
        << "/" << l.colsAt << "\n";
    for (const auto &c : m.columns)
        out << "col " << c.min << ":" << c.max << " w" << c.width << " s" << c.style << " " << c.customWidth
            << c.bestFit << c.hidden << c.otherAttributes << "\n";
    for (const auto &row : m.store.Rows()) {
        const auto &a = row.attributes;
        out << "row " << row.index << " s" << a.style << " h" << a.height << " o" << int(a.outlineLevel) << " "
            << a.customFormat << a.customHeight << a.hidden << a.collapsed << "\n";
        for (const auto &cell : row.cells) {
            out << "  c" << cell.column << " s" << cell.style << " k" << int(cell.kind) << " ";
            if (cell.kind == workbook::CellKind::String) {
                if (cell.StringIndex() < sharedCount) out << "shared " << cell.StringIndex();
                else out << "'" << pool.Get(cell.StringIndex()) << "'";
            } else {
                out << cell.payload;
            }
            if (cell.flags & workbook::Cell::kHasFormula) {
                const auto *f = m.store.FormulaOf(row.index, cell.column);
                out << " f " << (f ? f->xml + " " + std::to_string(f->sharedIndex) + " " +
                                         std::to_string(f->sharedMaster)
                                   : "missing");
            }
            out << "\n";
        }
    }
    return out.str();
}

struct Read {
    std::string model;  // or the error
    uint64_t rowsScanned = 0;
};

// Reads part, fed in the given pieces, with the shared-string pool standing
// in for the workbook's.
Read ReadPart(const std::vector<std::string_view> &pieces, SheetScan scan, uint32_t sharedCount = kSharedCount)
{
    workbook::StringPool pool;
    for (uint32_t i = 0; i < sharedCount; ++i) pool.Add("shared");
    workbook::SheetContext ctx{pool, sharedCount, false};
    Read r;
    try {
        workbook::SheetPartReader reader("xl/worksheets/sheet1.xml", ctx, scan);
        for (auto piece : pieces) reader.Feed(piece.data(), piece.size());
        workbook::SheetModel model = reader.Finish();
        r.rowsScanned = reader.RowsScanned();
        r.model = Describe(model, pool, sharedCount);
    } catch (const automation::ComError &e) {
        std::ostringstream out;
        out << "error 0x" << std::hex << e.Code() << " " << e.what();
        r.model = out.str();
    }
    return r;
}

// Reads xml both ways, whole and cut in two at every byte, and expects the
// same each time. Returns the rows the scanner read from the whole part.
uint64_t ExpectSameBothWays(const std::string &xml, const std::string &label)
{
    const Read expat = ReadPart({xml}, SheetScan::ExpatOnly);
    const Read fast = ReadPart({xml}, SheetScan::Fast);
    EXPECT_EQ(expat.rowsScanned, 0u);
    EXPECT_EQ(fast.model, expat.model) << label;
    for (size_t cut = 1; cut < xml.size(); ++cut) {
        std::string_view all(xml);
        const Read split = ReadPart({all.substr(0, cut), all.substr(cut)}, SheetScan::Fast);
        if (split.model != expat.model) {
            ADD_FAILURE() << label << ": cut at byte " << cut << " reads\n" << split.model << "\nexpat reads\n" << expat.model;
            break;
        }
    }
    return fast.rowsScanned;
}

std::string Sheet(const std::string &rows, const std::string &rootExtra = "")
{
    return R"(<?xml version="1.0" encoding="UTF-8" standalone="yes"?>)"
           "\n<worksheet xmlns=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\" "
           "xmlns:r=\"http://schemas.openxmlformats.org/officeDocument/2006/relationships\" "
           "xmlns:x14ac=\"http://schemas.microsoft.com/office/spreadsheetml/2009/9/ac\"" +
           rootExtra + "><dimension ref=\"A1:C4\"/><cols><col min=\"1\" max=\"2\" width=\"12.5\" customWidth=\"1\"/></cols>"
           "<sheetData>" + rows + "</sheetData><mergeCells count=\"1\"><mergeCell ref=\"A1:B1\"/></mergeCells></worksheet>";
}

TEST(SheetScanner, ReadsTheCommonFormsAsExpatDoes)
{
    // Forms the corpus sheets have few or none of.
    const std::vector<std::pair<std::string, std::string>> cases = {
        {"inline and formula texts with references",
         R"(<row r="3"><c r="A3" t="inlineStr"><is><t xml:space="preserve"> a &amp; b &lt;c&gt; &quot;&apos; &#233;&#x1F600; _x000D_ </t></is></c>)"
         R"(<c r="B3" t="str"><f>CONCAT("a","b")</f><v>ab</v></c><c r="C3" t='inlineStr'><is><r><rPr><b/></rPr><t>rich</t></r><r><t> text</t></r><rPh sb="0" eb="1"><t>ph</t></rPh></is></c></row>)"},
        {"cells in every spelling of the plain form and just beside it",
         R"(<row r="1"><c r = "A1" ><v>1</v></c><c t="s" s="2" r="B1"><v>3</v></c><c r="C1"><v></v></c><c r="D1"><v>1</v> </c>)"
         R"(<c r="E1" s="12x"><v>2</v></c><c r="F1" rr="1"><v>3</v></c><c r="G1" t="str"><v>4]</v></c><c r="H1"/><c r="I1" s="7"></c>)"
         R"(<c r="J1" t="b"><v>1</v></c><c r="K1"><v>	5
</v></c><c r="L1" x14ac:a="1"><v>6</v></c></row>)"},
    };
    for (const auto &[label, rows] : cases) EXPECT_GT(ExpectSameBothWays(Sheet(rows), label), 0u) << label;
}

TEST(SheetScanner, LeavesTheUnusualToExpatWithTheSameResult)
{
    // Each either reads the same as with expat alone or fails with the same
    // message, positions and lines included.
    const std::vector<std::pair<std::string, std::string>> cases = {
        {"comment between rows", R"(<row r="1"><c r="A1"><v>1</v></c></row><!-- note --><row r="2"><c r="A2"><v>2</v></c></row>)"},
        {"CDATA in a value", R"(<row r="1"><c r="A1"><v><![CDATA[12]]></v></c></row>)"},
        {"mismatched end tag", "<row r=\"1\">\n<c r=\"A1\"><v>1</c></v></row>"},
        {"duplicate attribute through two prefixes", R"(<row r="1" x14ac:dyDescent="1" y:dyDescent="2"><c r="A1"><v>1</v></c></row>)"},
        {"unknown entity", R"(<row r="1"><c r="A1" t="inlineStr"><is><t>&nbsp;</t></is></c></row>)"},
        {"control character", "<row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>a\x01</t></is></c></row>"},
        {"unclosed row at the end", R"(<row r="1"><c r="A1"><v>1</v></c>)"},
    };
    for (const auto &[label, rows] : cases) ExpectSameBothWays(Sheet(rows), label);
}

TEST(SheetScanner, StandsAsideWhereThePartIsNotPlain)
{
    const std::string row = R"(<row r="1"><c r="A1"><v>1</v></c></row>)";
    // A part in another encoding is read by expat, with the same result (as
    // are the corpus sheets whose sheetData stands under a prefix or is empty).
    std::string latin = Sheet("<row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>caf\xE9</t></is></c></row>");
    latin.replace(latin.find("UTF-8"), 5, "ISO-8859-1");
    EXPECT_EQ(ExpectSameBothWays(latin, "latin-1"), 0u);
    // A sheetData tag with a '>' inside a quoted value still hands over.
    std::string quoted = Sheet(row);
    quoted.replace(quoted.find("<sheetData>"), 11, "<sheetData q:a='x>y' xmlns:q=\"urn:q\">");
    EXPECT_GT(ExpectSameBothWays(quoted, "quoted"), 0u);
}

// Every worksheet of every workbook under dir, read both ways in the pieces
// the package gives (and, for small parts, in small pieces too).
void CompareWorkbooksUnder(const std::filesystem::path &dir, uint64_t &sheets, uint64_t &rowsScanned)
{
    for (const auto &entry : std::filesystem::recursive_directory_iterator(dir)) {
        const auto ext = entry.path().extension().string();
        if (!entry.is_regular_file() || (ext != ".xlsx" && ext != ".xlsm")) continue;
        std::unique_ptr<workbook::PackageSource> source;
        try {
            source = workbook::PackageSource::OpenFile(entry.path().string());
        } catch (const automation::ComError &) {
            continue;  // not a package: the open tests cover it
        }
        for (const auto &name : source->EntryNames()) {
            if (!name.starts_with("xl/worksheets/") || !name.ends_with(".xml")) continue;
            std::string xml;
            try {
                xml = source->ReadAll(name);
            } catch (const automation::ComError &) {
                continue;
            }
            const std::string label = entry.path().string() + " " + name;
            const Read expat = ReadPart({xml}, SheetScan::ExpatOnly, kCorpusSharedCount);
            const Read fast = ReadPart({xml}, SheetScan::Fast, kCorpusSharedCount);
            EXPECT_EQ(fast.model, expat.model) << label;
            if (xml.size() < 200000) {
                for (size_t piece : {size_t{5}, size_t{4093}}) {
                    std::vector<std::string_view> pieces;
                    for (size_t at = 0; at < xml.size(); at += piece) pieces.push_back(std::string_view(xml).substr(at, piece));
                    EXPECT_EQ(ReadPart(pieces, SheetScan::Fast, kCorpusSharedCount).model, expat.model) << label << " in pieces of " << piece;
                }
            }
            ++sheets;
            rowsScanned += fast.rowsScanned;
        }
    }
}

TEST(SheetScanner, ReadsEveryCorpusAndFixtureSheetAsExpatDoes)
{
    uint64_t sheets = 0, rowsScanned = 0;
    CompareWorkbooksUnder(WORKBOOK_CORPUS_DIR, sheets, rowsScanned);
    CompareWorkbooksUnder(WORKBOOK_TESTS_DATA_DIR, sheets, rowsScanned);
    EXPECT_GT(sheets, 50u);
    EXPECT_GT(rowsScanned, 1000u);  // the scanner did read, not only stand aside
}

}  // namespace
