// SPDX-License-Identifier: MIT
#include "xml/xml_parser.h"

#include <expat.h>

#include <climits>
#include <cstring>
#include <exception>

#include "errors.h"
#include "workbook/limits.h"

namespace workbook::xml {
namespace {

// Separates URI, local name and prefix in expat's expanded names.
constexpr char kSep = '\x01';


}  // namespace

Name Attributes::SplitName(const char *expanded)
{
    std::string_view s(expanded);
    size_t a = s.find(kSep);
    if (a == std::string_view::npos) return {{}, s, {}};
    size_t b = s.find(kSep, a + 1);
    if (b == std::string_view::npos) return {s.substr(0, a), s.substr(a + 1), {}};
    return {s.substr(0, a), s.substr(a + 1, b - a - 1), s.substr(b + 1)};
}

const char *Attributes::Find(std::string_view local) const
{
    for (const char **a = raw_; *a; a += 2)
        if (std::strchr(a[0], kSep) == nullptr && local == a[0]) return a[1];
    return nullptr;
}

struct Parser::Impl {
    XML_Parser p = nullptr;
    Handler *handler = nullptr;
    std::string what;
    std::string abortText;
    std::exception_ptr thrown;  // a handler's exception, raised again after XML_Parse
    uint64_t skippedBytes = 0;  // read by another reader, never fed
    uint64_t skippedLines = 0;
    uint32_t depth = 0;  // elements open now
    bool tooDeep = false;

    template <typename F>
    void Guard(F &&f)
    {
        if (thrown) return;
        try {
            f();
        } catch (...) {
            thrown = std::current_exception();
            XML_StopParser(p, XML_FALSE);
        }
    }

    void Stop(const char *text)
    {
        if (abortText.empty()) abortText = text;
        XML_StopParser(p, XML_FALSE);
    }

    static void Start(void *self, const XML_Char *name, const XML_Char **atts)
    {
        auto *impl = static_cast<Impl *>(self);
        // expat keeps every open element, and readers their own stack: a
        // part of endless unclosed elements would fill memory.
        if (++impl->depth > limits::kMaxXmlDepth) {
            impl->tooDeep = true;
            return impl->Stop("");
        }
        impl->Guard([&] { impl->handler->OnStart(Attributes::SplitName(name), Attributes(atts)); });
    }
    static void End(void *self, const XML_Char *name)
    {
        auto *impl = static_cast<Impl *>(self);
        --impl->depth;
        impl->Guard([&] { impl->handler->OnEnd(Attributes::SplitName(name)); });
    }
    static void Text(void *self, const XML_Char *s, int len)
    {
        auto *impl = static_cast<Impl *>(self);
        impl->Guard([&] { impl->handler->OnText(std::string_view(s, static_cast<size_t>(len))); });
    }
    static void Namespace(void *self, const XML_Char *prefix, const XML_Char *uri)
    {
        auto *impl = static_cast<Impl *>(self);
        impl->Guard([&] {
            impl->handler->OnNamespace(prefix ? std::string_view(prefix) : std::string_view(),
                                       uri ? std::string_view(uri) : std::string_view());
        });
    }
    static void Doctype(void *self, const XML_Char *, const XML_Char *, const XML_Char *, int)
    {
        static_cast<Impl *>(self)->Stop("a document type declaration is not allowed");
    }
    static void Entity(void *self, const XML_Char *, int, const XML_Char *, int, const XML_Char *,
                       const XML_Char *, const XML_Char *, const XML_Char *)
    {
        static_cast<Impl *>(self)->Stop("an entity declaration is not allowed");
    }
    static int ExternalEntity(XML_Parser, const XML_Char *, const XML_Char *, const XML_Char *,
                              const XML_Char *)
    {
        return XML_STATUS_ERROR;
    }
};

Parser::Parser(Handler &handler, std::string what) : impl_(new Impl)
{
    impl_->handler = &handler;
    impl_->what = std::move(what);
    impl_->p = XML_ParserCreateNS(nullptr, kSep);
    if (!impl_->p) {
        delete impl_;
        throw std::bad_alloc();
    }
    XML_SetReturnNSTriplet(impl_->p, 1);
    XML_SetUserData(impl_->p, impl_);
    XML_SetElementHandler(impl_->p, &Impl::Start, &Impl::End);
    XML_SetCharacterDataHandler(impl_->p, &Impl::Text);
    XML_SetStartNamespaceDeclHandler(impl_->p, &Impl::Namespace);
    XML_SetStartDoctypeDeclHandler(impl_->p, &Impl::Doctype);
    XML_SetEntityDeclHandler(impl_->p, &Impl::Entity);
    XML_SetExternalEntityRefHandler(impl_->p, &Impl::ExternalEntity);
    XML_SetParamEntityParsing(impl_->p, XML_PARAM_ENTITY_PARSING_NEVER);
}

Parser::~Parser()
{
    XML_ParserFree(impl_->p);
    delete impl_;
}

void Parser::Feed(const char *data, size_t size, bool final)
{
    // expat takes an int length: feed large pieces in slices.
    constexpr size_t kSlice = size_t{1} << 30;
    do {
        size_t n = size < kSlice ? size : kSlice;
        bool last = final && n == size;
        if (XML_Parse(impl_->p, data, static_cast<int>(n), last) != XML_STATUS_OK) {
            if (impl_->thrown) std::rethrow_exception(impl_->thrown);
            std::string text = impl_->what + " is not well-formed XML: ";
            if (impl_->tooDeep)
                text = impl_->what + " nests its elements more than " + std::to_string(limits::kMaxXmlDepth) + " deep";
            else if (!impl_->abortText.empty())
                text += impl_->abortText;
            else
                text += XML_ErrorString(XML_GetErrorCode(impl_->p));
            text += " (line " + std::to_string(XML_GetCurrentLineNumber(impl_->p) + impl_->skippedLines) + ")";
            Fail(kBadFile, text);
        }
        data += n;
        size -= n;
    } while (size > 0);
}

Span Parser::CurrentTag() const
{
    auto at = static_cast<uint64_t>(XML_GetCurrentByteIndex(impl_->p));
    auto n = static_cast<uint64_t>(XML_GetCurrentByteCount(impl_->p));
    return {at + impl_->skippedBytes, at + impl_->skippedBytes + n};
}

void Parser::Abort(const std::string &text)
{
    impl_->abortText = text;
    XML_StopParser(impl_->p, XML_FALSE);
}

void Parser::Skipped(std::string_view bytes)
{
    impl_->skippedBytes += bytes.size();
    // Line breaks as expat counts them: LF, CR LF, and a CR alone.
    // Found with memchr, which passes over the long stretches between line
    // breaks much faster than a byte-by-byte count.
    for (const char *p = bytes.data(), *end = p + bytes.size();
         (p = static_cast<const char *>(std::memchr(p, '\n', size_t(end - p)))) != nullptr; ++p)
        ++impl_->skippedLines;
    for (size_t i = bytes.find('\r'); i != std::string_view::npos; i = bytes.find('\r', i + 1))
        if (i + 1 == bytes.size() || bytes[i + 1] != '\n') ++impl_->skippedLines;
}

}  // namespace workbook::xml
