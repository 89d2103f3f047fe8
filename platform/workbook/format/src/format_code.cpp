// SPDX-License-Identifier: MIT
#include "workbook/format/format_code.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <charconv>

#include "utf8.h"

namespace workbook::format {
namespace {

constexpr std::array<std::string_view, 8> kColorNames{"black", "blue",    "cyan",  "green",
                                                      "magenta", "red", "white", "yellow"};

char Lower(char c) { return static_cast<char>(std::tolower(static_cast<unsigned char>(c))); }

bool StartsWithIgnoringCase(std::string_view text, std::string_view prefix) {
    return text.size() >= prefix.size() &&
           std::equal(prefix.begin(), prefix.end(), text.begin(),
                      [](char a, char b) { return Lower(a) == Lower(b); });
}

std::string LowerCopy(std::string_view text) {
    std::string out(text);
    std::transform(out.begin(), out.end(), out.begin(), Lower);
    return out;
}

[[noreturn]] void Fail(const std::string &what, size_t position) {
    throw FormatCodeError("format code: " + what + " at position " + std::to_string(position));
}

bool IsDateTimeKind(TokenKind kind) {
    switch (kind) {
    case TokenKind::Year:
    case TokenKind::Month:
    case TokenKind::Minute:
    case TokenKind::Day:
    case TokenKind::Hour:
    case TokenKind::Second:
    case TokenKind::ElapsedHours:
    case TokenKind::ElapsedMinutes:
    case TokenKind::ElapsedSeconds:
    case TokenKind::AmPm:
        return true;
    default:
        return false;
    }
}

bool IsDigitPlaceholder(TokenKind kind) {
    return kind == TokenKind::DigitZero || kind == TokenKind::DigitHash ||
           kind == TokenKind::DigitQuestion;
}

// Reads the sections of a code one character at a time.
class FormatCodeReader {
public:
    explicit FormatCodeReader(std::string_view code) : code_(code) {}

    FormatCode Read() {
        FormatCode result;
        result.sections.emplace_back();
        while (pos_ < code_.size()) {
            if (code_[pos_] == ';') {
                if (result.sections.size() == 4) Fail("more than four sections", pos_);
                result.sections.emplace_back();
                ++pos_;
                continue;
            }
            ReadToken(result.sections.back());
        }
        for (auto &section : result.sections) Classify(section);
        return result;
    }

private:
    void Add(FormatSection &section, TokenKind kind, std::string text, int count = 1) {
        if (kind == TokenKind::Literal && !section.tokens.empty() &&
            section.tokens.back().kind == TokenKind::Literal) {
            section.tokens.back().text += text;
            return;
        }
        section.tokens.push_back(FormatToken{kind, std::move(text), count});
    }

    // The whole UTF-8 character after a '\', '_' or '*' at pos_.
    std::string_view NextCharacter(char introducer) {
        if (pos_ + 1 >= code_.size())
            Fail(std::string("'") + introducer + "' without a character after it", pos_);
        size_t length = Utf8SequenceLength(code_, pos_ + 1);
        std::string_view ch = code_.substr(pos_ + 1, length);
        pos_ += 1 + length;
        return ch;
    }

