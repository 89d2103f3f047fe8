// SPDX-License-Identifier: MIT
// Editing a part's XML text in place, so that whatever the engine does not
// understand passes through exactly as it was written.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "xml/xml_parser.h"

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

// Collects the spans of the root's children that TakeChild keeps: the start
// tag, through its end tag when the element isn't written empty.
class ChildSpanReader : public ShapeTracker {
public:
    std::vector<Span> spans;

    void OnStart(const Name &name, const Attributes &attrs) override
    {
        TrackStart(name);
        if (Depth() != 2) return;
        open_ = TakeChild(name, attrs);
        if (open_) spans.push_back(parser_->CurrentTag());
    }
    void OnEnd(const Name &) override
    {
        // <Item ...></Item>: the element ends at its end tag.
        if (Depth() == 2 && open_ && parser_->CurrentTag().Found()) spans.back().end = parser_->CurrentTag().end;
        if (Depth() == 2) open_ = false;
        TrackEnd();
    }

protected:
    // True for a child of the root to keep, after noting what it holds.
    virtual bool TakeChild(const Name &name, const Attributes &attrs) = 0;

private:
    bool open_ = false;  // the last start tag was a kept child's, not yet ended
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
