// SPDX-License-Identifier: MIT
// Workbooks made to hurt the reader, and files that are no workbook at all.
// Each is refused with an error that names its fault (or, where the file is
// merely odd, read for what it really holds), never with a crash, a hang or
// memory spent on what a header merely claims.
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <functional>
#include <tuple>

#include "hostile_packages.h"
#include "workbook/limits.h"

namespace {

using engine_test::MinimalPackage;
using engine_test::OpenAndRead;
using engine_test::Parts;

const std::string kNs = std::string(" xmlns=\"") + engine_test::kMainNs + "\"";
const std::string kSheetPart = "xl/worksheets/sheet1.xml";
const std::string kWorkbookRels = "xl/_rels/workbook.xml.rels";

std::string Rows(const std::string &rows) { return "<sheetData>" + rows + "</sheetData>"; }

class HostileWorkbooks : public ::testing::Test {
protected:
    std::string Write(const std::string &name, const std::string &bytes)
    {
        testing_host::WriteFile(dir.File(name), bytes);
        return dir.File(name);
    }
    std::string WriteParts(const std::string &name, const Parts &parts)
    {
        return Write(name, engine_test::PackageBytes(parts));
    }
    // The first sheet of a package that must open, each in a file of its own.
    std::shared_ptr<workbook::Worksheet> FirstSheet(const Parts &parts)
    {
        const std::string name = "sound" + std::to_string(++opened) + ".xlsx";
        return app->GetWorkbooks()->Open(WriteParts(name, parts))->GetWorksheets()->Item(1);
    }

