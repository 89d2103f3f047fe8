// SPDX-License-Identifier: MIT
// The OpenDocument namespaces the spreadsheet reader looks at, and attribute
// look-up by namespace, whatever prefixes a producer chose.
#pragma once

#include <string_view>

#include "xml/xml_parser.h"

namespace workbook::ods {

inline constexpr std::string_view kOfficeNs = "urn:oasis:names:tc:opendocument:xmlns:office:1.0";
inline constexpr std::string_view kTableNs = "urn:oasis:names:tc:opendocument:xmlns:table:1.0";
inline constexpr std::string_view kTextNs = "urn:oasis:names:tc:opendocument:xmlns:text:1.0";
inline constexpr std::string_view kStyleNs = "urn:oasis:names:tc:opendocument:xmlns:style:1.0";
inline constexpr std::string_view kNumberNs = "urn:oasis:names:tc:opendocument:xmlns:datastyle:1.0";
inline constexpr std::string_view kFoNs = "urn:oasis:names:tc:opendocument:xmlns:xsl-fo-compatible:1.0";
// LibreOffice's extensions: the error type of a formula result, and the
// least decimals of a number.
inline constexpr std::string_view kCalcExtNs = "urn:org:documentfoundation:names:experimental:calc:xmlns:calcext:1.0";
inline constexpr std::string_view kLoExtNs = "urn:org:documentfoundation:names:experimental:office:xmlns:loext:1.0";

inline bool Is(const xml::Name &name, std::string_view ns, std::string_view local)
{
    return name.ns == ns && name.local == local;
}

// The attribute's value, or an empty view when the element has none.
inline std::string_view Attr(const xml::Attributes &attrs, std::string_view ns, std::string_view local)
{
    const char *value = attrs.FindNs(local, [ns](std::string_view uri) { return uri == ns; });
    return value ? std::string_view(value) : std::string_view();
}

}  // namespace workbook::ods
