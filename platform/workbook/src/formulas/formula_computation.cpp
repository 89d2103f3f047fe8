// SPDX-License-Identifier: MIT
#include "formulas/formula_computation.h"

#include <bit>
#include <cmath>
#include <ixion/formula.hpp>
#include <ixion/formula_name_resolver.hpp>
#include <ixion/model_context.hpp>
#include <map>
#include <unordered_map>

#include "automation/text.h"
#include "cells/cell_ref.h"
#include "cells/cell_values.h"
#include "errors.h"
#include "formulas/formula_evaluator.h"
#include "workbook/limits.h"

namespace workbook {
namespace {

// A sheet name as a formula writes it: quoted unless letters, digits and '_'.
std::string SheetInFormula(const std::string &name)
{
    bool plain = !name.empty();
    for (unsigned char c : name) plain = plain && (std::isalnum(c) || c == '_' || c >= 0x80);
    if (plain) return name;
    std::string quoted = "'";
    for (char c : name) quoted += c == '\'' ? std::string("''") : std::string(1, c);
    return quoted + "'";
}

class Computation : public FormulaCells {
public:
    Computation(const std::vector<NamedSheet> &sheets, StringPool &strings, bool date1904)
        : sheets_(sheets), strings_(strings), date1904_(date1904),
          model_(ixion::rc_size_t{static_cast<ixion::row_t>(limits::kMaxRows), static_cast<ixion::col_t>(limits::kMaxColumns)})
    {
        for (const NamedSheet &s : sheets_) model_.append_sheet(s.name);
        resolver_ = ixion::formula_name_resolver::get(ixion::formula_name_resolver_t::excel_a1, &model_);
    }

    void Run()
    {
        ixion::abs_range_set_t dirty;
        for (size_t s = 0; s < sheets_.size(); ++s) {
            std::map<int64_t, const FormulaSource *> masters;
            for (const FormulaSource &m : sheets_[s].model->sharedMasters) masters.emplace(m.sharedIndex, &m);
            std::map<int64_t, ixion::formula_tokens_store_ptr_t> groups;  // each shared formula is parsed once
            for (const FormulaSource &f : sheets_[s].model->formulasWithoutResult) {
                Pending p{s, &f, &f, {}, State::Waiting};
                if (f.sharedIndex >= 0) {
                    auto m = masters.find(f.sharedIndex);
                    if (m == masters.end()) Refuse(p, "it shares a formula that the sheet doesn't hold");
                    p.text = m->second;
                }
                if (f.array || p.text->array) Refuse(p, "array formulas and data tables are not computed");
                if (p.text->text.empty()) Refuse(p, "it has no text");
                auto group = f.sharedIndex >= 0 ? groups.find(f.sharedIndex) : groups.end();
                p.tokens = group != groups.end() ? group->second : Parse(p);
                if (f.sharedIndex >= 0) groups.emplace(f.sharedIndex, p.tokens);
                const ixion::abs_address_t at = Position(p);
                model_.set_formula_cell(at, p.tokens);
                ixion::register_formula_cell(model_, at);
                dirty.insert(at);
                pendingAt_.emplace(Key(s, f.row, f.column), pending_.size());
                pending_.push_back(std::move(p));
            }
        }
        // In the order the cells depend on each other, so that a long chain
        // doesn't nest; what the order misses is computed when it is read.
        for (const ixion::abs_range_t &r : ixion::query_and_sort_dirty_cells(model_, ixion::abs_range_set_t(), &dirty))
            for (ixion::row_t row = r.first.row; row <= r.last.row; ++row)
                for (ixion::col_t col = r.first.column; col <= r.last.column; ++col) {
                    auto it = pendingAt_.find(Key(size_t(r.first.sheet), uint32_t(row + 1), uint32_t(col + 1)));
                    if (it != pendingAt_.end() && pending_[it->second].state == State::Waiting) Compute(it->second);
                }
        for (size_t i = 0; i < pending_.size(); ++i)
            if (pending_[i].state == State::Waiting) Compute(i);
    }

    CellValue Value(size_t sheet, uint32_t row, uint32_t column) override
    {
        const Cell *cell = sheets_.at(sheet).model->store.Find(row, column);
        if (cell && Uncomputed(*cell)) ComputeAt(sheet, row, column);
        return ValueOf(cell, strings_);
    }

    void ForEachValue(size_t sheet, const Rect &r, const std::function<void(const CellValue &)> &visit) override
    {
        sheets_.at(sheet).model->store.ForEach(r, [&](uint32_t row, const Cell &cell) {
            if (Uncomputed(cell)) ComputeAt(sheet, row, cell.column);
            if (cell.kind != CellKind::Empty) visit(ValueOf(&cell, strings_));
        });
    }

private:
    enum class State : uint8_t { Waiting, Running, Done };
    struct Pending {
        size_t sheet;
        const FormulaSource *cell;  // where the formula stands
        const FormulaSource *text;  // whose text it has: itself, or its shared formula's master
        ixion::formula_tokens_store_ptr_t tokens;
        State state;
    };

    // How deep formulas read other formulas without results before theirs are known.
    static constexpr int kMaxChain = 1000;

    static uint64_t Key(size_t sheet, uint32_t row, uint32_t column)
    {
        return (uint64_t{sheet} << 40) | (uint64_t{row} << 16) | column;
    }