    testing_host::TempDir dir;
    int opened = 0;
    std::shared_ptr<workbook::Application> app = workbook::CreateApplication();
};

// Runs work in a child process and tells how it ended and the child's peak
// resident memory, so that a test can hold the engine to a memory bound.
struct ChildRun {
    int exitCode = -1;  // -1: killed by a signal
    long peakKilobytes = 0;
};

ChildRun InChild(const std::function<int()> &work)
{
    ChildRun run;
    const pid_t child = fork();
    if (child < 0) return run;
    if (child == 0) {
        int code = 99;
        try {
            code = work();
        } catch (...) {
            code = 98;
        }
        _exit(code);
    }
    int status = 0;
    struct rusage usage {};
    if (wait4(child, &status, 0, &usage) != child) return run;
    run.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    run.peakKilobytes = usage.ru_maxrss;
    return run;
}

// 0 when reading the file raises a ComError whose text holds part, 1 when it
// reads, 2 for another error text.
int RefusedWith(const std::string &path, const std::string &part)
{
    try {
        OpenAndRead(path);
        return 1;
    } catch (const automation::ComError &e) {
        return std::string(e.what()).find(part) != std::string::npos ? 0 : 2;
    }
}

TEST_F(HostileWorkbooks, FilesThatAreNoPackageOrAreCutOff)
{
    EXPECT_COM_ERROR(OpenAndRead(dir.File("absent.xlsx")), E_FAIL, dir.File("absent.xlsx") + ": no such file");
    EXPECT_COM_ERROR(OpenAndRead(Write("text.xlsx", "just some text, not a zip")), E_FAIL, "is not a workbook package");
    const std::string whole = engine_test::PackageBytes(MinimalPackage(hostile::kOkSheet));
    OpenAndRead(Write("whole.xlsx", whole));
    // Other readers open a package followed by a signature or a comment they
    // don't know, and local headers whose extra fields the directory lacks.
    OpenAndRead(Write("signed.xlsx", whole + std::string(142, 'S')));
    OpenAndRead(Write("after.xlsx", whole + "PK\x05\x06 and more"));
    std::vector<hostile::ZipEntry> stored;
    for (const auto &[name, bytes] : MinimalPackage(hostile::kOkSheet))
        stored.push_back({name, bytes, 0, hostile::Crc(bytes), bytes.size()});
    const std::string extra("\xfe\xca\x04\x00tidy", 8);
    OpenAndRead(Write("extra.xlsx", hostile::HandMadeZip(stored, extra)));
    // A part whose bytes don't match their checksum is damage.
    for (hostile::ZipEntry &e : stored)
        if (e.name == kSheetPart) e.crc ^= 1;
    EXPECT_EQ(RefusedWith(Write("crc.xlsx", hostile::HandMadeZip(stored, extra)), "is damaged"), 0);
    EXPECT_COM_ERROR(OpenAndRead(Write("cut_signed.xlsx", whole.substr(0, whole.size() - 30) + std::string(142, 'S'))),
                     E_FAIL, "is not a workbook package");
    // Lengths short of the whole: every one over the last 200 bytes, where the
    // directory stands, and every fifth before; the directory is gone or cut.
    for (size_t length = 0; length < whole.size(); length += length + 200 < whole.size() ? 5 : 1) {
        SCOPED_TRACE("cut to " + std::to_string(length) + " of " + std::to_string(whole.size()) + " bytes");
        EXPECT_COM_ERROR(OpenAndRead(Write("cut.xlsx", whole.substr(0, length))), E_FAIL, "is not a workbook package");
    }
}

TEST_F(HostileWorkbooks, EntriesClaimingSizesBeyondTheirData)
{
    // The hand-made zip itself is sound.
    OpenAndRead(Write("honest.xlsx", hostile::LyingSizes(kSheetPart, 0, 0)));
    const auto start = std::chrono::steady_clock::now();
    // 4 GiB inflated claimed for a few hundred bytes: no buffer of that size is
    // made, and the data that is there does not make up the claim.
    EXPECT_COM_ERROR(OpenAndRead(Write("inflated.xlsx", hostile::LyingSizes(kSheetPart, 0, 0xFFFFFFF0u))), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: it inflates to 189 bytes, its header says 4294967280");
    // Compressed data claimed far beyond the end of the file.
    EXPECT_COM_ERROR(OpenAndRead(Write("packed.xlsx", hostile::LyingSizes(kSheetPart, 0x7FFFFFF0u, 0))), E_FAIL,
                     "is not a workbook package");
    // Less than the data: the read stops at the claim instead of trusting it.
    EXPECT_COM_ERROR(OpenAndRead(Write("short.xlsx", hostile::LyingSizes(kSheetPart, 0, 20))), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: it inflates to more than ");
    // Both, on the workbook part that is read first.
    EXPECT_COM_ERROR(OpenAndRead(Write("both.xlsx", hostile::LyingSizes("xl/workbook.xml", 0x7FFFFFF0u, 0xFFFFFFF0u))),
                     E_FAIL, "is not a workbook package");
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10));
}

TEST_F(HostileWorkbooks, BigPartDamagedWhileReadAhead)
{
    // A part of some MB is inflated on a second thread: the damage it finds
    // there is told as it is for a small part, and nothing hangs.
    const std::string sound = hostile::GigabyteSheet(uint64_t{6} << 20);
    OpenAndRead(Write("sound.xlsx", sound));
    const size_t header = sound.find(kSheetPart) - 30;  // the sheet's local header
    ASSERT_EQ(sound.compare(header, 4, "PK\x03\x04"), 0);

    // The checksum in both headers says other than what inflates.
    std::string badCrc = sound;
    for (size_t at = sound.find(kSheetPart); at != std::string::npos; at = sound.find(kSheetPart, at + 1)) {
        const size_t crcAt = sound.compare(at - 30, 4, "PK\x03\x04") == 0 ? at - 30 + 14 : at - 46 + 16;
        badCrc[crcAt] = static_cast<char>(badCrc[crcAt] ^ 0x5A);
    }
    EXPECT_COM_ERROR(OpenAndRead(Write("crc.xlsx", badCrc)), E_FAIL, "part 'xl/worksheets/sheet1.xml' is damaged: CRC error");

    // Bytes past its first MB that are no deflate stream.
    std::string garbled = sound;
    const size_t middle = header + 30 + kSheetPart.size() + (garbled.size() - header) / 2;
    for (size_t i = 0; i < 64; ++i) garbled[middle + i] = static_cast<char>(0xFF);
    EXPECT_COM_ERROR(OpenAndRead(Write("garbled.xlsx", garbled)), E_FAIL, "part 'xl/worksheets/sheet1.xml' is damaged: ");
}

TEST_F(HostileWorkbooks, DeflateStreamsThatEndEarlyOrLie)
{
    const Parts parts = MinimalPackage(hostile::kOkSheet);
    const std::string sheet = hostile::PartOf(parts, kSheetPart);
    // The package with its sheet entry as given and the rest deflated soundly.
    const auto zipWith = [&](const std::string &stored, uint16_t method, uint32_t crc) {
        std::vector<hostile::ZipEntry> entries;
        for (const auto &[part, bytes] : parts)
            entries.push_back(part == kSheetPart ? hostile::ZipEntry{part, stored, method, crc, sheet.size()}
                                                 : hostile::DeflatedEntry(part, bytes));
        return hostile::HandMadeZip(entries);
    };
    const uint32_t crc = hostile::Crc(sheet);
    const std::string deflated = hostile::DeflatedEntry(kSheetPart, sheet).stored;
    hostile::Deflater unfinished;
    const std::string damaged = "part 'xl/worksheets/sheet1.xml' is damaged: ";

    // Stored as it is: read, and held to its checksum too.
    OpenAndRead(Write("stored.xlsx", zipWith(sheet, 0, crc)));
    const std::vector<std::tuple<std::string, std::string, std::string>> cases = {
        {"stored, wrong checksum", zipWith(sheet, 0, crc ^ 1u), "CRC error"},
        {"deflated, wrong checksum", zipWith(deflated, 8, crc ^ 1u), "CRC error"},
        {"stream cut short", zipWith(deflated.substr(0, deflated.size() / 2), 8, crc), "its compressed data ends early"},
        {"no last block", zipWith(unfinished.Piece(sheet, Z_SYNC_FLUSH), 8, crc), "its compressed data ends early"},
        {"reserved block type", zipWith(std::string("\x07\x00\x00", 3), 8, crc), "its compressed data is not valid"},
    };
    for (const auto &[label, zip, fault] : cases) {
        SCOPED_TRACE(label);
        EXPECT_COM_ERROR(OpenAndRead(Write("bad.xlsx", zip)), E_FAIL, damaged + fault);
    }
}

TEST_F(HostileWorkbooks, PartsThatInflateToGigabytes)
{
    // The generator makes a sheet that reads when it is small...
    auto sheet = app->GetWorkbooks()->Open(Write("small.xlsx", hostile::GigabyteSheet(uint64_t{4} << 20)))->GetWorksheets()->Item(1);
    EXPECT_EQ(sheet->GetRange("A1")->GetValue2().Raw().dblVal, 1.0);
    // ...and 1.25 GiB of it, a few MB on disk, is refused at the 1 GiB bound of
    // a part, as is one text of that size (no cell holds more than 32,767
    // characters), while the reader's memory stays far below what inflates.
    const std::pair<std::string, std::string> bombs[] = {
        {hostile::GigabyteSheet(uint64_t{5} << 28), "inflates beyond the limit of 1 GiB"},
        {hostile::InflatingSheet("<sheetData><row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>", "text ", uint64_t{5} << 28,
                                 "</t></is></c></row></sheetData>"),
         "has cell A1 with a text longer than 1048576 bytes"}};
    for (const auto &[bomb, fault] : bombs) {
        SCOPED_TRACE(fault);
        EXPECT_LT(bomb.size(), size_t{8} << 20);
        const std::string path = Write("bomb.xlsx", bomb);
        const auto start = std::chrono::steady_clock::now();
        const ChildRun run = InChild([&] { return RefusedWith(path, fault); });
        EXPECT_EQ(run.exitCode, 0) << "1: read it all, 2: another error, -1: killed";
        EXPECT_LT(run.peakKilobytes, 600L * 1024) << "peak memory in kB";
        EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(120));
    }
}

