// SPDX-License-Identifier: MIT
// The functions a formula without a stored result may call: the common
// arithmetic, aggregate, logical, text and date functions.
#include <algorithm>
#include <cctype>
#include <cmath>
#include <unordered_map>

#include "cells/date_serial.h"
#include "formulas/formula_operands.h"

namespace workbook {
namespace {

using Args = std::vector<Operand>;

// The numbers of the arguments, as SUM and its kin read them: in a range only
// numbers count (and errors fail); a value given directly is converted.
struct Numbers {
    std::vector<double> values;
    std::optional<CellError> error;
    size_t filled = 0;  // the non-empty cells and values, for COUNTA
};

Numbers CollectNumbers(const Args &args, FormulaContext &c)
{
    Numbers out;
    for (const Operand &a : args) {
        if (auto *r = std::get_if<RangeRef>(&a)) {
            c.cells.ForEachValue(r->sheet, r->rect, [&](const CellValue &v) {
                ++out.filled;
                if (auto *d = std::get_if<double>(&v)) out.values.push_back(*d);
                else if (auto *e = std::get_if<CellError>(&v); e && !out.error) out.error = *e;
            });
            continue;
        }
        const CellValue &v = std::get<CellValue>(a);
        if (std::holds_alternative<std::monostate>(v)) continue;
        ++out.filled;
        const auto n = NumberOf(v);
        if (auto *e = std::get_if<CellError>(&n)) {
            if (!out.error) out.error = *e;
        } else {
            out.values.push_back(std::get<double>(n));
        }
    }
    return out;
}

CellValue Finite(double d)
{
    if (!std::isfinite(d)) return CellError::Num;
    return d;
}

// The numbers of exactly `count` arguments (`optional` of them may be left
// out, giving `fallback`), or the first error among them.
std::variant<std::vector<double>, CellError> Numeric(const Args &args, FormulaContext &c, size_t count,
                                                     size_t optional = 0, double fallback = 0)
{
    if (args.size() > count || args.size() + optional < count) return CellError::Value;
    std::vector<double> out;
    for (const Operand &a : args) {
        const auto n = NumberOf(Scalar(a, c));
        if (auto *e = std::get_if<CellError>(&n)) return *e;
        out.push_back(std::get<double>(n));
    }
    out.resize(count, fallback);
    return out;
}

// Applies f to the numbers of the arguments, or gives their error.
template <typename F>
CellValue WithNumbers(const Args &args, FormulaContext &c, size_t count, F f, size_t optional = 0,
                      double fallback = 0)
{
    const auto n = Numeric(args, c, count, optional, fallback);
    if (auto *e = std::get_if<CellError>(&n)) return *e;
    return f(std::get<std::vector<double>>(n));
}

CellValue Sum(const Args &a, FormulaContext &c)
{
    const Numbers n = CollectNumbers(a, c);
    if (n.error) return *n.error;
    double s = 0;
    for (double d : n.values) s += d;
    return Finite(s);
}

CellValue Product(const Args &a, FormulaContext &c)
{
    const Numbers n = CollectNumbers(a, c);
    if (n.error) return *n.error;
    double p = n.values.empty() ? 0 : 1;
    for (double d : n.values) p *= d;
    return Finite(p);
}

CellValue Min(const Args &a, FormulaContext &c)
{
    const Numbers n = CollectNumbers(a, c);
    if (n.error) return *n.error;
    return n.values.empty() ? 0.0 : *std::min_element(n.values.begin(), n.values.end());
}

CellValue Max(const Args &a, FormulaContext &c)
{
    const Numbers n = CollectNumbers(a, c);
    if (n.error) return *n.error;
    return n.values.empty() ? 0.0 : *std::max_element(n.values.begin(), n.values.end());
}

CellValue Average(const Args &a, FormulaContext &c)
{
    const Numbers n = CollectNumbers(a, c);
    if (n.error) return *n.error;
    if (n.values.empty()) return CellError::Div0;
    double s = 0;
    for (double d : n.values) s += d;
    return Finite(s / static_cast<double>(n.values.size()));
}

CellValue Count(const Args &a, FormulaContext &c)
{
    // Errors are not counted, and don't fail the count.
    Numbers n = CollectNumbers(a, c);
    return static_cast<double>(n.values.size());
}

CellValue CountA(const Args &a, FormulaContext &c) { return static_cast<double>(CollectNumbers(a, c).filled); }

CellValue If(const Args &a, FormulaContext &c)
{
    if (a.empty() || a.size() > 3) return CellError::Value;
    const auto test = BooleanOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&test)) return *e;
    if (std::get<bool>(test)) return a.size() > 1 ? Scalar(a[1], c) : CellValue(true);
    return a.size() > 2 ? Scalar(a[2], c) : CellValue(false);
}

