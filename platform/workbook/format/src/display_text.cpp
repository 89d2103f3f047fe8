// SPDX-License-Identifier: MIT
// Which section a value goes through, and with which sign.
#include "workbook/format/display_text.h"

#include <array>
#include <cmath>

#include "date_section.h"
#include "general_number.h"
#include "number_section.h"
#include "workbook/format/format_code.h"

namespace workbook::format {
namespace {

constexpr size_t kTextSection = 3;

struct Choice {
    const FormatSection *section = nullptr;
    bool showSign = false;  // a negative value gets '-' in front
};

// Without conditions: one section takes all and shows the sign; with two the
// second takes negatives; with three the third takes zero. A section chosen
// by the second's implied "< 0" shows the number without its sign.
// With conditions, a section without its own condition takes the rest
// (the second: what the first leaves, or the negatives when a third
// follows), and the chosen section shows the sign of a negative number.
Choice ChooseSection(const FormatCode &code, double value) {
    const auto &sections = code.sections;
    const size_t numeric = std::min(sections.size(), kTextSection);
    const FormatSection &first = sections[0];
    const bool conditional = first.condition || (numeric > 1 && sections[1].condition);
    if (!conditional) {
        if (numeric == 1 || (value > 0) || (value == 0 && numeric == 2)) return {&first, numeric == 1};
        if (value < 0) return {&sections[1], false};
        return {&sections[2], false};
    }
    const bool firstTakes = first.condition ? first.condition->Holds(value)
                                            : (numeric >= 3 ? value > 0 : value >= 0);
    if (firstTakes) return {&first, true};
    if (numeric >= 2) {
        const FormatSection &second = sections[1];
        const bool secondTakes = second.condition ? second.condition->Holds(value)
                                                  : (numeric == 2 || value < 0);
        if (secondTakes) return {&second, true};
    }
    if (numeric >= 3) return {&sections[2], true};
    return {};
}

// A text section, or a number under one: '@' shows `shown`, literals stand.
std::string FillTextSection(const FormatSection &section, const std::string &shown) {
    std::string out;
    for (const auto &token : section.tokens) {
        if (token.kind == TokenKind::TextValue) out += shown;
        else if (token.kind == TokenKind::Literal) out += token.text;
    }
    return out;
}

std::string DisplayNumberWith(const FormatCode &code, double value, bool date1904) {
    if (!std::isfinite(value)) return "#NUM!";
    if (value == 0) value = 0;  // -0 is 0
    const Choice choice = ChooseSection(code, value);
    if (!choice.section) return std::string(kOverflowText);
    const FormatSection &section = *choice.section;
    switch (section.kind) {
    case SectionKind::Date: {
        // Negative serials have no date, whichever section shows them.
        auto text = FormatDateSection(value, section, date1904);
        return text ? *text : std::string(kOverflowText);
    }
    case SectionKind::Text:
        return FillTextSection(section, GeneralNumberText(value));
    case SectionKind::Number:
        break;
    }
    std::string text = FormatNumberSection(std::fabs(value), section);
    if (choice.showSign && value < 0) text.insert(text.begin(), '-');
    return text;
}

std::string DisplayTextWith(const FormatCode &code, const std::string &text) {
    if (code.sections.size() > kTextSection) return FillTextSection(code.sections[kTextSection], text);
    if (code.sections.size() == 1 && code.sections[0].kind == SectionKind::Text)
        return FillTextSection(code.sections[0], text);
    return text;
}

// The parsed codes of the last formats used on this thread: a sheet is shown
// cell after cell under a handful of formats (a date column beside numbers),
// so parsing each time would dominate. A code that fails to parse is not
// kept and throws every time.
const FormatCode &ParsedFormatCode(std::string_view code) {
    struct Entry {
        std::string code;
        FormatCode parsed;
        bool valid = false;
    };
    constexpr size_t kEntries = 4;
    thread_local std::array<Entry, kEntries> cache;
    thread_local size_t next = 0;
    for (const Entry &entry : cache)
        if (entry.valid && entry.code == code) return entry.parsed;
    Entry &entry = cache[next];
    entry.valid = false;
    entry.parsed = ParseFormatCode(code);
    entry.code.assign(code);
    entry.valid = true;
    next = (next + 1) % kEntries;
    return entry.parsed;
}

}  // namespace

std::string DisplayText(const CellContent &value, std::string_view formatCode, bool date1904) {
    struct Visitor {
        std::string_view code;
        bool date1904;
        std::string operator()(std::monostate) const { return {}; }
        std::string operator()(double number) const {
            return DisplayNumberWith(ParsedFormatCode(code), number, date1904);
        }
        std::string operator()(bool flag) const { return flag ? "TRUE" : "FALSE"; }
        std::string operator()(const std::string &text) const {
            return DisplayTextWith(ParsedFormatCode(code), text);
        }
        std::string operator()(const ErrorValue &error) const { return error.text; }
    };
    return std::visit(Visitor{formatCode, date1904}, value);
}

std::string DisplayNumber(double value, std::string_view formatCode, bool date1904) {
    return DisplayNumberWith(ParsedFormatCode(formatCode), value, date1904);
}

}  // namespace workbook::format