TEST_F(HostileWorkbooks, SheetsThatAllNameOnePart)
{
    // Ten sheets name one part of two million cells: the first is read alone,
    // with the memory of one sheet.
    const std::string row = "<row>" + [] { std::string c; for (int i = 0; i < 16; ++i) c += "<c><v>7</v></c>"; return c; }() + "</row>";
    const std::string ten = Write("ten.xlsx", hostile::InflatingSheet("<sheetData>", row, uint64_t{32} << 20, "</sheetData>", 10));
    const ChildRun first = InChild([&] {
        auto sheets = workbook::CreateApplication()->GetWorkbooks()->Open(ten)->GetWorksheets();
        return sheets->Count() == 10 && sheets->Item(1)->GetRange("P1")->GetValue2().Raw().dblVal == 7.0 ? 0 : 1;
    });
    EXPECT_EQ(first.exitCode, 0);
    EXPECT_LT(first.peakKilobytes, 150L * 1024) << "peak memory in kB";
    // Five namings of a part of 1 GiB go beyond what a workbook's sheets may
    // inflate to together, and are refused before anything inflates.
    const std::string five = Write("five.xlsx", hostile::InflatingSheet("", "<!-- filler -->\n", uint64_t{1} << 30, "", 5));
    EXPECT_COM_ERROR(app->GetWorkbooks()->Open(five), E_FAIL, five + ": the sheets' parts inflate to more than 4 GiB "
                                                                     "together (a part that several sheets name counts for each)");
}

