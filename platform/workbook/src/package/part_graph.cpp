// SPDX-License-Identifier: MIT
#include "package/part_graph.h"

#include <algorithm>
#include <optional>

#include "errors.h"
#include "package/part_names.h"
#include "package/relationships.h"

namespace workbook {
namespace {

// The part a relationships part belongs to ("" for the package's own), or
// none when the name is no relationships part.
std::optional<std::string> OwnerOfRels(const std::string &entry)
{
    constexpr std::string_view kFolder = "_rels/", kSuffix = ".rels";
    const size_t at = entry.rfind(kFolder);
    if (at == std::string::npos || (at != 0 && entry[at - 1] != '/')) return std::nullopt;
    std::string name = entry.substr(at + kFolder.size());
    if (name.size() < kSuffix.size() || name.compare(name.size() - kSuffix.size(), kSuffix.size(), kSuffix) != 0)
        return std::nullopt;
    name.resize(name.size() - kSuffix.size());
    return entry.substr(0, at) + name;
}

}  // namespace

std::set<std::string> PartsLeftUnused(const PackageSource &source, const std::map<std::string, std::string> &editedRels,
                                      const std::set<std::string> &removed, std::vector<std::string> candidates)
{
    // Who points at what: each part's internal targets, as stored entry names.
    std::map<std::string, std::vector<std::string>> targets;
    for (const std::string &entry : source.EntryNames()) {
        const auto owner = OwnerOfRels(entry);
        if (!owner || removed.count(entry)) continue;
        auto edited = editedRels.find(entry);
        const std::string text = edited != editedRels.end() ? edited->second : source.ReadAll(entry);
        std::vector<std::string> &list = targets[*owner];
        const Relationships rels = Relationships::Parse(text, entry);
        for (const Relationship &r : rels.Items()) {
            if (r.external) continue;
            try {
                std::string part = source.Find(ResolveTarget(*owner, r.target));
                if (!part.empty()) list.push_back(std::move(part));
            } catch (const automation::ComError &) {
                // A target outside the package is none of the candidates.
            }
        }
    }
    std::set<std::string> gone = removed;
    std::set<std::string> unused;
    for (bool changed = true; changed;) {
        changed = false;
        for (size_t i = 0; i < candidates.size(); ++i) {
            const std::string part = candidates[i];
            if (gone.count(part)) continue;
            const bool named = std::any_of(targets.begin(), targets.end(), [&](const auto &owner) {
                return !gone.count(owner.first) && std::find(owner.second.begin(), owner.second.end(), part) != owner.second.end();
            });
            if (named) continue;
            gone.insert(part);
            unused.insert(part);
            const std::string rels = source.Find(RelsPartOf(part));
            if (!rels.empty()) {
                gone.insert(rels);
                unused.insert(rels);
            }
            if (auto own = targets.find(part); own != targets.end())
                candidates.insert(candidates.end(), own->second.begin(), own->second.end());
            changed = true;
        }
    }
    return unused;
}

}  // namespace workbook
