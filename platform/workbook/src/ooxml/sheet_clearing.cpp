// SPDX-License-Identifier: MIT
#include "ooxml/sheet_clearing.h"

#include <algorithm>
#include <iterator>
#include <vector>

#include "errors.h"
#include "package/part_names.h"
#include "xml/namespaces.h"
#include "xml/xml_splice.h"

namespace workbook {
namespace {

constexpr std::string_view kMarkupCompatibilityNs = "http://schemas.openxmlformats.org/markup-compatibility/2006";

// Children of a worksheet that a cleared sheet doesn't keep.
bool HoldsContent(std::string_view local)
{
    static constexpr std::string_view kContent[] = {
        "cols",        "autoFilter",     "sortState",  "dataConsolidate", "scenarios",  "protectedRanges",
        "mergeCells",  "conditionalFormatting", "dataValidations", "hyperlinks", "ignoredErrors",
        "smartTags",   "cellWatches",    "drawing",    "legacyDrawing",   "oleObjects", "controls",
        "tableParts",  "extLst"};
    return std::find(std::begin(kContent), std::end(kContent), local) != std::end(kContent);
}

bool IsTrue(const char *v)
{
    std::string_view s(v ? v : "");
    return s == "1" || s == "true";
}

class ContentFinder : public xml::ShapeTracker {
public:
    explicit ContentFinder(const std::string &sheetName) : sheetName_(sheetName) {}

    std::vector<xml::Span> spans;  // of the elements to take out, in order
    std::set<std::string> relIds;

    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override
    {
        TrackStart(name);
        if (Depth() == 2) {
            if (ns::IsMain(name.ns) && name.local == "sheetProtection" && IsTrue(attrs.Find("sheet")))
                throw automation::ComError(kRequestRefused,
                                           "sheet '" + sheetName_ +
                                               "' is protected and can't be cleared: unprotect it in a spreadsheet "
                                               "program, save the workbook and try again");
            // Controls and embedded objects come wrapped for older readers.
            taking_ = (ns::IsMain(name.ns) && HoldsContent(name.local)) ||
                      (name.ns == kMarkupCompatibilityNs && name.local == "AlternateContent");
            if (taking_) spans.push_back(parser_->CurrentTag());
        }
        if (!taking_) return;
        for (const char **a = attrs.Raw(); *a; a += 2)
            if (ns::IsRel(xml::Attributes::SplitName(a[0]).ns)) relIds.insert(a[1]);
    }

    void OnEnd(const xml::Name &) override
    {
        if (Depth() == 2 && taking_) {
            if (parser_->CurrentTag().Found()) spans.back().end = parser_->CurrentTag().end;
            taking_ = false;
        }
        TrackEnd();
    }

private:
    const std::string &sheetName_;
    bool taking_ = false;
};

}  // namespace

ClearedSheetPart ClearSheetPart(std::string_view text, const SheetLayout &layout, const std::string &partName,
                                const std::string &sheetName)
{
    // The rows go first, so that the scan below reads only what surrounds them.
    std::string emptied;
    if (layout.sheetData.Found() && layout.sheetData.end <= text.size()) {
        emptied.append(text.substr(0, layout.sheetData.begin));
        emptied += "<" + xml::Qualified(layout.root.prefix, "sheetData") + "/>";
        emptied.append(text.substr(layout.sheetData.end));
    } else {
        emptied.assign(text);
    }
    ContentFinder finder(sheetName);
    xml::ParseWhole(finder, emptied, "part '" + partName + "'");
    ClearedSheetPart out;
    uint64_t pos = 0;
    for (const xml::Span &s : finder.spans) {
        out.text.append(emptied, pos, s.begin - pos);
        pos = s.end;
    }
    out.text.append(emptied, pos);
    out.relIds = std::move(finder.relIds);
    return out;
}

bool GoesWithSheetContent(std::string_view type)
{
    const std::string_view kind = RelationshipKind(type);
    return kind == "comments" || kind == "threadedComment" || kind == "pivotTable";
}

}  // namespace workbook
