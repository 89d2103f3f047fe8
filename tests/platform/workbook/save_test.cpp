// SPDX-License-Identifier: MIT
// Saving: untouched parts stay byte for byte, a workbook without strings or
// styles gains them, values come back exactly as they were written, and the
// file saved over keeps its mode, its symbolic link and its read-only state.
// (A failed save keeps the old file: the bridge's write-safety tests.)
#include <sys/stat.h>

#include <bit>
#include <filesystem>
#include <limits>
#include <stdexcept>

#include "engine_test_support.h"
#include "package/parallel_deflate.h"

namespace {

using automation::Variant;
using engine_test::Utf8;

TEST(SaveTest, UntouchedPartsStayByteForByte)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(WORKBOOK_CORPUS_DIR "/tafia__calamine/picture_richdata.xlsx", path);
    std::filesystem::permissions(path, std::filesystem::perms::owner_write, std::filesystem::perm_options::add);
    auto before = engine_test::ZipEntries(path);
    const std::string sheetPart = "xl/worksheets/sheet1.xml";

    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    auto sheet = book->GetWorksheets()->Item(1);
    sheet->GetRange("Z40")->SetValue2(Variant::R8(0.1).Raw());
    book->Save();
    auto after = engine_test::ZipEntries(path);
    ASSERT_EQ(after.size(), before.size());
    for (const auto &[name, bytes] : before) {
        if (name != sheetPart && name != "xl/workbook.xml") { EXPECT_EQ(after[name], bytes) << name << " changed"; }
    }
    // Cells changed: formulas are computed again on opening, the rest of calcPr stays.
    std::string marked = before["xl/workbook.xml"];
    marked.replace(marked.find("<calcPr calcId=\"181029\"/>"), 25, "<calcPr calcId=\"181029\" fullCalcOnLoad=\"1\"/>");
    EXPECT_EQ(after["xl/workbook.xml"], marked);
    // The sheet keeps its other elements; the cell is there.
    const std::string &oldSheet = before[sheetPart];
    for (const char *element : {"<sheetViews", "<pageMargins", "<sheetFormatPr"}) {
        const size_t at = oldSheet.find(element);
        ASSERT_NE(at, std::string::npos) << element;
        EXPECT_NE(after[sheetPart].find(oldSheet.substr(at, oldSheet.find('>', at) - at + 1)), std::string::npos) << element;
    }
    EXPECT_NE(after[sheetPart].find("<c r=\"Z40\"><v>0.1</v></c>"), std::string::npos);

    // A text adds a shared string; the parts that don't list parts still stay.
    sheet->GetRange("Z41")->SetValue2(Variant::String("new text").Raw());
    book->Save();
    auto third = engine_test::ZipEntries(path);
    for (const auto &[name, bytes] : before) {
        const bool lists = name == "[Content_Types].xml" || name == "xl/_rels/workbook.xml.rels" || name == "xl/workbook.xml";
        if (name != sheetPart && !lists && name.find("sharedStrings") == std::string::npos) { EXPECT_EQ(third[name], bytes) << name; }
    }
    book->Close(false);

    sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    EXPECT_EQ(sheet->GetRange("Z40")->GetValue2().Raw().dblVal, 0.1);
    EXPECT_EQ(Utf8(sheet->GetRange("Z41")->GetValue2()), "new text");
}

TEST(SaveTest, TheFileSavedOverKeepsModeOwnerLinkAndReadOnlyState)
{
    testing_host::TempDir dir;
    std::filesystem::create_directory(dir.File("real"));
    const std::string target = dir.File("real/book.xlsx"), link = dir.File("link.xlsx"), locked = dir.File("locked.xlsx");
    engine_test::WriteZip(target, engine_test::MinimalPackage("<sheetData/>"));
    std::filesystem::copy_file(target, locked);
    std::filesystem::create_symlink("real/book.xlsx", link);
    ASSERT_EQ(::chmod(target.c_str(), 0640), 0);
    // Another user's workbook, where the run may give files away (CI runs as root).
    const bool privileged = ::geteuid() == 0;
    const uid_t owner = privileged ? 1000 : ::geteuid();
    const gid_t group = privileged ? 100 : ::getegid();
    ASSERT_EQ(::chown(target.c_str(), owner, group), 0);
    ASSERT_EQ(::chmod(locked.c_str(), 0444), 0);  // no write bit: refused even where root could write it

    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(link);
    book->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(7).Raw());
    book->Save();
    EXPECT_TRUE(std::filesystem::is_symlink(link));
    struct stat st {};
    ASSERT_EQ(::stat(target.c_str(), &st), 0);
    EXPECT_EQ(st.st_mode & 07777, 0640u);
    EXPECT_EQ(st.st_uid, owner);
    EXPECT_EQ(st.st_gid, group);
    EXPECT_EQ(app->GetWorkbooks()->Open(target)->GetWorksheets()->Item(1)->GetRange("A1")->GetValue2().Raw().dblVal, 7.0);

    const std::string bytes = testing_host::ReadFile(locked);
    auto readOnly = app->GetWorkbooks()->Open(locked);
    readOnly->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(8).Raw());
    const std::string refusal = "cannot save '" + locked + "': the file is read-only. Make it writable, or save the workbook under another name";
    EXPECT_COM_ERROR(readOnly->Save(), E_ACCESSDENIED, refusal);
    EXPECT_COM_ERROR(readOnly->Close(true), E_ACCESSDENIED, refusal);
    EXPECT_EQ(testing_host::ReadFile(locked), bytes);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.File("")), std::filesystem::directory_iterator()), 3);
}

