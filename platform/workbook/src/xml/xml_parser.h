// SPDX-License-Identifier: MIT
// The one wrapper around expat. Names arrive split into namespace, local name
// and prefix, so a reader matches elements whatever prefix a producer chose.
// Document type declarations are refused outright: no DTD, no entity, internal
// or external, is ever loaded; expat's own amplification guard stays on.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace workbook::xml {

struct Name {
    std::string_view ns;      // namespace URI, empty when none
    std::string_view local;
    std::string_view prefix;  // as written in the document, empty when none
};

// The attributes of one start tag, as expat hands them over.
class Attributes {
public:
    explicit Attributes(const char **raw) : raw_(raw) {}
    // The value of the attribute with this local name and no namespace.
    const char *Find(std::string_view local) const;
    // The value of the attribute with this local name in a namespace for which
    // nsMatches(uri) is true.
    template <typename Pred>
    const char *FindNs(std::string_view local, Pred nsMatches) const
    {
        for (const char **a = raw_; *a; a += 2) {
            Name n = SplitName(a[0]);
            if (n.local == local && !n.ns.empty() && nsMatches(n.ns)) return a[1];
        }
        return nullptr;
    }
    const char **Raw() const { return raw_; }
    static Name SplitName(const char *expanded);

private:
    const char **raw_;
};

class Handler {
public:
    virtual ~Handler() = default;
    virtual void OnStart(const Name &name, const Attributes &attrs) = 0;
    virtual void OnEnd(const Name &name) = 0;
    virtual void OnText(std::string_view) {}
    // A namespace declaration of the element whose OnStart comes next; the
    // default namespace has an empty prefix, an undeclaration an empty uri.
    virtual void OnNamespace(std::string_view /*prefix*/, std::string_view /*uri*/) {}
};

// Byte positions in the document fed so far, for readers that splice parts.
struct Span {
    uint64_t begin = 0;
    uint64_t end = 0;
    bool Found() const { return end > begin; }
};

class Parser {
public:
    // what names the part in error texts.
    Parser(Handler &handler, std::string what);
    ~Parser();
    Parser(const Parser &) = delete;
    Parser &operator=(const Parser &) = delete;

    // Feeds the next piece; final marks the last. Raises ComError on bad XML.
    void Feed(const char *data, size_t size, bool final);
    void Feed(std::string_view text) { Feed(text.data(), text.size(), true); }

    // Only valid inside a handler call: the bytes of the tag being reported.
    // For the end of an empty element <a/> the span is empty.
    Span CurrentTag() const;

    // Stops the parse from a handler; Feed then raises ComError with the text.
    void Abort(const std::string &text);

    // Tells that these bytes of the document, which come right after the
    // last ones fed, were read by another reader and won't be fed: positions
    // and line numbers stay those of the whole document.
    void Skipped(std::string_view bytes);

private:
    struct Impl;
    Impl *impl_;
};

}  // namespace workbook::xml
