// SPDX-License-Identifier: MIT
#include "ooxml/new_package.h"

#include "ooxml/shared_strings.h"
#include "package/content_types.h"
#include "package/relationships.h"
#include "styles/styles.h"
#include "xml/namespaces.h"

namespace workbook {

std::vector<std::pair<std::string, std::string>> NewWorkbookParts()
{
    std::string mainNs(ns::kMain);
    std::string relNs(ns::kRel);
    std::vector<std::pair<std::string, std::string>> parts;
    parts.emplace_back(kContentTypesPart,
                       ContentTypes::Compose({{"xl/workbook.xml", content_type::kWorkbook},
                                              {"xl/worksheets/sheet1.xml", content_type::kWorksheet},
                                              {"xl/styles.xml", content_type::kStyles},
                                              {"xl/sharedStrings.xml", content_type::kSharedStrings}}));
    parts.emplace_back("_rels/.rels", Relationships::Compose({{"rId1", kOfficeDocument, "xl/workbook.xml", false}}));
    parts.emplace_back("xl/workbook.xml",
                       std::string(kXmlHead) + "<workbook xmlns=\"" + mainNs + "\" xmlns:r=\"" + relNs +
                           "\"><bookViews><workbookView/></bookViews><sheets>"
                           "<sheet name=\"Sheet1\" sheetId=\"1\" r:id=\"rId1\"/></sheets></workbook>");
    parts.emplace_back("xl/_rels/workbook.xml.rels",
                       Relationships::Compose({{"rId1", RelType("worksheet"), "worksheets/sheet1.xml", false},
                                               {"rId2", RelType("styles"), "styles.xml", false},
                                               {"rId3", RelType("sharedStrings"), "sharedStrings.xml", false}}));
    parts.emplace_back("xl/worksheets/sheet1.xml",
                       std::string(kXmlHead) + "<worksheet xmlns=\"" + mainNs + "\" xmlns:r=\"" + relNs +
                           "\"><dimension ref=\"A1\"/><sheetViews><sheetView workbookViewId=\"0\"/>"
                           "</sheetViews><sheetFormatPr defaultRowHeight=\"15\"/><sheetData/>"
                           "<pageMargins left=\"0.7\" right=\"0.7\" top=\"0.75\" bottom=\"0.75\" "
                           "header=\"0.3\" footer=\"0.3\"/></worksheet>");
    parts.emplace_back("xl/styles.xml", Styles::Default().Compose(mainNs));
    parts.emplace_back("xl/sharedStrings.xml", SharedStrings::Compose(mainNs, {}));
    return parts;
}

}  // namespace workbook
