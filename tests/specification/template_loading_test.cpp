// SPDX-License-Identifier: MIT
// Loading template files: schemas, readers, checks and their messages, and a
// parser that reads nothing but the file it is given.
#include <chrono>
#include <fstream>
#include <string>

#include <gtest/gtest.h>

#include "module/string_table.h"
#include "specification/specification.h"
#include "specification/xml_template_doc.h"
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

class Templates : public ::testing::Test {
protected:
    std::string Write(const std::string &name, const std::string &text)
    {
        const std::string path = dir_.File(name);
        std::ofstream(path, std::ios::binary) << text;
        return path;
    }
    std::string WriteTemplate(const std::string &attributes, const std::string &content = "")
    {
        const std::string text = std::string(kHeader) + attributes +
                                 (content.empty() ? "/>" : ">" + content + "</MSExcelVantrelSpecification>");
        return Write("t" + std::to_string(++count_) + ".xml", text);
    }

    bool LoadOpen(const std::string &path, OpenSpecification &record, std::string &error)
    {
        spec_ = CSpecification();
        return spec_.LoadOpenTemplate(path, record, error);
    }

    testing_host::TempDir dir_;
    CSpecification spec_;
    int count_ = 0;
};

std::string Message(int id) { return vantrel::LoadMessage(id); }

TEST_F(Templates, SchemasOfTheStringTableCompileAndJoinBetweenTwoAttributes)
{
    const std::string head = Message(103);
    const std::string tail = Message(104);
    // The head ends with the attribute DateCol, the tail starts with UseDFormat.
    EXPECT_EQ(head.rfind("<xs:attribute "), head.find("<xs:attribute name=\"DateCol\""));
    EXPECT_EQ(tail.find("<xs:attribute "), tail.find("<xs:attribute name=\"UseDFormat\""));
    EXPECT_NE(tail.find("<xs:attribute "), std::string::npos);
    // A document each schema accepts proves that both compile.
    CXmlTemplateDoc document;
    ASSERT_TRUE(document.InitDocument());
    ASSERT_TRUE(document.LoadFile(WriteTemplate(kSaveAttributes)));
    std::string error = "untouched";
    EXPECT_TRUE(document.ValidateSchema(Message(101), error));
    EXPECT_TRUE(document.ValidateSchema(head + tail, error));
    EXPECT_EQ(error, "untouched");
    // The short schema refuses an attribute of the open template, with the reason.
    ASSERT_TRUE(document.LoadFile(WriteTemplate(std::string(kSaveAttributes) + "ExcelSheet=\"1\" ")));
    EXPECT_FALSE(document.ValidateSchema(Message(101), error));
    EXPECT_EQ(error.rfind("XML Document is invalid.\n\nReason:\n", 0), 0u) << error;
    EXPECT_NE(error.find("ExcelSheet"), std::string::npos) << error;
}

