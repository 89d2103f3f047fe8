// SPDX-License-Identifier: MIT
#include "ooxml/shared_strings.h"

#include "errors.h"
#include "workbook/limits.h"
#include "xml/namespaces.h"
#include "xml/xml_text.h"

namespace workbook {
namespace {

class SstReader : public xml::ShapeTracker {
public:
    explicit SstReader(StringPool &pool) : pool_(pool) {}
    uint32_t count = 0;

    void OnStart(const xml::Name &name, const xml::Attributes &) override
    {
        TrackStart(name);
        if (!ns::IsMain(name.ns)) return;
        if (Depth() == 2 && name.local == "si") {
            inItem_ = true;
            text_.clear();
        } else if (inItem_ && name.local == "rPh") {
            ++phonetic_;
        } else if (inItem_ && name.local == "t" && phonetic_ == 0) {
            inText_ = true;
        }
    }
    void OnEnd(const xml::Name &name) override
    {
        if (ns::IsMain(name.ns)) {
            if (Depth() == 2 && name.local == "si") {
                inItem_ = false;
                xml::DecodeCellEscapes(text_);
                pool_.Add(text_);
                ++count;
            } else if (name.local == "rPh" && phonetic_ > 0) {
                --phonetic_;
            } else if (name.local == "t") {
                inText_ = false;
            }
        }
        TrackEnd();
    }
    void OnText(std::string_view s) override
    {
        if (!inText_) return;
        if (text_.size() + s.size() > limits::kMaxCellTextBytes)
            Fail(kBadFile, "shared string " + std::to_string(count) + " is longer than " +
                               std::to_string(limits::kMaxCellTextBytes) + " bytes");
        text_.append(s);
    }

private:
    StringPool &pool_;
    std::string text_;
    bool inItem_ = false;
    bool inText_ = false;
    int phonetic_ = 0;
};

std::string ItemXml(std::string_view prefix, std::string_view text)
{
    std::string out = "<" + xml::Qualified(prefix, "si") + "><" + xml::Qualified(prefix, "t");
    if (!text.empty() && (text.front() == ' ' || text.back() == ' ' || text.front() == '\n' ||
                          text.back() == '\n' || text.front() == '\t' || text.back() == '\t'))
        out += " xml:space=\"preserve\"";
    out += ">";
    xml::AppendCellText(out, text);
    out += "</" + xml::Qualified(prefix, "t") + "></" + xml::Qualified(prefix, "si") + ">";
    return out;
}

}  // namespace

SharedStrings SharedStrings::Parse(std::string_view text, const std::string &partName, StringPool &pool)
{
    SstReader reader(pool);
    xml::ParseWhole(reader, text, "part '" + partName + "'");
    SharedStrings s;
    s.count_ = reader.count;
    s.root_ = reader.Root();
    return s;
}

std::string SharedStrings::WithAdded(std::string_view text, const std::vector<std::string_view> &added) const
{
    std::string items;
    for (auto t : added) items += ItemXml(root_.prefix, t);
    // Bring the counts in the root's start tag up to date, then add the items.
    std::string_view startTag = text.substr(root_.start.begin, root_.start.end - root_.start.begin);
    std::string unique = std::to_string(count_ + added.size());
    std::string tag = xml::WithAttribute(xml::WithAttribute(startTag, "uniqueCount", unique), "count", unique);
    std::string retagged = std::string(text.substr(0, root_.start.begin)) + tag +
                           std::string(text.substr(root_.start.end));
    xml::RootShape shape = root_;
    uint64_t grown = tag.size() - startTag.size();
    shape.start.end += grown;
    if (shape.end.Found()) {
        shape.end.begin += grown;
        shape.end.end += grown;
    }
    return xml::InsertBeforeRootEnd(retagged, shape, items);
}

std::string SharedStrings::Compose(std::string_view mainNs, const std::vector<std::string_view> &items)
{
    std::string n = std::to_string(items.size());
    std::string out = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n<sst xmlns=\"";
    out += mainNs;
    out += "\" count=\"" + n + "\" uniqueCount=\"" + n + "\">";
    for (auto t : items) out += ItemXml("", t);
    out += "</sst>";
    return out;
}

}  // namespace workbook
