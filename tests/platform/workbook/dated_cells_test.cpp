// SPDX-License-Identifier: MIT
// Cells stored as ISO dates (t="d") and date formulas read as serials of the
// workbook's date system; a date no calendar has is refused.
#include "engine_test_support.h"

namespace {

// A workbook whose one cell holds text as a date, or a formula ("=..."), in the 1904 system if asked.
engine_test::Parts DatedCell(const std::string &text, bool date1904)
{
    const std::string cell = text.starts_with('=') ? "><f>" + text.substr(1) + "</f>" : " t=\"d\"><v>" + text + "</v>";
    const engine_test::Parts parts = engine_test::MinimalPackage("<sheetData><row r=\"1\"><c r=\"A1\"" + cell + "</c></row></sheetData>");
    return date1904 ? engine_test::Edit(parts, "xl/workbook.xml", "<sheets>", "<workbookPr date1904=\"1\"/><sheets>") : parts;
}

TEST(DatedCells, ReadAsSerialsOfTheirDateSystem)
{
    const struct {
        const char *text;
        bool date1904; double serial;
    } cases[] = {
        {"2021-01-01", false, 44197.0}, {"1900-01-01", false, 1.0}, {"1900-02-28", false, 59.0}, {"1900-03-01", false, 61.0},
        {"1904-01-02", true, 1.0}, {"2021-01-01T12:00:00", false, 44197.5}, {"06:00:00", false, 0.25}, {"=DATE(2020,14,0)", false, 44227.0},
        {"=DATE(2021,-1,1)", false, 44136.0}, {"=MONTH(60)*100+DAY(60)", false, 229.0}, {"=DAY(59)*100+DAY(61)", false, 2801.0},
        {"=YEAR(0)*10000+MONTH(0)*100+DAY(0)", true, 19040101.0},
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
        EXPECT_COM_ERROR(engine_test::OpenAndRead(dir.File("bad.xlsx")), E_FAIL, "has cell A1 with a bad date \"" + std::string(text) + "\"");
    }
}

}  // namespace
