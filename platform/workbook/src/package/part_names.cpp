// SPDX-License-Identifier: MIT
#include "package/part_names.h"

#include <vector>

#include "errors.h"

namespace workbook {
namespace {

int Hex(char c)
{
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}

std::string PercentDecoded(std::string_view s)
{
    std::string out;
    for (size_t i = 0; i < s.size(); ++i) {
        if (s[i] == '%' && i + 2 < s.size() && Hex(s[i + 1]) >= 0 &&
            Hex(s[i + 2]) >= 0) {
            out += static_cast<char>(Hex(s[i + 1]) * 16 + Hex(s[i + 2]));
            i += 2;
        } else {
            out += s[i];
        }
    }
    return out;
}

std::string FolderOf(const std::string &part)
{
    size_t slash = part.rfind('/');
    return slash == std::string::npos ? std::string() : part.substr(0, slash + 1);
}

}  // namespace

std::string ResolveTarget(const std::string &sourcePart, std::string_view rawTarget)
{
    std::string target = PercentDecoded(rawTarget);
    size_t cut = target.find_first_of("#?");
    if (cut != std::string::npos) target.resize(cut);
    if (target.find("://") != std::string::npos || target.rfind("//", 0) == 0)
        Fail(kBadFile, "relationship target '" + std::string(rawTarget) +
                           "' points outside the package");
    for (char &c : target)
        if (c == '\\') c = '/';
    std::string joined = !target.empty() && target[0] == '/' ? target : FolderOf(sourcePart) + target;
    std::vector<std::string> segments;
    size_t pos = 0;
    while (pos <= joined.size()) {
        size_t next = joined.find('/', pos);
        if (next == std::string::npos) next = joined.size();
        std::string seg = joined.substr(pos, next - pos);
        pos = next + 1;
        if (seg.empty() || seg == ".") continue;
        if (seg == "..") {
            if (segments.empty())
                Fail(kBadFile, "relationship target '" + std::string(rawTarget) +
                                   "' points outside the package");
            segments.pop_back();
            continue;
        }
        segments.push_back(seg);
    }
    if (segments.empty())
        Fail(kBadFile, "relationship target '" + std::string(rawTarget) + "' names no part");
    std::string out;
    for (const auto &s : segments) {
        if (!out.empty()) out += '/';
        out += s;
    }
    return out;
}

std::string RelsPartOf(const std::string &part)
{
    std::string folder = FolderOf(part);
    return folder + "_rels/" + part.substr(folder.size()) + ".rels";
}

std::string TargetFor(const std::string &fromPart, const std::string &toPart)
{
    std::string folder = FolderOf(fromPart);
    if (toPart.compare(0, folder.size(), folder) == 0) return toPart.substr(folder.size());
    return "/" + toPart;
}

std::string_view RelationshipKind(std::string_view typeUri)
{
    size_t slash = typeUri.rfind('/');
    return slash == std::string_view::npos ? typeUri : typeUri.substr(slash + 1);
}

}  // namespace workbook
