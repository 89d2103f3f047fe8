// SPDX-License-Identifier: MIT
#include "package/relationships.h"

#include "errors.h"
#include "package/part_names.h"
#include "xml/xml_text.h"

namespace workbook {
namespace {

constexpr const char *kRelsNs = "http://schemas.openxmlformats.org/package/2006/relationships";

class RelsReader : public xml::ChildSpanReader {
public:
    std::vector<Relationship> items;

private:
    bool TakeChild(const xml::Name &name, const xml::Attributes &attrs) override
    {
        if (name.local != "Relationship") return false;
        const char *id = attrs.Find("Id");
        const char *type = attrs.Find("Type");
        const char *target = attrs.Find("Target");
        const char *mode = attrs.Find("TargetMode");
        if (!id || !type || !target) return false;
        items.push_back({id, type, target, mode && std::string_view(mode) == "External"});
        return true;
    }
};

std::string ItemXml(std::string_view prefix, const Relationship &r)
{
    std::string out = "<" + xml::Qualified(prefix, "Relationship") + " Id=\"";
    xml::AppendEscaped(out, r.id);
    out += "\" Type=\"";
    xml::AppendEscaped(out, r.type);
    out += "\" Target=\"";
    xml::AppendEscaped(out, r.target);
    out += "\"";
    if (r.external) out += " TargetMode=\"External\"";
    out += "/>";
    return out;
}

}  // namespace

Relationships Relationships::Parse(std::string_view text, const std::string &partName)
{
    RelsReader reader;
    xml::ParseWhole(reader, text, "part '" + partName + "'");
    Relationships r;
    r.items_ = std::move(reader.items);
    r.spans_ = std::move(reader.spans);
    r.root_ = reader.Root();
    return r;
}

const Relationship *Relationships::ById(std::string_view id) const
{
    for (const auto &r : items_)
        if (r.id == id) return &r;
    return nullptr;
}

const Relationship *Relationships::ByKind(std::string_view kind) const
{
    for (const auto &r : items_)
        if (RelationshipKind(r.type) == kind) return &r;
    return nullptr;
}

std::string Relationships::NewId() const
{
    for (size_t n = items_.size() + 1;; ++n) {
        std::string id = "rId" + std::to_string(n);
        if (!ById(id)) return id;
    }
}

std::string Relationships::Added(std::string_view text, const Relationship &r) const
{
    return xml::InsertBeforeRootEnd(text, root_, ItemXml(root_.prefix, r));
}

std::string Relationships::Without(std::string_view text, const std::set<std::string> &ids) const
{
    std::string out;
    uint64_t pos = 0;
    for (size_t i = 0; i < items_.size(); ++i) {
        if (!ids.count(items_[i].id)) continue;
        out.append(text.substr(pos, spans_[i].begin - pos));
        pos = spans_[i].end;
    }
    out.append(text.substr(pos));
    return out;
}

std::string Relationships::Compose(const std::vector<Relationship> &items)
{
    std::string out = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n<Relationships xmlns=\"";
    out += kRelsNs;
    out += "\">";
    for (const auto &r : items) out += ItemXml("", r);
    out += "</Relationships>";
    return out;
}

}  // namespace workbook
