// SPDX-License-Identifier: MIT
#include "workbook/format/format_code.h"

#include <gtest/gtest.h>

namespace workbook::format {
namespace {

// The tokens of one section, written back compactly: a letter for each kind
// and the token's text, e.g. "Y(yyyy)L(-)".
std::string Describe(const FormatSection &section) {
    std::string out;
    for (const auto &token : section.tokens) {
        switch (token.kind) {
        case TokenKind::Literal: out += "L"; break;
        case TokenKind::General: out += "G"; break;
        case TokenKind::DigitZero:
        case TokenKind::DigitHash:
        case TokenKind::DigitQuestion: out += "D"; break;
        case TokenKind::DecimalPoint: out += "P"; break;
        case TokenKind::Comma: out += "C"; break;
        case TokenKind::Percent: out += "%"; break;
        case TokenKind::Exponent: out += "E"; break;
        case TokenKind::FractionSlash: out += "F"; break;
        case TokenKind::TextValue: out += "@"; break;
        case TokenKind::Year: out += "Y"; break;
        case TokenKind::Month: out += "M"; break;
        case TokenKind::Minute: out += "N"; break;
        case TokenKind::Day: out += "d"; break;
        case TokenKind::Hour: out += "H"; break;
        case TokenKind::Second: out += "S"; break;
        case TokenKind::ElapsedHours: out += "[H]"; break;
        case TokenKind::ElapsedMinutes: out += "[N]"; break;
        case TokenKind::ElapsedSeconds: out += "[S]"; break;
        case TokenKind::SecondFraction: out += "f"; break;
        case TokenKind::AmPm: out += "A"; break;
        }
        out += "(" + token.text + ")";
    }
    return out;
}

TEST(FormatCode, TokensOfOneSection) {
    const std::pair<const char *, const char *> cases[] = {
        {"", "G(General)"},
        {"general", "G(general)"},
        {"#,##0.00", "D(#)C(,)D(#)D(#)D(0)P(.)D(0)D(0)"},
        {"0.00E+00", "D(0)P(.)D(0)D(0)E(E+)D(0)D(0)"},
        {"0.0e-0", "D(0)P(.)D(0)E(E-)D(0)"},
        {"\"a;b\"0", "L(a;b)D(0)"},
        {"\\x0_)*-", "L(x)D(0)L( )"},
        {"# ?/?", "D(#)L( )D(?)F(/)D(?)"},
        {"# ?/16", "D(#)L( )D(?)F(/)L(16)"},
        {"0/", "D(0)L(/)"},
        {"[$€-407]0", "L(€)D(0)"},
        {"[$-409]0", "D(0)"},
        {"yyyy-mm-dd", "Y(yyyy)L(-)M(mm)L(-)d(dd)"},
        {"h:mm", "H(h)L(:)N(mm)"},
        {"mm:ss", "N(mm)L(:)S(ss)"},
        {"mmss.0", "N(mm)S(ss)f(.0)"},
        {"m/d h", "M(m)L(/)d(d)L( )H(h)"},
        {"mmm h:mm", "M(mmm)L( )H(h)L(:)N(mm)"},
        {"[h]:mm:ss.000", "[H]([h])L(:)N(mm)L(:)S(ss)f(.000)"},
        {"[mm]:ss", "[N]([mm])L(:)S(ss)"},
        {"h AM/PM", "H(h)L( )A(AM/PM)"},
        {"h am/pm", "H(h)L( )A(AM/PM)"},
        {"h a/p", "H(h)L( )A(a/p)"},
        {"yyyy \"d\" 0", "Y(yyyy)L( d 0)"},
        {"\"Total: \"@", "L(Total: )@(@)"},
        {"@ 0", "@(@)L( 0)"},
        {"0 kg", "D(0)L( kg)"},
    };
    for (const auto &[code, tokens] : cases) {
        const FormatCode parsed = ParseFormatCode(code);
        ASSERT_EQ(parsed.sections.size(), 1u) << code;
        EXPECT_EQ(Describe(parsed.sections[0]), tokens) << code;
    }
}

TEST(FormatCode, SectionsColoursAndConditions) {
    const FormatCode code = ParseFormatCode("[Red][>=100]0;[color12][<-5.5]0.0;[BLUE]\"z\";@");
    ASSERT_EQ(code.sections.size(), 4u);
    EXPECT_EQ(code.sections[0].color, "Red");
    ASSERT_TRUE(code.sections[0].condition);
    EXPECT_EQ(code.sections[0].condition->op, ConditionOp::GreaterEqual);
    EXPECT_EQ(code.sections[0].condition->operand, 100);
    EXPECT_EQ(code.sections[1].color, "color12");
    ASSERT_TRUE(code.sections[1].condition);
    EXPECT_EQ(code.sections[1].condition->op, ConditionOp::Less);
    EXPECT_EQ(code.sections[1].condition->operand, -5.5);
    EXPECT_EQ(code.sections[2].color, "BLUE");
    EXPECT_FALSE(code.sections[2].condition);
    EXPECT_EQ(code.sections[0].kind, SectionKind::Number);
    EXPECT_EQ(code.sections[3].kind, SectionKind::Text);

    const FormatCode empties = ParseFormatCode(";;;");
    ASSERT_EQ(empties.sections.size(), 4u);
    for (const auto &section : empties.sections) EXPECT_TRUE(section.tokens.empty());

    const FormatCode dates = ParseFormatCode("yyyy;\"neg\"");
    EXPECT_EQ(dates.sections[0].kind, SectionKind::Date);
    EXPECT_EQ(dates.sections[1].kind, SectionKind::Number);

    const std::pair<ConditionOp, const char *> ops[] = {
        {ConditionOp::Less, "[<1]0"},       {ConditionOp::LessEqual, "[<=1]0"},
        {ConditionOp::Greater, "[>1]0"},    {ConditionOp::GreaterEqual, "[>=1]0"},
        {ConditionOp::Equal, "[=1]0"},      {ConditionOp::NotEqual, "[<>1]0"},
    };
    for (const auto &[op, text] : ops) {
        const auto condition = ParseFormatCode(text).sections[0].condition;
        ASSERT_TRUE(condition) << text;
        EXPECT_EQ(condition->op, op) << text;
        EXPECT_EQ(condition->operand, 1) << text;
    }
}

TEST(FormatCode, CodesThatCannotBeRead) {
    const std::pair<const char *, const char *> cases[] = {
        {"0;0;0;@;0", "format code: more than four sections at position 7"},
        {"\"abc", "format code: unterminated quoted text at position 0"},
        {"0\\", "format code: '\\' without a character after it at position 1"},
        {"0_", "format code: '_' without a character after it at position 1"},
        {"0*", "format code: '*' without a character after it at position 1"},
        {"[Red0", "format code: unterminated '[' at position 0"},
        {"[]0", "format code: empty brackets at position 0"},
        {"[Purple]0", "format code: unknown bracket [Purple] at position 0"},
        {"[Color57]0", "format code: unknown bracket [Color57] at position 0"},
        {"0;[>abc]0", "format code: bad condition [>abc] at position 2"},
        {"[<]0", "format code: bad condition [<] at position 0"},
    };
    for (const auto &[code, message] : cases) {
        try {
            ParseFormatCode(code);
            ADD_FAILURE() << "no error for " << code;
        } catch (const FormatCodeError &error) {
            EXPECT_STREQ(error.what(), message) << code;
        }
    }
}

}  // namespace
}  // namespace workbook::format
