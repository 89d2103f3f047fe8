// SPDX-License-Identifier: MIT
// Saving: untouched parts stay byte for byte, a new workbook is one that
// another reader opens, values come back exactly, and a failed save leaves
// the old file as it was.
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <limits>

#include <nlohmann/json.hpp>

#include "atomic_file.h"
#include "engine_test_support.h"

namespace {

using automation::Variant;
using engine_test::Missing;
using engine_test::Utf8;

const std::string kCorpus = WORKBOOK_CORPUS_DIR;

std::string RunCommand(const std::string &command)
{
    std::string out;
    FILE *p = popen(command.c_str(), "r");
    if (!p) return out;
    char buf[4096];
    size_t n;
    while ((n = fread(buf, 1, sizeof buf, p)) > 0) out.append(buf, n);
    pclose(p);
    return out;
}

TEST(SaveTest, UntouchedPartsStayByteForByte)
{
    testing_host::TempDir dir;
    std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(kCorpus + "/tafia__calamine/picture_richdata.xlsx", path);
    auto before = engine_test::ZipEntries(path);
    auto storedBefore = engine_test::StoredEntries(path);

    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    auto sheets = book->GetWorksheets();
    sheets->Item(1)->GetRange("Z40")->SetValue2(Variant::R8(0.1).Raw());
    book->Save();
    auto after = engine_test::ZipEntries(path);
    ASSERT_EQ(after.size(), before.size());
    std::string sheetPart = "xl/worksheets/sheet1.xml";
    for (const auto &[name, bytes] : before) {
        ASSERT_TRUE(after.count(name)) << name;
        if (name != sheetPart) {
            EXPECT_EQ(after[name], bytes) << name << " changed";
        }
    }
    // Untouched entries are copied as stored, not inflated and deflated again.
    auto storedAfter = engine_test::StoredEntries(path);
    for (const auto &[name, bytes] : storedBefore) {
        if (name != sheetPart) {
            EXPECT_EQ(storedAfter[name], bytes) << name << " was stored anew";
        }
    }
    // The sheet keeps its other elements; the cell is there.
    const std::string &oldSheet = before[sheetPart];
    const std::string &newSheet = after[sheetPart];
    for (const char *element : {"<sheetViews", "<pageMargins", "<sheetFormatPr"}) {
        size_t at = oldSheet.find(element);
        if (at == std::string::npos) continue;
        size_t end = oldSheet.find('>', at);
        EXPECT_NE(newSheet.find(oldSheet.substr(at, end - at + 1)), std::string::npos) << element;
    }
    EXPECT_NE(newSheet.find("<c r=\"Z40\"><v>0.1</v></c>"), std::string::npos);

    // A text adds a shared string; the other parts still stay.
    sheets->Item(1)->GetRange("Z41")->SetValue2(Variant::String("new text").Raw());
    book->Save();
    auto third = engine_test::ZipEntries(path);
    for (const auto &[name, bytes] : before)
        if (name != sheetPart && name.find("sharedStrings") == std::string::npos &&
            name != "[Content_Types].xml" && name != "xl/_rels/workbook.xml.rels") {
            EXPECT_EQ(third[name], bytes) << name << " changed";
        }
    book->Close(false);

    book = app->GetWorkbooks()->Open(path);
    auto first = book->GetWorksheets()->Item(1);
    EXPECT_EQ(first->GetRange("Z40")->GetValue2().Raw().dblVal, 0.1);
    EXPECT_EQ(Utf8(first->GetRange("Z41")->GetValue2()), "new text");
    app->Quit();
}

TEST(SaveTest, WorkbookWithoutStringsOrStylesGainsTheParts)
{
    testing_host::TempDir dir;
    std::string path = dir.File("bare.xlsx");
    engine_test::WriteZip(path, engine_test::MinimalPackage(
                                    "<sheetData><row r=\"1\"><c r=\"A1\"><v>1</v></c></row></sheetData>"));
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    auto range = book->GetWorksheets()->Item(1)->GetRange("B1");
    range->SetValue2(Variant::String("hello").Raw());
    range->SetNumberFormat("0.000");
    book->Close(true);
    auto parts = engine_test::ZipEntries(path);
    ASSERT_TRUE(parts.count("xl/sharedStrings.xml"));
    ASSERT_TRUE(parts.count("xl/styles.xml"));
    EXPECT_NE(parts["xl/_rels/workbook.xml.rels"].find("sharedStrings.xml"), std::string::npos);
    EXPECT_NE(parts["[Content_Types].xml"].find("/xl/styles.xml"), std::string::npos);
    book = app->GetWorkbooks()->Open(path);
    auto sheet = book->GetWorksheets()->Item(1);
    EXPECT_EQ(Utf8(sheet->GetRange("B1")->GetValue2()), "hello");
    sheet->GetRange("C1")->SetValue2(Variant::R8(2).Raw());
    sheet->GetRange("C1")->SetNumberFormat("0.000");
    EXPECT_EQ(Utf8(sheet->GetRange("C1")->GetText()), "2.000");
    app->Quit();
}

TEST(SaveTest, RoundTripReturnsExactlyWhatWasWritten)
{
    testing_host::TempDir dir;
    std::string path = dir.File("round.xlsx");
    const double numbers[] = {0.1, 1.0 / 3.0, -1e-300, 5e-324, std::numeric_limits<double>::max(), 123456789.123456789,
                              -0.0, 1e21};
    const std::string texts[] = {"plain", "  spaced  ", "<&>\"'", "_x0041_ literal", std::string("ctl\x01\x1f", 5),
                                 "line\r\nbreak", "Grüße 東京 😀"};
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(Missing().Raw());
    auto sheet = book->GetWorksheets()->Item(1);
    int row = 1;
    for (double d : numbers) sheet->GetRange("A" + std::to_string(row++))->SetValue2(Variant::R8(d).Raw());
    row = 1;
    for (const auto &t : texts) {
        // Through a one-element array, so that the text goes in unread.
        SAFEARRAY *sa = SafeArrayCreateVector(VT_VARIANT, 0, 1);
        LONG i = 0;
        Variant v = Variant::String(t);
        SafeArrayPutElement(sa, &i, v.Ptr());
        sheet->GetRange("B" + std::to_string(row++))->SetValue2(Variant::Array(VT_VARIANT, sa).Raw());
    }
    sheet->GetRange("C1")->SetValue2(Variant::Bool(true).Raw());
    sheet->GetRange("C2")->SetValue2(Variant::Bool(false).Raw());
    sheet->GetRange("C3")->SetValue2(Variant::Error(static_cast<SCODE>(0x800A07FA)).Raw());
    book->SaveAs(dir.File("round.xlsm"));  // xlsx whatever the extension
    book->Close(false);

    book = app->GetWorkbooks()->Open(dir.File("round.xlsm"));
    sheet = book->GetWorksheets()->Item(1);
    row = 1;
    for (double d : numbers) {
        Variant v = sheet->GetRange("A" + std::to_string(row++))->GetValue2();
        ASSERT_EQ(v.Type(), VT_R8);
        EXPECT_EQ(std::memcmp(&v.Raw().dblVal, &d, sizeof d), 0) << d;
    }
    row = 1;
    for (const auto &t : texts) EXPECT_EQ(Utf8(sheet->GetRange("B" + std::to_string(row++))->GetValue2()), t);
    EXPECT_EQ(sheet->GetRange("C1")->GetValue2().Raw().boolVal, VARIANT_TRUE);
    EXPECT_EQ(sheet->GetRange("C2")->GetValue2().Raw().boolVal, VARIANT_FALSE);
    EXPECT_HR(static_cast<SCODE>(0x800A07FA), sheet->GetRange("C3")->GetValue2().Raw().scode);
    EXPECT_EQ(engine_test::ReadBytes(dir.File("round.xlsm")).substr(0, 2), "PK");
    app->Quit();
    (void)path;
}

TEST(SaveTest, AnotherReaderOpensANewWorkbook)
{
    testing_host::TempDir dir;
    std::string path = dir.File("new.xlsx");
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(Missing().Raw());
    auto sheet = book->GetWorksheets()->Item(1);
    sheet->GetRange("A1")->SetValue2(Variant::String("Title").Raw());
    sheet->GetRange("A2")->SetValue(Variant::Date(45351.5).Raw());
    sheet->GetRange("B2")->SetValue2(Variant::R8(2.5).Raw());
    sheet->GetRange("B2")->SetNumberFormat("0.000");
    sheet->GetRange("C2")->SetValue2(Variant::Bool(true).Raw());
    book->SaveAs(path);
    book->Close(false);
    app->Quit();

    std::string script =
        "import json, sys, openpyxl\n"
        "wb = openpyxl.load_workbook(sys.argv[1])\n"
        "ws = wb.worksheets[0]\n"
        "print(json.dumps({'sheets': wb.sheetnames, 'a1': ws['A1'].value, 'a2': str(ws['A2'].value),"
        " 'a2fmt': ws['A2'].number_format, 'b2': ws['B2'].value, 'b2fmt': ws['B2'].number_format,"
        " 'c2': ws['C2'].value, 'dims': ws.dimensions}))\n";
    engine_test::WriteBytes(dir.File("read.py"), script);
    std::string out = RunCommand(std::string(WORKBOOK_PYTHON) + " " + dir.File("read.py") + " " + path + " 2>&1");
    nlohmann::json j;
    try {
        j = nlohmann::json::parse(out);
    } catch (const std::exception &) {
        FAIL() << "openpyxl could not read the workbook: " << out;
    }
    EXPECT_EQ(j["sheets"], nlohmann::json::array({"Sheet1"}));
    EXPECT_EQ(j["a1"], "Title");
    EXPECT_EQ(j["a2"], "2024-02-29 12:00:00");
    EXPECT_EQ(j["a2fmt"], "m/d/yy h:mm");  // openpyxl's spelling of built-in format 22
    EXPECT_EQ(j["b2"], 2.5);
    EXPECT_EQ(j["b2fmt"], "0.000");
    EXPECT_EQ(j["c2"], true);
    EXPECT_EQ(j["dims"], "A1:C2");
}

// Replaces one file operation for the time of a test.
class FileOpsOverride {
public:
    FileOpsOverride() : saved_(workbook::detail::ActiveFileOps()) {}
    ~FileOpsOverride() { workbook::detail::ActiveFileOps() = saved_; }

private:
    workbook::detail::FileOps saved_;
};

ssize_t FailingWrite(int, const void *, size_t)
{
    errno = ENOSPC;
    return -1;
}

int FailingRename(const char *, const char *)
{
    errno = EXDEV;
    return -1;
}

TEST(SaveTest, AFailedSaveLeavesTheOldFile)
{
    testing_host::TempDir dir;
    std::string path = dir.File("keep.xlsx");
    std::filesystem::copy_file(std::string(WORKBOOK_FIXTURE_DIR) + "/several_sheets.xlsx", path);
    const std::string original = engine_test::ReadBytes(path);
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    book->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(5).Raw());
    {
        FileOpsOverride restore;
        workbook::detail::ActiveFileOps().write = &FailingWrite;
        EXPECT_COM_ERROR(book->Save(), E_FAIL, "writing failed: No space left on device");
    }
    {
        FileOpsOverride restore;
        workbook::detail::ActiveFileOps().rename = &FailingRename;
        EXPECT_COM_ERROR(book->Save(), E_FAIL, "renaming failed");
    }
    EXPECT_EQ(engine_test::ReadBytes(path), original);
    size_t files = 0;
    for (const auto &e : std::filesystem::directory_iterator(dir.Path())) {
        (void)e;
        ++files;
    }
    EXPECT_EQ(files, 1u) << "a temporary file was left behind";
    // The workbook is still whole: a later save succeeds.
    book->Save();
    book->Close(false);
    book = app->GetWorkbooks()->Open(path);
    EXPECT_EQ(book->GetWorksheets()->Item(1)->GetRange("A1")->GetValue2().Raw().dblVal, 5.0);
    app->Quit();
}