template <bool All>
CellValue Logical(const Args &a, FormulaContext &c)
{
    if (a.empty()) return CellError::Value;
    bool result = All;
    for (const Operand &o : a) {
        const auto b = BooleanOf(Scalar(o, c));
        if (auto *e = std::get_if<CellError>(&b)) return *e;
        result = All ? (result && std::get<bool>(b)) : (result || std::get<bool>(b));
    }
    return result;
}

CellValue Not(const Args &a, FormulaContext &c)
{
    if (a.size() != 1) return CellError::Value;
    const auto b = BooleanOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&b)) return *e;
    return !std::get<bool>(b);
}

CellValue True(const Args &a, FormulaContext &) { return a.empty() ? CellValue(true) : CellValue(CellError::Value); }
CellValue False(const Args &a, FormulaContext &) { return a.empty() ? CellValue(false) : CellValue(CellError::Value); }

CellValue IfError(const Args &a, FormulaContext &c)
{
    if (a.size() != 2) return CellError::Value;
    CellValue v = Scalar(a[0], c);
    return std::holds_alternative<CellError>(v) ? Scalar(a[1], c) : v;
}

template <typename Test>
CellValue Is(const Args &a, FormulaContext &c, Test test)
{
    if (a.size() != 1) return CellError::Value;
    return test(Scalar(a[0], c));
}

CellValue IsError(const Args &a, FormulaContext &c)
{
    return Is(a, c, [](const CellValue &v) { return std::holds_alternative<CellError>(v); });
}
CellValue IsBlank(const Args &a, FormulaContext &c)
{
    return Is(a, c, [](const CellValue &v) { return std::holds_alternative<std::monostate>(v); });
}
CellValue IsNumber(const Args &a, FormulaContext &c)
{
    return Is(a, c, [](const CellValue &v) { return std::holds_alternative<double>(v); });
}
CellValue IsText(const Args &a, FormulaContext &c)
{
    return Is(a, c, [](const CellValue &v) { return std::holds_alternative<std::string>(v); });
}

CellValue NotAvailable(const Args &a, FormulaContext &) { return a.empty() ? CellError::NA : CellError::Value; }

CellValue Abs(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 1, [](const std::vector<double> &n) -> CellValue { return std::fabs(n[0]); });
}

CellValue Int(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 1, [](const std::vector<double> &n) -> CellValue { return std::floor(n[0]); });
}

// Rounds half away from zero at `digits` decimals (negative: left of the point).
double RoundAt(double x, double digits, double (*how)(double))
{
    const double scale = std::pow(10.0, std::trunc(digits));
    return how(x * scale) / scale;
}

double Up(double x) { return x < 0 ? -std::ceil(-x - 1e-9) : std::ceil(x - 1e-9); }

CellValue Round(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 2, [](const std::vector<double> &n) { return Finite(RoundAt(n[0], n[1], std::round)); });
}
CellValue RoundDown(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 2, [](const std::vector<double> &n) { return Finite(RoundAt(n[0], n[1], std::trunc)); });
}
CellValue RoundUp(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 2, [](const std::vector<double> &n) { return Finite(RoundAt(n[0], n[1], Up)); });
}

CellValue Mod(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 2, [](const std::vector<double> &n) -> CellValue {
        if (n[1] == 0) return CellError::Div0;
        return Finite(n[0] - n[1] * std::floor(n[0] / n[1]));
    });
}

CellValue Sqrt(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 1, [](const std::vector<double> &n) -> CellValue {
        if (n[0] < 0) return CellError::Num;
        return std::sqrt(n[0]);
    });
}

CellValue Power(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 2, [](const std::vector<double> &n) -> CellValue {
        if (n[0] == 0 && n[1] <= 0) return n[1] == 0 ? CellError::Num : CellError::Div0;
        return Finite(std::pow(n[0], n[1]));
    });
}

CellValue Pi(const Args &a, FormulaContext &) { return a.empty() ? CellValue(M_PI) : CellValue(CellError::Value); }

