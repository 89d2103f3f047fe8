// SPDX-License-Identifier: MIT
// The package-part units one element at a time, as exact XML.
#include <gtest/gtest.h>

#include "cell_ref.h"
#include "date_serial.h"
#include "engine_test_support.h"
#include "part_names.h"
#include "shared_strings.h"
#include "sheet_writer.h"
#include "styles.h"
#include "xml_text.h"

namespace {

using namespace workbook;

TEST(PartsTest, SheetDataIsWrittenFromTheStore)
{
    SheetModel sheet;
    StringPool pool;
    uint32_t text = pool.Add("a<b");
    sheet.store.SetValue(2, 1, CellKind::Number, std::bit_cast<uint64_t>(0.1));
    sheet.store.SetValue(2, 3, CellKind::String, text);
    sheet.store.SetValue(1, 28, CellKind::Boolean, 1);
    sheet.store.SetValue(3, 2, CellKind::Error, static_cast<uint64_t>(CellError::NA));
    sheet.store.SetStyle(3, 4, 7);
    SheetWriteContext ctx{pool, [](uint32_t p) { return p + 10; }};
    std::string out;
    AppendSheetData(out, sheet, ctx, "x");
    EXPECT_EQ(out,
              "<x:sheetData><x:row r=\"1\"><x:c r=\"AB1\" t=\"b\"><x:v>1</x:v></x:c></x:row>"
              "<x:row r=\"2\"><x:c r=\"A2\"><x:v>0.1</x:v></x:c><x:c r=\"C2\" t=\"s\"><x:v>10</x:v></x:c></x:row>"
              "<x:row r=\"3\"><x:c r=\"B3\" t=\"e\"><x:v>#N/A</x:v></x:c><x:c r=\"D3\" s=\"7\"/></x:row>"
              "</x:sheetData>");
    SheetModel empty;
    out.clear();
    AppendSheetData(out, empty, ctx, "");
    EXPECT_EQ(out, "<sheetData/>");
}

TEST(PartsTest, CellTextEscapesRoundTrip)
{
    std::string out;
    xml::AppendCellText(out, std::string("a&b<c>\x01_x0041_\r\n\t", 17));
    EXPECT_EQ(out, "a&amp;b&lt;c&gt;_x0001__x005F_x0041__x000D_\n\t");
    std::string back = "a_x0001__x005F_x0041__x000D_\n_xD83D__xDE00__x004g_";
    xml::DecodeCellEscapes(back);
    EXPECT_EQ(back, "a\x01_x0041_\r\n\xF0\x9F\x98\x80_x004g_");
}

TEST(PartsTest, RelationshipTargetsResolveInsideThePackage)
{
    EXPECT_EQ(ResolveTarget("xl/workbook.xml", "worksheets/sheet1.xml"), "xl/worksheets/sheet1.xml");
    EXPECT_EQ(ResolveTarget("xl/workbook.xml", "/xl/worksheets/sheet1.xml"), "xl/worksheets/sheet1.xml");
    EXPECT_EQ(ResolveTarget("xl/workbook.xml", "../customXml/item1.xml"), "customXml/item1.xml");
    EXPECT_EQ(ResolveTarget("", "xl/./workbook.xml"), "xl/workbook.xml");
    EXPECT_EQ(ResolveTarget("xl/workbook.xml", "sheet%201.xml"), "xl/sheet 1.xml");
    EXPECT_COM_ERROR(ResolveTarget("xl/workbook.xml", "../../x.xml"), E_FAIL, "points outside the package");
    EXPECT_COM_ERROR(ResolveTarget("xl/workbook.xml", "file:///etc/passwd"), E_FAIL, "points outside the package");
    EXPECT_EQ(RelsPartOf("xl/workbook.xml"), "xl/_rels/workbook.xml.rels");
    EXPECT_EQ(TargetFor("xl/workbook.xml", "xl/styles.xml"), "styles.xml");
    EXPECT_EQ(TargetFor("xl/workbook.xml", "other/styles.xml"), "/other/styles.xml");
    EXPECT_EQ(RelationshipKind("http://purl.oclc.org/ooxml/officeDocument/relationships/worksheet"), "worksheet");
}

TEST(PartsTest, CellAddresses)
{
    EXPECT_EQ(CellAddress(5, 26), "Z5");
    EXPECT_EQ(CellAddress(5, 27), "AA5");
    EXPECT_EQ(CellAddress(1, 702), "ZZ1");
    EXPECT_EQ(CellAddress(1048576, 16384), "XFD1048576");
    auto r = ParseRangeAddress("$C$10:a2");
    ASSERT_TRUE(r);
    EXPECT_EQ(RangeAddress(*r), "A2:C10");
    EXPECT_FALSE(ParseRangeAddress("A1:"));
    EXPECT_FALSE(ParseRangeAddress("AAAAA1"));
    EXPECT_FALSE(ParseCellAddress("A99999999999"));
}

TEST(PartsTest, IsoDatesBecomeSerials)
{
    EXPECT_EQ(IsoTextToSerial("2021-01-01", false), 44197.0);
    EXPECT_EQ(IsoTextToSerial("1900-01-01", false), 1.0);
    EXPECT_EQ(IsoTextToSerial("1900-03-01", false), 61.0);
    EXPECT_EQ(IsoTextToSerial("1904-01-02", true), 1.0);
    EXPECT_DOUBLE_EQ(*IsoTextToSerial("2021-01-01T12:00:00", false), 44197.5);
    EXPECT_DOUBLE_EQ(*IsoTextToSerial("06:00:00", false), 0.25);
    EXPECT_FALSE(IsoTextToSerial("2021-13-01", false));
    EXPECT_FALSE(IsoTextToSerial("yesterday", false));
}

TEST(PartsTest, StylesGainFormatsInPlace)
{
    // A stylesheet written with a prefix, and an xf that has children.
    const std::string part =
        "<m:styleSheet xmlns:m=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\"><m:fonts count=\"1\"/>"
        "<m:cellXfs count=\"1\"><m:xf numFmtId=\"0\" fontId=\"0\"><m:alignment wrapText=\"1\"/></m:xf></m:cellXfs>"
        "<m:cellStyles count=\"0\"/></m:styleSheet>";
    Styles styles = Styles::Parse(part, "xl/styles.xml");
    EXPECT_EQ(styles.WithNumberFormat(0, "General"), 0u);
    uint32_t twoPlaces = styles.WithNumberFormat(0, "0.00");  // built-in 2
    uint32_t custom = styles.WithNumberFormat(0, "0.000 \"m\"");
    EXPECT_EQ(twoPlaces, 1u);
    EXPECT_EQ(custom, 2u);
    EXPECT_EQ(styles.WithNumberFormat(0, "0.000 \"m\""), 2u);  // found again
    EXPECT_EQ(styles.NumberFormatOf(custom), "0.000 \"m\"");
    EXPECT_EQ(styles.NumberFormatIdOf(twoPlaces), 2u);
    EXPECT_EQ(styles.Write(part),
              "<m:styleSheet xmlns:m=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\">"
              "<m:numFmts count=\"1\"><m:numFmt numFmtId=\"164\" formatCode=\"0.000 &quot;m&quot;\"/></m:numFmts>"
              "<m:fonts count=\"1\"/><m:cellXfs count=\"3\">"
              "<m:xf numFmtId=\"0\" fontId=\"0\"><m:alignment wrapText=\"1\"/></m:xf>"
              "<m:xf numFmtId=\"2\" fontId=\"0\" applyNumberFormat=\"1\"><m:alignment wrapText=\"1\"/></m:xf>"
              "<m:xf numFmtId=\"164\" fontId=\"0\" applyNumberFormat=\"1\"><m:alignment wrapText=\"1\"/></m:xf>"
              "</m:cellXfs><m:cellStyles count=\"0\"/></m:styleSheet>");
}

TEST(PartsTest, SharedStringsGainItemsAtTheEnd)
{
    StringPool pool;
    const std::string empty = "<x:sst xmlns:x=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\" count=\"0\"/>";
    SharedStrings sst = SharedStrings::Parse(empty, "xl/sharedStrings.xml", pool);
    EXPECT_EQ(sst.WithAdded(empty, {"a", " b "}),
              "<x:sst xmlns:x=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\" count=\"2\" "
              "uniqueCount=\"2\"><x:si><x:t>a</x:t></x:si><x:si><x:t xml:space=\"preserve\"> b </x:t></x:si></x:sst>");
    const std::string rich =
        "<sst xmlns=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\" uniqueCount=\"1\"><si><r><t>x</t></r>"
        "<r><rPr><b/></rPr><t>y</t></r><rPh sb=\"0\" eb=\"1\"><t>PH</t></rPh></si></sst>";
    sst = SharedStrings::Parse(rich, "xl/sharedStrings.xml", pool);
    EXPECT_EQ(pool.Get(0), "xy");
    EXPECT_EQ(sst.Count(), 1u);
}

}  // namespace
