// SPDX-License-Identifier: MIT
#include "styles/styles.h"

#include <charconv>
#include <cstring>

#include <strings.h>

#include "errors.h"
#include "styles/format_bridge.h"
#include "workbook/limits.h"
#include "xml/namespaces.h"
#include "xml/xml_text.h"

namespace workbook {
namespace {

uint32_t ToUint(const char *s, uint32_t fallback)
{
    if (!s) return fallback;
    uint32_t v = fallback;
    auto r = std::from_chars(s, s + std::strlen(s), v);
    return r.ec == std::errc() ? v : fallback;
}

// Elements that follow cellXfs in a stylesheet.
bool FollowsCellXfs(std::string_view local)
{
    return local == "cellStyles" || local == "dxfs" || local == "tableStyles" ||
           local == "colors" || local == "extLst";
}

class StylesReader : public xml::ShapeTracker {
public:
    std::map<uint32_t, std::string> formats;
    std::vector<uint32_t> xfNumFmt;
    std::vector<xml::Span> xfSpans;
    xml::Span numFmts, cellXfsStart, cellXfsEnd;
    uint64_t followerAt = 0;

    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override
    {
        TrackStart(name);
        if (!ns::IsMain(name.ns)) return;
        xml::Span tag = parser_->CurrentTag();
        if (Depth() == 2) {
            section_ = name.local;
            if (name.local == "numFmts") numFmts = tag;
            if (name.local == "cellXfs") cellXfsStart = tag;
            if (FollowsCellXfs(name.local) && followerAt == 0) followerAt = tag.begin;
        } else if (Depth() == 3 && section_ == "numFmts" && name.local == "numFmt") {
            const char *id = attrs.Find("numFmtId");
            const char *code = attrs.Find("formatCode");
            if (id && code) formats[ToUint(id, 0)] = code;
        } else if (Depth() == 3 && section_ == "cellXfs" && name.local == "xf") {
            if (xfNumFmt.size() >= limits::kMaxCellFormats)
                throw automation::ComError(kBadFile, "the styles part holds too many cell formats");
            xfNumFmt.push_back(ToUint(attrs.Find("numFmtId"), 0));
            xfSpans.push_back({tag.begin, tag.end});
        }
    }
    void OnEnd(const xml::Name &name) override
    {
        if (ns::IsMain(name.ns)) {
            xml::Span tag = parser_->CurrentTag();
            if (Depth() == 2 && name.local == "numFmts" && tag.Found()) numFmts.end = tag.end;
            if (Depth() == 2 && name.local == "cellXfs") cellXfsEnd = tag;
            if (Depth() == 2) section_.clear();
            if (Depth() == 3 && section_ == "cellXfs" && name.local == "xf" && tag.Found())
                xfSpans.back().end = tag.end;
        }
        TrackEnd();
    }

private:
    std::string section_;
};

}  // namespace

Styles Styles::Parse(std::string_view text, const std::string &partName)
{
    StylesReader reader;
    xml::ParseWhole(reader, text, "part '" + partName + "'");
    Styles s;
    s.hasPart_ = true;
    s.customFormats_ = std::move(reader.formats);
    s.xfNumFmt_ = std::move(reader.xfNumFmt);
    for (const auto &span : reader.xfSpans)
        s.xfXml_.emplace_back(text.substr(span.begin, span.end - span.begin));
    s.xfBase_.assign(s.xfNumFmt_.size(), 0);
    s.partXfCount_ = static_cast<uint32_t>(s.xfNumFmt_.size());
    s.root_ = reader.Root();
    s.numFmts_ = reader.numFmts;
    s.cellXfsStart_ = reader.cellXfsStart;
    s.cellXfsEnd_ = reader.cellXfsEnd;
    s.insertXfsAt_ = reader.followerAt ? reader.followerAt : s.root_.end.begin;
    return s;
}

void Styles::Rebase(std::string_view savedText, const std::string &partName)
{
    Styles saved = Parse(savedText, partName);
    saved.derived_ = std::move(derived_);
    *this = std::move(saved);
}

Styles Styles::Default()
{
    Styles s;
    s.xfNumFmt_.push_back(0);
    s.xfXml_.emplace_back();
    s.xfBase_.push_back(0);
    return s;
}

uint32_t Styles::NumberFormatIdOf(uint32_t xf) const
{
    return xf < xfNumFmt_.size() ? xfNumFmt_[xf] : 0;
}

std::string Styles::NumberFormatOf(uint32_t xf) const
{
    uint32_t id = NumberFormatIdOf(xf);
    auto it = customFormats_.find(id);
    if (it != customFormats_.end()) return it->second;
    if (auto code = format_bridge::BuiltinFormatCode(id)) return *code;
    return "General";
}

bool Styles::IsGeneral(uint32_t xf) const
{
    const std::string code = NumberFormatOf(xf);
    return code.size() == 7 && strncasecmp(code.c_str(), "General", 7) == 0;
}

bool Styles::IsText(uint32_t xf) const { return NumberFormatOf(xf) == "@"; }

uint32_t Styles::WithNumberFormat(uint32_t base, std::string_view code)
{
    if (auto id = format_bridge::BuiltinFormatId(code)) return WithNumberFormatId(base, *id);
    for (const auto &[id, c] : customFormats_)
        if (c == code && id >= kFirstCustomFormatId) return WithNumberFormatId(base, id);
    uint32_t id = kFirstCustomFormatId;
    if (!customFormats_.empty()) id = std::max(id, customFormats_.rbegin()->first + 1);
    customFormats_[id] = std::string(code);
    changed_ = true;
    return WithNumberFormatId(base, id);
}

uint32_t Styles::WithNumberFormatId(uint32_t base, uint32_t numFmtId)
{
    if (base >= xfNumFmt_.size()) base = 0;
    if (xfNumFmt_[base] == numFmtId) return base;
    auto key = std::make_pair(base, numFmtId);
    if (auto it = derived_.find(key); it != derived_.end()) return it->second;
    if (xfNumFmt_.size() >= limits::kMaxCellFormats) Fail(E_OUTOFMEMORY, "too many cell formats");
    uint32_t xf = static_cast<uint32_t>(xfNumFmt_.size());
    xfNumFmt_.push_back(numFmtId);
    xfXml_.emplace_back();
    xfBase_.push_back(base);
    derived_[key] = xf;
    changed_ = true;
    return xf;
}

std::string Styles::XfXml(uint32_t xf, std::string_view prefix) const
{
    std::string id = std::to_string(xfNumFmt_[xf]);
    uint32_t base = xfBase_[xf];
    while (xfXml_[base].empty() && xfBase_[base] != base) base = xfBase_[base];
    if (!xfXml_[base].empty()) {
        // Copy the base format and give it the new number format.
        const std::string &raw = xfXml_[base];
        size_t tagEnd = raw.find('>') + 1;
        std::string tag = xml::WithAttribute(
            xml::WithAttribute(std::string_view(raw).substr(0, tagEnd), "numFmtId", id),
            "applyNumberFormat", "1");
        return tag + raw.substr(tagEnd);
    }
    return "<" + xml::Qualified(prefix, "xf") + " numFmtId=\"" + id +
           "\" fontId=\"0\" fillId=\"0\" borderId=\"0\" xfId=\"0\"" +
           (xfNumFmt_[xf] ? " applyNumberFormat=\"1\"" : "") + "/>";
}

std::string Styles::NumFmtsXml(std::string_view prefix) const
{
    if (customFormats_.empty()) return {};
    std::string out = "<" + xml::Qualified(prefix, "numFmts") + " count=\"" +
                      std::to_string(customFormats_.size()) + "\">";
    for (const auto &[id, code] : customFormats_) {
        out += "<" + xml::Qualified(prefix, "numFmt") + " numFmtId=\"" + std::to_string(id) +
               "\" formatCode=\"";
        xml::AppendEscaped(out, code);
        out += "\"/>";
    }
    out += "</" + xml::Qualified(prefix, "numFmts") + ">";
    return out;
}

std::string Styles::Write(std::string_view text) const
{
    const std::string &p = root_.prefix;
    std::string added;
    for (uint32_t xf = partXfCount_; xf < xfNumFmt_.size(); ++xf) added += XfXml(xf, p);
    std::string count = std::to_string(xfNumFmt_.size());

    std::string out;
    out.reserve(text.size() + added.size() + 256);
    uint64_t pos = 0;
    // numFmts: replaced where it stands, or made the stylesheet's first child.
    if (numFmts_.end > numFmts_.begin) {
        out.append(text.substr(0, numFmts_.begin));
        out += NumFmtsXml(p);
        pos = numFmts_.end;
    } else {
        out.append(text.substr(0, root_.start.end));
        out += NumFmtsXml(p);
        pos = root_.start.end;
    }
    if (cellXfsStart_.Found()) {
        out.append(text.substr(pos, cellXfsStart_.begin - pos));
        std::string_view start = text.substr(cellXfsStart_.begin, cellXfsStart_.end - cellXfsStart_.begin);
        if (cellXfsEnd_.Found()) {
            out += xml::WithAttribute(start, "count", count);
            out.append(text.substr(cellXfsStart_.end, cellXfsEnd_.begin - cellXfsStart_.end));
            out += added;
            pos = cellXfsEnd_.begin;
        } else {  // <cellXfs/>
            std::string open(start.substr(0, start.size() - 2));
            out += xml::WithAttribute(open + ">", "count", count) + added + "</" +
                   xml::Qualified(p, "cellXfs") + ">";
            pos = cellXfsStart_.end;
        }
    } else {
        out.append(text.substr(pos, insertXfsAt_ - pos));
        out += "<" + xml::Qualified(p, "cellXfs") + " count=\"" + count + "\">";
        for (uint32_t xf = 0; xf < xfNumFmt_.size(); ++xf) out += XfXml(xf, p);
        out += "</" + xml::Qualified(p, "cellXfs") + ">";
        pos = insertXfsAt_;
    }
    out.append(text.substr(pos));
    return out;
}

std::string Styles::Compose(std::string_view mainNs) const
{
    std::string out = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n<styleSheet xmlns=\"";
    out += mainNs;
    out += "\">";
    out += NumFmtsXml("");
    out += "<fonts count=\"1\"><font><sz val=\"11\"/><name val=\"Calibri\"/><family val=\"2\"/>"
           "</font></fonts>"
           "<fills count=\"2\"><fill><patternFill patternType=\"none\"/></fill>"
           "<fill><patternFill patternType=\"gray125\"/></fill></fills>"
           "<borders count=\"1\"><border><left/><right/><top/><bottom/><diagonal/></border></borders>"
           "<cellStyleXfs count=\"1\"><xf numFmtId=\"0\" fontId=\"0\" fillId=\"0\" borderId=\"0\"/>"
           "</cellStyleXfs>";
    out += "<cellXfs count=\"" + std::to_string(xfNumFmt_.size()) + "\">";
    for (uint32_t xf = 0; xf < xfNumFmt_.size(); ++xf) out += XfXml(xf, "");
    out += "</cellXfs><cellStyles count=\"1\"><cellStyle name=\"Normal\" xfId=\"0\" builtinId=\"0\"/>"
           "</cellStyles></styleSheet>";
    return out;
}

}  // namespace workbook