TEST_F(Templates, OpenTemplateReadsEveryAttributeByItsRule)
{
    const std::string path = WriteTemplate(
        "ExcelSheet=\"2,4\" DataTimeType=\"1\" DateTimeCol=\"3\" UseDTFormat=\"1\" "
        "DateTimeFormat=\"'YYYY'\" GlobalDate=\"2021-05-06\" TimeCol=\"2\" UseTFormat=\"true\" "
        "GlobalTime=\"07:08:09\" TimeFormat=\"HH:mm'\" DateCol=\"5\" UseDFormat=\"false\" "
        "DateFormat=\"''DD.MM''\" UseUnitTypeRow=\"false\" GlobalUnitType=\"Rainfall\" UnitTypeRow=\"9\" "
        "UseUnitRow=\"true\" GlobalUnit=\"mm\" UnitRow=\"1\" UseValueTypeRow=\"true\" "
        "GlobalValueType=\"Accumulated\" ValueTypeRow=\"2\" ItemDescriptionRow=\"3\" StartRow=\"4\" "
        "UseDelValNotEmpty=\"true\" UseDeleteValueRow=\"false\" DeleteValue=\"-99.5\" DeleteValueRow=\"7\" "
        "UseUnitTypeOption=\"2\" UseUnitOption=\"-5\" UseValueTypeOption=\"0\" UseItemTitleOption=\"1\" "
        "SelItems=\"1,3\" ");
    OpenSpecification r;
    std::string error;
    ASSERT_TRUE(LoadOpen(path, r, error)) << error;
    EXPECT_EQ(r.ExcelSheet, "2,4");
    EXPECT_EQ(r.DataTimeType, 1);
    EXPECT_EQ(r.DateTimeCol, 3);
    EXPECT_EQ(r.UseDTFormat, 0);  // "1" is no "true"
    EXPECT_EQ(r.DateTimeFormat, "\"YYYY\"");
    EXPECT_EQ(r.GlobalDate, "2021-05-06");
    EXPECT_EQ(r.TimeCol, 2);
    EXPECT_EQ(r.UseTFormat, 1);
    EXPECT_EQ(r.GlobalTime, "07:08:09");
    EXPECT_EQ(r.TimeFormat, "HH:mm'");  // a quote only at the end stays
    EXPECT_EQ(r.DateCol, 5);
    EXPECT_EQ(r.UseDFormat, 0);
    EXPECT_EQ(r.DateFormat, "\"DD.MM\"");
    EXPECT_EQ(r.UseUnitTypeRow, 0);
    EXPECT_EQ(r.GlobalUnitType, "Rainfall");
    EXPECT_EQ(r.UnitTypeRow, 9);  // free below the data as its flag is off
    EXPECT_EQ(r.UseUnitRow, 1);
    EXPECT_EQ(r.GlobalUnit, "mm");
    EXPECT_EQ(r.UnitRow, 1);
    EXPECT_EQ(r.UseValueTypeRow, 1);
    EXPECT_EQ(r.GlobalValueType, "Accumulated");
    EXPECT_EQ(r.ValueTypeRow, 2);
    EXPECT_EQ(r.ItemDescriptionRow, 3);
    EXPECT_EQ(r.StartRow, 4);
    EXPECT_EQ(r.UseDelValNotEmpty, 1);
    EXPECT_EQ(r.UseDeleteValueRow, 0);
    EXPECT_EQ(r.DeleteValue, "-99.5");
    EXPECT_EQ(r.DeleteValueRow, 7);
    EXPECT_EQ(r.UseUnitTypeOption, 2);
    EXPECT_EQ(r.UseUnitOption, -5);
    EXPECT_EQ(r.UseValueTypeOption, 0);
    EXPECT_EQ(r.UseItemTitleOption, 1);
    EXPECT_EQ(spec_.SelItems, "1,3");
    EXPECT_TRUE(spec_.ItemTitles.empty());
}

TEST_F(Templates, OpenTemplateWithOnlyTheDatesTakesDefaultsAndTheExtensionLists)
{
    OpenSpecification r;
    std::string error;
    ASSERT_TRUE(LoadOpen(WriteTemplate(kDates,
                                       "\n  <MSExcelVantrelSpecificationExtension>\n"
                                       "    <ItemTitles><ItemTitle> Gauge A </ItemTitle><!-- c -->\n"
                                       "      <ItemTitle>Gauge B</ItemTitle><ItemTitle/></ItemTitles>\n"
                                       "    <ItemUnits><ItemUnit>mm</ItemUnit></ItemUnits>\n"
                                       "    <ValueTypes><ValueType>Accumulated</ValueType>"
                                       "<ValueType>5</ValueType></ValueTypes>\n"
                                       "  </MSExcelVantrelSpecificationExtension>\n"),
                         r, error))
        << error;
    const OpenSpecification defaults;
    EXPECT_EQ(r.ExcelSheet, defaults.ExcelSheet);
    EXPECT_EQ(r.DateTimeFormat, defaults.DateTimeFormat);
    EXPECT_EQ(r.StartRow, defaults.StartRow);
    EXPECT_EQ(r.DeleteValue, "Error");
    EXPECT_EQ(spec_.ItemTitles, (std::vector<std::string>{"Gauge A", "Gauge B", ""}));
    EXPECT_TRUE(spec_.ItemTypes.empty());
    EXPECT_EQ(spec_.ItemUnits, (std::vector<std::string>{"mm"}));
    EXPECT_EQ(spec_.ValueTypes, (std::vector<std::string>{"Accumulated", "5"}));
    EXPECT_EQ(spec_.SelItems, "");
    std::string text;
    spec_.OpenSpecificationToString(r, text);
    EXPECT_EQ(text, "DateTimeCol=1;StartRow=3;UnitTypeRow=1;UnitRow=1;ValueTypeRow=1;"
                    "ItemDescriptionRow=2;ExcelSheet=1;");
}

