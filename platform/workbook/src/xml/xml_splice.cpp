// SPDX-License-Identifier: MIT
#include "xml/xml_splice.h"

#include "errors.h"
#include "xml/xml_text.h"

namespace workbook::xml {

std::string Qualified(std::string_view prefix, std::string_view local)
{
    std::string q;
    if (!prefix.empty()) {
        q += prefix;
        q += ':';
    }
    q += local;
    return q;
}

std::string InsertBeforeRootEnd(std::string_view xml, const RootShape &root,
                                std::string_view children)
{
    std::string out;
    out.reserve(xml.size() + children.size() + 64);
    if (root.end.Found()) {
        out.append(xml.substr(0, root.end.begin));
        out.append(children);
        out.append(xml.substr(root.end.begin));
        return out;
    }
    // <root .../>: open it, add the children, close it.
    std::string_view tag = xml.substr(root.start.begin, root.start.end - root.start.begin);
    size_t slash = tag.rfind('/');
    if (slash == std::string_view::npos) Fail(kBadFile, "unexpected root element shape");
    out.append(xml.substr(0, root.start.begin));
    out.append(tag.substr(0, slash));
    out += '>';
    out.append(children);
    out += "</" + Qualified(root.prefix, root.local) + ">";
    out.append(xml.substr(root.start.end));
    return out;
}

std::string WithAttribute(std::string_view tag, std::string_view name, std::string_view value)
{
    std::string escaped;
    AppendEscaped(escaped, value);
    // Look for name="..." or name='...' preceded by white space.
    for (size_t pos = 0; (pos = tag.find(name, pos)) != std::string_view::npos; pos += name.size()) {
        if (pos == 0 || !(tag[pos - 1] == ' ' || tag[pos - 1] == '\t' || tag[pos - 1] == '\n' ||
                          tag[pos - 1] == '\r'))
            continue;
        size_t eq = pos + name.size();
        while (eq < tag.size() && (tag[eq] == ' ' || tag[eq] == '\t' || tag[eq] == '\n' || tag[eq] == '\r')) ++eq;
        if (eq >= tag.size() || tag[eq] != '=') continue;
        size_t q = eq + 1;
        while (q < tag.size() && (tag[q] == ' ' || tag[q] == '\t' || tag[q] == '\n' || tag[q] == '\r')) ++q;
        if (q >= tag.size() || (tag[q] != '"' && tag[q] != '\'')) continue;
        size_t close = tag.find(tag[q], q + 1);
        if (close == std::string_view::npos) break;
        std::string out(tag.substr(0, q + 1));
        out += escaped;
        out.append(tag.substr(close));
        return out;
    }
    size_t end = tag.size() - 1;  // the '>'
    if (end > 0 && tag[end - 1] == '/') --end;
    std::string out(tag.substr(0, end));
    out += ' ';
    out += name;
    out += "=\"" + escaped + "\"";
    out.append(tag.substr(end));
    return out;
}

}  // namespace workbook::xml
