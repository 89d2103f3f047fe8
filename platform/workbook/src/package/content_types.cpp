// SPDX-License-Identifier: MIT
#include "package/content_types.h"

#include <strings.h>

#include "xml/xml_text.h"

namespace workbook {
namespace {

constexpr const char *kTypesNs = "http://schemas.openxmlformats.org/package/2006/content-types";

class TypesReader : public xml::ChildSpanReader {
public:
    std::vector<std::string> overrides;

private:
    bool TakeChild(const xml::Name &name, const xml::Attributes &attrs) override
    {
        const char *part = attrs.Find("PartName");
        if (name.local != "Override" || !part) return false;
        std::string_view p(part);
        if (!p.empty() && p[0] == '/') p.remove_prefix(1);
        overrides.emplace_back(p);
        return true;
    }
};

std::string OverrideXml(std::string_view prefix, std::string_view part, std::string_view type)
{
    std::string out = "<" + xml::Qualified(prefix, "Override") + " PartName=\"/";
    xml::AppendEscaped(out, part);
    out += "\" ContentType=\"";
    xml::AppendEscaped(out, type);
    out += "\"/>";
    return out;
}

}  // namespace

ContentTypes ContentTypes::Parse(std::string_view text)
{
    TypesReader reader;
    xml::ParseWhole(reader, text, std::string("part '") + kContentTypesPart + "'");
    ContentTypes t;
    t.overrides_ = std::move(reader.overrides);
    t.spans_ = std::move(reader.spans);
    t.root_ = reader.Root();
    return t;
}

bool ContentTypes::HasOverride(std::string_view part) const
{
    for (const auto &o : overrides_)
        if (o.size() == part.size() && strncasecmp(o.data(), part.data(), part.size()) == 0) return true;
    return false;
}

std::string ContentTypes::WithOverride(std::string_view text, std::string_view part,
                                       std::string_view contentType) const
{
    return xml::InsertBeforeRootEnd(text, root_, OverrideXml(root_.prefix, part, contentType));
}

std::string ContentTypes::WithoutOverrides(std::string_view text, const std::set<std::string> &parts) const
{
    auto listed = [&](const std::string &o) {
        for (const auto &p : parts)
            if (p.size() == o.size() && strncasecmp(p.data(), o.data(), o.size()) == 0) return true;
        return false;
    };
    std::string out;
    uint64_t pos = 0;
    for (size_t i = 0; i < overrides_.size(); ++i) {
        if (!listed(overrides_[i])) continue;
        out.append(text.substr(pos, spans_[i].begin - pos));
        pos = spans_[i].end;
    }
    out.append(text.substr(pos));
    return out;
}

std::string ContentTypes::Compose(const std::vector<std::pair<std::string, std::string>> &overrides)
{
    std::string out = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n<Types xmlns=\"";
    out += kTypesNs;
    out += "\"><Default Extension=\"rels\" ContentType=\"";
    out += content_type::kRels;
    out += "\"/><Default Extension=\"xml\" ContentType=\"";
    out += content_type::kXml;
    out += "\"/>";
    for (const auto &[part, type] : overrides) out += OverrideXml("", part, type);
    out += "</Types>";
    return out;
}

}  // namespace workbook
