// SPDX-License-Identifier: MIT
// The session members: application, workbooks, worksheets, and objects used
// after their workbook closed or their application quit.
#include <filesystem>

#include "engine_test_support.h"

namespace {

using automation::Variant;
using engine_test::Missing;

const std::string kFixtures = WORKBOOK_FIXTURE_DIR;

TEST(SessionTest, ApplicationGivesVersionAndWorkbooks)
{
    auto app = workbook::CreateApplication();
    EXPECT_EQ(app->Version(), "16.0");
    ASSERT_NE(app->GetWorkbooks(), nullptr);
    app->Quit();
    app->Quit();  // a second quit is harmless
    EXPECT_COM_ERROR(app->Version(), static_cast<HRESULT>(0x80010108), "quit");
}

TEST(SessionTest, AddMakesOneEmptySheetNamedSheet1)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Add(Missing().Raw());
    auto sheets = book->GetWorksheets();
    EXPECT_EQ(sheets->Count(), 1);
    auto used = sheets->Item(1)->UsedRange();
    EXPECT_EQ(used->Row(), 1);
    EXPECT_EQ(used->Column(), 1);
    EXPECT_EQ(used->Count(), 1);
    EXPECT_EQ(used->GetValue2().Type(), VT_EMPTY);
    EXPECT_COM_ERROR(sheets->Item(0), DISP_E_BADINDEX, "worksheet 0 does not exist");
    EXPECT_COM_ERROR(sheets->Item(2), DISP_E_BADINDEX, "worksheet 2 does not exist");
    EXPECT_COM_ERROR(book->Save(), static_cast<HRESULT>(0x800A03EC), "SaveAs");
    EXPECT_COM_ERROR(app->GetWorkbooks()->Add(Variant::String("template.xltx").Raw()), E_INVALIDARG, "template");
    app->Quit();
}

TEST(SessionTest, OpenCountsWorksheetsOnlyInWorkbookOrder)
{
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(kFixtures + "/several_sheets.xlsx");
    auto sheets = book->GetWorksheets();
    ASSERT_EQ(sheets->Count(), 3);  // the chart sheet is not one
    EXPECT_EQ(engine_test::Utf8(sheets->Item(1)->GetRange("A1")->GetValue2()), "Name");
    EXPECT_EQ(engine_test::Utf8(sheets->Item(2)->GetRange("C3")->GetValue2()), "top left");
    EXPECT_EQ(sheets->Item(3)->GetRange("B1")->GetValue2().Type(), VT_BSTR);
    book->Close(false);
    app->Quit();
}

TEST(SessionTest, ObjectsOfAClosedWorkbookFailCleanly)
{
    auto app = workbook::CreateApplication();
    auto books = app->GetWorkbooks();
    auto book = books->Open(kFixtures + "/several_sheets.xlsx");
    auto sheets = book->GetWorksheets();
    auto sheet = sheets->Item(1);
    auto range = sheet->GetRange("A1", "B2");
    book->Close(false);
    EXPECT_COM_ERROR(book->GetWorksheets(), static_cast<HRESULT>(0x80010108), "closed");
    EXPECT_COM_ERROR(sheets->Count(), static_cast<HRESULT>(0x80010108), "closed");
    EXPECT_COM_ERROR(sheet->UsedRange(), static_cast<HRESULT>(0x80010108), "closed");
    EXPECT_COM_ERROR(range->GetValue2(), static_cast<HRESULT>(0x80010108), "closed");
    EXPECT_COM_ERROR(range->SetValue2(Variant::R8(1).Raw()), static_cast<HRESULT>(0x80010108), "closed");
    EXPECT_COM_ERROR(book->Close(false), static_cast<HRESULT>(0x80010108), "closed");

    // Workbooks.Close closes every workbook; Quit ends everything.
    auto a = books->Open(kFixtures + "/several_sheets.xlsx");
    auto b = books->Add(Missing().Raw());
    auto bRange = b->GetWorksheets()->Item(1)->GetRange("A1");
    books->Close();
    EXPECT_COM_ERROR(a->GetWorksheets(), static_cast<HRESULT>(0x80010108), "closed");
    EXPECT_COM_ERROR(bRange->Count(), static_cast<HRESULT>(0x80010108), "closed");
    auto c = books->Add(Missing().Raw());
    auto cRange = c->GetWorksheets()->Item(1)->GetRange("A1");
    app->Quit();
    EXPECT_COM_ERROR(cRange->Row(), static_cast<HRESULT>(0x80010108), "quit");
    EXPECT_COM_ERROR(books->Open(kFixtures + "/several_sheets.xlsx"), static_cast<HRESULT>(0x80010108), "quit");
    EXPECT_COM_ERROR(app->GetWorkbooks(), static_cast<HRESULT>(0x80010108), "quit");
}

TEST(SessionTest, CloseSavesOnlyWhenAsked)
{
    testing_host::TempDir dir;
    std::string path = dir.File("book.xlsx");
    std::filesystem::copy_file(kFixtures + "/several_sheets.xlsx", path);
    std::string before = engine_test::ReadBytes(path);
    auto app = workbook::CreateApplication();
    auto book = app->GetWorkbooks()->Open(path);
    book->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(99).Raw());
    book->Close(false);
    EXPECT_EQ(engine_test::ReadBytes(path), before);

    book = app->GetWorkbooks()->Open(path);
    book->GetWorksheets()->Item(1)->GetRange("A1")->SetValue2(Variant::R8(99).Raw());
    book->Close(true);
    book = app->GetWorkbooks()->Open(path);
    Variant v = book->GetWorksheets()->Item(1)->GetRange("A1")->GetValue2();
    ASSERT_EQ(v.Type(), VT_R8);
    EXPECT_EQ(v.Raw().dblVal, 99.0);
    app->Quit();
}

}  // namespace
