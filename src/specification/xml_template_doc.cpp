// SPDX-License-Identifier: MIT
// The template document on libxml2. Files are read into memory by this code,
// so the parser never opens a path or a URL of its own, and a document type
// declaration stops the parse before any of it is read.
#include "specification/xml_template_doc.h"

#include <libxml/parser.h>
#include <libxml/tree.h>
#include <libxml/xmlschemas.h>
#include <libxml/xpath.h>

#include <memory>

#include "automation/automation.h"
#include "module/string_table.h"
#include "specification/bounded_file.h"

namespace {

// A template is a few hundred bytes; the bound keeps a huge file from being
// read without end (a device or a FIFO is refused by its kind).
constexpr size_t kMaxTemplateBytes = 16u << 20;

// What the parser may do: nothing from the network, no DTD loaded, entities
// left unexpanded (the DOCTYPE refusal below means none can be declared).
constexpr int kParseOptions = XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING;

constexpr int kMessageInvalidDocument = 128;

// Called by the parser at <!DOCTYPE ...>, before its subset is read.
void RefuseDocumentType(void *context, const xmlChar *, const xmlChar *, const xmlChar *)
{
    xmlStopParser(static_cast<xmlParserCtxtPtr>(context));
}

// Keeps the first message of a validation as its reason.
void KeepFirstReason(void *reason, xmlErrorPtr error)
{
    auto *text = static_cast<std::string *>(reason);
    if (!text->empty() || !error || !error->message) return;
    *text = error->message;
    while (!text->empty() && (text->back() == '\n' || text->back() == '\r')) text->pop_back();
}

void IgnoreError(void *, xmlErrorPtr) {}

std::string NodeText(xmlNodePtr node)
{
    std::unique_ptr<xmlChar, void (*)(void *)> content(xmlNodeGetContent(node), xmlFree);
    std::string text = content ? reinterpret_cast<const char *>(content.get()) : "";
    const auto first = text.find_first_not_of(" \t\r\n");
    if (first == std::string::npos) return std::string();
    const auto last = text.find_last_not_of(" \t\r\n");
    return text.substr(first, last - first + 1);
}

const xmlChar *XmlText(const std::string &text) { return reinterpret_cast<const xmlChar *>(text.c_str()); }

}  // namespace

CXmlTemplateDoc::~CXmlTemplateDoc()
{
    if (m_document) xmlFreeDoc(m_document);
    if (m_initialised) CoUninitialize();
}

bool CXmlTemplateDoc::InitDocument()
{
    if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) return false;
    m_initialised = true;
    xmlInitParser();
    return true;
}

bool CXmlTemplateDoc::LoadFile(const std::string &path)
{
    if (!m_initialised) return false;
    std::string text;
    std::string reason;
    if (!vantrel::ReadBoundedFile(path, kMaxTemplateBytes, text, reason)) return false;

    std::unique_ptr<xmlParserCtxt, void (*)(xmlParserCtxtPtr)> parser(xmlNewParserCtxt(),
                                                                      xmlFreeParserCtxt);
    if (!parser || !parser->sax) return false;
    parser->sax->internalSubset = RefuseDocumentType;
    xmlDocPtr document = xmlCtxtReadMemory(parser.get(), text.data(), int(text.size()), nullptr,
                                           nullptr, kParseOptions);
    if (!document) return false;
    if (!parser->wellFormed || document->intSubset || document->extSubset ||
        !xmlDocGetRootElement(document)) {
        xmlFreeDoc(document);
        return false;
    }
    if (m_document) xmlFreeDoc(m_document);
    m_document = document;
    m_root = nullptr;
    m_attributes = nullptr;
    return true;
}

bool CXmlTemplateDoc::ValidateSchema(const std::string &schema, std::string &error)
{
    if (!m_document) return false;
    std::string reason;
    std::unique_ptr<xmlSchemaParserCtxt, void (*)(xmlSchemaParserCtxtPtr)> parser(
        xmlSchemaNewMemParserCtxt(schema.data(), int(schema.size())), xmlSchemaFreeParserCtxt);
    if (!parser) return false;
    xmlSchemaSetParserStructuredErrors(parser.get(), KeepFirstReason, &reason);
    std::unique_ptr<xmlSchema, void (*)(xmlSchemaPtr)> compiled(xmlSchemaParse(parser.get()),
                                                               xmlSchemaFree);
    bool valid = false;
    if (compiled) {
        std::unique_ptr<xmlSchemaValidCtxt, void (*)(xmlSchemaValidCtxtPtr)> validator(
            xmlSchemaNewValidCtxt(compiled.get()), xmlSchemaFreeValidCtxt);
        if (validator) {
            xmlSchemaSetValidStructuredErrors(validator.get(), KeepFirstReason, &reason);
            valid = xmlSchemaValidateDoc(validator.get(), m_document) == 0;
        }
    }
    if (!valid) error = vantrel::LoadMessage(kMessageInvalidDocument) + reason;
    return valid;
}

bool CXmlTemplateDoc::SelectRoot(const std::string &xpath)
{
    xmlNodePtr node = SelectNode(xpath);
    if (!node || node->type != XML_ELEMENT_NODE) return false;
    m_root = node;
    m_attributes = node->properties;
    return true;
}

bool CXmlTemplateDoc::GetAttribute(const std::string &name, std::string &value) const
{
    if (!m_document || !m_root) return false;
    for (xmlAttrPtr attribute = m_attributes; attribute; attribute = attribute->next) {
        if (attribute->ns || xmlStrcmp(attribute->name, XmlText(name)) != 0) continue;
        std::unique_ptr<xmlChar, void (*)(void *)> raw(
            xmlNodeListGetString(m_document, attribute->children, 1), xmlFree);
        value = raw ? reinterpret_cast<const char *>(raw.get()) : "";
        return true;
    }
    return false;
}

bool CXmlTemplateDoc::GetAttributeInt(const std::string &name, int &value) const
{
    std::string text;
    if (!GetAttribute(name, text)) return false;
    int parsed = 0;
    if (std::sscanf(text.c_str(), "%d", &parsed) != 1) return false;
    value = parsed;
    return true;
}

xmlNodePtr CXmlTemplateDoc::SelectNode(const std::string &xpath, xmlNodePtr from) const
{
    if (!m_document) return nullptr;
    std::unique_ptr<xmlXPathContext, void (*)(xmlXPathContextPtr)> context(
        xmlXPathNewContext(m_document), xmlXPathFreeContext);
    if (!context) return nullptr;
    xmlSetStructuredErrorFunc(nullptr, IgnoreError);
    std::unique_ptr<xmlXPathObject, void (*)(xmlXPathObjectPtr)> result(
        from ? xmlXPathNodeEval(from, XmlText(xpath), context.get())
             : xmlXPathEvalExpression(XmlText(xpath), context.get()),
        xmlXPathFreeObject);
    xmlSetStructuredErrorFunc(nullptr, nullptr);
    if (!result || result->type != XPATH_NODESET || xmlXPathNodeSetIsEmpty(result->nodesetval))
        return nullptr;
    return result->nodesetval->nodeTab[0];
}

std::vector<std::string> CXmlTemplateDoc::ChildTexts(xmlNodePtr node)
{
    std::vector<std::string> texts;
    for (xmlNodePtr child = node ? xmlFirstElementChild(node) : nullptr; child;
         child = xmlNextElementSibling(child))
        texts.push_back(NodeText(child));
    return texts;
}
