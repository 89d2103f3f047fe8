// SPDX-License-Identifier: MIT
#include "bridge/spec_warnings.h"

#include <charconv>
#include <cmath>

#include "bridge/header_cells.h"
#include "datetime/format_text.h"
#include "specification/specification.h"
#include "specification/tokenizer.h"

namespace vantrel::bridge {

namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

std::string_view Trimmed(std::string_view text)
{
    while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
    while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
    return text;
}

// Keys compare exactly; a key with blanks around it or in another case is
// ignored by every reader, and so is one that matches nothing.
void WarnAboutKeys(const std::string &spec, RunReport &report)
{
    const CSpecification specification;
    for (const std::string_view piece : SplitPieces(spec, ";")) {
        const auto tokens = SplitPieces(piece, "=");
        if (tokens.empty() || Trimmed(tokens[0]).empty()) continue;
        const std::string_view key = tokens[0];
        std::string name, blankMatch, caseMatch;
        bool exact = false;
        for (int number = 0; specification.GetKeyName(number, name) && !exact; ++number) {
            exact = key == name;
            if (Trimmed(key) == name) blankMatch = name;
            else if (EqualsIgnoringCase(Trimmed(key), name)) caseMatch = name;
        }
        if (exact) continue;
        if (!blankMatch.empty()) report.KeyWithBlanks(piece, blankMatch);
        else if (!caseMatch.empty()) report.KeyInOtherCase(piece, caseMatch);
        else report.UnknownKey(piece);
    }
}

bool IsLetterRun(std::string_view token, std::string_view letters)
{
    return !token.empty() && letters.find(token.front()) != std::string_view::npos &&
           token.find_first_not_of(token.front()) == std::string_view::npos;
}

// "m" is minutes and "M" the month: a minute field beside a year or a day,
// or a month field beside an hour or a second, is a slip of case.
void WarnAboutFormat(std::string_view key, std::string_view format, RunReport &report)
{
    const auto tokens = datetime::Tokenize(datetime::StripQuotes(datetime::TrimWhiteSpace(format)));
    for (size_t i = 0; i < tokens.size(); ++i) {
        const std::string_view token = tokens[i].text;
        const bool minutes = IsLetterRun(token, "m");
        const bool month = IsLetterRun(token, "M");
        if (!minutes && !month) continue;
        for (const size_t n : {i - 1, i + 1}) {
            if (n >= tokens.size()) continue;  // i - 1 wraps for the first token
            const std::string_view neighbour = tokens[n].text;
            if ((minutes && IsLetterRun(neighbour, "yYdD")) || (month && IsLetterRun(neighbour, "hHsS"))) {
                report.FormatCaseSlip(key, format, token, neighbour, minutes);
                break;
            }
        }
    }
}

}  // namespace

float LeadingFloat(std::string_view text)
{
    while (!text.empty() && (text.front() == ' ' || text.front() == '\t')) text.remove_prefix(1);
    if (!text.empty() && text.front() == '+') text.remove_prefix(1);
    double value = 0.0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (end == text.data()) return 0.0f;
    if (error == std::errc::result_out_of_range) value = text.front() == '-' ? -HUGE_VAL : HUGE_VAL;
    return float(value);
}

void WarnAboutSpecification(const std::string &spec, RunReport &report)
{
    WarnAboutKeys(spec, report);
    const CSpecification specification;
    for (const PARSINGTYPE key : {DateFormat, TimeFormat, DateTimeFormat}) {
        std::string name, format;
        if (specification.GetKeyValue(spec, key, format) && specification.GetKeyName(key, name))
            WarnAboutFormat(name, format, report);
    }
    std::string deleteValue;
    if (specification.GetKeyValue(spec, DeleteValue, deleteValue)) {
        std::string_view number = Trimmed(deleteValue);
        if (!number.empty() && number.front() == '+') number.remove_prefix(1);
        double parsed = 0.0;
        const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), parsed);
        if (number.empty() || error != std::errc() || end != number.data() + number.size())
            report.DeleteValueNotANumber(deleteValue, LeadingFloat(deleteValue));
    }
}

}  // namespace vantrel::bridge
