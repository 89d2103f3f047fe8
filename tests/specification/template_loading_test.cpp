// SPDX-License-Identifier: MIT
// Template files to specification strings: the rules of each attribute, the
// checks and their messages, and a parser that reads nothing but the file it is given.
#include <sys/stat.h>

#include <chrono>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "module/string_table.h"
#include "specification/specification.h"
#include "support/files.h"
#include "support/temp_dir.h"

namespace {

const char kHeader[] =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<MSExcelVantrelSpecification xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n";

// A save template as the save dialog writes it.
const char kSaveAttributes[] =
    "DateTimeCol=\"2\" UseDTFormat=\"true\" DateTimeFormat=\"YYYY-MM-DD HH:mm\" UnitTypeRow=\"1\" "
    "UnitRow=\"2\" ValueTypeRow=\"3\" ItemDescriptionRow=\"4\" StartRow=\"6\" "
    "UseDelValNotEmpty=\"true\" DeleteValueRow=\"5\" ";

const char kDates[] = "GlobalDate=\"2020-01-02\" GlobalTime=\"12:30:00\" ";

// The rows of a default layout, as they end an open specification.
const std::string kDefaultRows = "StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;";

std::string Message(int id) { return vantrel::LoadMessage(id); }

class Templates : public ::testing::Test {
protected:
    std::string Write(const std::string &name, const std::string &text)
    {
        testing_host::WriteFile(dir_.File(name), text);
        return dir_.File(name);
    }
    std::string WriteTemplate(const std::string &attributes, const std::string &content = "")
    {
        return Write("t" + std::to_string(++count_) + ".xml",
                     kHeader + attributes +
                         (content.empty() ? "/>" : ">" + content + "</MSExcelVantrelSpecification>"));
    }
    // The open specification string the template gives, or "error: " and the message.
    std::string OpenString(const std::string &path)
    {
        spec_ = CSpecification();
        OpenSpecification record;
        std::string error, text;
        if (!spec_.LoadOpenTemplate(path, record, error)) return "error: " + error;
        CSpecification().OpenSpecificationToString(record, text);
        return text;
    }
    std::string SaveString(const std::string &path)
    {
        SaveSpecification record;
        std::string error, text;
        if (!CSpecification().LoadSaveTemplate(path, record, error)) return "error: " + error;
        CSpecification().SaveSpecificationToString(record, text);
        return text;
    }