TEST_F(HostileWorkbooks, ElementsNestedBeyondTheBound)
{
    // Endless unclosed elements, in the sheet and in an inline string, stop at
    // the bound on nesting long before their gigabyte inflates.
    const std::pair<std::string, std::string> cases[] = {
        {"<sheetData><row r=\"1\">", "<x>"},
        {"<sheetData><row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is>", "<r><t>a</t>"},
    };
    for (const auto &[head, unit] : cases) {
        SCOPED_TRACE(unit);
        const std::string path = Write("deep.xlsx", hostile::InflatingSheet(head, unit, uint64_t{1} << 30, ""));
        const ChildRun run = InChild([&] { return RefusedWith(path, "sheet1.xml' nests its elements more than 256 deep (line 1)"); });
        EXPECT_EQ(run.exitCode, 0) << "1: read it all, 2: another error, -1: killed";
        EXPECT_LT(run.peakKilobytes, 200L * 1024) << "peak memory in kB";
    }
}

TEST_F(HostileWorkbooks, TextsLongerThanAnyCellHolds)
{
    // Texts beyond the bound are refused where they stand, in the sheet and in
    // the shared strings, while one just at the bound still reads.
    const std::string longest(workbook::limits::kMaxCellTextBytes, 'x');
    const auto package = [&](const std::string &inlineText, const std::string &sharedText) {
        return MinimalPackage(Rows("<row r=\"1\"><c r=\"B1\" t=\"inlineStr\"><is><t>" + inlineText +
                                   "</t></is></c><c r=\"C1\" t=\"s\"><v>0</v></c></row>"),
                              "<sst" + kNs + "><si><t>" + sharedText + "</t></si></sst>", "<styleSheet" + kNs + "/>");
    };
    auto sheet = FirstSheet(package(longest, longest));
    for (const char *cell : {"B1", "C1"}) {
        const automation::Variant value = sheet->GetRange(cell)->GetValue2();
        ASSERT_EQ(value.Type(), VT_BSTR) << cell;
        EXPECT_EQ(SysStringLen(value.Raw().bstrVal), longest.size()) << cell;
    }
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("cell.xlsx", package(longest + "x", "x"))), E_FAIL,
                     "has cell B1 with a text longer than 1048576 bytes");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("shared.xlsx", package("x", longest + "x"))), E_FAIL,
                     "shared string 0 is longer than 1048576 bytes");
}

