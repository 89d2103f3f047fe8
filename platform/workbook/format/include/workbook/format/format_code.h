// SPDX-License-Identifier: MIT
// A number format code taken apart into its sections and tokens.
//
// A code has up to four sections separated by ';': positive, negative, zero
// and text. Each section may start with a colour ([Red], [Color12]) and a
// condition ([>100]); quoted text, '\x', '_x' (a blank as wide as x) and '*x'
// (a fill, which a displayed text leaves out) are literals.
#pragma once

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace workbook::format {

// A code that cannot be read: unterminated quote or bracket, unknown bracket,
// dangling '\', '_' or '*', more than four sections.
class FormatCodeError : public std::invalid_argument {
public:
    using std::invalid_argument::invalid_argument;
};

enum class TokenKind {
    Literal,         // text shown as it stands
    General,         // the General rendering of the number
    DigitZero,       // '0'
    DigitHash,       // '#'
    DigitQuestion,   // '?'
    DecimalPoint,    // '.'
    Comma,           // ',' grouping or scaling by 1000
    Percent,         // '%'
    Exponent,        // "E+" / "E-" (text keeps the sign written)
    FractionSlash,   // '/' between numerator and denominator
    TextValue,       // '@'
    Year,            // y.. (count letters)
    Month,           // m.. read as a month
    Minute,          // m or mm read as minutes
    Day,             // d..
    Hour,            // h..
    Second,          // s..
    ElapsedHours,    // [h]
    ElapsedMinutes,  // [m]
    ElapsedSeconds,  // [s]
    SecondFraction,  // ".0", ".00", ".000" behind seconds (count digits)
    AmPm,            // AM/PM (text "AM/PM") or A/P (text as written, e.g. "a/p")
};

struct FormatToken {
    TokenKind kind;
    std::string text;  // the literal, or the code text of the token
    int count = 1;     // letters of a date/time token, digits of a second fraction
};

enum class ConditionOp { Less, LessEqual, Greater, GreaterEqual, Equal, NotEqual };

struct Condition {
    ConditionOp op;
    double operand;
    bool Holds(double value) const;
};

enum class SectionKind {
    Number,  // digit placeholders, General, or literals only
    Date,    // date or time tokens
    Text,    // '@' and literals only
};

struct FormatSection {
    SectionKind kind = SectionKind::Number;
    std::vector<FormatToken> tokens;
    std::optional<Condition> condition;
    std::string color;  // as written, without brackets; empty if none
};

struct FormatCode {
    std::vector<FormatSection> sections;  // at least one
};

// Reads a code. The empty code reads as General.
FormatCode ParseFormatCode(std::string_view code);

}  // namespace workbook::format
