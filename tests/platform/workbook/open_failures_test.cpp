// SPDX-License-Identifier: MIT
// Files the engine must refuse with a clear error, never a crash or a hang.
#include <chrono>

#include "engine_test_support.h"

namespace {

using engine_test::MinimalPackage;
using engine_test::Parts;

class OpenFailuresTest : public ::testing::Test {
protected:
    // Opens the file and reads every worksheet's used range.
    void OpenAndRead(const std::string &path)
    {
        auto app = workbook::CreateApplication();
        auto book = app->GetWorkbooks()->Open(path);
        auto sheets = book->GetWorksheets();
        for (int32_t i = 1; i <= sheets->Count(); ++i) sheets->Item(i)->UsedRange()->GetValue2();
    }
    std::string Write(const std::string &name, const Parts &parts)
    {
        std::string path = dir.File(name);
        engine_test::WriteZip(path, parts);
        return path;
    }
    static Parts Replace(Parts parts, const std::string &name, const std::string &bytes)
    {
        for (auto &p : parts)
            if (p.first == name) p.second = bytes;
        return parts;
    }

    testing_host::TempDir dir;
    const std::string okSheet = "<sheetData><row r=\"1\"><c r=\"A1\"><v>1</v></c></row></sheetData>";
};

TEST_F(OpenFailuresTest, FilesThatAreNoPackage)
{
    EXPECT_COM_ERROR(OpenAndRead(dir.File("absent.xlsx")), E_FAIL, "cannot open '" + dir.File("absent.xlsx") + "'");
    engine_test::WriteBytes(dir.File("text.xlsx"), "just some text, not a zip");
    EXPECT_COM_ERROR(OpenAndRead(dir.File("text.xlsx")), E_FAIL, "is not a workbook package");
    std::string good = Write("good.xlsx", MinimalPackage(okSheet));
    OpenAndRead(good);  // the untruncated file reads
    std::string bytes = engine_test::ReadBytes(good);
    engine_test::WriteBytes(dir.File("cut.xlsx"), bytes.substr(0, bytes.size() / 2));
    EXPECT_COM_ERROR(OpenAndRead(dir.File("cut.xlsx")), E_FAIL, "is not a workbook package");
    // A damaged entry behind an intact directory: flip bytes of the data.
    std::string damaged = bytes;
    for (size_t i = 60; i < 200 && i < damaged.size(); ++i) damaged[i] = static_cast<char>(damaged[i] ^ 0x5A);
    engine_test::WriteBytes(dir.File("damaged.xlsx"), damaged);
    EXPECT_ANY_THROW(OpenAndRead(dir.File("damaged.xlsx")));
}

TEST_F(OpenFailuresTest, PackagesMissingTheirParts)
{
    Parts parts = MinimalPackage(okSheet);
    Parts noTypes(parts.begin() + 1, parts.end());
    EXPECT_COM_ERROR(OpenAndRead(Write("notypes.xlsx", noTypes)), E_FAIL, "no content types part");
    Parts noWorkbook;
    for (const auto &p : parts)
        if (p.first != "xl/workbook.xml") noWorkbook.push_back(p);
    EXPECT_COM_ERROR(OpenAndRead(Write("nowb.xlsx", noWorkbook)), E_FAIL, "no workbook part");
    Parts noSheet;
    for (const auto &p : parts)
        if (p.first != "xl/worksheets/sheet1.xml") noSheet.push_back(p);
    EXPECT_COM_ERROR(OpenAndRead(Write("nosheet.xlsx", noSheet)), E_FAIL, "the part of sheet 'Data' is missing");
}

TEST_F(OpenFailuresTest, MalformedXml)
{
    EXPECT_COM_ERROR(OpenAndRead(Write("bad.xlsx", MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\"><v>1</c>"))),
                     E_FAIL, "sheet part 'xl/worksheets/sheet1.xml' is not well-formed XML");
    EXPECT_COM_ERROR(OpenAndRead(Write("num.xlsx", MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\"><v>1x</v></c></row></sheetData>"))),
                     E_FAIL, "bad number '1x'");
    EXPECT_COM_ERROR(OpenAndRead(Write("sst.xlsx", MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\" t=\"s\"><v>3</v></c></row></sheetData>"))),
                     E_FAIL, "naming a shared string that doesn't exist");
    Parts parts = Replace(MinimalPackage(okSheet), "xl/workbook.xml",
                          std::string("<workbook xmlns=\"") + engine_test::kMainNs + "\"><sheets>");
    EXPECT_COM_ERROR(OpenAndRead(Write("wb.xlsx", parts)), E_FAIL, "part 'xl/workbook.xml' is not well-formed XML");
    parts = Replace(MinimalPackage(okSheet), "xl/workbook.xml", "<workbook><sheets/></workbook>");
    EXPECT_COM_ERROR(OpenAndRead(Write("nons.xlsx", parts)), E_FAIL, "the workbook part has no workbook element");
}

