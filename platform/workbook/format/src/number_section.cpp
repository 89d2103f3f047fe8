// SPDX-License-Identifier: MIT
// Decimal and scientific number sections. Integer digits beyond the
// placeholders go in front of the first one; fraction digits are rounded to
// the placeholders after the point.
#include "number_section.h"

#include <cmath>
#include <vector>

#include "decimal_number.h"
#include "fraction_section.h"
#include "general_number.h"
#include "placeholders.h"

namespace workbook::format {
namespace {

// Decimal and scientific sections.
class DecimalLayout {
public:
    explicit DecimalLayout(const FormatSection &section) : tokens_(section.tokens) {
        exponentAt_ = tokens_.size();
        for (size_t i = 0; i < tokens_.size(); ++i)
            if (tokens_[i].kind == TokenKind::Exponent) exponentAt_ = i;
        pointAt_ = exponentAt_;
        for (size_t i = 0; i < exponentAt_; ++i)
            if (tokens_[i].kind == TokenKind::DecimalPoint) { pointAt_ = i; break; }
        for (size_t i = 0; i < tokens_.size(); ++i) {
            const TokenKind kind = tokens_[i].kind;
            if (kind == TokenKind::Percent) ++percent_;
            if (!IsPlaceholder(kind)) continue;
            if (i < pointAt_) integerSlots_.push_back(kind);
            else if (i < exponentAt_) fractionSlots_.push_back(kind);
            else exponentSlots_.push_back(kind);
        }
        ClassifyCommas();
    }

    std::string Format(double value) const {
        DecimalNumber number = DecimalNumber::FromDouble(value).TimesPowerOfTen(2 * percent_ - 3 * scaling_);
        int exponent = 0;
        if (exponentAt_ < tokens_.size()) number = ScientificMantissa(number, exponent);
        else number = number.RoundedToDecimals(static_cast<int>(fractionSlots_.size()));
        return Emit(number, exponent, value);
    }

private:
    // A comma between integer placeholders groups thousands; one with no
    // placeholder after it in the number scales by 1000.
    void ClassifyCommas() {
        commaRole_.assign(tokens_.size(), CommaRole::Literal);
        for (size_t i = 0; i < exponentAt_; ++i) {
            if (tokens_[i].kind != TokenKind::Comma) continue;
            bool before = false, integerAfter = false, anyAfter = false;
            for (size_t j = 0; j < i; ++j) before = before || IsPlaceholder(tokens_[j].kind);
            for (size_t j = i + 1; j < exponentAt_; ++j) {
                if (!IsPlaceholder(tokens_[j].kind)) continue;
                anyAfter = true;
                if (j < pointAt_) integerAfter = true;
            }
            if (before && integerAfter && i < pointAt_) {
                commaRole_[i] = CommaRole::Grouping;
                grouping_ = true;
            } else if (before && !anyAfter) {
                commaRole_[i] = CommaRole::Scaling;
                ++scaling_;
            } else if (before) {
                commaRole_[i] = CommaRole::Ignored;
            }
        }
    }

    // The mantissa rounded to the fraction placeholders; `exponent` is set so
    // that mantissa x 10^exponent is the value.
    DecimalNumber ScientificMantissa(const DecimalNumber &number, int &exponent) const {
        const int decimals = static_cast<int>(fractionSlots_.size());
        const int k = static_cast<int>(integerSlots_.size());
        bool optional = false;
        for (TokenKind kind : integerSlots_) optional = optional || kind != TokenKind::DigitZero;
        const bool engineering = k > 1 && optional;
        if (number.IsZero()) {
            exponent = 0;
            return number;
        }
        auto exponentFor = [&](int magnitude) {
            if (engineering) return static_cast<int>(std::floor(static_cast<double>(magnitude) / k)) * k;
            return k == 0 ? magnitude + 1 : magnitude - (k - 1);
        };
        exponent = exponentFor(number.Magnitude());
        DecimalNumber mantissa = number.TimesPowerOfTen(-exponent).RoundedToDecimals(decimals);
        if (mantissa.Magnitude() > k - 1) {  // rounding carried into a new digit
            exponent = exponentFor(number.Magnitude() + 1);
            mantissa = number.TimesPowerOfTen(-exponent).RoundedToDecimals(decimals);
        }
        return mantissa;
    }

