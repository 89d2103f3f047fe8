// SPDX-License-Identifier: MIT
#include "formulas/formula_evaluator.h"

#include <charconv>
#include <cmath>
#include <ixion/formula_function_opcode.hpp>

#include "formulas/formula_operands.h"
#include "workbook/limits.h"

namespace workbook {
namespace {

using ixion::fopcode_t;

std::string_view TrimmedSpaces(std::string_view s)
{
    while (!s.empty() && s.front() == ' ') s.remove_prefix(1);
    while (!s.empty() && s.back() == ' ') s.remove_suffix(1);
    return s;
}

int CompareText(std::string_view a, std::string_view b)
{
    // Texts compare without regard to case, as a spreadsheet compares them.
    for (size_t i = 0; i < a.size() && i < b.size(); ++i) {
        const int x = std::tolower(static_cast<unsigned char>(a[i]));
        const int y = std::tolower(static_cast<unsigned char>(b[i]));
        if (x != y) return x < y ? -1 : 1;
    }
    return a.size() == b.size() ? 0 : (a.size() < b.size() ? -1 : 1);
}

// Numbers sort before texts, texts before booleans; an empty cell takes the
// other side's type.
int Compare(const CellValue &a, const CellValue &b)
{
    auto rank = [](const CellValue &v) { return std::holds_alternative<std::string>(v) ? 1 : std::holds_alternative<bool>(v) ? 2 : 0; };
    auto filled = [](const CellValue &v, const CellValue &other) -> CellValue {
        if (!std::holds_alternative<std::monostate>(v)) return v;
        if (std::holds_alternative<std::string>(other)) return std::string();
        if (std::holds_alternative<bool>(other)) return false;
        return 0.0;
    };
    const CellValue x = filled(a, b), y = filled(b, a);
    if (rank(x) != rank(y)) return rank(x) < rank(y) ? -1 : 1;
    if (auto *s = std::get_if<std::string>(&x)) return CompareText(*s, std::get<std::string>(y));
    if (auto *t = std::get_if<bool>(&x)) return *t == std::get<bool>(y) ? 0 : (*t ? 1 : -1);
    const double p = std::get<double>(x), q = std::get<double>(y);
    return p == q ? 0 : (p < q ? -1 : 1);
}

CellValue Arithmetic(fopcode_t op, const CellValue &a, const CellValue &b)
{
    const auto x = NumberOf(a);
    if (auto *e = std::get_if<CellError>(&x)) return *e;
    const auto y = NumberOf(b);
    if (auto *e = std::get_if<CellError>(&y)) return *e;
    const double p = std::get<double>(x), q = std::get<double>(y);
    double r = 0;
    switch (op) {
    case fopcode_t::fop_plus: r = p + q; break;
    case fopcode_t::fop_minus: r = p - q; break;
    case fopcode_t::fop_multiply: r = p * q; break;
    case fopcode_t::fop_divide:
        if (q == 0) return CellError::Div0;
        r = p / q;
        break;
    case fopcode_t::fop_exponent:
        if (p == 0 && q == 0) return CellError::Num;
        r = std::pow(p, q);
        break;
    default: return CellError::Value;
    }
    if (!std::isfinite(r)) return CellError::Num;
    return r;
}

// Reads the tokens left to right, by the operators' precedence: comparison,
// then &, then + and -, then * and /, then ^, then a sign.
class Evaluator {
public:
    Evaluator(const ixion::formula_tokens_t &tokens, const ixion::abs_address_t &pos,
              const ixion::iface::formula_model_access &model, FormulaContext &context)
        : tokens_(tokens), pos_(pos), model_(model), context_(context)
    {
    }

    CellValue Run()
    {
        Operand result = Comparison();
        if (at_ != tokens_.size()) Malformed();
        CellValue value = Scalar(result, context_);
        if (std::holds_alternative<std::monostate>(value)) return 0.0;
        return value;
    }

private:
    fopcode_t Peek() const { return at_ < tokens_.size() ? tokens_[at_]->get_opcode() : fopcode_t::fop_unknown; }

    [[noreturn]] static void Malformed() { throw FormulaFailure("its text could not be read"); }

    CellValue Value(const Operand &o) { return Scalar(o, context_); }

    // Nesting as deep as a spreadsheet allows, and a bound on the stack.
    static constexpr int kMaxNesting = 256;

    Operand Comparison()
    {
        if (++depth_ > kMaxNesting) throw FormulaFailure("it nests deeper than " + std::to_string(kMaxNesting) + " levels");
        Operand result = ComparisonChain();
        --depth_;
        return result;
    }

