// SPDX-License-Identifier: MIT
#include "dialogs/dialog_to_string.h"

#include "specification/parsing_type.h"
#include "specification/specification.h"

bool DialogToString(CSpecification &specification, const CDialogKeySource &dialog, std::string &spec)
{
    for (int key = 0; key < kParsingTypeCount; ++key) {
        std::string value;
        if (dialog.GetDialogKeyValue(key, value)) specification.KeyValues[PARSINGTYPE(key)] = value;
    }
    return specification.JoinKeyValues(spec);
}
