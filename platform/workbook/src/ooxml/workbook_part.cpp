// SPDX-License-Identifier: MIT
#include "ooxml/workbook_part.h"

#include <algorithm>
#include <iterator>

#include "errors.h"
#include "workbook/limits.h"
#include "xml/namespaces.h"
#include "xml/xml_splice.h"

namespace workbook {
namespace {

bool IsTrue(const char *v)
{
    std::string_view s(v ? v : "");
    return s == "1" || s == "true";
}

class WorkbookReader : public xml::ShapeTracker {
public:
    WorkbookPart part;

    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override
    {
        TrackStart(name);
        if (Depth() == 1) {
            if (name.local != "workbook" || !ns::IsMain(name.ns))
                throw automation::ComError(kBadFile, "the workbook part has no workbook element");
            part.mainNs = std::string(name.ns);
            return;
        }
        if (!ns::IsMain(name.ns)) return;
        if (Depth() == 2 && name.local == "workbookPr") {
            part.date1904 = IsTrue(attrs.Find("date1904"));
        } else if (Depth() == 3 && name.local == "sheet") {
            const char *sheetName = attrs.Find("name");
            const char *id = attrs.FindNs("id", ns::IsRel);
            const char *state = attrs.Find("state");
            if (!sheetName || !id)
                throw automation::ComError(kBadFile, "a sheet of the workbook has no name or no id");
            if (part.sheets.size() >= limits::kMaxSheets)
                throw automation::ComError(kBadFile, "the workbook lists too many sheets");
            part.sheets.push_back({sheetName, id, state ? state : "visible"});
        }
    }
    void OnEnd(const xml::Name &) override { TrackEnd(); }
};

// Where calcPr stands, or where it would go: before the first element that
// follows it in a workbook, else at the root's end.
class CalcSettingsFinder : public xml::ShapeTracker {
public:
    xml::Span calcPr;
    uint64_t insertAt = 0;

    void OnStart(const xml::Name &name, const xml::Attributes &) override
    {
        TrackStart(name);
        if (Depth() != 2 || !ns::IsMain(name.ns)) return;
        static constexpr std::string_view kFollowers[] = {
            "oleSize",      "customWorkbookViews", "pivotCaches",       "smartTagPr", "smartTagTypes",
            "webPublishing", "fileRecoveryPr",     "webPublishObjects", "extLst"};
        if (name.local == "calcPr" && !calcPr.Found()) calcPr = parser_->CurrentTag();
        else if (insertAt == 0 && std::find(std::begin(kFollowers), std::end(kFollowers), name.local) != std::end(kFollowers))
            insertAt = parser_->CurrentTag().begin;
    }
    void OnEnd(const xml::Name &) override { TrackEnd(); }
};

}  // namespace

std::string WithFullCalcOnLoad(std::string_view text, const std::string &partName)
{
    CalcSettingsFinder finder;
    xml::ParseWhole(finder, text, "part '" + partName + "'");
    std::string out;
    if (finder.calcPr.Found()) {
        const xml::Span tag = finder.calcPr;
        out.append(text.substr(0, tag.begin));
        out += xml::WithAttribute(text.substr(tag.begin, tag.end - tag.begin), "fullCalcOnLoad", "1");
        out.append(text.substr(tag.end));
        return out;
    }
    const xml::RootShape &root = finder.Root();
    const std::string element = "<" + xml::Qualified(root.prefix, "calcPr") + " fullCalcOnLoad=\"1\"/>";
    if (finder.insertAt == 0) return xml::InsertBeforeRootEnd(text, root, element);
    out.append(text.substr(0, finder.insertAt));
    out += element;
    out.append(text.substr(finder.insertAt));
    return out;
}

WorkbookPart WorkbookPart::Parse(std::string_view text, const std::string &partName)
{
    WorkbookReader reader;
    xml::ParseWhole(reader, text, "part '" + partName + "'");
    if (reader.part.mainNs.empty()) Fail(kBadFile, "the workbook part has no workbook element");
    return std::move(reader.part);
}

}  // namespace workbook
