// SPDX-License-Identifier: MIT
#include "fraction_section.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "decimal_number.h"
#include "placeholders.h"

namespace workbook::format {
namespace {

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

std::string FormatFractionSection(double value, const FormatSection &section) {
    return FractionLayout(section).Format(value);
}

}  // namespace workbook::format
