// SPDX-License-Identifier: MIT
// Helpers of the workbook engine's tests: files, small packages made on the
// spot, and checks of the automation errors the engine raises.
#pragma once

#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <map>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "automation/com_error.h"
#include "automation/values.h"
#include "expect_hr.h"
#include "temp_dir.h"
#include "workbook/engine.h"
#include <zip.h>

#include "zip_source.h"
#include "zip_writer.h"

namespace engine_test {

using Parts = std::vector<std::pair<std::string, std::string>>;

inline std::string ReadBytes(const std::string &path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

inline void WriteBytes(const std::string &path, const std::string &bytes)
{
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
}

// A zip file holding parts, in order.
inline void WriteZip(const std::string &path, const Parts &parts)
{
    workbook::ZipBuilder zip;
    for (const auto &[name, bytes] : parts) zip.AddBytes(name, bytes);
    WriteBytes(path, zip.Finish());
}

// Every entry of a zip file, inflated.
inline std::map<std::string, std::string> ZipEntries(const std::string &path)
{
    auto source = workbook::PackageSource::OpenFile(path);
    std::map<std::string, std::string> entries;
    for (const auto &name : source->EntryNames()) entries[name] = source->ReadAll(name);
    return entries;
}

constexpr const char *kMainNs = "http://schemas.openxmlformats.org/spreadsheetml/2006/main";
constexpr const char *kRelNs = "http://schemas.openxmlformats.org/officeDocument/2006/relationships";

// A one-sheet package written by hand, with the given sheet XML body (what
// stands inside <worksheet>), and optional shared strings and styles parts.
inline Parts MinimalPackage(const std::string &sheetBody, const std::string &sharedStrings = {},
                            const std::string &styles = {})
{
    std::string types =
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?><Types "
        "xmlns=\"http://schemas.openxmlformats.org/package/2006/content-types\">"
        "<Default Extension=\"rels\" ContentType=\"application/vnd.openxmlformats-package.relationships+xml\"/>"
        "<Default Extension=\"xml\" ContentType=\"application/xml\"/>"
        "<Override PartName=\"/xl/workbook.xml\" "
        "ContentType=\"application/vnd.openxmlformats-officedocument.spreadsheetml.sheet.main+xml\"/>"
        "<Override PartName=\"/xl/worksheets/sheet1.xml\" "
        "ContentType=\"application/vnd.openxmlformats-officedocument.spreadsheetml.worksheet+xml\"/></Types>";
    std::string rels =
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?><Relationships "
        "xmlns=\"http://schemas.openxmlformats.org/package/2006/relationships\"><Relationship Id=\"rId1\" "
        "Type=\"http://schemas.openxmlformats.org/officeDocument/2006/relationships/officeDocument\" "
        "Target=\"xl/workbook.xml\"/></Relationships>";
    std::string workbook = std::string("<?xml version=\"1.0\" encoding=\"UTF-8\"?><workbook xmlns=\"") + kMainNs +
                           "\" xmlns:r=\"" + kRelNs +
                           "\"><sheets><sheet name=\"Data\" sheetId=\"1\" r:id=\"rId1\"/></sheets></workbook>";
    std::string wbRels =
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?><Relationships "
        "xmlns=\"http://schemas.openxmlformats.org/package/2006/relationships\">"
        "<Relationship Id=\"rId1\" Type=\"http://schemas.openxmlformats.org/officeDocument/2006/relationships/worksheet\" "
        "Target=\"worksheets/sheet1.xml\"/>";
    if (!sharedStrings.empty())
        wbRels += "<Relationship Id=\"rId2\" Type=\"http://schemas.openxmlformats.org/officeDocument/2006/"
                  "relationships/sharedStrings\" Target=\"sharedStrings.xml\"/>";
    if (!styles.empty())
        wbRels += "<Relationship Id=\"rId3\" Type=\"http://schemas.openxmlformats.org/officeDocument/2006/"
                  "relationships/styles\" Target=\"styles.xml\"/>";
    wbRels += "</Relationships>";
    std::string sheet = std::string("<?xml version=\"1.0\" encoding=\"UTF-8\"?><worksheet xmlns=\"") + kMainNs +
                        "\">" + sheetBody + "</worksheet>";
    Parts parts{{"[Content_Types].xml", types},
                {"_rels/.rels", rels},
                {"xl/workbook.xml", workbook},
                {"xl/_rels/workbook.xml.rels", wbRels},
                {"xl/worksheets/sheet1.xml", sheet}};
    if (!sharedStrings.empty()) parts.emplace_back("xl/sharedStrings.xml", sharedStrings);
    if (!styles.empty()) parts.emplace_back("xl/styles.xml", styles);
    return parts;
}

// Every entry of a zip file as stored (still compressed).
inline std::map<std::string, std::string> StoredEntries(const std::string &path)
{
    std::map<std::string, std::string> entries;
    zip_t *za = zip_open(path.c_str(), ZIP_RDONLY, nullptr);
    if (!za) return entries;
    for (zip_int64_t i = 0; i < zip_get_num_entries(za, 0); ++i) {
        zip_file_t *f = zip_fopen_index(za, static_cast<zip_uint64_t>(i), ZIP_FL_COMPRESSED);
        if (!f) continue;
        std::string data;
        char buf[65536];
        zip_int64_t n;
        while ((n = zip_fread(f, buf, sizeof buf)) > 0) data.append(buf, static_cast<size_t>(n));
        zip_fclose(f);
        entries[zip_get_name(za, static_cast<zip_uint64_t>(i), 0)] = data;
    }
    zip_discard(za);
    return entries;
}

inline automation::Variant Missing() { return automation::Variant::Missing(); }

inline std::string Utf8(const automation::Variant &v) { return automation::BstrToUtf8(v.Raw().bstrVal); }

}  // namespace engine_test

// Runs statement and expects a ComError with code hr whose text holds part.
#define EXPECT_COM_ERROR(statement, hr, part)                                             \
    do {                                                                                  \
        try {                                                                             \
            statement;                                                                    \
            ADD_FAILURE() << #statement " raised nothing";                                \
        } catch (const automation::ComError &e) {                                         \
            EXPECT_HR(hr, e.Code());                                                      \
            EXPECT_NE(std::string(e.what()).find(part), std::string::npos) << e.what();   \
        }                                                                                 \
    } while (0)
