// SPDX-License-Identifier: MIT
// Workbooks made to hurt the reader. Each is refused with a clear error (or,
// where the file is merely odd, read for what it really holds), never with a
// crash, a hang or memory spent on what a header merely claims.
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <functional>

#include "hostile_packages.h"
#include "workbook/limits.h"

namespace {

using engine_test::MinimalPackage;
using engine_test::Parts;
using hostile::Sheet;

class HostileWorkbooks : public ::testing::Test {
protected:
    // Opens the file and reads every worksheet's used range, as an import does.
    static void OpenAndRead(const std::string &path)
    {
        auto app = workbook::CreateApplication();
        auto book = app->GetWorkbooks()->Open(path);
        auto sheets = book->GetWorksheets();
        for (int32_t i = 1; i <= sheets->Count(); ++i) sheets->Item(i)->UsedRange()->GetValue2();
    }
    std::string WriteParts(const std::string &name, const Parts &parts)
    {
        const std::string path = dir.File(name);
        engine_test::WriteZip(path, parts);
        return path;
    }
    std::string WriteFile(const std::string &name, const std::string &bytes)
    {
        const std::string path = dir.File(name);
        engine_test::WriteBytes(path, bytes);
        return path;
    }
    static std::string SheetXml(const Parts &parts)
    {
        for (const auto &p : parts)
            if (p.first == "xl/worksheets/sheet1.xml") return p.second;
        return {};
    }

    testing_host::TempDir dir;
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
        auto app = workbook::CreateApplication();
        auto book = app->GetWorkbooks()->Open(path);
        book->GetWorksheets()->Item(1)->UsedRange()->GetValue2();
        return 1;
    } catch (const automation::ComError &e) {
        return std::string(e.what()).find(part) != std::string::npos ? 0 : 2;
    }
}

TEST_F(HostileWorkbooks, ZipCutOffAtAnyPoint)
{
    const std::string whole = engine_test::ReadBytes(WriteParts("whole.xlsx", MinimalPackage(hostile::kOkSheet)));
    OpenAndRead(dir.File("whole.xlsx"));
    // Lengths short of the whole: every one over the last 200 bytes, where the
    // directory stands, and every fifth before; the directory is gone or cut.
    for (size_t length = 0; length < whole.size(); length += length + 200 < whole.size() ? 5 : 1) {
        SCOPED_TRACE("cut to " + std::to_string(length) + " of " + std::to_string(whole.size()) + " bytes");
        EXPECT_COM_ERROR(OpenAndRead(WriteFile("cut.xlsx", whole.substr(0, length))), E_FAIL,
                         "is not a workbook package");
    }
}

TEST_F(HostileWorkbooks, EntriesClaimingSizesBeyondTheirData)
{
    const std::string sheet = "xl/worksheets/sheet1.xml";
    // The hand-made zip itself is sound.
    OpenAndRead(WriteFile("honest.xlsx", hostile::LyingSizes(sheet, 0, 0)));
    const auto start = std::chrono::steady_clock::now();
    // 4 GiB inflated claimed for a few hundred bytes: no buffer of that size is
    // made, and the data that is there does not make up the claim.
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("inflated.xlsx", hostile::LyingSizes(sheet, 0, 0xFFFFFFF0u))), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: it inflates to 189 bytes, its header says 4294967280");
    // Compressed data claimed far beyond the end of the file.
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("packed.xlsx", hostile::LyingSizes(sheet, 0x7FFFFFF0u, 0))), E_FAIL,
                     "is not a workbook package");
    // Less than the data: the read stops at the claim instead of trusting it.
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("short.xlsx", hostile::LyingSizes(sheet, 0, 20))), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: it inflates to more than ");
    // Both, on the workbook part that is read first.
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("both.xlsx", hostile::LyingSizes("xl/workbook.xml", 0x7FFFFFF0u, 0xFFFFFFF0u))),
                     E_FAIL, "is not a workbook package");
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10));
}

