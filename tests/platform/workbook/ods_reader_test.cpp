// SPDX-License-Identifier: MIT
// OpenDocument spreadsheets made on the spot: what each kind of cell reads as
// and shows, and files made to hurt the reader, each refused with its reason.
#include <chrono>

#include "engine_test_support.h"
#include "minimal_package.h"

namespace {

using automation::Variant;

const std::string kStyles =
    "<number:date-style style:name='D'><number:year number:style='long'/><number:text>-</number:text>"
    "<number:month number:style='long'/><number:text>-</number:text><number:day number:style='long'/></number:date-style>"
    "<number:percentage-style style:name='P'><number:number number:decimal-places='1' number:min-integer-digits='1'/>"
    "<number:text>%</number:text></number:percentage-style>"
    "<number:currency-style style:name='C'><number:number number:decimal-places='2' number:min-integer-digits='1' "
    "number:grouping='true'/><number:text> </number:text><number:currency-symbol>€</number:currency-symbol></number:currency-style>"
    "<style:style style:name='Dated' style:family='table-cell' style:data-style-name='D'/>"
    "<style:style style:name='Pct' style:family='table-cell' style:data-style-name='P'/>"
    "<style:style style:name='Money' style:family='table-cell' style:parent-style-name='Base'/>"
    "<style:style style:name='Base' style:family='table-cell' style:data-style-name='C'/>"
    "<style:style style:name='Shut' style:family='table'><style:table-properties table:display='false'/></style:style>";

// An .ods package of the given automatic styles and spreadsheet body.
std::string Ods(const std::string &body, const std::string &styles = kStyles)
{
    const std::string content =
        "<office:document-content xmlns:office='urn:oasis:names:tc:opendocument:xmlns:office:1.0' "
        "xmlns:table='urn:oasis:names:tc:opendocument:xmlns:table:1.0' "
        "xmlns:text='urn:oasis:names:tc:opendocument:xmlns:text:1.0' "
        "xmlns:style='urn:oasis:names:tc:opendocument:xmlns:style:1.0' "
        "xmlns:number='urn:oasis:names:tc:opendocument:xmlns:datastyle:1.0' "
        "xmlns:calcext='urn:org:documentfoundation:names:experimental:calc:xmlns:calcext:1.0'>"
        "<office:automatic-styles>" + styles + "</office:automatic-styles><office:body><office:spreadsheet>" + body +
        "</office:spreadsheet></office:body></office:document-content>";
    return engine_test::PackageBytes({{"mimetype", "application/vnd.oasis.opendocument.spreadsheet"}, {"content.xml", content}});
}

std::string Cell(const std::string &attributes, const std::string &inside = "")
{
    return "<table:table-cell " + attributes + ">" + inside + "</table:table-cell>";
}
std::string Row(const std::string &cells, const std::string &attributes = "")
{
    return "<table:table-row " + attributes + ">" + cells + "</table:table-row>";
}
std::string Table(const std::string &rows, const std::string &name = "Data")
{
    return "<table:table table:name='" + name + "'>" + rows + "</table:table>";
}

std::string Describe(const Variant &v)
{
    if (v.Type() == VT_R8) return std::to_string(v.Raw().dblVal);
    if (v.Type() == VT_BSTR) return "'" + engine_test::Utf8(v) + "'";
    if (v.Type() == VT_BOOL) return v.Raw().boolVal ? "TRUE" : "FALSE";
    if (v.Type() == VT_ERROR) return "error " + std::to_string(v.Raw().scode & 0xFFFF);
    return "type " + std::to_string(v.Type());
}

TEST(OdsReader, CellsReadAndShowAsASpreadsheetShowsThem)
{
    const std::string body =
        "<table:calculation-settings><table:null-date table:date-value='1904-01-01'/></table:calculation-settings>" +
        Table("<table:table-column table:default-cell-style-name='Dated'/>"
              "<table:table-column table:number-columns-repeated='16383'/>" +
              Row(Cell("office:value-type='float' office:value='0'") +
                  Cell("office:value-type='string'",
                       "<text:p>  a  <text:span>b</text:span><text:s text:c='3'/>c<text:tab/>d</text:p>"
                       "<office:annotation><text:p>note</text:p></office:annotation><text:p>e<text:line-break/>f</text:p>")) +
              Row(Cell("office:value-type='date' office:date-value='2007-06-16T12:30:00' table:style-name='None'") +
                  Cell("office:value-type='time' office:time-value='PT12H30M00S'") +
                  Cell("office:value-type='time' office:time-value='P1DT2H'")) +
              Row(Cell("office:value-type='percentage' office:value='0.125' table:style-name='Pct'") +
                  Cell("office:value-type='currency' office:value='1234.5' table:style-name='Money'") +
                  Cell("table:number-columns-repeated='2'")) +
              Row(Cell("office:value-type='boolean' office:boolean-value='true'") +
                  Cell("table:formula='of:=1/0' office:value-type='string' calcext:value-type='error'", "<text:p>#DIV/0!</text:p>") +
                  "<table:covered-table-cell office:value-type='float' office:value='7'/>") +
              Row(Cell("table:number-columns-repeated='16384'"), "table:number-rows-repeated='1048571'") +
              Row(Cell("") + Cell("table:number-columns-repeated='2' office:value-type='float' office:value='1'"))) +
        Table("<table:table-row table:number-rows-repeated='3'>" + Cell("table:number-columns-repeated='2' office:value-type='string'",
                                                                         "<text:p>x</text:p>") + "</table:table-row>" +
              Row(Cell("table:number-columns-repeated='16384'"), "table:number-rows-repeated='2000000000'"), "Hidden' table:style-name='Shut") +
        // One cell in the sheet's last corner: the widest dimension there is.
        Table(Row(Cell("table:number-columns-repeated='16384'"), "table:number-rows-repeated='1048575'") +
              Row(Cell("table:number-columns-repeated='16383'") + Cell("office:value-type='float' office:value='2'")), "Corner");
    testing_host::TempDir dir;
    const std::string path = dir.File("cells.ods");
    testing_host::WriteFile(path, Ods(body));
    auto app = workbook::CreateApplication();
    auto sheets = app->GetWorkbooks()->Open(path)->GetWorksheets();
    ASSERT_EQ(sheets->Count(), 3);
    const struct {
        int sheet;
        const char *cell, *value, *text;
    } cases[] = {
        {1, "A1", "1462.000000", "1904-01-01"},  // a date style counts days from the null date
        {1, "B1", "'a b   c\td\ne\nf'", "a b   c\td\ne\nf"},
        {1, "A2", "39249.520833", "2007-06-16 12:30:00"},
        {1, "B2", "0.520833", "12:30:00"},
        {1, "C2", "1.083333", "26:00:00"},
        {1, "A3", "0.125000", "12.5%"},
        {1, "B3", "1234.500000", "1,234.50 €"},
        {1, "A4", "TRUE", "TRUE"},
        {1, "B4", "error 2007", "#DIV/0!"},
        {1, "C4", "7.000000", "7"},
        {1, "C1048576", "1.000000", "1"},
        {2, "B3", "'x'", "x"},
        {3, "XFD1048576", "2.000000", "2"},
    };
    for (const auto &c : cases) {
        auto range = sheets->Item(c.sheet)->GetRange(c.cell);
        EXPECT_EQ(Describe(range->GetValue2()), c.value) << c.cell;
        EXPECT_EQ(engine_test::Utf8(range->GetText()), c.text) << c.cell;
    }
    auto used = sheets->Item(1)->UsedRange();
    EXPECT_EQ(used->Count(), 1048576 * 3);
    auto hidden = sheets->Item(2)->UsedRange();
    EXPECT_EQ(hidden->Count(), 6);
}

// A stored number that no double holds reads as #NUM! (one too small to tell
// from 0 as 0) in either kind of file, and the sheet lists it; the file opens.
TEST(OdsReader, StoredNumbersNoDoubleHoldsAreListedAsInAnyWorkbook)
{
    const std::pair<std::string, std::string> cases[] = {
        {"1e400", "#NUM!"}, {"-1E+400", "#NUM!"}, {"NaN", "#NUM!"}, {"INF", "#NUM!"}, {"0x1p3", "#NUM!"}, {"1x", "#NUM!"},
        {"1e-400", "0"},    {"+1e-400", "0"},     {"-0.0001e-400", "0"}, {"123456789012345678901234567890e-360", "0"}};
    std::string xlsxRows, odsRows;
    for (size_t i = 0; i < std::size(cases); ++i) {
        xlsxRows += "<row r='" + std::to_string(i + 1) + "'><c r='C" + std::to_string(i + 1) + "'><v>" + cases[i].first + "</v></c></row>";
        odsRows += Row(Cell("table:number-columns-repeated='2'") + Cell("office:value-type='float' office:value='" + cases[i].first + "'"));
    }
    testing_host::TempDir dir;
    testing_host::WriteFile(dir.File("a.xlsx"), engine_test::PackageBytes(engine_test::MinimalPackage("<sheetData>" + xlsxRows + "</sheetData>")));
    testing_host::WriteFile(dir.File("a.ods"), Ods(Table(odsRows)));
    for (const std::string name : {"a.xlsx", "a.ods"}) {
        auto sheet = workbook::CreateApplication()->GetWorkbooks()->Open(dir.File(name))->GetWorksheets()->Item(1);
        const std::vector<workbook::UnreadableNumber> listed = sheet->UnreadableNumbers();
        ASSERT_EQ(listed.size(), std::size(cases)) << name;
        for (size_t i = 0; i < std::size(cases); ++i) {
            const auto &[stored, shown] = cases[i];
            EXPECT_EQ(engine_test::Utf8(sheet->GetRange("C" + std::to_string(i + 1))->GetText()), shown) << stored;
            EXPECT_EQ(std::tie(listed[i].row, listed[i].column, listed[i].excerpt, listed[i].underflow),
                      std::make_tuple(int32_t(i + 1), 3, "\"" + stored + "\"", shown == "0")) << name << " " << stored;
        }
    }
}

TEST(OdsReader, HostileFilesAreRefusedWithTheirReason)
{
    const std::string thousand = "<text:p>" + std::string(1000, 'x') + "</text:p>";
    const std::string text = Cell("office:value-type='string'", thousand);
    std::string deep = "<text:p>";
    for (int i = 0; i < 1000; ++i) deep += "<text:span>";
    const std::string sound = Ods(Table(Row(text)));
    const std::string xlsx = engine_test::PackageBytes(engine_test::MinimalPackage(""));
    const struct {
        const char *name;
        std::string bytes;
        std::string reason;
    } cases[] = {
        {"rows.ods", Ods(Table(Row(text, "table:number-rows-repeated='2000000000'"))),
         "sheet 'Data', row 1: its cells reach beyond the sheet's last row 1048576 (the row is repeated 2000000000 times)"},
        {"after.ods", Ods(Table(Row(Cell(""), "table:number-rows-repeated='2000000000'") + Row(text))),
         "sheet 'Data', row 1048577: its cells reach beyond the sheet's last row 1048576"},
        {"columns.ods", Ods(Table(Row(Cell("") + Cell("office:value-type='float' office:value='1' table:number-columns-repeated='16384'")))),
         "sheet 'Data', row 1: a cell repeated over 16384 columns reaches beyond the sheet's last column 16384"},
        {"bomb.ods", Ods(Table(Row(Cell("table:number-columns-repeated='16384' office:value-type='string'", thousand),
                                       "table:number-rows-repeated='1000'"))),
         "sheet 'Data', row 1: its repeated cells expand to more than 256 MiB; the file is refused as an allocation bomb"},
        {"spaces.ods", Ods(Table(Row(Cell("office:value-type='string'", "<text:p><text:s text:c='2000000000'/></text:p>")))),
         "sheet 'Data', row 1, column 1: its text is longer than 1 MiB"},
        {"deep.ods", Ods(Table(Row(Cell("office:value-type='string'", deep)))), "content.xml nests its elements more than 256 deep (line 1)"},
        {"count.ods", Ods(Table(Row(text, "table:number-rows-repeated='-1'"))),
         "sheet 'Data', row 1: table:number-rows-repeated '-1' is no count"},
        {"date.ods", Ods(Table(Row(Cell("office:value-type='date' office:date-value='16.06.2007'")))),
         "sheet 'Data', row 1, column 1: the date '16.06.2007' can't be read"},
        {"empty.ods", engine_test::PackageBytes({{"mimetype", "application/vnd.oasis.opendocument.spreadsheet"}}),
         "the OpenDocument package has no content.xml"},
        {"cut.ods", sound.substr(0, sound.size() / 2), "the file is not a workbook package: Not a zip archive"},
        {"named.xlsx", sound,
         "the file holds an OpenDocument spreadsheet (.ods), not what its name says: give it the extension of what it holds"},
        {"named.ods", xlsx,
         "the file holds an Office Open XML workbook (.xlsx, .xlsm), not what its name says: give it the extension of what it holds"},
    };
    testing_host::TempDir dir;
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        testing_host::WriteFile(dir.File(c.name), c.bytes);
        const auto start = std::chrono::steady_clock::now();
        EXPECT_COM_ERROR(engine_test::OpenAndRead(dir.File(c.name)), E_FAIL, dir.File(c.name) + ": " + c.reason);
        EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(5));  // refused early, not after the work
    }
}

}  // namespace
