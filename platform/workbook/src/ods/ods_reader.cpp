// SPDX-License-Identifier: MIT
#include "ods/ods_reader.h"

#include "errors.h"
#include "ods/content_reader.h"
#include "ods/ods_styles.h"
#include "ods/ods_xml.h"

namespace workbook::ods {
namespace {

// Hands the common styles of styles.xml to the style collector; the rest of
// that part (page layouts, master pages) says nothing about cells.
class CommonStylesReader : public xml::Handler {
public:
    explicit CommonStylesReader(Styles &styles) : styles_(styles) {}

    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override
    {
        ++depth_;
        if (stylesDepth_) styles_.OnStart(name, attrs);
        else if (Is(name, kOfficeNs, "styles")) stylesDepth_ = depth_;
    }
    void OnEnd(const xml::Name &name) override
    {
        if (depth_ == stylesDepth_) stylesDepth_ = 0;
        else if (stylesDepth_) styles_.OnEnd(name);
        --depth_;
    }
    void OnText(std::string_view text) override
    {
        if (stylesDepth_) styles_.OnText(text);
    }

private:
    Styles &styles_;
    int depth_ = 0, stylesDepth_ = 0;
};

void Stream(const PackageSource &package, const std::string &entry, xml::Handler &handler)
{
    xml::Parser parser(handler, entry);
    package.Read(entry, [&](const char *data, size_t size) { parser.Feed(data, size, false); });
    parser.Feed(nullptr, 0, true);
}

}  // namespace

void ReadSpreadsheet(const PackageSource &package, ConvertedBook &book)
{
    Styles styles;
    if (const std::string entry = package.Find("styles.xml"); !entry.empty()) {
        CommonStylesReader common(styles);
        Stream(package, entry, common);
    }
    const std::string content = package.Find("content.xml");
    if (content.empty()) Fail(kBadFile, "the OpenDocument package has no content.xml");
    ContentReader reader(styles, book);
    Stream(package, content, reader);
}

}  // namespace workbook::ods