TEST_F(HostileWorkbooks, PackagesRefusedForTheirFault)
{
    const Parts plain = MinimalPackage(hostile::kOkSheet);
    const Parts full = MinimalPackage(hostile::kOkSheet, "<sst" + kNs + "><si><t>x</t></si></sst>", "<styleSheet" + kNs + "/>");
    const auto sheet = [](const std::string &rows) { return MinimalPackage(Rows(rows)); };
    const auto sharedIndex = [&](const std::string &index) {
        return hostile::Replace(full, kSheetPart, hostile::PartOf(MinimalPackage(Rows(
                                                      "<row r=\"1\"><c r=\"A1\" t=\"s\"><v>" + index + "</v></c></row>")), kSheetPart));
    };
    const auto bomb = [&](const std::string &part, const std::string &root, const std::string &inside) {
        return hostile::Replace(full, part, hostile::EntityBomb(root, "<" + root + kNs + ">" + inside + "</" + root + ">"));
    };
    const std::string noSharedString = "has cell A1 naming a shared string that doesn't exist";
    const std::string outside = "points outside the package";
    const std::string doctype = "a document type declaration is not allowed";
    const std::vector<std::tuple<std::string, Parts, std::string>> cases = {
        // Parts missing or not XML.
        {"no content types", hostile::Without(plain, "[Content_Types].xml"), "no content types part"},
        {"no workbook part", hostile::Without(plain, "xl/workbook.xml"), "no workbook part"},
        {"no sheet part", hostile::Without(plain, kSheetPart), "the part of sheet 'Data' is missing"},
        {"sheet not XML", MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\"><v>1</c>"),
         "sheet part 'xl/worksheets/sheet1.xml' is not well-formed XML"},
        {"workbook not XML", hostile::Replace(plain, "xl/workbook.xml", "<workbook" + kNs + "><sheets>"),
         "part 'xl/workbook.xml' is not well-formed XML"},
        {"no workbook element", hostile::Replace(plain, "xl/workbook.xml", "<workbook><sheets/></workbook>"),
         "the workbook part has no workbook element"},
        // Shared strings that aren't there.
        {"shared strings part missing", hostile::Without(sharedIndex("0"), "xl/sharedStrings.xml"), noSharedString},
        {"no shared strings at all", sheet("<row r=\"1\"><c r=\"A1\" t=\"s\"><v>0</v></c></row>"), noSharedString},
        {"index past the strings", sharedIndex("1"), noSharedString},
        {"index past 32 bits", sharedIndex("4294967296"), noSharedString},
        {"index empty", sharedIndex(""), noSharedString},
        // References and dimensions off the grid or out of their row.
        {"row 1048577", sheet("<row r=\"1\"><c r=\"A1048577\"><v>1</v></c></row>"), "has cell A1048577 outside its row"},
        {"cell below its row", sheet("<row r=\"12\"><c r=\"A13\"><v>1</v></c></row>"), "has cell A13 outside its row"},
        {"row beyond the grid", sheet("<row r=\"1048577\"><c r=\"A1048577\"><v>1</v></c></row>"),
         "has a row beyond the sheet grid (row 1048577)"},
        {"column beyond the grid", sheet("<row r=\"1\"><c r=\"XFE1\"><v>1</v></c></row>"), "beyond the sheet grid (column 16385)"},
        {"endless column name", sheet("<row r=\"1\"><c r=\"ZZZZZZZZZZZZZZZ1\"><v>1</v></c></row>"),
         "has a cell with a bad reference \"ZZZZZZZZZZZZZZZ1\""},
        {"row past 32 bits", sheet("<row r=\"4294967297\"><c><v>1</v></c></row>"), "has a row with a bad number \"4294967297\""},
        {"cell following the last column", sheet("<row r=\"1048576\"><c r=\"XFD1048576\"><v>1</v></c><c><v>2</v></c></row>"),
         "beyond the sheet grid"},
        {"dimension beyond the grid", MinimalPackage("<dimension ref=\"A1:XFD99999999\"/>" + hostile::kOkSheet),
         "claims dimensions beyond the sheet grid (A1:XFD99999999)"},
        {"column entry beyond the grid", MinimalPackage("<cols><col min=\"1\" max=\"99999\"/></cols>" + hostile::kOkSheet),
         "column entry beyond the sheet grid"},
        // Relationships that leave the package.
        {"sheet up and out", hostile::Edit(full, kWorkbookRels, "worksheets/sheet1.xml", "../../../etc/passwd"),
         "relationship target '../../../etc/passwd' points outside the package"},
        {"sheet elsewhere", hostile::Edit(full, kWorkbookRels, "Target=\"worksheets/sheet1.xml\"",
                                          "Target=\"http://example.invalid/s.xml\" TargetMode=\"External\""), outside},
        {"styles in a local file", hostile::Edit(full, kWorkbookRels, "Target=\"styles.xml\"",
                                                 "Target=\"file:///etc/passwd\" TargetMode=\"External\""), outside},
        {"workbook elsewhere", hostile::Edit(full, "_rels/.rels", "Target=\"xl/workbook.xml\"",
                                             "Target=\"http://example.invalid/workbook.xml\" TargetMode=\"External\""),
         "the workbook part lies outside the package"},
        // Document types, whether their entities expand a billion times or
        // fetch a file.
        {"entities in content types", bomb("[Content_Types].xml", "Types", "&l9;"), doctype},
        {"entities in workbook relationships", bomb(kWorkbookRels, "Relationships", "&l9;"), doctype},
        {"entities in shared strings", bomb("xl/sharedStrings.xml", "sst", "<si><t>&l9;</t></si>"), doctype},
        {"entities in the sheet", bomb(kSheetPart, "worksheet", Rows("<row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>&l9;</t></is></c></row>")),
         doctype},
        {"external entity", hostile::Replace(plain, "xl/workbook.xml",
                                             "<?xml version=\"1.0\"?><!DOCTYPE x [<!ENTITY e SYSTEM \"file:///etc/passwd\">]><x>&e;</x>"),
         doctype},
    };
    const auto start = std::chrono::steady_clock::now();
    for (const auto &[label, parts, fault] : cases) {
        SCOPED_TRACE(label);
        EXPECT_COM_ERROR(OpenAndRead(WriteParts("bad.xlsx", parts)), E_FAIL, fault);
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10));
}