    std::string ExponentSign(int exponent) const {
        if (exponent < 0) return "-";
        return tokens_[exponentAt_].text == "E+" ? "+" : "";
    }

    std::string ExponentDigits(int exponent) const {
        size_t width = 0;
        for (TokenKind kind : exponentSlots_) width += kind == TokenKind::DigitZero ? 1 : 0;
        std::string digits = std::to_string(exponent < 0 ? -exponent : exponent);
        if (digits.size() < width) digits.insert(0, width - digits.size(), '0');
        return digits;
    }

    std::string Emit(const DecimalNumber &number, int exponent, double value) const {
        const std::string integerDigits = number.IntegerDigits();
        const std::vector<std::string> integerTexts = AlignRight(integerDigits, integerSlots_);
        const std::string fraction = number.FractionDigits(static_cast<int>(fractionSlots_.size()));
        const size_t lastSignificant = fraction.find_last_not_of('0');

        size_t digitCount = 0;
        for (const auto &text : integerTexts)
            for (char c : text) digitCount += c >= '0' && c <= '9';

        std::string out;
        size_t integerIndex = 0, fractionIndex = 0, digitsEmitted = 0;
        bool exponentDigitsDone = false;
        for (size_t i = 0; i < tokens_.size(); ++i) {
            const FormatToken &token = tokens_[i];
            switch (token.kind) {
            case TokenKind::DigitZero:
            case TokenKind::DigitHash:
            case TokenKind::DigitQuestion:
                if (i < pointAt_) {
                    for (char c : integerTexts[integerIndex]) {
                        out += c;
                        if (c < '0' || c > '9') continue;
                        const size_t remaining = digitCount - ++digitsEmitted;
                        if (grouping_ && remaining > 0 && remaining % 3 == 0) out += ',';
                    }
                    ++integerIndex;
                } else if (i < exponentAt_) {
                    const bool significant = lastSignificant != std::string::npos &&
                                             fractionIndex <= lastSignificant;
                    out += significant ? std::string(1, fraction[fractionIndex]) : Filler(token.kind);
                    ++fractionIndex;
                } else if (!exponentDigitsDone) {
                    out += ExponentDigits(exponent);
                    exponentDigitsDone = true;
                }
                break;
            case TokenKind::DecimalPoint:
                if (i == pointAt_ && integerSlots_.empty()) out += integerDigits;
                out += '.';
                break;
            case TokenKind::Comma:
                if (commaRole_[i] == CommaRole::Literal) out += ',';
                break;
            case TokenKind::Exponent:
                out += 'E';
                out += ExponentSign(exponent);
                if (exponentSlots_.empty()) out += ExponentDigits(exponent);
                break;
            case TokenKind::General:
                out += GeneralMagnitudeText(value);
                break;
            default:
                out += token.text;
                break;
            }
        }
        return out;
    }

    enum class CommaRole { Literal, Grouping, Scaling, Ignored };

    const std::vector<FormatToken> &tokens_;
    size_t exponentAt_ = 0;
    size_t pointAt_ = 0;
    int percent_ = 0;
    int scaling_ = 0;
    bool grouping_ = false;
    std::vector<TokenKind> integerSlots_, fractionSlots_, exponentSlots_;
    std::vector<CommaRole> commaRole_;
};

}  // namespace

std::string FormatNumberSection(double value, const FormatSection &section) {
    // A lone General, the commonest section, is its own text: no layout to build.
    if (section.tokens.size() == 1 && section.tokens[0].kind == TokenKind::General) return GeneralMagnitudeText(value);
    for (const auto &token : section.tokens)
        if (token.kind == TokenKind::FractionSlash) return FormatFractionSection(value, section);
    return DecimalLayout(section).Format(value);
}

}  // namespace workbook::format