TEST_F(Templates, OpenTemplateFailuresCarryTheirMessages)
{
    struct Case {
        std::string text;  // whole file
        int message;
    };
    const std::string h = kHeader;
    const Case cases[] = {
        // Defaults of the two dates don't parse.
        {h + "StartRow=\"5\" />", 143},
        {h + "GlobalDate=\"2020-01-02\" />", 143},
        // Well formed dates of another form fail the schema.
        {h + "GlobalDate=\"01/02/2020\" GlobalTime=\"12:30:00\" />", 134},
        {h + kDates + "DeleteValue=\"none\" />", 134},
        {h + kDates + "UseDTFormat=\"yes\" />", 134},
        {h + kDates + "StartRow=\"x\" />", 134},
        {h + kDates + "Unknown=\"1\" />", 134},
        {h + kDates + "><Other/></MSExcelVantrelSpecification>", 134},
        {"<?xml version=\"1.0\"?><Other " + std::string(kDates) + "/>", 134},
        // Rows out of order.
        {h + kDates + "UnitTypeRow=\"3\" />", 143},
        {h + kDates + "ItemDescriptionRow=\"1\" />", 143},
        {h + kDates + "ItemDescriptionRow=\"3\" StartRow=\"3\" />", 143},
        // Not a document.
        {"this is no xml", 135},
        {h + kDates, 135},
        {"", 135},
    };
    for (const Case &c : cases) {
        OpenSpecification r;
        std::string error = "untouched";
        EXPECT_FALSE(LoadOpen(Write("case.xml", c.text), r, error)) << c.text;
        EXPECT_EQ(error, Message(c.message)) << c.text;
    }
    OpenSpecification r;
    std::string error;
    EXPECT_FALSE(LoadOpen(dir_.File("missing.xml"), r, error));
    EXPECT_EQ(error, Message(135));
    EXPECT_FALSE(LoadOpen(dir_.Path().string(), r, error));
    EXPECT_EQ(error, Message(135));
}

TEST_F(Templates, OpenRowChecksFollowFlagsAndTheTitleOption)
{
    OpenSpecification r;
    std::string error;
    // A header row whose flag is off may lie anywhere.
    EXPECT_TRUE(LoadOpen(WriteTemplate(std::string(kDates) +
                                       "UseUnitTypeRow=\"false\" UnitTypeRow=\"9\" UseUnitRow=\"false\" "
                                       "UnitRow=\"2\" "),
                         r, error))
        << error;
    r = OpenSpecification();
    EXPECT_TRUE(LoadOpen(WriteTemplate(std::string(kDates) + "UseUnitTypeRow=\"false\" UnitTypeRow=\"2\" "),
                         r, error));
    // The title option frees the title row, not the header rows.
    r = OpenSpecification();
    EXPECT_TRUE(LoadOpen(WriteTemplate(std::string(kDates) + "UseItemTitleOption=\"1\" ItemDescriptionRow=\"1\" "),
                         r, error));
    r = OpenSpecification();
    EXPECT_TRUE(LoadOpen(WriteTemplate(std::string(kDates) + "UseItemTitleOption=\"1\" ItemDescriptionRow=\"30\" "),
                         r, error));
    r = OpenSpecification();
    EXPECT_FALSE(LoadOpen(WriteTemplate(std::string(kDates) + "UseItemTitleOption=\"1\" ValueTypeRow=\"3\" "),
                          r, error));
    // A save template never loads as an open one: it has no dates.
    r = OpenSpecification();
    EXPECT_FALSE(LoadOpen(WriteTemplate(kSaveAttributes), r, error));
    EXPECT_EQ(error, Message(143));
}

TEST_F(Templates, SaveTemplateLoadsReadsItsChainAndChecksRows)
{
    CSpecification spec;
    SaveSpecification r;
    std::string error = "untouched";
    ASSERT_TRUE(spec.LoadSaveTemplate(WriteTemplate(kSaveAttributes), r, error)) << error;
    EXPECT_EQ(error, "untouched");
    EXPECT_EQ(r.DateTimeCol, 2);
    EXPECT_EQ(r.UseDTFormat, 1);
    EXPECT_EQ(r.DateTimeFormat, "YYYY-MM-DD HH:mm");
    EXPECT_EQ(r.UnitTypeRow, 1);
    EXPECT_EQ(r.UnitRow, 2);
    EXPECT_EQ(r.ValueTypeRow, 3);
    EXPECT_EQ(r.ItemDescriptionRow, 4);
    EXPECT_EQ(r.StartRow, 6);
    EXPECT_EQ(r.UseDelValNotEmpty, 1);
    EXPECT_EQ(r.DeleteValueRow, 5);
    std::string text;
    spec.SaveSpecificationToString(r, text);
    EXPECT_EQ(text, "DateTimeCol=2;DateTimeFormat=YYYY-MM-DD HH:mm;StartRow=6;UnitTypeRow=1;UnitRow=2;"
                    "ValueTypeRow=3;ItemDescriptionRow=4;DelValRow=5;");

    // Without UnitRow the chain stops there: the later fields keep their
    // defaults though the file gives them; quotes of a format stay as written.
    SaveSpecification partial;
    ASSERT_TRUE(CSpecification().LoadSaveTemplate(
        WriteTemplate("DateTimeCol=\"4\" DateTimeFormat=\"'x'\" UnitTypeRow=\"1\" ValueTypeRow=\"9\" "
                      "ItemDescriptionRow=\"8\" StartRow=\"10\" UseDelValNotEmpty=\"true\" DeleteValueRow=\"7\" "),
        partial, error));
    EXPECT_EQ(partial.DateTimeCol, 4);
    EXPECT_EQ(partial.DateTimeFormat, "'x'");
    const SaveSpecification defaults;
    EXPECT_EQ(partial.ValueTypeRow, defaults.ValueTypeRow);
    EXPECT_EQ(partial.ItemDescriptionRow, defaults.ItemDescriptionRow);
    EXPECT_EQ(partial.StartRow, defaults.StartRow);
    EXPECT_EQ(partial.UseDelValNotEmpty, defaults.UseDelValNotEmpty);
    EXPECT_EQ(partial.DeleteValueRow, defaults.DeleteValueRow);

    // Without DateTimeCol nothing is read.
    SaveSpecification none;
    ASSERT_TRUE(CSpecification().LoadSaveTemplate(WriteTemplate("StartRow=\"9\" UseDTFormat=\"true\" "), none,
                                                  error));
    EXPECT_EQ(none.StartRow, 3);
    EXPECT_EQ(none.UseDTFormat, 0);
}