    void ReadToken(FormatSection &section) {
        const char c = code_[pos_];
        const std::string_view rest = code_.substr(pos_);
        switch (c) {
        case '"': {
            size_t close = code_.find('"', pos_ + 1);
            if (close == std::string_view::npos) Fail("unterminated quoted text", pos_);
            Add(section, TokenKind::Literal, std::string(code_.substr(pos_ + 1, close - pos_ - 1)));
            pos_ = close + 1;
            return;
        }
        case '\\':
            Add(section, TokenKind::Literal, std::string(NextCharacter(c)));
            return;
        case '_':
            NextCharacter(c);
            Add(section, TokenKind::Literal, " ");
            return;
        case '*':
            NextCharacter(c);  // a fill repeats to the cell's width: no text of its own
            return;
        case '[':
            ReadBracket(section);
            return;
        case '0': Add(section, TokenKind::DigitZero, "0"); ++pos_; return;
        case '#': Add(section, TokenKind::DigitHash, "#"); ++pos_; return;
        case '?': Add(section, TokenKind::DigitQuestion, "?"); ++pos_; return;
        case '.': Add(section, TokenKind::DecimalPoint, "."); ++pos_; return;
        case ',': Add(section, TokenKind::Comma, ","); ++pos_; return;
        case '%': Add(section, TokenKind::Percent, "%"); ++pos_; return;
        case '@': Add(section, TokenKind::TextValue, "@"); ++pos_; return;
        case '/': Add(section, TokenKind::FractionSlash, "/"); ++pos_; return;
        default:
            break;
        }
        if (StartsWithIgnoringCase(rest, "general")) {
            Add(section, TokenKind::General, std::string(rest.substr(0, 7)));
            pos_ += 7;
            return;
        }
        if ((c == 'E' || c == 'e') && rest.size() > 1 && (rest[1] == '+' || rest[1] == '-')) {
            Add(section, TokenKind::Exponent, std::string("E") + rest[1]);
            pos_ += 2;
            return;
        }
        if (StartsWithIgnoringCase(rest, "am/pm")) {
            Add(section, TokenKind::AmPm, "AM/PM");
            pos_ += 5;
            return;
        }
        if (StartsWithIgnoringCase(rest, "a/p")) {
            Add(section, TokenKind::AmPm, std::string(rest.substr(0, 3)));
            pos_ += 3;
            return;
        }
        const char lower = Lower(c);
        if (lower == 'y' || lower == 'm' || lower == 'd' || lower == 'h' || lower == 's') {
            size_t end = pos_;
            while (end < code_.size() && Lower(code_[end]) == lower) ++end;
            const int count = static_cast<int>(end - pos_);
            const TokenKind kind = lower == 'y'   ? TokenKind::Year
                                   : lower == 'm' ? TokenKind::Month
                                   : lower == 'd' ? TokenKind::Day
                                   : lower == 'h' ? TokenKind::Hour
                                                  : TokenKind::Second;
            Add(section, kind, std::string(code_.substr(pos_, end - pos_)), count);
            pos_ = end;
            return;
        }
        const size_t length = Utf8SequenceLength(code_, pos_);
        Add(section, TokenKind::Literal, std::string(code_.substr(pos_, length)));
        pos_ += length;
    }

    void ReadBracket(FormatSection &section) {
        const size_t close = code_.find(']', pos_ + 1);
        if (close == std::string_view::npos) Fail("unterminated '['", pos_);
        const std::string_view inner = code_.substr(pos_ + 1, close - pos_ - 1);
        const size_t start = pos_;
        pos_ = close + 1;
        if (inner.empty()) Fail("empty brackets", start);
        if (inner[0] == '$') {
            // [$USD-409]: a currency text, then an optional locale after '-'.
            const std::string_view symbol = inner.substr(1, inner.find('-') - 1);
            if (!symbol.empty()) Add(section, TokenKind::Literal, std::string(symbol));
            return;
        }
        if (inner[0] == '<' || inner[0] == '>' || inner[0] == '=') {
            section.condition = ReadCondition(inner, start);
            return;
        }
        const char first = Lower(inner[0]);
        if ((first == 'h' || first == 'm' || first == 's') &&
            std::all_of(inner.begin(), inner.end(), [&](char ch) { return Lower(ch) == first; })) {
            const TokenKind kind = first == 'h'   ? TokenKind::ElapsedHours
                                   : first == 'm' ? TokenKind::ElapsedMinutes
                                                  : TokenKind::ElapsedSeconds;
            Add(section, kind, "[" + std::string(inner) + "]", static_cast<int>(inner.size()));
            return;
        }
        const std::string lower = LowerCopy(inner);
        if (std::find(kColorNames.begin(), kColorNames.end(), lower) != kColorNames.end()) {
            section.color = std::string(inner);
            return;
        }
        if (lower.starts_with("color")) {
            int number = 0;
            const char *begin = lower.data() + 5;
            const char *end = lower.data() + lower.size();
            auto [ptr, ec] = std::from_chars(begin, end, number);
            if (ec == std::errc() && ptr == end && begin != end && number >= 1 && number <= 56) {
                section.color = std::string(inner);
                return;
            }
        }
        Fail("unknown bracket [" + std::string(inner) + "]", start);
    }