TEST_F(HostileWorkbooks, BigPartDamagedWhileReadAhead)
{
    // A part of some MB is inflated on a second thread: the damage it finds
    // there is told as it is for a small part, and nothing hangs.
    const std::string sound = hostile::GigabyteSheet(uint64_t{6} << 20);
    OpenAndRead(WriteFile("sound.xlsx", sound));
    const std::string sheet = "xl/worksheets/sheet1.xml";
    const size_t header = sound.find(sheet) - 30;  // the sheet's local header
    ASSERT_EQ(sound.compare(header, 4, "PK\x03\x04"), 0);

    // The checksum in both headers says other than what inflates.
    std::string badCrc = sound;
    for (size_t at = sound.find(sheet); at != std::string::npos; at = sound.find(sheet, at + 1)) {
        const size_t crcAt = sound.compare(at - 30, 4, "PK\x03\x04") == 0 ? at - 30 + 14 : at - 46 + 16;
        badCrc[crcAt] = static_cast<char>(badCrc[crcAt] ^ 0x5A);
    }
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("crc.xlsx", badCrc)), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: CRC error");

    // Bytes past its first MB that are no deflate stream.
    std::string garbled = sound;
    const size_t middle = header + 30 + sheet.size() + (garbled.size() - header) / 2;
    for (size_t i = 0; i < 64; ++i) garbled[middle + i] = static_cast<char>(0xFF);
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("garbled.xlsx", garbled)), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: ");
}

TEST_F(HostileWorkbooks, DeflateStreamsThatEndEarlyOrLie)
{
    const std::string name = "xl/worksheets/sheet1.xml";
    const Parts parts = MinimalPackage(hostile::kOkSheet);
    const std::string sheet = SheetXml(parts);
    // The package with its sheet entry made by `entry` and the rest deflated soundly.
    const auto zipWith = [&](const hostile::ZipEntry &entry) {
        std::vector<hostile::ZipEntry> entries;
        for (const auto &[part, bytes] : parts)
            entries.push_back(part == name ? entry : hostile::DeflatedEntry(part, bytes));
        return hostile::HandMadeZip(entries);
    };
    const uint32_t crc = hostile::Crc(sheet);

    // Stored as it is: libzip reads it, and holds it to its checksum too.
    OpenAndRead(WriteFile("stored.xlsx", zipWith({name, sheet, 0, crc, sheet.size()})));
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("stored-crc.xlsx", zipWith({name, sheet, 0, crc ^ 1u, sheet.size()}))),
                     E_FAIL, "part 'xl/worksheets/sheet1.xml' is damaged: CRC error");

    const std::string deflated = hostile::DeflatedEntry(name, sheet).stored;
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("crc.xlsx", zipWith({name, deflated, 8, crc ^ 1u, sheet.size()}))), E_FAIL,
                     "part 'xl/worksheets/sheet1.xml' is damaged: CRC error");
    // The stream cut short, its headers telling the cut length.
    EXPECT_COM_ERROR(
        OpenAndRead(WriteFile("cut.xlsx", zipWith({name, deflated.substr(0, deflated.size() / 2), 8, crc, sheet.size()}))),
        E_FAIL, "part 'xl/worksheets/sheet1.xml' is damaged: its compressed data ends early");
    // Sound blocks with no last block after them.
    hostile::Deflater unfinished;
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("unfinished.xlsx",
                                           zipWith({name, unfinished.Piece(sheet, Z_SYNC_FLUSH), 8, crc, sheet.size()}))),
                     E_FAIL, "part 'xl/worksheets/sheet1.xml' is damaged: its compressed data ends early");
    // A block type deflate doesn't have (the reserved type 3).
    EXPECT_COM_ERROR(OpenAndRead(WriteFile("reserved.xlsx", zipWith({name, std::string("\x07\x00\x00", 3), 8, crc,
                                                                     sheet.size()}))),
                     E_FAIL, "part 'xl/worksheets/sheet1.xml' is damaged: its compressed data is not valid");
}

TEST_F(HostileWorkbooks, SheetThatInflatesToGigabytes)
{
    // The generator makes a sheet that reads when it is small...
    const std::string small = WriteFile("small.xlsx", hostile::GigabyteSheet(uint64_t{4} << 20));
    {
        auto app = workbook::CreateApplication();
        auto sheet = app->GetWorkbooks()->Open(small)->GetWorksheets()->Item(1);
        EXPECT_EQ(sheet->GetRange("A1")->GetValue2().Raw().dblVal, 1.0);
        EXPECT_EQ(sheet->UsedRange()->Count(), 1);
    }
    // ...and 1.25 GiB of it, a few MB on disk, is refused at the 1 GiB bound of
    // a part while the reader's memory stays far below what inflates.
    const std::string bomb = hostile::GigabyteSheet(uint64_t{5} << 28);
    EXPECT_LT(bomb.size(), size_t{8} << 20);
    const std::string path = WriteFile("bomb.xlsx", bomb);
    const auto start = std::chrono::steady_clock::now();
    const ChildRun run = InChild([&] { return RefusedWith(path, "inflates beyond the limit of 1 GiB"); });
    EXPECT_EQ(run.exitCode, 0) << "1: read it all, 2: another error, -1: killed";
    EXPECT_LT(run.peakKilobytes, 600L * 1024) << "peak memory in kB";
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(120));
}