TEST_F(Templates, SaveTemplateFailuresCarryTheirMessages)
{
    struct Case {
        std::string attributes;
        int message;
    };
    const std::string base = "DateTimeCol=\"1\" ";
    const Case cases[] = {
        // An open template's attribute has no place in the short schema.
        {std::string(kDates), 134},
        {"ExcelSheet=\"1\" ", 134},
        {base + "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"1\" StartRow=\"3\" ", 116},
        {base + "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"4\" ItemDescriptionRow=\"2\" StartRow=\"3\" ", 115},
        {base + "UnitTypeRow=\"0\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" ", 137},
        // 137 then 115: the later message wins.
        {base + "UnitTypeRow=\"-1\" UnitRow=\"5\" ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\" ", 115},
        // Below 1 suppresses the title test: no 116 after 137.
        {base + "UnitTypeRow=\"1\" UnitRow=\"1\" ValueTypeRow=\"1\" ItemDescriptionRow=\"1\" StartRow=\"0\" ", 115},
        {base + "UnitTypeRow=\"0\" UnitRow=\"0\" ValueTypeRow=\"0\" ItemDescriptionRow=\"0\" StartRow=\"3\" ", 137},
    };
    for (const Case &c : cases) {
        SaveSpecification r;
        std::string error;
        EXPECT_FALSE(CSpecification().LoadSaveTemplate(WriteTemplate(c.attributes), r, error)) << c.attributes;
        EXPECT_EQ(error, Message(c.message)) << c.attributes;
    }
}

TEST_F(Templates, ParserLoadsNoDocumentTypeEntityOrOtherFile)
{
    const std::string secret = Write("secret.txt", "StartRow");
    const std::string h = "<?xml version=\"1.0\"?>\n";
    const std::string root = "<MSExcelVantrelSpecification DateTimeCol=\"1\" UnitTypeRow=\"1\" UnitRow=\"1\" "
                             "ValueTypeRow=\"1\" ItemDescriptionRow=\"2\" StartRow=\"3\"";
    const std::string lol = "<!ENTITY a \"aaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaaa\">"
                            "<!ENTITY b \"&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;&a;\">"
                            "<!ENTITY c \"&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;&b;\">"
                            "<!ENTITY d \"&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;&c;\">"
                            "<!ENTITY e \"&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;&d;\">"
                            "<!ENTITY f \"&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;&e;\">";
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
        SaveSpecification save;
        std::string error;
        EXPECT_FALSE(CSpecification().LoadSaveTemplate(Write("doctype.xml", text), save, error)) << text;
        EXPECT_EQ(error, Message(135)) << text;
        OpenSpecification open;
        EXPECT_FALSE(LoadOpen(Write("doctype.xml", text), open, error));
        EXPECT_EQ(error, Message(135));
        EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(2));
    }
    // An inclusion element is no inclusion: it is an unknown child.
    SaveSpecification save;
    std::string error;
    EXPECT_FALSE(CSpecification().LoadSaveTemplate(
        Write("xi.xml", h + root + " xmlns:xi=\"http://www.w3.org/2001/XInclude\"><xi:include href=\"" + secret +
                            "\" parse=\"text\"/></MSExcelVantrelSpecification>"),
        save, error));
    EXPECT_EQ(error, Message(134));
}

}  // namespace
