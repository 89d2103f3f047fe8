// SPDX-License-Identifier: MIT
// A relationships part (_rels/*.rels): which parts a part points at.
#pragma once

#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "xml/xml_splice.h"

namespace workbook {

struct Relationship {
    std::string id;
    std::string type;    // the full type URI
    std::string target;  // as written
    bool external = false;
};

class Relationships {
public:
    static Relationships Parse(std::string_view xml, const std::string &partName);

    const std::vector<Relationship> &Items() const { return items_; }
    const Relationship *ById(std::string_view id) const;
    // The first relationship whose type ends in /kind.
    const Relationship *ByKind(std::string_view kind) const;
    // An id not yet in use.
    std::string NewId() const;

    // The part's text with one more relationship (text is the part as parsed).
    std::string Added(std::string_view text, const Relationship &r) const;
    // The part's text without the relationships of these ids.
    std::string Without(std::string_view text, const std::set<std::string> &ids) const;
    // A whole relationships part holding items.
    static std::string Compose(const std::vector<Relationship> &items);

private:
    std::vector<Relationship> items_;
    std::vector<xml::Span> spans_;  // of each item's element in the part
    xml::RootShape root_;
};

}  // namespace workbook