CellValue Date(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 3, [&c](const std::vector<double> &n) -> CellValue {
        double year = std::trunc(n[0]);
        if (year >= 0 && year < 1900) year += 1900;  // two-digit years and the like count from 1900
        if (year < 0 || year > 9999 || std::fabs(n[1]) > 1e6 || std::fabs(n[2]) > 1e8) return CellError::Num;
        const double serial = SerialOfDay(static_cast<int64_t>(year), static_cast<int64_t>(std::trunc(n[1])),
                                          static_cast<int64_t>(std::trunc(n[2])), c.date1904);
        if (serial < 0) return CellError::Num;
        return serial;
    });
}

CellValue Time(const Args &a, FormulaContext &c)
{
    return WithNumbers(a, c, 3, [](const std::vector<double> &n) -> CellValue {
        const double seconds = std::trunc(n[0]) * 3600 + std::trunc(n[1]) * 60 + std::trunc(n[2]);
        if (seconds < 0 || !std::isfinite(seconds)) return CellError::Num;
        return std::fmod(seconds, 86400.0) / 86400.0;
    });
}

// A part of the day or of the time of day a serial stands for.
template <typename Part>
CellValue OfSerial(const Args &a, FormulaContext &c, Part part)
{
    return WithNumbers(a, c, 1, [&](const std::vector<double> &n) -> CellValue {
        if (n[0] < 0 || n[0] > 2958465) return CellError::Num;
        return part(n[0]);
    });
}

CellValue Year(const Args &a, FormulaContext &c)
{
    return OfSerial(a, c, [&](double s) { return static_cast<double>(DayOfSerial(s, c.date1904).year); });
}
CellValue Month(const Args &a, FormulaContext &c)
{
    return OfSerial(a, c, [&](double s) { return static_cast<double>(DayOfSerial(s, c.date1904).month); });
}
CellValue Day(const Args &a, FormulaContext &c)
{
    return OfSerial(a, c, [&](double s) { return static_cast<double>(DayOfSerial(s, c.date1904).day); });
}

// Seconds into the day, rounded to the second as a spreadsheet shows them.
double SecondOfDay(double serial)
{
    const double s = std::round((serial - std::floor(serial)) * 86400.0);
    return s >= 86400 ? 0 : s;
}
CellValue Hour(const Args &a, FormulaContext &c)
{
    return OfSerial(a, c, [](double s) { return std::floor(SecondOfDay(s) / 3600); });
}
CellValue Minute(const Args &a, FormulaContext &c)
{
    return OfSerial(a, c, [](double s) { return std::fmod(std::floor(SecondOfDay(s) / 60), 60.0); });
}
CellValue Second(const Args &a, FormulaContext &c)
{
    return OfSerial(a, c, [](double s) { return std::fmod(SecondOfDay(s), 60.0); });
}

CellValue Concatenate(const Args &a, FormulaContext &c)
{
    std::string out;
    for (const Operand &o : a) {
        const auto t = TextOf(Scalar(o, c));
        if (auto *e = std::get_if<CellError>(&t)) return *e;
        out += std::get<std::string>(t);
    }
    return out;
}

// Byte offsets of the characters of a UTF-8 text, and its size at the end.
std::vector<size_t> CharacterStarts(const std::string &s)
{
    std::vector<size_t> starts;
    for (size_t i = 0; i < s.size(); ++i)
        if ((static_cast<unsigned char>(s[i]) & 0xC0) != 0x80) starts.push_back(i);
    starts.push_back(s.size());
    return starts;
}

// The characters [first, first + count) of the first argument's text.
CellValue Characters(const Args &a, FormulaContext &c, double first, double count)
{
    const auto t = TextOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&t)) return *e;
    if (first < 0 || count < 0) return CellError::Value;
    const std::string &s = std::get<std::string>(t);
    const std::vector<size_t> starts = CharacterStarts(s);
    const size_t length = starts.size() - 1;
    const size_t from = static_cast<size_t>(std::min<double>(first, static_cast<double>(length)));
    const size_t to = static_cast<size_t>(std::min<double>(static_cast<double>(from) + std::trunc(count),
                                                           static_cast<double>(length)));
    return s.substr(starts[from], starts[to] - starts[from]);
}

CellValue Len(const Args &a, FormulaContext &c)
{
    if (a.size() != 1) return CellError::Value;
    const auto t = TextOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&t)) return *e;
    return static_cast<double>(CharacterStarts(std::get<std::string>(t)).size() - 1);
}