    Operand ComparisonChain()
    {
        Operand left = Concatenation();
        for (;;) {
            const fopcode_t op = Peek();
            if (op != fopcode_t::fop_equal && op != fopcode_t::fop_not_equal && op != fopcode_t::fop_less &&
                op != fopcode_t::fop_greater && op != fopcode_t::fop_less_equal && op != fopcode_t::fop_greater_equal)
                return left;
            ++at_;
            const CellValue a = Value(left), b = Value(Concatenation());
            if (auto *e = std::get_if<CellError>(&a)) {
                left = CellValue(*e);
                continue;
            }
            if (auto *e = std::get_if<CellError>(&b)) {
                left = CellValue(*e);
                continue;
            }
            const int c = Compare(a, b);
            bool r = false;
            switch (op) {
            case fopcode_t::fop_equal: r = c == 0; break;
            case fopcode_t::fop_not_equal: r = c != 0; break;
            case fopcode_t::fop_less: r = c < 0; break;
            case fopcode_t::fop_greater: r = c > 0; break;
            case fopcode_t::fop_less_equal: r = c <= 0; break;
            default: r = c >= 0; break;
            }
            left = CellValue(r);
        }
    }

    Operand Concatenation()
    {
        Operand left = Additive();
        while (Peek() == fopcode_t::fop_concat) {
            ++at_;
            const auto a = TextOf(Value(left));
            const auto b = TextOf(Value(Additive()));
            if (auto *e = std::get_if<CellError>(&a)) left = CellValue(*e);
            else if (auto *f = std::get_if<CellError>(&b)) left = CellValue(*f);
            else left = CellValue(std::get<std::string>(a) + std::get<std::string>(b));
        }
        return left;
    }

    Operand Additive()
    {
        Operand left = Multiplicative();
        for (fopcode_t op = Peek(); op == fopcode_t::fop_plus || op == fopcode_t::fop_minus; op = Peek()) {
            ++at_;
            const CellValue a = Value(left);
            left = Arithmetic(op, a, Value(Multiplicative()));
        }
        return left;
    }

    Operand Multiplicative()
    {
        Operand left = Power();
        for (fopcode_t op = Peek(); op == fopcode_t::fop_multiply || op == fopcode_t::fop_divide; op = Peek()) {
            ++at_;
            const CellValue a = Value(left);
            left = Arithmetic(op, a, Value(Power()));
        }
        return left;
    }

    Operand Power()
    {
        Operand left = Sign();
        while (Peek() == fopcode_t::fop_exponent) {
            ++at_;
            const CellValue a = Value(left);
            left = Arithmetic(fopcode_t::fop_exponent, a, Value(Sign()));
        }
        return left;
    }

    Operand Sign()
    {
        const fopcode_t op = Peek();
        if (op != fopcode_t::fop_plus && op != fopcode_t::fop_minus) return Primary();
        ++at_;
        if (++depth_ > kMaxNesting) throw FormulaFailure("it nests deeper than " + std::to_string(kMaxNesting) + " levels");
        const CellValue v = Value(Sign());
        --depth_;
        if (op == fopcode_t::fop_plus) return v;
        return Arithmetic(fopcode_t::fop_minus, 0.0, v);
    }

    Operand Primary()
    {
        if (at_ >= tokens_.size()) Malformed();
        const ixion::formula_token &t = *tokens_[at_++];
        switch (t.get_opcode()) {
        case fopcode_t::fop_value: return CellValue(t.get_value());
        case fopcode_t::fop_string: {
            const std::string *s = model_.get_string(t.get_uint32());
            return CellValue(s ? *s : std::string());
        }
        case fopcode_t::fop_single_ref: {
            const ixion::abs_address_t a = t.get_single_ref().to_abs(pos_);
            return Reference(a, a);
        }
        case fopcode_t::fop_range_ref: {
            const ixion::abs_range_t r = t.get_range_ref().to_abs(pos_);
            return Reference(r.first, r.last);
        }
        case fopcode_t::fop_open: {
            Operand inner = Comparison();
            if (Peek() != fopcode_t::fop_close) Malformed();
            ++at_;
            return inner;
        }
        case fopcode_t::fop_function: return Call(static_cast<ixion::formula_function_t>(t.get_uint32()));
        case fopcode_t::fop_named_expression:
            if (Peek() == fopcode_t::fop_open) throw FormulaFailure("unknown function " + t.get_name());
            throw FormulaFailure("unknown name " + t.get_name());
        case fopcode_t::fop_table_ref: throw FormulaFailure("references to tables are not supported");
        default: Malformed();
        }
    }