    static bool Uncomputed(const Cell &cell) { return (cell.flags & Cell::kHasFormula) && cell.kind == CellKind::Empty; }

    static ixion::abs_address_t Position(const Pending &p)
    {
        return ixion::abs_address_t(static_cast<ixion::sheet_t>(p.sheet), static_cast<ixion::row_t>(p.cell->row - 1),
                                    static_cast<ixion::col_t>(p.cell->column - 1));
    }

    std::string Where(const Pending &p) const
    {
        return SheetInFormula(sheets_[p.sheet].name) + "!" + CellAddress(p.cell->row, p.cell->column);
    }

    [[noreturn]] void Refuse(const Pending &p, const std::string &why) const
    {
        // A formula is shown as written unless it is long or holds bytes no
        // terminal shows: then as a short escaped excerpt.
        const std::string written = "=" + p.text->text;
        const std::string excerpt = automation::MessageExcerpt(written);
        const std::string formula = p.text->text.empty()                      ? std::string()
                                    : excerpt.size() == written.size() + 2 ? " " + written
                                                                            : " " + excerpt;
        Fail(kBadFile, Where(p) + ": the formula" + formula + " could not be computed: " + why);
    }

    ixion::formula_tokens_store_ptr_t Parse(const Pending &p)
    {
        // A shared formula is read where its master stands; its relative
        // references then move with each cell that shares it.
        const ixion::abs_address_t at(static_cast<ixion::sheet_t>(p.sheet), static_cast<ixion::row_t>(p.text->row - 1),
                                      static_cast<ixion::col_t>(p.text->column - 1));
        ixion::formula_tokens_store_ptr_t store = ixion::formula_tokens_store::create();
        try {
            store->get() = ixion::parse_formula_string(model_, at, *resolver_, p.text->text);
        } catch (const std::exception &e) {
            if (p.text->text.find('[') != std::string::npos) Refuse(p, "it refers to another workbook");
            Refuse(p, std::string("its text could not be read (") + e.what() + ")");
        }
        return store;
    }

    void ComputeAt(size_t sheet, uint32_t row, uint32_t column)
    {
        auto it = pendingAt_.find(Key(sheet, row, column));
        if (it == pendingAt_.end()) return;
        const Pending &p = pending_[it->second];
        if (p.state == State::Running)
            throw FormulaFailure("a circular reference through " + Where(p));
        if (p.state == State::Waiting) Compute(it->second);
    }

    void Compute(size_t index)
    {
        Pending &p = pending_[index];
        if (chain_ >= kMaxChain)
            Refuse(p, "it depends on more than " + std::to_string(kMaxChain) + " formulas in a row that have no result");
        p.state = State::Running;
        ++chain_;
        CellValue result;
        try {
            result = EvaluateFormula(p.tokens->get(), Position(p), model_, *this, date1904_);
        } catch (const FormulaFailure &e) {
            Refuse(p, e.what());
        }
        --chain_;
        Store(p, result);
        p.state = State::Done;
    }

    void Store(const Pending &p, const CellValue &v)
    {
        CellStore &store = sheets_[p.sheet].model->store;
        const uint32_t row = p.cell->row, column = p.cell->column;
        if (auto *d = std::get_if<double>(&v)) {
            if (std::isfinite(*d)) store.SetFormulaResult(row, column, CellKind::Number, std::bit_cast<uint64_t>(*d));
            else store.SetFormulaResult(row, column, CellKind::Error, static_cast<uint64_t>(CellError::Num));
        } else if (auto *s = std::get_if<std::string>(&v)) {
            store.SetFormulaResult(row, column, CellKind::String, strings_.Add(*s));
        } else if (auto *b = std::get_if<bool>(&v)) {
            store.SetFormulaResult(row, column, CellKind::Boolean, *b ? 1 : 0);
        } else if (auto *e = std::get_if<CellError>(&v)) {
            store.SetFormulaResult(row, column, CellKind::Error, static_cast<uint64_t>(*e));
        } else {
            store.SetFormulaResult(row, column, CellKind::Number, std::bit_cast<uint64_t>(0.0));
        }
    }

    const std::vector<NamedSheet> &sheets_;
    StringPool &strings_;
    bool date1904_;
    ixion::model_context model_;
    std::unique_ptr<ixion::formula_name_resolver> resolver_;
    std::vector<Pending> pending_;
    std::unordered_map<uint64_t, size_t> pendingAt_;
    int chain_ = 0;
};

}  // namespace

void ComputeFormulasWithoutResult(const std::vector<NamedSheet> &sheets, StringPool &strings, bool date1904)
{
    bool any = false;
    for (const NamedSheet &s : sheets) any = any || !s.model->formulasWithoutResult.empty();
    if (!any) return;  // no formula library model for workbooks that don't need one
    try {
        Computation computation(sheets, strings, date1904);
        computation.Run();
    } catch (const automation::ComError &) {
        throw;
    } catch (const FormulaFailure &e) {
        Fail(kBadFile, std::string("a formula could not be computed: ") + e.what());
    } catch (const std::exception &e) {
        Fail(kBadFile, std::string("the formulas without a result could not be computed: ") + e.what());
    }
}

}  // namespace workbook
