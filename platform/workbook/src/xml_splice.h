// SPDX-License-Identifier: MIT
// Editing a part's XML text in place, so that whatever the engine does not
// understand passes through exactly as it was written.
#pragma once

#include <string>
#include <string_view>

#include "xml_parser.h"

namespace workbook::xml {

// Where a part's root element stands, and the prefix it was written with.
struct RootShape {
    std::string ns;
    std::string prefix;
    std::string local;
    Span start;  // the root's start tag
    Span end;    // the root's end tag; empty for <root/>
};

// "p:local", or "local" when prefix is empty.
std::string Qualified(std::string_view prefix, std::string_view local);

// The document with children added as the root's last content.
std::string InsertBeforeRootEnd(std::string_view xml, const RootShape &root,
                                std::string_view children);

// A start tag with the attribute set to value (replaced, or added at its end).
std::string WithAttribute(std::string_view startTag, std::string_view name, std::string_view value);

// A handler that records the root's shape; readers derive from it and call
// TrackStart/TrackEnd first in their handlers.
class ShapeTracker : public Handler {
public:
    void Attach(const Parser &parser) { parser_ = &parser; }
    const RootShape &Root() const { return root_; }
    int Depth() const { return depth_; }

protected:
    void TrackStart(const Name &name)
    {
        if (depth_++ == 0) {
            root_.ns = std::string(name.ns);
            root_.prefix = std::string(name.prefix);
            root_.local = std::string(name.local);
            root_.start = parser_->CurrentTag();
        }
    }
    void TrackEnd()
    {
        if (--depth_ == 0) root_.end = parser_->CurrentTag();
    }
    const Parser *parser_ = nullptr;

private:
    RootShape root_;
    int depth_ = 0;
};

// Parses a whole part with a tracker-derived handler.
template <typename H>
void ParseWhole(H &handler, std::string_view text, const std::string &what)
{
    Parser parser(handler, what);
    handler.Attach(parser);
    parser.Feed(text);
}

}  // namespace workbook::xml
