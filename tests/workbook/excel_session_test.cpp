// SPDX-License-Identifier: MIT
// CExcelObj's session over the workbook engine: start, open, create, select,
// close and quit, with the messages a caller shows.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "automation/com_error.h"
#include "support/temp_dir.h"
#include "workbook/excel_obj.h"

namespace {

std::string ReadBytes(const std::string &path)
{
    std::ifstream in(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

// An engine that answers only its version, for the version rule.
class VersionOnly : public workbook::Application {
public:
    explicit VersionOnly(std::string version) : version_(std::move(version)) {}
    std::shared_ptr<workbook::Workbooks> GetWorkbooks() override
    {
        throw automation::ComError(E_NOTIMPL, "no workbooks here");
    }
    std::string Version() override { return version_; }
    void Quit() override {}

private:
    std::string version_;
};

struct FactoryGuard {
    explicit FactoryGuard(CExcelObj::ApplicationFactory f) { CExcelObj::SetApplicationFactory(std::move(f)); }
    ~FactoryGuard() { CExcelObj::ResetApplicationFactory(); }
};

TEST(ExcelSession, StartThatFails)
{
    for (bool throws : {true, false}) {
        FactoryGuard guard([throws]() -> std::shared_ptr<workbook::Application> {
            if (throws) throw automation::ComError(REGDB_E_CLASSNOTREG, "no engine");
            return nullptr;
        });
        auto excel = std::make_unique<CExcelObj>();
        std::string error;
        EXPECT_FALSE(excel->StartExcel(error));
        EXPECT_EQ(error, "Could not locate Excel. Please verify that MS Excel has been installed correctly.");
        // Opening on a session that never started fails by message, not by crash.
        error.clear();
        EXPECT_FALSE(excel->OpenWorkbook("/tmp/x.xlsx", error));
        EXPECT_EQ(error, "Excel Workbook could not open file.");
        EXPECT_TRUE(excel->QuitExcel());
        excel.reset();
    }
}

TEST(ExcelSession, VersionRule)
{
    const std::pair<const char *, int> cases[] = {{"16.0", 16}, {"12.0", 12}, {"11.0", 11},
                                                  {" 14.0", 14}, {"x12", 0}, {"", 0}};
    for (const auto &[text, number] : cases) {
        FactoryGuard guard([text = std::string(text)] { return std::make_shared<VersionOnly>(text); });
        CExcelObj excel;
        std::string error;
        ASSERT_TRUE(excel.StartExcel(error));
        EXPECT_EQ(excel.GetExcelVersionText(), text);
        EXPECT_EQ(excel.GetExcelVersion(), number) << text;
        excel.QuitExcel();
    }
    CExcelObj real;
    std::string error;
    ASSERT_TRUE(real.StartExcel(error));
    EXPECT_GE(real.GetExcelVersion(), 12);  // the engine writes the xlsx format
    real.QuitExcel();
}

TEST(ExcelSession, OpenFailures)
{
    testing_host::TempDir dir;
    const std::string text = dir.File("notes.xlsx");
    std::ofstream(text) << "plain text, not a package";
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error));
    for (const std::string &path : {dir.File("missing.xlsx"), text, dir.Path().string(), std::string()}) {
        error.clear();
        EXPECT_FALSE(excel.OpenWorkbook(path, error)) << path;
        EXPECT_EQ(error, "Excel Workbook could not open file.");
    }
    EXPECT_EQ(ReadBytes(text), "plain text, not a package");
    excel.QuitExcel();
}

TEST(ExcelSession, CreateOpenSelectCloseQuit)
{
    testing_host::TempDir dir;
    // The format is the engine's default whatever the extension says.
    const std::string path = dir.File("series.xls");
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error));
    EXPECT_EQ(excel.GetSelectedSheet(), 0);
    ASSERT_TRUE(excel.CreateWorkbook(path, error)) << error;
    EXPECT_EQ(ReadBytes(path).substr(0, 2), "PK");

    ASSERT_TRUE(excel.OpenWorkbook(path, error)) << error;
    ASSERT_EQ(excel.GetSheetCount(), 1);
    EXPECT_TRUE(excel.SelectSheet(1, error));
    EXPECT_EQ(excel.GetSelectedSheet(), 1);
    // One past the count fails with its message and keeps the current sheet.
    error.clear();
    EXPECT_FALSE(excel.SelectSheet(2, error));
    EXPECT_EQ(error, "The sheet index is greater than the total number of sheets in the file.");
    EXPECT_EQ(excel.GetSelectedSheet(), 1);
    // Below 1 passes the count test and fails in the engine, by exception.
    EXPECT_THROW(excel.SelectSheet(0, error), automation::ComError);
    EXPECT_TRUE(excel.ClearSheet());
    EXPECT_TRUE(excel.CloseWorkbook(1));
    // Open again on the same session, as an inspection followed by a read does.
    ASSERT_TRUE(excel.OpenWorkbook(path, error)) << error;
    EXPECT_EQ(excel.GetSelectedSheet(), 1);  // not reset by opening
    EXPECT_TRUE(excel.CloseWorkbook(0));
    EXPECT_TRUE(excel.QuitExcel());
    EXPECT_TRUE(excel.QuitExcel());  // nothing left to release

    // Another program opens what was made (it goes by the extension, so it
    // reads a copy named as what the file is).
    const std::string copy = dir.File("series-copy.xlsx");
    std::filesystem::copy_file(path, copy);
    const std::string check =
        "/usr/bin/python3 -c \"import openpyxl,sys; wb=openpyxl.load_workbook(sys.argv[1]); "
        "sys.exit(0 if wb.sheetnames==['Sheet1'] else 3)\" '" + copy + "'";
    EXPECT_EQ(std::system(check.c_str()), 0);
}

TEST(ExcelSession, CreateInAFolderThatIsMissing)
{
    CExcelObj excel;
    std::string error;
    ASSERT_TRUE(excel.StartExcel(error));
    EXPECT_FALSE(excel.CreateWorkbook("/no/such/folder/book.xlsx", error));
    EXPECT_EQ(error, "Excel could not create file");
    EXPECT_FALSE(std::filesystem::exists("/no/such/folder/book.xlsx"));
    excel.QuitExcel();
}

}  // namespace