TEST_F(HostileWorkbooks, CellTextThatInflatesToGigabytes)
{
    // One inline text of 1.25 GiB is refused, and since no cell holds more than
    // 32,767 characters, a reader need not keep a gigabyte of it first.
    const std::string path = WriteFile("text.xlsx", hostile::GigabyteCellText(uint64_t{5} << 28));
    const auto start = std::chrono::steady_clock::now();
    const ChildRun run = InChild([&] { return RefusedWith(path, "'xl/worksheets/sheet1.xml'"); });
    EXPECT_EQ(run.exitCode, 0) << "1: read it all, 2: another error, -1: killed";
    EXPECT_LT(run.peakKilobytes, 600L * 1024) << "peak memory in kB";
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(120));
}

TEST_F(HostileWorkbooks, TextsLongerThanAnyCellHolds)
{
    // A cell holds at most 32,767 characters; texts far beyond that are
    // refused where they stand, in the sheet and in the shared strings, while
    // one just below the bound still reads.
    const std::string ns = std::string(" xmlns=\"") + engine_test::kMainNs + "\"";
    const std::string longest(workbook::limits::kMaxCellTextBytes, 'x');
    const std::string tooLong = longest + "x";
    const auto sheetWith = [&](const std::string &text) {
        return "<sheetData><row r=\"1\"><c r=\"B1\" t=\"inlineStr\"><is><t>" + text +
               "</t></is></c><c r=\"C1\" t=\"s\"><v>0</v></c></row></sheetData>";
    };
    const auto sst = [&](const std::string &text) { return "<sst" + ns + "><si><t>" + text + "</t></si></sst>"; };
    const std::string styles = "<styleSheet" + ns + "/>";
    {
        auto app = workbook::CreateApplication();
        auto sheet = app->GetWorkbooks()
                         ->Open(WriteParts("longest.xlsx", MinimalPackage(sheetWith(longest), sst(longest), styles)))
                         ->GetWorksheets()
                         ->Item(1);
        for (const char *cell : {"B1", "C1"}) {
            const automation::Variant value = sheet->GetRange(cell)->GetValue2();
            ASSERT_EQ(value.Type(), VT_BSTR) << cell;
            EXPECT_EQ(SysStringLen(value.Raw().bstrVal), longest.size()) << cell;
        }
    }
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("cell.xlsx", MinimalPackage(sheetWith(tooLong), sst("x"), styles))),
                     E_FAIL, "has cell B1 with a text longer than 1048576 bytes");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("shared.xlsx", MinimalPackage(sheetWith("x"), sst(tooLong), styles))),
                     E_FAIL, "shared string 0 is longer than 1048576 bytes");
}

TEST_F(HostileWorkbooks, EntityExpansionInAnyPart)
{
    const std::string ns = std::string(" xmlns=\"") + engine_test::kMainNs + "\"";
    const Parts parts = MinimalPackage(hostile::kOkSheet, "<sst" + ns + "><si><t>x</t></si></sst>",
                                       "<styleSheet" + ns + "/>");
    const std::vector<std::pair<std::string, std::string>> bombs = {
        {"[Content_Types].xml", hostile::EntityBomb("Types", "<Types>&l9;</Types>")},
        {"_rels/.rels", hostile::EntityBomb("Relationships", "<Relationships>&l9;</Relationships>")},
        {"xl/_rels/workbook.xml.rels", hostile::EntityBomb("Relationships", "<Relationships>&l9;</Relationships>")},
        {"xl/sharedStrings.xml", hostile::EntityBomb("sst", "<sst" + ns + "><si><t>&l9;</t></si></sst>")},
        {"xl/styles.xml", hostile::EntityBomb("styleSheet", "<styleSheet" + ns + ">&l9;</styleSheet>")},
        {"xl/worksheets/sheet1.xml",
         hostile::EntityBomb("worksheet", "<worksheet" + ns + "><sheetData><row r=\"1\"><c r=\"A1\" t=\"inlineStr\"><is><t>"
                                          "&l9;</t></is></c></row></sheetData></worksheet>")},
    };
    OpenAndRead(WriteParts("plain.xlsx", parts));
    const auto start = std::chrono::steady_clock::now();
    for (const auto &[part, bomb] : bombs) {
        SCOPED_TRACE(part);
        EXPECT_COM_ERROR(OpenAndRead(WriteParts("bomb.xlsx", hostile::Replace(parts, part, bomb))), E_FAIL,
                         "a document type declaration is not allowed");
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));
}

