// SPDX-License-Identifier: MIT
// Text helpers for the package's XML: escaping for output, and the _xHHHH_
// escapes by which spreadsheet XML carries characters that XML 1.0 can't.
#pragma once

#include <string>
#include <string_view>

#include "automation/text.h"

namespace workbook::xml {

// Appends text escaped for element content or an attribute value (quotes too).
void AppendEscaped(std::string &out, std::string_view text);

// Appends cell text: XML-escaped, with characters XML 1.0 can't hold (and a
// literal "_xHHHH_" that would read as an escape) written as _xHHHH_.
void AppendCellText(std::string &out, std::string_view text);

// Replaces every _xHHHH_ escape in place by the character it names (UTF-8).
void DecodeCellEscapes(std::string &text);

// Appends one code point as UTF-8.
using automation::AppendUtf8;

}  // namespace workbook::xml
