// SPDX-License-Identifier: MIT
// CSpecification: reads the settings of an import or export out of a
// specification string ("Key=Value;" pairs, no quoting). An object lives for
// one call and holds no settings between calls.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "specification/parsing_type.h"

class CSpecification {
public:
    CSpecification() = default;
    virtual ~CSpecification() = default;

    // The key's text for 0 to 21; false and an empty text for any other number.
    bool GetKeyName(int key, std::string &name) const;

    // True if the key stands in the string; the value may be empty. The first
    // pair with the key wins. A failed call leaves value as it was.
    bool GetKeyValue(const std::string &spec, int key, std::string &value) const;

    // True if the key is a numeric one and stands in the string; the value is
    // the text's leading integer by the rules of atoi (0 when there is none).
    bool GetKeyValueInt(const std::string &spec, int key, int &value) const;

    // Filled only when an open template is read.
    std::vector<std::string> ItemTitles;
    std::vector<std::string> ItemTypes;
    std::vector<std::string> ItemUnits;
    std::vector<std::string> ValueTypes;
    std::string SelItems;
    // Filled by the operations that build a string from a record or a dialog.
    std::map<PARSINGTYPE, std::string> KeyValues;
};
