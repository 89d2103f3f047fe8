// SPDX-License-Identifier: MIT
#include "workbook_part.h"

#include "errors.h"
#include "namespaces.h"
#include "workbook/limits.h"
#include "xml_splice.h"

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

}  // namespace

WorkbookPart WorkbookPart::Parse(std::string_view text, const std::string &partName)
{
    WorkbookReader reader;
    xml::ParseWhole(reader, text, "part '" + partName + "'");
    if (reader.part.mainNs.empty()) Fail(kBadFile, "the workbook part has no workbook element");
    return std::move(reader.part);
}

}  // namespace workbook