TEST_F(OpenFailuresTest, DocumentTypesAndEntitiesAreRefused)
{
    const std::string bomb =
        "<?xml version=\"1.0\"?><!DOCTYPE lolz [<!ENTITY lol \"lol\"><!ENTITY lol2 "
        "\"&lol;&lol;&lol;&lol;&lol;&lol;&lol;&lol;&lol;&lol;\"><!ENTITY lol3 "
        "\"&lol2;&lol2;&lol2;&lol2;&lol2;&lol2;&lol2;&lol2;&lol2;&lol2;\">]>"
        "<worksheet xmlns=\"http://schemas.openxmlformats.org/spreadsheetml/2006/main\"><sheetData><row r=\"1\">"
        "<c r=\"A1\" t=\"inlineStr\"><is><t>&lol3;</t></is></c></row></sheetData></worksheet>";
    auto start = std::chrono::steady_clock::now();
    EXPECT_COM_ERROR(OpenAndRead(Write("bomb.xlsx", Replace(MinimalPackage(okSheet), "xl/worksheets/sheet1.xml", bomb))),
                     E_FAIL, "a document type declaration is not allowed");
    const std::string external =
        "<?xml version=\"1.0\"?><!DOCTYPE x [<!ENTITY e SYSTEM \"file:///etc/passwd\">]><x>&e;</x>";
    EXPECT_COM_ERROR(OpenAndRead(Write("ext.xlsx", Replace(MinimalPackage(okSheet), "xl/workbook.xml", external))),
                     E_FAIL, "a document type declaration is not allowed");
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
}

TEST_F(OpenFailuresTest, RelationshipsOutOfThePackage)
{
    Parts parts = MinimalPackage(okSheet);
    std::string rels = parts[3].second;
    std::string climbing = rels;
    climbing.replace(climbing.find("worksheets/sheet1.xml"), 21, "../../../etc/passwd");
    EXPECT_COM_ERROR(OpenAndRead(Write("climb.xlsx", Replace(parts, "xl/_rels/workbook.xml.rels", climbing))), E_FAIL,
                     "relationship target '../../../etc/passwd' points outside the package");
    std::string external = rels;
    external.replace(external.find("Target=\"worksheets/sheet1.xml\""), 30,
                     "Target=\"http://example.invalid/s.xml\" TargetMode=\"External\"");
    EXPECT_COM_ERROR(OpenAndRead(Write("external.xlsx", Replace(parts, "xl/_rels/workbook.xml.rels", external))),
                     E_FAIL, "points outside the package");
    // An absolute target inside the package is fine.
    std::string absolute = rels;
    absolute.replace(absolute.find("worksheets/sheet1.xml"), 21, "/xl/worksheets/sheet1.xml");
    OpenAndRead(Write("absolute.xlsx", Replace(parts, "xl/_rels/workbook.xml.rels", absolute)));
}

TEST_F(OpenFailuresTest, GiganticDimensions)
{
    EXPECT_COM_ERROR(OpenAndRead(Write("dim.xlsx", MinimalPackage("<dimension ref=\"A1:XFD99999999\"/>" + okSheet))), E_FAIL,
                     "claims dimensions beyond the sheet grid (A1:XFD99999999)");
    EXPECT_COM_ERROR(OpenAndRead(Write("row.xlsx", MinimalPackage("<sheetData><row r=\"1048577\"><c><v>1</v></c></row></sheetData>"))),
                     E_FAIL, "has a row beyond the sheet grid (row 1048577)");
    EXPECT_COM_ERROR(OpenAndRead(Write("col.xlsx", MinimalPackage("<sheetData><row r=\"1\"><c r=\"XFE1\"><v>1</v></c></row></sheetData>"))),
                     E_FAIL, "beyond the sheet grid (column 16385)");
    EXPECT_COM_ERROR(OpenAndRead(Write("cols.xlsx", MinimalPackage("<cols><col min=\"1\" max=\"99999\"/></cols>" + okSheet))),
                     E_FAIL, "column entry beyond the sheet grid");
    // The largest legal sheet is declared, not allocated.
    OpenAndRead(Write("whole.xlsx", MinimalPackage("<dimension ref=\"A1:XFD1048576\"/>" + okSheet)));
}

TEST_F(OpenFailuresTest, CellsWithoutReferencesFollowOn)
{
    std::string path = Write("norefs.xlsx", MinimalPackage("<sheetData><row><c><v>1</v></c><c><v>2</v></c></row>"
                                                         "<row><c r=\"C2\"><v>3</v></c><c><v>4</v></c></row>"
                                                         "<row r=\"5\"><c><v>5</v></c></row></sheetData>"));
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    EXPECT_EQ(sheet->GetRange("B1")->GetValue2().Raw().dblVal, 2.0);
    EXPECT_EQ(sheet->GetRange("D2")->GetValue2().Raw().dblVal, 4.0);
    EXPECT_EQ(sheet->GetRange("A5")->GetValue2().Raw().dblVal, 5.0);
    EXPECT_EQ(sheet->UsedRange()->Count(), 20);  // A1:D5
    app->Quit();
}

}  // namespace
