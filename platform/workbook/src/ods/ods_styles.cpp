// SPDX-License-Identifier: MIT
#include "ods/ods_styles.h"

#include <algorithm>

#include "ods/ods_values.h"
#include "ods/ods_xml.h"

namespace workbook::ods {
namespace {

// Repeats of a digit placeholder, bounded: no shown number needs more.
std::string Repeat(char c, std::string_view count, uint64_t fallback)
{
    const uint64_t n = count.empty() ? fallback : ParseCount(count).value_or(0);
    return std::string(size_t(std::min<uint64_t>(n, 30)), c);
}

// The integer digits of a number part, with thousands separators when grouped.
std::string IntegerDigits(const xml::Attributes &attrs)
{
    std::string digits = Repeat('0', Attr(attrs, kNumberNs, "min-integer-digits"), 1);
    if (Attr(attrs, kNumberNs, "grouping") != "true") return digits.empty() ? "#" : digits;
    while (digits.size() < 4) digits.insert(digits.begin(), '#');
    digits.insert(digits.size() - 3, 1, ',');
    return digits;
}

std::string Decimals(const xml::Attributes &attrs)
{
    const std::string places = Repeat('0', Attr(attrs, kNumberNs, "decimal-places"), 0);
    std::string_view least = Attr(attrs, kLoExtNs, "min-decimal-places");
    const size_t shown = least.empty() ? places.size() : std::min(places.size(), Repeat('0', least, 0).size());
    if (places.empty()) return std::string();
    return "." + std::string(shown, '0') + std::string(places.size() - shown, '#');
}

std::string_view WithoutSpaces(std::string_view condition, std::string &buffer)
{
    buffer.clear();
    for (char c : condition)
        if (c != ' ') buffer += c;
    return buffer;
}

}  // namespace

void Styles::OnStart(const xml::Name &name, const xml::Attributes &attrs)
{
    if (name.ns == kStyleNs && name.local == "style") {
        if (Attr(attrs, kStyleNs, "family") == "table-cell")
            cellStyles_[std::string(Attr(attrs, kStyleNs, "name"))] = {std::string(Attr(attrs, kStyleNs, "parent-style-name")),
                                                                       std::string(Attr(attrs, kStyleNs, "data-style-name"))};
        return;
    }
    if (name.ns == kNumberNs && name.local.ends_with("-style")) {
        inDataStyle_ = true;
        current_ = DataStyle{};
        name_ = Attr(attrs, kStyleNs, "name");
        color_.clear();
        kind_ = name.local == "number-style" || name.local == "currency-style" ? Kind::Number
                : name.local == "percentage-style"                            ? Kind::Percentage
                : name.local == "date-style" || name.local == "time-style"    ? Kind::Date
                                                                              : Kind::Other;
        elapsedHours_ = name.local == "time-style" && Attr(attrs, kNumberNs, "truncate-on-overflow") == "false";
        return;
    }
    if (!inDataStyle_) return;
    if (name.ns == kStyleNs && name.local == "map") {
        current_.maps.emplace_back(Attr(attrs, kStyleNs, "condition"), Attr(attrs, kStyleNs, "apply-style-name"));
    } else if (name.ns == kStyleNs && name.local == "text-properties") {
        color_ = Attr(attrs, kFoNs, "color");
    } else if (name.ns == kNumberNs) {
        StartPart(name.local, attrs);
    }
}

void Styles::StartPart(std::string_view local, const xml::Attributes &attrs)
{
    const bool long_ = Attr(attrs, kNumberNs, "style") == "long";
    std::string &code = current_.code;
    if (local == "number") {
        // Without a count of decimals a number shows as many as it needs.
        if (Attr(attrs, kNumberNs, "decimal-places").empty() && Attr(attrs, kNumberNs, "grouping") != "true")
            code += "General";
        else
            code += IntegerDigits(attrs) + Decimals(attrs);
    } else if (local == "scientific-number") {
        code += IntegerDigits(attrs) + Decimals(attrs) + "E+" + Repeat('0', Attr(attrs, kNumberNs, "min-exponent-digits"), 2);
    } else if (local == "fraction") {
        if (!Attr(attrs, kNumberNs, "min-integer-digits").empty()) code += "# ";
        code += Repeat('?', Attr(attrs, kNumberNs, "min-numerator-digits"), 1) + "/";
        const std::string_view denominator = Attr(attrs, kNumberNs, "denominator-value");
        code += ParseCount(denominator) ? std::string(denominator)
                                        : Repeat('?', Attr(attrs, kNumberNs, "min-denominator-digits"), 1);
    } else if (local == "text" || local == "currency-symbol") {
        inLiteral_ = true;
        literal_.clear();
    } else if (local == "text-content") {
        code += '@';
    } else if (local == "day") {
        code += long_ ? "dd" : "d";
    } else if (local == "month") {
        const bool textual = Attr(attrs, kNumberNs, "textual") == "true";
        code += textual ? (long_ ? "mmmm" : "mmm") : (long_ ? "mm" : "m");
    } else if (local == "year") {
        code += long_ ? "yyyy" : "yy";
    } else if (local == "day-of-week") {
        code += long_ ? "dddd" : "ddd";
    } else if (local == "hours") {
        code += elapsedHours_ ? (long_ ? "[hh]" : "[h]") : (long_ ? "hh" : "h");
    } else if (local == "minutes") {
        code += long_ ? "mm" : "m";
    } else if (local == "seconds") {
        code += long_ ? "ss" : "s";
        const std::string places = Repeat('0', Attr(attrs, kNumberNs, "decimal-places"), 0);
        if (!places.empty()) code += "." + places;
    } else if (local == "am-pm") {
        code += "AM/PM";
    }
}

void Styles::OnText(std::string_view text)
{
    if (inLiteral_) literal_ += text.substr(0, 1024 - std::min<size_t>(1024, literal_.size()));
}

void Styles::AppendLiteral(std::string_view text)
{
    // Characters a format code shows as they stand; all others go in quotes.
    const std::string_view plain = kind_ == Kind::Date ? " -/:.," : " -()";
    std::string &code = current_.code;
    bool quoted = false;
    for (char c : text) {
        const bool bare = plain.find(c) != std::string_view::npos || (c == '%' && kind_ == Kind::Percentage);
        if (bare || c == '"') {
            if (quoted) code += '"';
            quoted = false;
            code += c == '"' ? "\\\"" : std::string(1, c);
        } else {
            if (!quoted) code += '"';
            quoted = true;
            code += c;
        }
    }
    if (quoted) code += '"';
}

void Styles::OnEnd(const xml::Name &name)
{
    if (!inDataStyle_ || name.ns != kNumberNs) return;
    if (inLiteral_ && (name.local == "text" || name.local == "currency-symbol")) {
        inLiteral_ = false;
        AppendLiteral(literal_);
    } else if (name.local.ends_with("-style")) {
        inDataStyle_ = false;
        if (current_.code == "General") current_.code.clear();
        if (!current_.code.empty() && (color_ == "#ff0000" || color_ == "#FF0000")) current_.code.insert(0, "[Red]");
        dataStyles_[name_] = std::move(current_);
    }
}

std::string Styles::Compose(const std::string &dataStyle) const
{
    const auto found = dataStyles_.find(dataStyle);
    if (found == dataStyles_.end()) return std::string();
    const DataStyle &style = found->second;
    const auto codeOf = [this](const std::string &name) {
        const auto mapped = dataStyles_.find(name);
        const std::string code = mapped == dataStyles_.end() ? std::string() : mapped->second.code;
        return code.empty() ? std::string("General") : code;
    };
    // The conditions producers write for a sign of their own: the style
    // itself then shows the other numbers.
    std::string positive, negative, buffer;
    bool orZero = false;
    for (const auto &[condition, applied] : style.maps) {
        const std::string_view c = WithoutSpaces(condition, buffer);
        if (c == "value()>=0") positive = codeOf(applied), orZero = true;
        else if (c == "value()>0") positive = codeOf(applied);
        else if (c == "value()<0") negative = codeOf(applied);
    }
    const std::string self = style.code.empty() ? "General" : style.code;
    if (positive.empty()) return style.code;
    if (orZero) return positive + ";" + self;
    return positive + ";" + (negative.empty() ? self : negative) + ";" + self;
}

const std::string &Styles::FormatOf(const std::string &cellStyle)
{
    if (const auto known = formats_.find(cellStyle); known != formats_.end()) return known->second;
    std::string code;
    std::string name = cellStyle;
    for (int depth = 0; depth < 32; ++depth) {  // a chain of parents, perhaps a circle
        const auto found = cellStyles_.find(name);
        if (found == cellStyles_.end()) break;
        if (!found->second.dataStyle.empty()) {
            code = Compose(found->second.dataStyle);
            break;
        }
        name = found->second.parent;
    }
    return formats_.emplace(cellStyle, std::move(code)).first->second;
}

}  // namespace workbook::ods