    static Condition ReadCondition(std::string_view inner, size_t position) {
        static constexpr std::array<std::pair<std::string_view, ConditionOp>, 6> kOps{{
            {"<=", ConditionOp::LessEqual},
            {">=", ConditionOp::GreaterEqual},
            {"<>", ConditionOp::NotEqual},
            {"<", ConditionOp::Less},
            {">", ConditionOp::Greater},
            {"=", ConditionOp::Equal},
        }};
        for (const auto &[text, op] : kOps) {
            if (!inner.starts_with(text)) continue;
            std::string_view number = inner.substr(text.size());
            while (!number.empty() && number.front() == ' ') number.remove_prefix(1);
            if (!number.empty() && number.front() == '+') number.remove_prefix(1);
            double operand = 0;
            auto [ptr, ec] = std::from_chars(number.data(), number.data() + number.size(), operand);
            if (ec != std::errc() || ptr != number.data() + number.size() || number.empty())
                Fail("bad condition [" + std::string(inner) + "]", position);
            return Condition{op, operand};
        }
        Fail("bad condition [" + std::string(inner) + "]", position);
    }

    static void ToLiteral(FormatToken &token) { token.kind = TokenKind::Literal; }

    static void Classify(FormatSection &section) {
        auto &tokens = section.tokens;
        const bool isDate = std::any_of(tokens.begin(), tokens.end(),
                                        [](const FormatToken &t) { return IsDateTimeKind(t.kind); });
        if (isDate) {
            section.kind = SectionKind::Date;
            ClassifyDate(tokens);
        } else if (std::any_of(tokens.begin(), tokens.end(),
                               [](const FormatToken &t) { return t.kind == TokenKind::TextValue; })) {
            section.kind = SectionKind::Text;
            for (auto &token : tokens)
                if (token.kind != TokenKind::TextValue) ToLiteral(token);
        } else {
            section.kind = SectionKind::Number;
            ClassifyNumber(tokens);
        }
        MergeLiterals(tokens);
    }

    static void ClassifyDate(std::vector<FormatToken> &tokens) {
        // m or mm right after an hour, or right before a second, is minutes.
        for (size_t i = 0; i < tokens.size(); ++i) {
            if (tokens[i].kind != TokenKind::Month || tokens[i].count > 2) continue;
            const TokenKind before = NeighbourDateKind(tokens, i, -1);
            const TokenKind after = NeighbourDateKind(tokens, i, +1);
            if (before == TokenKind::Hour || before == TokenKind::ElapsedHours ||
                after == TokenKind::Second || after == TokenKind::ElapsedSeconds)
                tokens[i].kind = TokenKind::Minute;
        }
        std::vector<FormatToken> out;
        for (size_t i = 0; i < tokens.size(); ++i) {
            FormatToken token = tokens[i];
            const bool afterSeconds = !out.empty() && (out.back().kind == TokenKind::Second ||
                                                       out.back().kind == TokenKind::ElapsedSeconds);
            if (token.kind == TokenKind::DecimalPoint && afterSeconds && i + 1 < tokens.size() &&
                tokens[i + 1].kind == TokenKind::DigitZero) {
                int digits = 0;
                while (i + 1 < tokens.size() && tokens[i + 1].kind == TokenKind::DigitZero) {
                    ++digits;
                    ++i;
                }
                out.push_back(FormatToken{TokenKind::SecondFraction, "." + std::string(digits, '0'),
                                          std::min(digits, 3)});
                continue;
            }
            if (!IsDateTimeKind(token.kind) && token.kind != TokenKind::Literal) ToLiteral(token);
            out.push_back(std::move(token));
        }
        tokens = std::move(out);
    }