TEST(SaveTest, SaveIntoAReadOnlyFolderFailsAndKeepsTheFile)
{
    testing_host::TempDir dir;
    std::filesystem::path folder = dir.Path() / "locked";
    std::filesystem::create_directory(folder);
    std::string path = (folder / "book.xlsx").string();
    std::filesystem::copy_file(std::string(WORKBOOK_FIXTURE_DIR) + "/several_sheets.xlsx", path);
    const std::string original = engine_test::ReadBytes(path);
    ASSERT_EQ(::chmod(folder.c_str(), 0555), 0);
    ASSERT_EQ(::chmod(path.c_str(), 0644), 0);
    ::chmod(dir.Path().c_str(), 0755);

    // The save runs in a child, which reports through its exit code.
    pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        int code = 3;
        // Root writes anywhere, so the child becomes nobody; anyone else is
        // already stopped by the folder's mode.
        if (geteuid() == 0 && (setgid(65534) != 0 || setuid(65534) != 0)) _exit(4);
        try {
            auto app = workbook::CreateApplication();
            auto book = app->GetWorkbooks()->Open(path);
            book->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(5).Raw());
            book->Save();
            code = 1;  // the save went through
        } catch (const automation::ComError &e) {
            code = e.Code() == E_ACCESSDENIED ? 0 : 2;
        } catch (...) {
            code = 3;
        }
        _exit(code);
    }
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ::chmod(folder.c_str(), 0755);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0) << "1: saved, 2: another error, 3: crash, 4: could not drop root";
    EXPECT_EQ(engine_test::ReadBytes(path), original);
}

}  // namespace
