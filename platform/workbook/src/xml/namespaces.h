// SPDX-License-Identifier: MIT
// The namespaces of spreadsheet XML, transitional and strict.
#pragma once

#include <string_view>

namespace workbook::ns {

inline constexpr std::string_view kMain = "http://schemas.openxmlformats.org/spreadsheetml/2006/main";
inline constexpr std::string_view kMainStrict = "http://purl.oclc.org/ooxml/spreadsheetml/main";
inline constexpr std::string_view kRel =
    "http://schemas.openxmlformats.org/officeDocument/2006/relationships";
inline constexpr std::string_view kRelStrict = "http://purl.oclc.org/ooxml/officeDocument/relationships";

inline bool IsMain(std::string_view uri) { return uri == kMain || uri == kMainStrict; }
inline bool IsRel(std::string_view uri) { return uri == kRel || uri == kRelStrict; }

// The relationship type URI of a kind in the same flavour as the main namespace.
inline std::string_view RelTypeBase(std::string_view mainUri)
{
    return mainUri == kMainStrict ? "http://purl.oclc.org/ooxml/officeDocument/relationships/"
                                  : "http://schemas.openxmlformats.org/officeDocument/2006/relationships/";
}

}  // namespace workbook::ns
