// SPDX-License-Identifier: MIT
// Checks of cell texts against column formats and of the fields of a format.
#include <string_view>

#include "datetime/date_fields.h"
#include "datetime/date_time_util.h"
#include "datetime/format_text.h"
#include "module/string_table.h"

using namespace vantrel::datetime;

namespace {

constexpr int kMsgValueDoesNotFitFormat = 117;
constexpr int kMsgFormatNotSupported = 118;
constexpr int kMsgFormatLettersAllowed = 140;

constexpr std::string_view kFieldLetters = "DHMSYdhmsy";

}  // namespace

bool CDateTimeUtil::CheckValueAgainstFormat(const std::string &value,
                                            const std::string &columnFormat, std::string &error)
{
    error.clear();
    const auto valueTokens = Tokenize(value);
    const auto formatTokens = Tokenize(columnFormat);
    if (valueTokens.size() != formatTokens.size()) {
        error = vantrel::LoadMessage(kMsgValueDoesNotFitFormat);
        return false;
    }
    // Only the order of the fields counts; any separator in the text will do.
    for (size_t i = 0; i < formatTokens.size(); ++i) {
        const std::string_view field = formatTokens[i].text;
        if (!AllLettersSame(field)) {
            error = vantrel::LoadMessage(kMsgFormatNotSupported);
            return false;
        }
        const auto rule = FieldOfLetter(field.front());
        if (!rule) return false;
        const auto number = ReadDecimal(valueTokens[i].text);
        if (!number || *number < rule->minimum || *number > rule->maximum) return false;
    }
    return true;
}

bool CDateTimeUtil::CheckFormatLetters(const std::string &format, std::string &error)
{
    error.clear();
    for (const FormatToken &token : Tokenize(format)) {
        if (kFieldLetters.find(token.text.front()) == std::string_view::npos ||
            !AllLettersSame(token.text)) {
            error = vantrel::LoadMessage(kMsgFormatLettersAllowed);
            return false;
        }
    }
    return true;
}
