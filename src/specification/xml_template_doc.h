// SPDX-License-Identifier: MIT
// CXmlTemplateDoc: one template file open for reading, for the time of one
// load. The parser never reads a document type declaration, an external
// entity or anything from the network: a file with a DOCTYPE doesn't load.
#pragma once

#include <string>
#include <vector>

struct _xmlDoc;
struct _xmlNode;
struct _xmlAttr;

class CXmlTemplateDoc {
public:
    CXmlTemplateDoc() = default;
    // Frees the document and leaves the apartment that InitDocument entered.
    virtual ~CXmlTemplateDoc();
    CXmlTemplateDoc(const CXmlTemplateDoc &) = delete;
    CXmlTemplateDoc &operator=(const CXmlTemplateDoc &) = delete;

    // Enters a single-threaded apartment and readies the parser.
    bool InitDocument();
    // Reads and parses a local file; false if it can't be read, isn't well
    // formed or declares a document type.
    bool LoadFile(const std::string &path);
    // Validates the loaded document against a schema text. On failure error
    // becomes "XML Document is invalid." with the reason; on success it stays.
    bool ValidateSchema(const std::string &schema, std::string &error);
    // Holds the first node that the XPath selects and its attributes.
    bool SelectRoot(const std::string &xpath);
    // The root's attribute of this name (no namespace).
    bool GetAttribute(const std::string &name, std::string &value) const;
    // The attribute's leading integer, when its text starts with one; else
    // value stays.
    bool GetAttributeInt(const std::string &name, int &value) const;

    // The first node that the XPath selects, searched from the given node
    // (null: the document); null when there is none.
    _xmlNode *SelectNode(const std::string &xpath, _xmlNode *from = nullptr) const;
    _xmlNode *Root() const { return m_root; }
    // The text of each element child of a node, in document order, trimmed
    // of the white space around it.
    static std::vector<std::string> ChildTexts(_xmlNode *node);

private:
    _xmlNode *m_root = nullptr;
    _xmlDoc *m_document = nullptr;
    _xmlAttr *m_attributes = nullptr;  // the root's attribute list
    bool m_initialised = false;        // the apartment was entered
};
