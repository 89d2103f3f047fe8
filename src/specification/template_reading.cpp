// SPDX-License-Identifier: MIT
// Reading a template document into a record. Each attribute stands alone: a
// missing one leaves the field's default. Flags are set only by "true".
#include <string>

#include "specification/specification.h"
#include "specification/xml_template_doc.h"

namespace {

constexpr const char kRootPath[] = "//MSExcelVantrelSpecification";
constexpr const char kExtensionPath[] = "//MSExcelVantrelSpecificationExtension";

void ReadText(const CXmlTemplateDoc &document, const char *name, std::string &field)
{
    document.GetAttribute(name, field);
}

void ReadInt(const CXmlTemplateDoc &document, const char *name, int &field)
{
    document.GetAttributeInt(name, field);
}

// "1" passes the schema's boolean but is no "true", so it reads as 0.
void ReadFlag(const CXmlTemplateDoc &document, const char *name, int &field)
{
    std::string text;
    if (document.GetAttribute(name, text)) field = text == "true" ? 1 : 0;
}

// A format that begins with a double quote is written between single quotes,
// as a double quote would end the attribute. Read back, the single quotes at
// both ends become double quotes again.
void ReadFormat(const CXmlTemplateDoc &document, const char *name, std::string &field)
{
    std::string text;
    if (!document.GetAttribute(name, text)) return;
    if (!text.empty() && text.front() == '\'') {
        const auto first = text.find_first_not_of('\'');
        const auto last = text.find_last_not_of('\'');
        const std::string inner = first == std::string::npos ? std::string()
                                                             : text.substr(first, last - first + 1);
        text = '"' + inner + '"';
    }
    field = text;
}

}  // namespace

bool CSpecification::ReadOpenTemplate(CXmlTemplateDoc &document, OpenSpecification &r)
{
    if (!document.SelectRoot(kRootPath)) return false;

    ReadText(document, "ExcelSheet", r.ExcelSheet);
    ReadInt(document, "DataTimeType", r.DataTimeType);
    ReadInt(document, "DateTimeCol", r.DateTimeCol);
    ReadFlag(document, "UseDTFormat", r.UseDTFormat);
    ReadFormat(document, "DateTimeFormat", r.DateTimeFormat);
    ReadText(document, "GlobalDate", r.GlobalDate);
    ReadInt(document, "TimeCol", r.TimeCol);
    ReadFlag(document, "UseTFormat", r.UseTFormat);
    ReadText(document, "GlobalTime", r.GlobalTime);
    ReadFormat(document, "TimeFormat", r.TimeFormat);
    ReadInt(document, "DateCol", r.DateCol);
    ReadFlag(document, "UseDFormat", r.UseDFormat);
    ReadFormat(document, "DateFormat", r.DateFormat);
    ReadFlag(document, "UseUnitTypeRow", r.UseUnitTypeRow);
    ReadText(document, "GlobalUnitType", r.GlobalUnitType);
    ReadInt(document, "UnitTypeRow", r.UnitTypeRow);
    ReadFlag(document, "UseUnitRow", r.UseUnitRow);
    ReadText(document, "GlobalUnit", r.GlobalUnit);
    ReadInt(document, "UnitRow", r.UnitRow);
    ReadFlag(document, "UseValueTypeRow", r.UseValueTypeRow);
    ReadText(document, "GlobalValueType", r.GlobalValueType);
    ReadInt(document, "ValueTypeRow", r.ValueTypeRow);
    ReadInt(document, "ItemDescriptionRow", r.ItemDescriptionRow);
    ReadInt(document, "StartRow", r.StartRow);
    ReadFlag(document, "UseDelValNotEmpty", r.UseDelValNotEmpty);
    ReadFlag(document, "UseDeleteValueRow", r.UseDeleteValueRow);
    ReadText(document, "DeleteValue", r.DeleteValue);
    ReadInt(document, "DeleteValueRow", r.DeleteValueRow);

    ReadInt(document, "UseUnitTypeOption", r.UseUnitTypeOption);
    ReadInt(document, "UseUnitOption", r.UseUnitOption);
    ReadInt(document, "UseValueTypeOption", r.UseValueTypeOption);
    ReadInt(document, "UseItemTitleOption", r.UseItemTitleOption);
    ReadText(document, "SelItems", SelItems);

    _xmlNode *extension = document.SelectNode(kExtensionPath, document.Root());
    if (extension) {
        const std::pair<const char *, std::vector<std::string> *> lists[] = {
            {"//ItemTitles", &ItemTitles},
            {"//ItemTypes", &ItemTypes},
            {"//ItemUnits", &ItemUnits},
            {"//ValueTypes", &ValueTypes},
        };
        for (const auto &[path, list] : lists) {
            _xmlNode *node = document.SelectNode(path, extension);
            if (!node) continue;
            for (std::string &text : CXmlTemplateDoc::ChildTexts(node)) list->push_back(std::move(text));
        }
    }
    return true;
}

bool CSpecification::ReadSaveTemplate(CXmlTemplateDoc &document, SaveSpecification &r) const
{
    // A chain: the first required attribute that is missing ends it, and the
    // fields further on keep their defaults.
    if (!document.SelectRoot(kRootPath)) return false;
    if (!document.GetAttributeInt("DateTimeCol", r.DateTimeCol)) return false;
    ReadFlag(document, "UseDTFormat", r.UseDTFormat);
    ReadText(document, "DateTimeFormat", r.DateTimeFormat);
    if (!document.GetAttributeInt("UnitTypeRow", r.UnitTypeRow)) return false;
    if (!document.GetAttributeInt("UnitRow", r.UnitRow)) return false;
    if (!document.GetAttributeInt("ValueTypeRow", r.ValueTypeRow)) return false;
    if (!document.GetAttributeInt("ItemDescriptionRow", r.ItemDescriptionRow)) return false;
    if (!document.GetAttributeInt("StartRow", r.StartRow)) return false;
    ReadFlag(document, "UseDelValNotEmpty", r.UseDelValNotEmpty);
    ReadInt(document, "DeleteValueRow", r.DeleteValueRow);
    return true;
}