TEST_F(HostileWorkbooks, CellReferencesBeyondTheLastRowOrColumn)
{
    struct Case {
        std::string sheetData, error;
    };
    const std::vector<Case> cases = {
        {"<row r=\"1\"><c r=\"A1048577\"><v>1</v></c></row>", "has cell A1048577 outside its row"},
        {"<row r=\"12\"><c r=\"A13\"><v>1</v></c></row>", "has cell A13 outside its row"},
        {"<row r=\"12\"><c r=\"B1\"><v>1</v></c></row>", "has cell B1 outside its row"},
        {"<row r=\"1\"><c r=\"C12\"><v>1</v></c></row>", "has cell C12 outside its row"},
        {"<row r=\"1048577\"><c r=\"A1048577\"><v>1</v></c></row>", "has a row beyond the sheet grid (row 1048577)"},
        {"<row r=\"1\"><c r=\"XFE1\"><v>1</v></c></row>", "beyond the sheet grid (column 16385)"},
        {"<row r=\"1\"><c r=\"ZZZZZZZZZZZZZZZ1\"><v>1</v></c></row>", "has a cell with a bad reference 'ZZZZZZZZZZZZZZZ1'"},
        {"<row r=\"1\"><c r=\"A99999999999999999999999\"><v>1</v></c></row>",
         "has a cell with a bad reference 'A99999999999999999999999'"},
        {"<row r=\"4294967297\"><c><v>1</v></c></row>", "has a row with a bad number '4294967297'"},
        {"<row r=\"99999999999999999999999\"><c><v>1</v></c></row>", "has a row with a bad number '99999999999999999999999'"},
        {"<row r=\"1048576\"><c r=\"XFD1048576\"><v>1</v></c><c><v>2</v></c></row>", "beyond the sheet grid"},
        {"<row r=\"1048576\"><c><v>1</v></c></row><row><c><v>2</v></c></row>", "beyond the sheet grid"},
    };
    for (const Case &c : cases) {
        SCOPED_TRACE(c.sheetData);
        EXPECT_COM_ERROR(OpenAndRead(WriteParts("grid.xlsx", MinimalPackage("<sheetData>" + c.sheetData + "</sheetData>"))),
                         E_FAIL, c.error);
    }
    // The last cell of the grid itself is a cell like any other.
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()
                     ->Open(WriteParts("last.xlsx", MinimalPackage("<sheetData><row r=\"1048576\"><c r=\"XFD1048576\">"
                                                                   "<v>7</v></c></row></sheetData>")))
                     ->GetWorksheets()
                     ->Item(1);
    EXPECT_EQ(sheet->GetRange("XFD1048576")->GetValue2().Raw().dblVal, 7.0);
    app->Quit();
}

TEST_F(HostileWorkbooks, CellReferencesInLessCommonForms)
{
    // Small letters, dollar signs, leading zeros and long column names all
    // name the cell they would name in a formula.
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()
                     ->Open(WriteParts("forms.xlsx", MinimalPackage("<sheetData><row r=\"12\"><c r=\"b12\"><v>1</v></c>"
                                                                    "<c r=\"$C$12\"><v>2</v></c><c r=\"D012\"><v>3</v></c>"
                                                                    "<c r=\"AAA12\"><v>4</v></c><c><v>5</v></c>"
                                                                    "<c r=\"XFD12\"><v>6</v></c></row></sheetData>")))
                     ->GetWorksheets()
                     ->Item(1);
    for (const auto &[address, value] : std::vector<std::pair<std::string, double>>{
             {"B12", 1}, {"C12", 2}, {"D12", 3}, {"AAA12", 4}, {"AAB12", 5}, {"XFD12", 6}})
        EXPECT_EQ(sheet->GetRange(address)->GetValue2().Raw().dblVal, value) << address;
    app->Quit();
}

