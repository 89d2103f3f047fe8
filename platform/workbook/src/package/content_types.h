// SPDX-License-Identifier: MIT
// The content types part ([Content_Types].xml) of a package.
#pragma once

#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "xml/xml_splice.h"

namespace workbook {

inline constexpr const char *kContentTypesPart = "[Content_Types].xml";

namespace content_type {
inline constexpr const char *kRels = "application/vnd.openxmlformats-package.relationships+xml";
inline constexpr const char *kXml = "application/xml";
inline constexpr const char *kWorkbook =
    "application/vnd.openxmlformats-officedocument.spreadsheetml.sheet.main+xml";
inline constexpr const char *kMacroWorkbook = "application/vnd.ms-excel.sheet.macroEnabled.main+xml";
inline constexpr const char *kWorksheet =
    "application/vnd.openxmlformats-officedocument.spreadsheetml.worksheet+xml";
inline constexpr const char *kStyles =
    "application/vnd.openxmlformats-officedocument.spreadsheetml.styles+xml";
inline constexpr const char *kSharedStrings =
    "application/vnd.openxmlformats-officedocument.spreadsheetml.sharedStrings+xml";
}  // namespace content_type

class ContentTypes {
public:
    static ContentTypes Parse(std::string_view xml);

    // Whether an Override names this part (given without the leading slash).
    bool HasOverride(std::string_view part) const;
    // The part's text with an Override added (text is the part as parsed).
    std::string WithOverride(std::string_view text, std::string_view part,
                             std::string_view contentType) const;

    // The part's text without the Overrides of these parts (named without
    // the leading slash, matched without regard to case).
    std::string WithoutOverrides(std::string_view text, const std::set<std::string> &parts) const;

    // A whole part: Default entries for rels and xml, and the overrides.
    static std::string Compose(const std::vector<std::pair<std::string, std::string>> &overrides);

private:
    std::vector<std::string> overrides_;  // part names without the slash
    std::vector<xml::Span> spans_;        // of each Override element
    xml::RootShape root_;
};

}  // namespace workbook