TEST_F(HostileWorkbooks, OddPackagesReadForWhatTheyHold)
{
    // Small letters, dollar signs, leading zeros, long column names and cells
    // or rows without a reference all name the cell they would name in a
    // formula; the last cell of the grid is a cell like any other.
    auto sheet = FirstSheet(MinimalPackage(Rows(
        "<row r=\"12\"><c r=\"b12\"><v>1</v></c><c r=\"$C$12\"><v>2</v></c><c r=\"D012\"><v>3</v></c>"
        "<c r=\"AAA12\"><v>4</v></c><c><v>5</v></c><c r=\"XFD12\"><v>6</v></c></row><row><c r=\"C13\"><v>7</v></c><c><v>8</v></c></row>"
        "<row r=\"1048576\"><c r=\"XFD1048576\"><v>9</v></c></row>")));
    for (const auto &[address, value] : std::vector<std::pair<std::string, double>>{
             {"B12", 1}, {"C12", 2}, {"D12", 3}, {"AAA12", 4}, {"AAB12", 5}, {"XFD12", 6}, {"C13", 7}, {"D13", 8}, {"XFD1048576", 9}})
        EXPECT_EQ(sheet->GetRange(address)->GetValue2().Raw().dblVal, value) << address;

    // Whatever the dimension claims, the used range is where the cells are; the
    // whole grid is declared, not allocated.
    const std::string data = Rows("<row r=\"1\"><c r=\"A1\"><v>1</v></c></row><row r=\"5\"><c r=\"C5\"><v>15</v></c></row>");
    for (const char *dimension : {"A1:A1", "B2", "A1:Z9999", "C5:A1", "nonsense", "A0:", ":", "", "A1:XFD1048576"}) {
        SCOPED_TRACE(dimension);
        sheet = FirstSheet(MinimalPackage(std::string("<dimension ref=\"") + dimension + "\"/>" + data));
        EXPECT_EQ(sheet->UsedRange()->Count(), 15);  // A1:C5
        EXPECT_EQ(sheet->GetRange("C5")->GetValue2().Raw().dblVal, 15.0);
    }
    // A relationship target from the package's root that stays inside it.
    OpenAndRead(WriteParts("absolute.xlsx", hostile::Edit(MinimalPackage(hostile::kOkSheet), kWorkbookRels,
                                                          "worksheets/sheet1.xml", "/xl/worksheets/sheet1.xml")));
}

}  // namespace
