// SPDX-License-Identifier: MIT
// Conversion between the system's UTF-8 text and the UTF-16 of automation calls.
#pragma once

#include <string>
#include <string_view>

#include "automation/automation.h"

namespace automation {

// Ill-formed input never fails: an unpaired surrogate or a bad UTF-8 sequence
// becomes U+FFFD, so a conversion always yields text.
AUTOMATION_CXX_API std::u16string Utf8ToUtf16(std::string_view utf8);
AUTOMATION_CXX_API std::string Utf16ToUtf8(std::u16string_view utf16);

// A BSTR's text as UTF-8; a null BSTR is the empty text.
AUTOMATION_CXX_API std::string BstrToUtf8(BSTR bstr);

// Appends one code point as UTF-8; the caller passes a valid scalar value.
AUTOMATION_CXX_API void AppendUtf8(std::string &out, char32_t cp);

// A piece of input as a message quotes it: in double quotes, at most
// maxCharacters characters of it, with quotes, backslashes, control characters
// and bytes that are no UTF-8 escaped (\", \\, \n, \t, \r, \xNN), never
// cutting a character in half; a cut text ends in "..." and tells its size:
// "abc..." (5242880 bytes).
AUTOMATION_CXX_API std::string MessageExcerpt(std::string_view text, size_t maxCharacters = 40);

// A new BSTR holding the text; the caller frees it with SysFreeString.
// Throws std::bad_alloc when memory runs out.
AUTOMATION_CXX_API BSTR AllocBstr(std::string_view utf8);

}  // namespace automation