TEST(SaveTest, WorkbookWithoutStringsOrStylesGainsTheParts)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("bare.xlsx");
    engine_test::WriteZip(path, engine_test::MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\"><v>1</v></c></row></sheetData>"));
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    auto range = book->GetWorksheets()->Item(1)->GetRange("B1");
    range->SetValue2(Variant::R8(2).Raw());
    range->SetNumberFormat("0.000");
    book->GetWorksheets()->Item(1)->GetRange("C1")->SetValue2(Variant::String("hello").Raw());
    book->Close(true);
    auto parts = engine_test::ZipEntries(path);
    ASSERT_TRUE(parts.count("xl/sharedStrings.xml"));
    ASSERT_TRUE(parts.count("xl/styles.xml"));
    EXPECT_NE(parts["xl/_rels/workbook.xml.rels"].find("sharedStrings.xml"), std::string::npos);
    EXPECT_NE(parts["[Content_Types].xml"].find("/xl/styles.xml"), std::string::npos);
    // Saved as .xlsm, the workbook part says it may hold macros, or no spreadsheet opens it.
    const std::string macros = dir.File("made.XLSM");
    app->GetWorkbooks()->Add(engine_test::Missing().Raw())->SaveAs(macros);
    EXPECT_NE(engine_test::ZipEntries(macros)["[Content_Types].xml"].find(
                  "PartName=\"/xl/workbook.xml\" ContentType=\"application/vnd.ms-excel.sheet.macroEnabled.main+xml\""),
              std::string::npos);
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    EXPECT_EQ(Utf8(sheet->GetRange("C1")->GetValue2()), "hello");
    EXPECT_EQ(Utf8(sheet->GetRange("B1")->GetText()), "2.000");
}

TEST(SaveTest, RoundTripReturnsExactlyWhatWasWritten)
{
    testing_host::TempDir dir;
    const double numbers[] = {0.1, 1.0 / 3.0, -1e-300, 5e-324, std::numeric_limits<double>::max(), 123456789.123456789,
                              -0.0, 1e21};
    const std::string texts[] = {"plain", "  spaced  ", "<&>\"'", "_x0041_ literal", std::string("ctl\x01\x1f", 5),
                                 "line\r\nbreak", "Grüße 東京 😀"};
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(engine_test::Missing().Raw());
    auto sheet = book->GetWorksheets()->Item(1);
    for (size_t i = 0; i < std::size(numbers); ++i)
        sheet->GetRange("A" + std::to_string(i + 1))->SetValue2(Variant::R8(numbers[i]).Raw());
    for (size_t i = 0; i < std::size(texts); ++i) {
        // Through a one-element array, so that the text goes in unread.
        SAFEARRAY *sa = SafeArrayCreateVector(VT_VARIANT, 0, 1);
        LONG at = 0;
        Variant v = Variant::String(texts[i]);
        SafeArrayPutElement(sa, &at, v.Ptr());
        sheet->GetRange("B" + std::to_string(i + 1))->SetValue2(Variant::Array(VT_VARIANT, sa).Raw());
    }
    sheet->GetRange("C1")->SetValue2(Variant::Bool(true).Raw());
    sheet->GetRange("C2")->SetValue2(Variant::Bool(false).Raw());
    sheet->GetRange("C3")->SetValue2(Variant::Error(static_cast<SCODE>(0x800A07FA)).Raw());
    book->SaveAs(dir.File("round.xlsm"));  // xlsx whatever the extension
    book->Close(false);

    sheet = app->GetWorkbooks()->Open(dir.File("round.xlsm"))->GetWorksheets()->Item(1);
    for (size_t i = 0; i < std::size(numbers); ++i) {
        const Variant v = sheet->GetRange("A" + std::to_string(i + 1))->GetValue2();
        ASSERT_EQ(v.Type(), VT_R8);
        EXPECT_EQ(std::bit_cast<uint64_t>(v.Raw().dblVal), std::bit_cast<uint64_t>(numbers[i])) << numbers[i];
    }
    for (size_t i = 0; i < std::size(texts); ++i)
        EXPECT_EQ(Utf8(sheet->GetRange("B" + std::to_string(i + 1))->GetValue2()), texts[i]);
    EXPECT_EQ(sheet->GetRange("C1")->GetValue2().Raw().boolVal, VARIANT_TRUE);
    EXPECT_EQ(sheet->GetRange("C2")->GetValue2().Raw().boolVal, VARIANT_FALSE);
    EXPECT_HR(static_cast<SCODE>(0x800A07FA), sheet->GetRange("C3")->GetValue2().Raw().scode);
    EXPECT_EQ(testing_host::ReadFile(dir.File("round.xlsm")).substr(0, 2), "PK");
}

// A sheet whose making fails half-way: the packing thread stops and is
// joined, and the making's own error comes out, whichever piece it was at.
TEST(SaveTest, AFailureWhileAPartIsMadeStopsItsPackingAndComesOut)
{
    for (int failAt : {0, 1, 5}) {
        int made = 0;
        try {
            workbook::DeflateAsMade([&](const workbook::PieceSink &sink) {
                for (; made < failAt; ++made) sink(std::string(size_t{1} << 20, char('a' + made)));
                throw std::runtime_error("no more cells");
            });
            ADD_FAILURE() << "no error after " << failAt << " pieces";
        } catch (const std::runtime_error &e) {
            EXPECT_STREQ(e.what(), "no more cells");
        }
        EXPECT_EQ(made, failAt);
    }
}

}  // namespace
