// SPDX-License-Identifier: MIT
// Cells stored as ISO dates (t="d") read as serials of the workbook's date
// system; a date no calendar has is refused.
#include "engine_test_support.h"

namespace {

// A workbook whose one cell holds text as a date, in the 1904 system if asked.
engine_test::Parts DatedCell(const std::string &text, bool date1904)
{
    const engine_test::Parts parts = engine_test::MinimalPackage(
        "<sheetData><row r=\"1\"><c r=\"A1\" t=\"d\"><v>" + text + "</v></c></row></sheetData>");
    return date1904 ? engine_test::Edit(parts, "xl/workbook.xml", "<sheets>", "<workbookPr date1904=\"1\"/><sheets>") : parts;
}

TEST(DatedCells, ReadAsSerialsOfTheirDateSystem)
{
    const struct {
        const char *text;
        bool date1904;
        double serial;
    } cases[] = {
        {"2021-01-01", false, 44197.0},        {"1900-01-01", false, 1.0},
        {"1900-03-01", false, 61.0},           {"1904-01-02", true, 1.0},
        {"2021-01-01T12:00:00", false, 44197.5}, {"06:00:00", false, 0.25},
    };
    testing_host::TempDir dir;
    auto app = workbook::CreateApplication();
    int made = 0;
    for (const auto &c : cases) {
        SCOPED_TRACE(c.text);
        const std::string path = dir.File(std::to_string(++made) + ".xlsx");
        engine_test::WriteZip(path, DatedCell(c.text, c.date1904));
        const automation::Variant v = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1)->GetRange("A1")->GetValue2();
        ASSERT_EQ(v.Type(), VT_R8);
        EXPECT_DOUBLE_EQ(v.Raw().dblVal, c.serial);
    }
    for (const char *text : {"2021-13-01", "yesterday"}) {
        engine_test::WriteZip(dir.File("bad.xlsx"), DatedCell(text, false));
        EXPECT_COM_ERROR(engine_test::OpenAndRead(dir.File("bad.xlsx")), E_FAIL, "has cell A1 with a bad date '" + std::string(text) + "'");
    }
}

}  // namespace
