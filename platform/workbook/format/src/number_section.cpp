// SPDX-License-Identifier: MIT
// Digit placeholders: '0' shows a digit or 0, '#' a digit or nothing, '?' a
// digit or a blank. Integer digits beyond the placeholders go in front of the
// first one; fraction digits are rounded to the placeholders after the point.
#include "number_section.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "decimal_number.h"
#include "general_number.h"

namespace workbook::format {
namespace {

bool IsPlaceholder(TokenKind kind) {
    return kind == TokenKind::DigitZero || kind == TokenKind::DigitHash ||
           kind == TokenKind::DigitQuestion;
}

// What a placeholder shows where the number has no digit for it.
std::string Filler(TokenKind kind) {
    return kind == TokenKind::DigitZero ? "0" : kind == TokenKind::DigitQuestion ? " " : "";
}

// Right-aligned digits over placeholders, one text for each; extra digits go
// into the first. An empty `digits` stands for a zero integer part.
std::vector<std::string> AlignRight(const std::string &digits, const std::vector<TokenKind> &slots) {
    std::vector<std::string> out(slots.size());
    const size_t n = slots.size();
    for (size_t i = 0; i < n; ++i) {
        const size_t fromRight = n - 1 - i;
        out[i] = fromRight < digits.size() ? std::string(1, digits[digits.size() - 1 - fromRight])
                                           : Filler(slots[i]);
    }
    if (n > 0 && digits.size() > n) out[0] = digits.substr(0, digits.size() - n) + out[0];
    return out;
}

// Left-aligned digits over placeholders (a fraction's denominator).
std::vector<std::string> AlignLeft(const std::string &digits, const std::vector<TokenKind> &slots) {
    std::vector<std::string> out(slots.size());
    for (size_t i = 0; i < slots.size(); ++i)
        out[i] = i < digits.size() ? std::string(1, digits[i]) : Filler(slots[i]);
    if (!slots.empty() && digits.size() > slots.size()) out.back() += digits.substr(slots.size());
    return out;
}

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
        const int limit = engineering ? k - 1 : std::max(k - 1, -1);
        if (mantissa.Magnitude() > limit) {  // rounding carried into a new digit
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

// Fractions: an optional integer part, a numerator, '/', and a denominator
// of placeholders (the best fit up to 9, 99, 999) or of fixed digits.
class FractionLayout {
    // A value without integer part this large has no fraction left to show:
    // it is shown over 1.
    static constexpr double kWholeOnly = 1e14;

public:
    explicit FractionLayout(const FormatSection &section) : tokens_(section.tokens) {
        for (size_t i = 0; i < tokens_.size(); ++i)
            if (tokens_[i].kind == TokenKind::FractionSlash) slashAt_ = i;
        numeratorBegin_ = slashAt_;
        while (numeratorBegin_ > 0 && IsPlaceholder(tokens_[numeratorBegin_ - 1].kind)) --numeratorBegin_;
        denominatorEnd_ = slashAt_ + 1;
        while (denominatorEnd_ < tokens_.size() && IsPlaceholder(tokens_[denominatorEnd_].kind))
            ++denominatorEnd_;
        if (denominatorEnd_ == slashAt_ + 1) {
            const std::string &text = tokens_[slashAt_ + 1].text;
            const size_t digits = text.find_first_not_of("0123456789");
            fixedDenominatorDigits_ = digits == std::string::npos ? text.size() : digits;
            fixedDenominator_ = std::stoll(text.substr(0, std::min<size_t>(fixedDenominatorDigits_, 9)));
            if (fixedDenominator_ == 0) fixedDenominator_ = 1;
        }
        for (size_t i = 0; i < numeratorBegin_; ++i)
            if (IsPlaceholder(tokens_[i].kind)) integerSlots_.push_back(tokens_[i].kind);
        for (size_t i = numeratorBegin_; i < slashAt_; ++i) numeratorSlots_.push_back(tokens_[i].kind);
        for (size_t i = slashAt_ + 1; i < denominatorEnd_; ++i) denominatorSlots_.push_back(tokens_[i].kind);
    }

    std::string Format(double value) const {
        double whole = 0, part = value;
        if (!integerSlots_.empty()) {
            whole = std::floor(value);
            part = value - whole;
        }
        long long numerator = 0, denominator = 1;
        std::string numeratorDigits;
        if (part >= kWholeOnly) {
            numeratorDigits = DecimalNumber::FromDouble(part).RoundedToDecimals(0).IntegerDigits();
        } else {
            BestFraction(part, numerator, denominator);
            if (!integerSlots_.empty() && numerator == denominator) {
                whole += 1;
                numerator = 0;
            }
            numeratorDigits = std::to_string(numerator);
        }
        const bool blankFraction = !integerSlots_.empty() && numerator == 0;
        std::string wholeDigits = whole >= 1 ? DecimalNumber::FromDouble(whole).IntegerDigits() : "";
        if (blankFraction && wholeDigits.empty()) wholeDigits = "0";

        const auto wholeTexts = AlignRight(wholeDigits, integerSlots_);
        const auto numeratorTexts = AlignRight(numeratorDigits, numeratorSlots_);
        const auto denominatorTexts = AlignLeft(std::to_string(denominator), denominatorSlots_);

        std::string out;
        size_t wholeIndex = 0;
        for (size_t i = 0; i < tokens_.size(); ++i) {
            const FormatToken &token = tokens_[i];
            if (i >= numeratorBegin_ && i < slashAt_) {
                const std::string &text = numeratorTexts[i - numeratorBegin_];
                out += blankFraction ? std::string(text.size(), ' ') : text;
            } else if (i == slashAt_) {
                out += blankFraction ? " " : "/";
            } else if (i > slashAt_ && i < denominatorEnd_) {
                const std::string &text = denominatorTexts[i - slashAt_ - 1];
                out += blankFraction ? std::string(text.size(), ' ') : text;
            } else if (i == slashAt_ + 1 && fixedDenominatorDigits_ > 0) {
                out += blankFraction ? std::string(fixedDenominatorDigits_, ' ') + token.text.substr(fixedDenominatorDigits_)
                                     : token.text;
            } else if (IsPlaceholder(token.kind) && i < numeratorBegin_) {
                out += wholeTexts[wholeIndex++];
            } else if (token.kind == TokenKind::Comma || token.kind == TokenKind::Percent ||
                       token.kind == TokenKind::DecimalPoint || IsPlaceholder(token.kind)) {
                continue;  // no meaning in a fraction
            } else {
                out += token.text;
            }
        }
        return out;
    }

private:
    // The closest fraction, the smallest denominator among equally close ones.
    void BestFraction(double part, long long &numerator, long long &denominator) const {
        if (fixedDenominator_ > 0) {
            denominator = fixedDenominator_;
            numerator = std::llround(part * static_cast<double>(denominator));
            return;
        }
        long long largest = 1;
        for (size_t i = 0; i < denominatorSlots_.size() && i < 4; ++i) largest *= 10;
        largest -= 1;
        double bestError = 2;
        for (long long q = 1; q <= largest; ++q) {
            const long long p = std::llround(part * static_cast<double>(q));
            const double error = std::fabs(part - static_cast<double>(p) / static_cast<double>(q));
            if (error < bestError - 1e-12) {
                bestError = error;
                numerator = p;
                denominator = q;
            }
        }
    }

    const std::vector<FormatToken> &tokens_;
    size_t slashAt_ = 0, numeratorBegin_ = 0, denominatorEnd_ = 0;
    size_t fixedDenominatorDigits_ = 0;
    long long fixedDenominator_ = 0;
    std::vector<TokenKind> integerSlots_, numeratorSlots_, denominatorSlots_;
};

}  // namespace

std::string FormatNumberSection(double value, const FormatSection &section) {
    for (const auto &token : section.tokens)
        if (token.kind == TokenKind::FractionSlash) return FractionLayout(section).Format(value);
    return DecimalLayout(section).Format(value);
}

}  // namespace workbook::format
