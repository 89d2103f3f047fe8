// SPDX-License-Identifier: MIT
// A dialog hands out the keys of its specification string one by one; the
// string is built from what it gives, in key order.
#pragma once

#include <string>

class CSpecification;

// Something that gives the value of a key out of a dialog's fields.
class CDialogKeySource {
public:
    virtual ~CDialogKeySource() = default;
    // True if the dialog gives the key a value; value is emptied first in any case.
    virtual bool GetDialogKeyValue(int key, std::string &value) const = 0;
};

// Asks the dialog for every key, stores the given ones in the KeyValues of
// specification and joins them into spec; true if spec is not empty.
bool DialogToString(CSpecification &specification, const CDialogKeySource &dialog, std::string &spec);