    testing_host::TempDir dir_;
    CSpecification spec_;
    int count_ = 0;
};

TEST_F(Templates, OpenTemplateAttributesReachTheSpecification)
{
    const struct { std::string attributes; std::string spec; } cases[] = {
        // Booleans are "true" or "false": "1" is no "true". Quotes ' at both ends of a format become ".
        {"DateTimeCol=\"3\" UseDTFormat=\"1\" DateTimeFormat=\"'YYYY'\" ", "DateTimeCol=3;" + kDefaultRows + "ExcelSheet=1;"},
        {"DateTimeCol=\"3\" UseDTFormat=\"true\" DateTimeFormat=\"'YYYY'\" ExcelSheet=\"2,4\" ",
         "DateTimeCol=3;DateTimeFormat=\"YYYY\";" + kDefaultRows + "ExcelSheet=2,4;"},
        // A time column with the global date; a quote only at the end stays.
        {"DataTimeType=\"1\" TimeCol=\"2\" UseTFormat=\"true\" TimeFormat=\"HH:mm'\" StartRow=\"4\" DateTimeCol=\"3\" ",
         "TimeCol=2;TimeFormat=HH:mm';GlobalDate=2020-01-02;StartRow=4;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;"
         "ItemDescriptionRow=2;ExcelSheet=1;"},
        {"DataTimeType=\"2\" DateCol=\"5\" UseDFormat=\"true\" DateFormat=\"''DD.MM''\" UseDTFormat=\"true\" ",
         "DateCol=5;DateFormat=\"DD.MM\";GlobalTime=12:30:00;" + kDefaultRows + "ExcelSheet=1;"},
        {"DataTimeType=\"2\" DateCol=\"5\" UseDFormat=\"false\" DateFormat=\"DD.MM\" ",
         "DateCol=5;GlobalTime=12:30:00;" + kDefaultRows + "ExcelSheet=1;"},
        // Globals instead of header rows; a header row whose flag is off may lie anywhere.
        {"UseUnitTypeRow=\"false\" GlobalUnitType=\"Rainfall\" UnitTypeRow=\"9\" UseUnitRow=\"false\" GlobalUnit=\"mm\" "
         "UnitRow=\"2\" UseValueTypeRow=\"false\" GlobalValueType=\"Accumulated\" ValueTypeRow=\"7\" "
         "UseDelValNotEmpty=\"true\" UseDeleteValueRow=\"false\" DeleteValue=\"-99.5\" DeleteValueRow=\"7\" ",
         "DateTimeCol=1;StartRow=3;GlobalUnitType=Rainfall;GlobalUnit=mm;GlobalValueType=Accumulated;"
         "ItemDescriptionRow=2;DeleteValue=-99.5;ExcelSheet=1;"},
        {"UseDelValNotEmpty=\"true\" DeleteValueRow=\"2\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" ",
         "DateTimeCol=1;" + kDefaultRows + "DelValRow=2;ExcelSheet=1;"},
        // Option 2 drops the row and the global key; title option 1 frees the title row.
        {"UseUnitTypeRow=\"false\" UseUnitTypeOption=\"2\" UseUnitOption=\"-5\" UseValueTypeOption=\"0\" UseItemTitleOption=\"1\" "
         "ItemDescriptionRow=\"30\" ",
         "DateTimeCol=1;StartRow=3;UnitRow=1;ValueTypeRow=1;ExcelSheet=1;"},
        {"UseItemTitleOption=\"1\" ItemDescriptionRow=\"1\" ", "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;"
                                                              "ValueTypeRow=1;ExcelSheet=1;"},
    };
    for (const auto &c : cases) EXPECT_EQ(OpenString(WriteTemplate(kDates + c.attributes)), c.spec) << c.attributes;
}

TEST_F(Templates, OpenTemplateExtensionListsAndSelection)
{
    EXPECT_EQ(OpenString(WriteTemplate(std::string(kDates) + "SelItems=\"1,3\" ",
                                       "\n  <MSExcelVantrelSpecificationExtension>\n"
                                       "    <ItemTitles><ItemTitle> Gauge A </ItemTitle><!-- c -->\n"
                                       "      <ItemTitle>Gauge B</ItemTitle><ItemTitle/></ItemTitles>\n"
                                       "    <ItemUnits><ItemUnit>mm</ItemUnit></ItemUnits>\n"
                                       "    <ValueTypes><ValueType>Accumulated</ValueType>"
                                       "<ValueType>5</ValueType></ValueTypes>\n"
                                       "  </MSExcelVantrelSpecificationExtension>\n")),
              "DateTimeCol=1;" + kDefaultRows + "ExcelSheet=1;");
    EXPECT_EQ(spec_.SelItems, "1,3");
    EXPECT_EQ(spec_.ItemTitles, (std::vector<std::string>{"Gauge A", "Gauge B", ""}));
    EXPECT_TRUE(spec_.ItemTypes.empty());
    EXPECT_EQ(spec_.ItemUnits, (std::vector<std::string>{"mm"}));
    EXPECT_EQ(spec_.ValueTypes, (std::vector<std::string>{"Accumulated", "5"}));
}

TEST_F(Templates, OpenTemplateFailuresCarryTheirMessages)
{
    const std::string h = kHeader;
    const struct { std::string file; int message; } cases[] = {
        // Defaults of the two dates don't parse.
        {h + "StartRow=\"5\" />", 143}, {h + "GlobalDate=\"2020-01-02\" />", 143},
        // Well formed dates of another form fail the schema.
        {h + "GlobalDate=\"01/02/2020\" GlobalTime=\"12:30:00\" />", 134},
        {h + kDates + "DeleteValue=\"none\" />", 134}, {h + kDates + "UseDTFormat=\"yes\" />", 134},
        {h + kDates + "StartRow=\"x\" />", 134}, {h + kDates + "Unknown=\"1\" />", 134},
        {h + kDates + "><Other/></MSExcelVantrelSpecification>", 134},
        {"<?xml version=\"1.0\"?><Other " + std::string(kDates) + "/>", 134},
        // Rows out of order; the title option frees the title row, not the header rows.
        {h + kDates + "UnitTypeRow=\"3\" />", 143}, {h + kDates + "ItemDescriptionRow=\"1\" />", 143},
        {h + kDates + "ItemDescriptionRow=\"3\" StartRow=\"3\" />", 143},
        {h + kDates + "UseItemTitleOption=\"1\" ValueTypeRow=\"3\" />", 143},
        // A save template never loads as an open one: it has no dates.
        {h + kSaveAttributes + "/>", 143},
        {"this is no xml", 135}, {h + kDates, 135}, {"", 135},  // not a document
    };
    for (const auto &c : cases) EXPECT_EQ(OpenString(Write("case.xml", c.file)), "error: " + Message(c.message)) << c.file;
    EXPECT_EQ(OpenString(dir_.File("missing.xml")), "error: " + Message(135));
    EXPECT_EQ(OpenString(dir_.Path().string()), "error: " + Message(135));
    // A FIFO without a writer is refused by its kind, not waited on.
    ASSERT_EQ(mkfifo(dir_.File("fifo.xml").c_str(), 0600), 0);
    EXPECT_EQ(OpenString(dir_.File("fifo.xml")), "error: " + Message(135));
}

TEST_F(Templates, SaveTemplatesReadTheirChain)
{
    EXPECT_EQ(SaveString(WriteTemplate(kSaveAttributes)),
              "DateTimeCol=2;DateTimeFormat=YYYY-MM-DD HH:mm;StartRow=6;UnitTypeRow=1;UnitRow=2;"
              "ValueTypeRow=3;ItemDescriptionRow=4;DelValRow=5;");
    // Without UnitRow the chain stops there: the later fields keep their
    // defaults though the file gives them; quotes of a format stay as written.
    EXPECT_EQ(SaveString(WriteTemplate("DateTimeCol=\"4\" UseDTFormat=\"true\" DateTimeFormat=\"'x'\" UnitTypeRow=\"1\" "
                                       "ValueTypeRow=\"9\" ItemDescriptionRow=\"8\" StartRow=\"10\" "
                                       "UseDelValNotEmpty=\"true\" DeleteValueRow=\"7\" ")),
              "DateTimeCol=4;DateTimeFormat='x';StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;");
    // Without DateTimeCol nothing is read.
    EXPECT_EQ(SaveString(WriteTemplate("StartRow=\"9\" UseDTFormat=\"true\" ")),
              "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;ItemDescriptionRow=2;");
}

// Keys that a save record leaves out of its specification string.
TEST(Records, SaveRecordLeavesOutZerosAndTakesFormatOnlyWhenFlagged)
{
    const auto text = [](const SaveSpecification &record) {
        std::string spec = "left over";
        CSpecification().SaveSpecificationToString(record, spec);
        return spec;
    };
    SaveSpecification record;
    record.DateTimeCol = 0;
    record.ItemDescriptionRow = 0;
    record.DateTimeFormat = "YYYY|MM|DD";
    EXPECT_EQ(text(record), "StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;");
    record.UseDTFormat = 1;
    record.UseDelValNotEmpty = 1;
    record.DeleteValueRow = 4;
    record.StartRow = 6;
    EXPECT_EQ(text(record), "DateTimeFormat=YYYY|MM|DD;StartRow=6;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;DelValRow=4;");
    record.DateTimeFormat.clear();
    record.DeleteValueRow = 0;
    EXPECT_EQ(text(record), "StartRow=6;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;");
}

TEST_F(Templates, SaveTemplateFailuresCarryTheirMessages)
{
    const std::string base = "DateTimeCol=\"1\" ";
    const struct { std::string attributes; int message; } cases[] = {
        // An open template's attribute has no place in the short schema.
        {std::string(kDates), 134}, {"ExcelSheet=\"1\" ", 134},
        {base + "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"1\" StartRow=\"3\" ", 116},
        {base + "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"4\" ItemDescriptionRow=\"2\" StartRow=\"3\" ", 115},
        {base + "UnitTypeRow=\"0\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" ", 137},
        // 137 then 115: the later message wins.
        {base + "UnitTypeRow=\"-1\" UnitRow=\"5\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" ", 115},
        // Below 1 suppresses the title test: no 116 after 137.
        {base + "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"1\" StartRow=\"0\" ", 115},
        {base + "UnitTypeRow=\"0\" UnitRow=\"0\" ValueTypeRow=\"0\" ItemDescriptionRow=\"0\" StartRow=\"3\" ", 137},
    };
    for (const auto &c : cases)
        EXPECT_EQ(SaveString(WriteTemplate(c.attributes)), "error: " + Message(c.message)) << c.attributes;
}

TEST_F(Templates, ParserLoadsNoDocumentTypeEntityOrOtherFile)
{
    const std::string secret = Write("secret.txt", "StartRow");
    const std::string h = "<?xml version=\"1.0\"?>\n";
    const std::string root = "<MSExcelVantrelSpecification DateTimeCol=\"1\" UnitTypeRow=\"1\" UnitRow=\"1\" "
                             "ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\"";
    std::string lol = "<!ENTITY a \"aaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaa\">";
    for (const char *entity : {"b", "c", "d", "e", "f"}) {
        lol += std::string("<!ENTITY ") + entity + " \"";
        for (int i = 0; i < 16; ++i) lol += std::string("&") + char(entity[0] - 1) + ";";
        lol += "\">";
    }
    const std::string files[] = {
        h + "<!DOCTYPE MSExcelVantrelSpecification SYSTEM \"" + secret + "\">" + root + "/>",
        h + "<!DOCTYPE MSExcelVantrelSpecification [<!ENTITY x SYSTEM \"file://" + secret + "\">]>" + root +
            " SelItems=\"&x;\"/>",
        h + "<!DOCTYPE MSExcelVantrelSpecification [" + lol + "]>" + root + " SelItems=\"&f;\"/>",
        h + "<!DOCTYPE MSExcelVantrelSpecification SYSTEM \"http://127.0.0.1:9/t.dtd\">" + root + "/>",
        h + root + " SelItems=\"&undeclared;\"/>",
    };
    for (const std::string &text : files) {
        const auto start = std::chrono::steady_clock::now();
        EXPECT_EQ(SaveString(Write("doctype.xml", text)), "error: " + Message(135)) << text;
        EXPECT_EQ(OpenString(Write("doctype.xml", text)), "error: " + Message(135)) << text;
        EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(2));
    }
    // An inclusion element is no inclusion: it is an unknown child.
    EXPECT_EQ(SaveString(Write("xi.xml", h + root + " xmlns:xi=\"http://www.w3.org/2001/XInclude\"><xi:include href=\"" +
                                             secret + "\" parse=\"text\"/></MSExcelVantrelSpecification>")),
              "error: " + Message(134));
}

}  // namespace