    // A reference within the sheet grid; a whole column or row where the
    // other coordinate is unset.
    Operand Reference(const ixion::abs_address_t &first, const ixion::abs_address_t &last)
    {
        if (first.sheet < 0 || static_cast<size_t>(first.sheet) >= model_.get_sheet_count() || last.sheet != first.sheet)
            return CellValue(CellError::Ref);
        const bool allRows = first.row == ixion::row_unset || last.row == ixion::row_unset;
        const bool allColumns = first.column == ixion::column_unset || last.column == ixion::column_unset;
        Rect r;
        r.top = allRows ? 1 : static_cast<uint32_t>(first.row + 1);
        r.bottom = allRows ? limits::kMaxRows : static_cast<uint32_t>(last.row + 1);
        r.left = allColumns ? 1 : static_cast<uint32_t>(first.column + 1);
        r.right = allColumns ? limits::kMaxColumns : static_cast<uint32_t>(last.column + 1);
        if ((!allRows && (first.row < 0 || last.row < first.row || r.bottom > limits::kMaxRows)) ||
            (!allColumns && (first.column < 0 || last.column < first.column || r.right > limits::kMaxColumns)))
            return CellValue(CellError::Ref);
        return RangeRef{static_cast<size_t>(first.sheet), r};
    }

    Operand Call(ixion::formula_function_t function)
    {
        const std::string name(ixion::get_formula_function_name(function));
        std::vector<Operand> args;
        if (Peek() == fopcode_t::fop_open) {
            ++at_;
            if (Peek() != fopcode_t::fop_close) {
                for (;;) {
                    args.push_back(Comparison());
                    if (Peek() != fopcode_t::fop_sep) break;
                    ++at_;
                }
            }
            if (Peek() != fopcode_t::fop_close) Malformed();
            ++at_;
        } else if (name != "TRUE" && name != "FALSE") {
            throw FormulaFailure("unknown name " + name);  // a function's name without its call
        }
        FormulaFunction f = FindFunction(name);
        if (!f) throw FormulaFailure("the function " + name + " is not supported");
        return f(args, context_);
    }

    const ixion::formula_tokens_t &tokens_;
    const ixion::abs_address_t &pos_;
    const ixion::iface::formula_model_access &model_;
    FormulaContext &context_;
    size_t at_ = 0;
    int depth_ = 0;
};

}  // namespace

CellValue Scalar(const Operand &operand, FormulaContext &context)
{
    if (auto *v = std::get_if<CellValue>(&operand)) return *v;
    const RangeRef &r = std::get<RangeRef>(operand);
    if (r.rect.Rows() != 1 || r.rect.Columns() != 1) return CellError::Value;
    return context.cells.Value(r.sheet, r.rect.top, r.rect.left);
}

std::variant<double, CellError> NumberOf(const CellValue &value)
{
    if (auto *d = std::get_if<double>(&value)) return *d;
    if (auto *b = std::get_if<bool>(&value)) return *b ? 1.0 : 0.0;
    if (auto *e = std::get_if<CellError>(&value)) return *e;
    if (auto *s = std::get_if<std::string>(&value)) {
        const std::string_view t = TrimmedSpaces(*s);
        double d = 0;
        auto r = std::from_chars(t.data(), t.data() + t.size(), d);
        if (t.empty() || r.ec != std::errc() || r.ptr != t.data() + t.size()) return CellError::Value;
        return d;
    }
    return 0.0;
}

std::variant<std::string, CellError> TextOf(const CellValue &value)
{
    if (auto *s = std::get_if<std::string>(&value)) return *s;
    if (auto *d = std::get_if<double>(&value)) return NumberText(*d);
    if (auto *b = std::get_if<bool>(&value)) return std::string(*b ? "TRUE" : "FALSE");
    if (auto *e = std::get_if<CellError>(&value)) return *e;
    return std::string();
}

std::variant<bool, CellError> BooleanOf(const CellValue &value)
{
    if (auto *b = std::get_if<bool>(&value)) return *b;
    if (auto *d = std::get_if<double>(&value)) return *d != 0;
    if (auto *e = std::get_if<CellError>(&value)) return *e;
    if (auto *s = std::get_if<std::string>(&value)) {
        if (CompareText(*s, "TRUE") == 0) return true;
        if (CompareText(*s, "FALSE") == 0) return false;
        return CellError::Value;
    }
    return false;
}

std::string NumberText(double number)
{
    char buffer[32];
    auto r = std::to_chars(buffer, buffer + sizeof buffer, number, std::chars_format::general, 15);
    return std::string(buffer, r.ptr);
}

CellValue EvaluateFormula(const ixion::formula_tokens_t &tokens, const ixion::abs_address_t &pos,
                          const ixion::iface::formula_model_access &model, FormulaCells &cells, bool date1904)
{
    FormulaContext context{cells, date1904};
    return Evaluator(tokens, pos, model, context).Run();
}

}  // namespace workbook
