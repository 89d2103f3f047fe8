// SPDX-License-Identifier: MIT
// The shared strings part (xl/sharedStrings.xml). Reading puts each item's
// plain text into the string pool: rich-text runs joined, phonetic runs left
// out, _xHHHH_ escapes decoded. Writing adds items at the end of the part as
// it stands, so rich text and phonetic data of the items already there stay.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "cells/string_pool.h"
#include "xml/xml_splice.h"

namespace workbook {

class SharedStrings {
public:
    // Adds the items to pool in order; they take the indexes 0..Count()-1 when
    // pool is empty.
    static SharedStrings Parse(std::string_view xml, const std::string &partName, StringPool &pool);

    uint32_t Count() const { return count_; }
    // The part's text (as parsed) with more items at its end.
    std::string WithAdded(std::string_view text, const std::vector<std::string_view> &added) const;
    // A whole new part holding items, in the given spreadsheet namespace.
    static std::string Compose(std::string_view mainNs, const std::vector<std::string_view> &items);

private:
    uint32_t count_ = 0;
    xml::RootShape root_;
};

}  // namespace workbook