TEST_F(HostileWorkbooks, DimensionThatLies)
{
    const std::string data = "<sheetData><row r=\"1\"><c r=\"A1\"><v>1</v></c></row>"
                             "<row r=\"5\"><c r=\"C5\"><v>15</v></c></row></sheetData>";
    // Whatever the dimension claims, the used range is where the cells are.
    for (const char *dimension : {"A1:A1", "B2", "A1:Z9999", "C5:A1", "nonsense", "A0:", ":", ""}) {
        SCOPED_TRACE(dimension);
        auto app = workbook::CreateApplication();
        auto sheet = app->GetWorkbooks()
                         ->Open(WriteParts("dim.xlsx", MinimalPackage(std::string("<dimension ref=\"") + dimension + "\"/>" + data)))
                         ->GetWorksheets()
                         ->Item(1);
        EXPECT_EQ(sheet->UsedRange()->Count(), 15);  // A1:C5
        EXPECT_EQ(sheet->GetRange("C5")->GetValue2().Raw().dblVal, 15.0);
        app->Quit();
    }
}

TEST_F(HostileWorkbooks, MissingSharedStringsPart)
{
    const std::string ns = std::string(" xmlns=\"") + engine_test::kMainNs + "\"";
    const Parts withStrings = MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\" t=\"s\"><v>0</v></c></row></sheetData>",
                                             "<sst" + ns + "><si><t>gauge</t></si></sst>");
    OpenAndRead(WriteParts("strings.xlsx", withStrings));
    // The relationship names the part, the package lacks it.
    const Parts missing = hostile::Without(withStrings, "xl/sharedStrings.xml");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("missing.xlsx", missing)), E_FAIL, "shared string");
    // Neither relationship nor part, with a cell naming a shared string.
    Parts noRelationship = MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\" t=\"s\"><v>0</v></c></row></sheetData>");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("norel.xlsx", noRelationship)), E_FAIL,
                     "naming a shared string that doesn't exist");
    // An index beyond the strings there are, negative, or no number.
    for (const char *index : {"1", "-1", "4294967296", "x", ""}) {
        SCOPED_TRACE(index);
        Parts bad = hostile::Replace(withStrings, "xl/worksheets/sheet1.xml",
                                     Sheet(std::string("<sheetData><row r=\"1\"><c r=\"A1\" t=\"s\"><v>") + index + "</v></c></row></sheetData>"));
        EXPECT_ANY_THROW(OpenAndRead(WriteParts("index.xlsx", bad)));
    }
}

TEST_F(HostileWorkbooks, RelationshipsPointingOutsideThePackage)
{
    const std::string ns = std::string(" xmlns=\"") + engine_test::kMainNs + "\"";
    const Parts parts = MinimalPackage(hostile::kOkSheet, "<sst" + ns + "><si><t>x</t></si></sst>", "<styleSheet" + ns + "/>");
    std::string rels;
    for (const auto &p : parts)
        if (p.first == "xl/_rels/workbook.xml.rels") rels = p.second;
    auto retarget = [&](const std::string &from, const std::string &to) {
        std::string changed = rels;
        changed.replace(changed.find(from), from.size(), to);
        return hostile::Replace(parts, "xl/_rels/workbook.xml.rels", changed);
    };
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("sst.xlsx", retarget("Target=\"sharedStrings.xml\"", "Target=\"../../../../etc/passwd\""))),
                     E_FAIL, "points outside the package");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("styles.xlsx", retarget("Target=\"styles.xml\"",
                                                                    "Target=\"file:///etc/passwd\" TargetMode=\"External\""))),
                     E_FAIL, "points outside the package");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("up.xlsx", retarget("Target=\"worksheets/sheet1.xml\"", "Target=\"/../../etc/passwd\""))),
                     E_FAIL, "points outside the package");
    // The package's own relationship to the workbook part, made external.
    Parts rootExternal = parts;
    for (auto &p : rootExternal)
        if (p.first == "_rels/.rels")
            p.second.replace(p.second.find("Target=\"xl/workbook.xml\""), 24,
                             "Target=\"http://example.invalid/workbook.xml\" TargetMode=\"External\"");
    EXPECT_COM_ERROR(OpenAndRead(WriteParts("root.xlsx", rootExternal)), E_FAIL, "the workbook part lies outside the package");
}

}  // namespace