CellValue Left(const Args &a, FormulaContext &c)
{
    if (a.empty() || a.size() > 2) return CellError::Value;
    const auto n = Numeric(Args(a.begin() + 1, a.end()), c, 1, 1, 1);
    if (auto *e = std::get_if<CellError>(&n)) return *e;
    return Characters(a, c, 0, std::get<std::vector<double>>(n)[0]);
}

CellValue Right(const Args &a, FormulaContext &c)
{
    if (a.empty() || a.size() > 2) return CellError::Value;
    const auto n = Numeric(Args(a.begin() + 1, a.end()), c, 1, 1, 1);
    if (auto *e = std::get_if<CellError>(&n)) return *e;
    const double count = std::trunc(std::get<std::vector<double>>(n)[0]);
    const CellValue whole = Len(Args{a[0]}, c);
    if (auto *e = std::get_if<CellError>(&whole)) return *e;
    const double length = std::get<double>(whole);
    return Characters(a, c, std::max(0.0, length - count), count);
}

CellValue Mid(const Args &a, FormulaContext &c)
{
    if (a.size() != 3) return CellError::Value;
    const auto n = Numeric(Args(a.begin() + 1, a.end()), c, 2);
    if (auto *e = std::get_if<CellError>(&n)) return *e;
    const std::vector<double> &v = std::get<std::vector<double>>(n);
    if (v[0] < 1) return CellError::Value;
    return Characters(a, c, std::trunc(v[0]) - 1, v[1]);
}

template <int (*Convert)(int)>
CellValue CaseOf(const Args &a, FormulaContext &c)
{
    if (a.size() != 1) return CellError::Value;
    auto t = TextOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&t)) return *e;
    std::string s = std::get<std::string>(t);
    for (char &ch : s)
        if (static_cast<unsigned char>(ch) < 0x80) ch = static_cast<char>(Convert(static_cast<unsigned char>(ch)));
    return s;
}

CellValue Trim(const Args &a, FormulaContext &c)
{
    if (a.size() != 1) return CellError::Value;
    const auto t = TextOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&t)) return *e;
    std::string out;
    for (char ch : std::get<std::string>(t)) {
        if (ch == ' ' && (out.empty() || out.back() == ' ')) continue;
        out += ch;
    }
    if (!out.empty() && out.back() == ' ') out.pop_back();
    return out;
}

CellValue Value(const Args &a, FormulaContext &c)
{
    if (a.size() != 1) return CellError::Value;
    const auto n = NumberOf(Scalar(a[0], c));
    if (auto *e = std::get_if<CellError>(&n)) return *e;
    return std::get<double>(n);
}

const std::unordered_map<std::string_view, FormulaFunction> kFunctions{
    {"SUM", Sum},         {"PRODUCT", Product},     {"MIN", Min},          {"MAX", Max},
    {"AVERAGE", Average}, {"COUNT", Count},         {"COUNTA", CountA},    {"IF", If},
    {"AND", Logical<true>}, {"OR", Logical<false>}, {"NOT", Not},          {"TRUE", True},
    {"FALSE", False},     {"IFERROR", IfError},     {"ISERROR", IsError},  {"ISBLANK", IsBlank},
    {"ISNUMBER", IsNumber}, {"ISTEXT", IsText},     {"NA", NotAvailable},  {"ABS", Abs},
    {"INT", Int},         {"ROUND", Round},         {"ROUNDDOWN", RoundDown}, {"ROUNDUP", RoundUp},
    {"MOD", Mod},         {"SQRT", Sqrt},           {"POWER", Power},      {"PI", Pi},
    {"DATE", Date},       {"TIME", Time},           {"YEAR", Year},        {"MONTH", Month},
    {"DAY", Day},         {"HOUR", Hour},           {"MINUTE", Minute},    {"SECOND", Second},
    {"CONCATENATE", Concatenate}, {"CONCAT", Concatenate}, {"LEN", Len},   {"LEFT", Left},
    {"RIGHT", Right},     {"MID", Mid},             {"UPPER", CaseOf<std::toupper>},
    {"LOWER", CaseOf<std::tolower>}, {"TRIM", Trim}, {"VALUE", Value},
};

}  // namespace

FormulaFunction FindFunction(std::string_view name)
{
    auto it = kFunctions.find(name);
    return it == kFunctions.end() ? nullptr : it->second;
}

}  // namespace workbook
