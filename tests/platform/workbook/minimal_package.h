// SPDX-License-Identifier: MIT
// A one-sheet workbook package written by hand, part by part, so that a test
// or a fuzz target can change any one part of an otherwise sound package.
#pragma once

#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "package/zip_writer.h"

namespace engine_test {

using Parts = std::vector<std::pair<std::string, std::string>>;

constexpr const char *kMainNs = "http://schemas.openxmlformats.org/spreadsheetml/2006/main";
constexpr const char *kRelNs = "http://schemas.openxmlformats.org/officeDocument/2006/relationships";

// The zip file's bytes, the parts in order.
inline std::string PackageBytes(const Parts &parts)
{
    workbook::ZipBuilder zip;
    for (const auto &[name, bytes] : parts) zip.AddBytes(name, bytes);
    return zip.Finish();
}

inline void WriteZip(const std::string &path, const Parts &parts)
{
    std::ofstream(path, std::ios::binary | std::ios::trunc) << PackageBytes(parts);
}

// The package with the given sheet body (what stands inside <worksheet>) and,
// when given, shared strings and styles parts.
inline Parts MinimalPackage(const std::string &sheetBody, const std::string &sharedStrings = {},
                            const std::string &styles = {})
{
    const std::string xml = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>";
    const std::string relsNs = "http://schemas.openxmlformats.org/package/2006/relationships";
    const auto relationship = [](const std::string &id, const std::string &type, const std::string &target) {
        return "<Relationship Id=\"" + id + "\" Type=\"" + kRelNs + "/" + type + "\" Target=\"" + target + "\"/>";
    };
    std::string wbRels = xml + "<Relationships xmlns=\"" + relsNs + "\">" +
                         relationship("rId1", "worksheet", "worksheets/sheet1.xml");
    if (!sharedStrings.empty()) wbRels += relationship("rId2", "sharedStrings", "sharedStrings.xml");
    if (!styles.empty()) wbRels += relationship("rId3", "styles", "styles.xml");
    Parts parts{
        {"[Content_Types].xml",
         xml + "<Types xmlns=\"http://schemas.openxmlformats.org/package/2006/content-types\">"
               "<Default Extension=\"rels\" ContentType=\"application/vnd.openxmlformats-package.relationships+xml\"/>"
               "<Default Extension=\"xml\" ContentType=\"application/xml\"/>"
               "<Override PartName=\"/xl/workbook.xml\" "
               "ContentType=\"application/vnd.openxmlformats-officedocument.spreadsheetml.sheet.main+xml\"/>"
               "<Override PartName=\"/xl/worksheets/sheet1.xml\" "
               "ContentType=\"application/vnd.openxmlformats-officedocument.spreadsheetml.worksheet+xml\"/></Types>"},
        {"_rels/.rels", xml + "<Relationships xmlns=\"" + relsNs + "\">" +
                            relationship("rId1", "officeDocument", "xl/workbook.xml") + "</Relationships>"},
        {"xl/workbook.xml", xml + "<workbook xmlns=\"" + kMainNs + "\" xmlns:r=\"" + kRelNs +
                                "\"><sheets><sheet name=\"Data\" sheetId=\"1\" r:id=\"rId1\"/></sheets></workbook>"},
        {"xl/_rels/workbook.xml.rels", wbRels + "</Relationships>"},
        {"xl/worksheets/sheet1.xml", xml + "<worksheet xmlns=\"" + kMainNs + "\">" + sheetBody + "</worksheet>"}};
    if (!sharedStrings.empty()) parts.emplace_back("xl/sharedStrings.xml", sharedStrings);
    if (!styles.empty()) parts.emplace_back("xl/styles.xml", styles);
    return parts;
}

inline Parts Replace(Parts parts, const std::string &name, const std::string &bytes)
{
    for (auto &p : parts)
        if (p.first == name) p.second = bytes;
    return parts;
}

inline Parts Without(const Parts &parts, const std::string &name)
{
    Parts kept;
    for (const auto &p : parts)
        if (p.first != name) kept.push_back(p);
    return kept;
}

// The bytes of part name, or "" when the package lacks it.
inline std::string PartOf(const Parts &parts, const std::string &name)
{
    for (const auto &p : parts)
        if (p.first == name) return p.second;
    return {};
}

// The package with the first `from` in part name changed to `to`.
inline Parts Edit(const Parts &parts, const std::string &name, const std::string &from, const std::string &to)
{
    std::string bytes = PartOf(parts, name);
    bytes.replace(bytes.find(from), from.size(), to);
    return Replace(parts, name, bytes);
}

}  // namespace engine_test