    // The kind of the nearest date/time token before (step -1) or after (+1)
    // token i, across literals; Literal if there is none.
    static TokenKind NeighbourDateKind(const std::vector<FormatToken> &tokens, size_t i, int step) {
        for (ptrdiff_t j = static_cast<ptrdiff_t>(i) + step;
             j >= 0 && j < static_cast<ptrdiff_t>(tokens.size()); j += step) {
            if (IsDateTimeKind(tokens[j].kind)) return tokens[j].kind;
        }
        return TokenKind::Literal;
    }

    static void ClassifyNumber(std::vector<FormatToken> &tokens) {
        for (size_t i = 0; i < tokens.size(); ++i) {
            if (tokens[i].kind != TokenKind::FractionSlash) continue;
            const bool placeholderBefore = i > 0 && IsDigitPlaceholder(tokens[i - 1].kind);
            const bool denominatorAfter =
                i + 1 < tokens.size() &&
                (IsDigitPlaceholder(tokens[i + 1].kind) ||
                 (tokens[i + 1].kind == TokenKind::Literal &&
                  std::isdigit(static_cast<unsigned char>(tokens[i + 1].text[0]))));
            if (!placeholderBefore || !denominatorAfter) ToLiteral(tokens[i]);
        }
        // Only the first fraction slash and the first exponent count.
        bool seenSlash = false, seenExponent = false, seenPoint = false;
        for (auto &token : tokens) {
            if (token.kind == TokenKind::FractionSlash) {
                if (seenSlash) ToLiteral(token);
                seenSlash = true;
            } else if (token.kind == TokenKind::Exponent) {
                if (seenExponent || seenSlash) ToLiteral(token);
                seenExponent = true;
            } else if (token.kind == TokenKind::DecimalPoint) {
                if (seenPoint || seenExponent || seenSlash) ToLiteral(token);
                seenPoint = true;
            }
        }
        JoinFixedDenominator(tokens);
    }

    static bool IsDigitLiteral(const FormatToken &token) {
        return token.kind == TokenKind::Literal && !token.text.empty() &&
               std::all_of(token.text.begin(), token.text.end(),
                           [](char ch) { return std::isdigit(static_cast<unsigned char>(ch)) != 0; });
    }

    // A '0' within a fixed denominator is one of its digits, not a
    // placeholder: "?/100" divides by 100, not by 1.
    static void JoinFixedDenominator(std::vector<FormatToken> &tokens) {
        const auto slash = std::find_if(tokens.begin(), tokens.end(),
                                        [](const FormatToken &t) { return t.kind == TokenKind::FractionSlash; });
        if (slash == tokens.end()) return;
        for (auto it = slash + 1; it != tokens.end() && it + 1 != tokens.end() && IsDigitLiteral(*it); ++it)
            if (it[1].kind == TokenKind::DigitZero) ToLiteral(it[1]);
    }

    static void MergeLiterals(std::vector<FormatToken> &tokens) {
        std::vector<FormatToken> out;
        for (auto &token : tokens) {
            if (token.kind == TokenKind::Literal && !out.empty() &&
                out.back().kind == TokenKind::Literal)
                out.back().text += token.text;
            else
                out.push_back(std::move(token));
        }
        tokens = std::move(out);
    }

    std::string_view code_;
    size_t pos_ = 0;
};

}  // namespace

bool Condition::Holds(double value) const {
    switch (op) {
    case ConditionOp::Less: return value < operand;
    case ConditionOp::LessEqual: return value <= operand;
    case ConditionOp::Greater: return value > operand;
    case ConditionOp::GreaterEqual: return value >= operand;
    case ConditionOp::Equal: return value == operand;
    case ConditionOp::NotEqual: return value != operand;
    }
    return false;
}

FormatCode ParseFormatCode(std::string_view code) {
    if (code.empty()) code = "General";
    return FormatCodeReader(code).Read();
}

}  // namespace workbook::format
