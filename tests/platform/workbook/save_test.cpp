// SPDX-License-Identifier: MIT
// Saving: untouched parts stay byte for byte, a workbook without strings or
// styles gains them, and values come back exactly as they were written. (A
// failed save keeps the old file: the bridge's write-safety tests.)
#include <bit>
#include <filesystem>
#include <limits>

#include "engine_test_support.h"

namespace {

using automation::Variant;
using engine_test::Utf8;

TEST(SaveTest, UntouchedPartsStayByteForByte)
{
    testing_host::TempDir dir;
    const std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(WORKBOOK_CORPUS_DIR "/tafia__calamine/picture_richdata.xlsx", path);
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
        if (name != sheetPart) { EXPECT_EQ(after[name], bytes) << name << " changed"; }
    }
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
        const bool lists = name == "[Content_Types].xml" || name == "xl/_rels/workbook.xml.rels";
        if (name != sheetPart && !lists && name.find("sharedStrings") == std::string::npos) { EXPECT_EQ(third[name], bytes) << name; }
    }
    book->Close(false);

    sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    EXPECT_EQ(sheet->GetRange("Z40")->GetValue2().Raw().dblVal, 0.1);
    EXPECT_EQ(Utf8(sheet->GetRange("Z41")->GetValue2()), "new text");
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

}  // namespace
