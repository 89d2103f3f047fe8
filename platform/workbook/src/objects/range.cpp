// SPDX-License-Identifier: MIT
// Range: values, texts, formats and column widths of a rectangle of cells.
#include <algorithm>
#include <cstring>
#include <exception>
#include <map>
#include <thread>
#include <unordered_map>

#include "cells/cell_ref.h"
#include "cells/cell_values.h"
#include "objects/cell_put.h"
#include "objects/session.h"
#include "styles/format_bridge.h"
#include "workbook/limits.h"

namespace workbook {
namespace {

// A non-owning VARIANT view of one element of a typed array.
VARIANT ElementView(VARTYPE type, const void *element, UINT size)
{
    VARIANT v;
    VariantInit(&v);
    v.vt = type;
    std::memcpy(&v.lVal, element, std::min<size_t>(size, sizeof(v.cyVal)));
    return v;
}

// Sets column's width as fitted, splitting an entry that spans other columns.
void SetFittedWidth(std::vector<ColumnSpec> &cols, uint32_t column, double width)
{
    auto it = std::find_if(cols.begin(), cols.end(), [&](const ColumnSpec &c) { return c.min <= column && column <= c.max; });
    if (it == cols.end()) {
        ColumnSpec c;
        c.min = c.max = column;
        it = cols.insert(std::find_if(cols.begin(), cols.end(), [&](const ColumnSpec &s) { return s.min > column; }), c);
    } else if (it->min != it->max) {
        ColumnSpec before = *it, after = *it, self = *it;
        before.max = column - 1;
        after.min = column + 1;
        self.min = self.max = column;
        size_t at = static_cast<size_t>(it - cols.begin());
        cols.erase(it);
        std::vector<ColumnSpec> pieces;
        if (before.max >= before.min) pieces.push_back(before);
        pieces.push_back(self);
        if (after.min <= after.max) pieces.push_back(after);
        cols.insert(cols.begin() + static_cast<ptrdiff_t>(at), pieces.begin(), pieces.end());
        it = std::find_if(cols.begin(), cols.end(), [&](const ColumnSpec &c) { return c.min == column && c.max == column; });
    }
    it->width = width;
    it->customWidth = true;
    it->bestFit = true;
}

// From this many rows on, AutoFit measures the lower half of the rows on a
// second thread: a long sheet's texts are most of an export's fitting.
constexpr uint64_t kRowsFittedInTwo = 50000;

// The fitted width of each column of r, never below standard: the widest
// text's. It only reads the store, the styles and the strings, so two
// stretches of rows may be measured at once.
std::map<uint32_t, double> FittedWidths(const CellStore &store, const Rect &r, const Styles &styles,
                                        const StringPool &strings, bool date1904, double standard)
{
    std::map<uint32_t, double> widths;
    // A sheet has few styles: their format codes are looked up once.
    std::unordered_map<uint32_t, std::string> codes;
    uint32_t lastColumn = 0;
    double *columnWidth = nullptr;
    store.ForEach(r, [&](uint32_t, const Cell &cell) {
        if (cell.kind == CellKind::Empty) return;
        auto code = codes.find(cell.style);
        if (code == codes.end()) code = codes.emplace(cell.style, styles.NumberFormatOf(cell.style)).first;
        if (!columnWidth || cell.column != lastColumn) {
            columnWidth = &widths.emplace(cell.column, standard).first->second;
            lastColumn = cell.column;
        }
        // Numbers under General, most of a sheet of measurements, are measured without their text.
        const double w = cell.kind == CellKind::Number && code->second == "General"
                             ? format_bridge::GeneralNumberFittingWidth(cell.Number())
                             : format_bridge::TextFittingWidth(
                                   format_bridge::DisplayText(ValueOf(&cell, strings), code->second, date1904));
        *columnWidth = std::max(*columnWidth, w);
    });
    return widths;
}

class RangeImpl : public Range {
public:
    RangeImpl(std::shared_ptr<Session> s, std::shared_ptr<Book> b, size_t sheet, const Rect &r, bool byColumns)
        : session_(std::move(s)), book_(std::move(b)), sheet_(sheet), rect_(r), byColumns_(byColumns)
    {
    }

    std::shared_ptr<Range> Columns() override
    {
        Doc();
        return MakeRange(session_, book_, sheet_, rect_, true);
    }

    void AutoFit() override
    {
        Document &doc = Doc();
        if (!byColumns_) Fail(kRequestRefused, "AutoFit needs whole columns: call it on Columns of the range");
        SheetModel &sheet = Model();
        // The fitted width is the widest text's, and never below the default:
        // each text is measured as it is made, none is kept.
        const double standard = format_bridge::FittingWidth({});
        const auto measure = [&](const Rect &r) {
            return FittedWidths(sheet.store, r, doc.CellFormats(), doc.Strings(), doc.Date1904(), standard);
        };
        std::map<uint32_t, double> widths;
        if (rect_.Rows() < kRowsFittedInTwo) {
            widths = measure(rect_);
        } else {
            Rect upper = rect_, lower = rect_;
            upper.bottom = rect_.top + uint32_t(rect_.Rows() / 2) - 1;
            lower.top = upper.bottom + 1;
            std::map<uint32_t, double> lowerWidths;
            std::exception_ptr lowerFailure;
            {
                std::jthread second([&] {
                    try {
                        lowerWidths = measure(lower);
                    } catch (...) {
                        lowerFailure = std::current_exception();
                    }
                });
                widths = measure(upper);
            }  // joined here, also when the upper half throws
            if (lowerFailure) std::rethrow_exception(lowerFailure);
            for (const auto &[column, w] : lowerWidths) {
                auto [at, added] = widths.emplace(column, w);
                if (!added) at->second = std::max(at->second, w);
            }
        }
        if (widths.empty()) return;
        for (const auto &[column, w] : widths) SetFittedWidth(sheet.columns, column, w);
        doc.Touch(sheet_);
    }

    void Clear() override
    {
        Document &doc = Doc();
        Model().store.Clear(rect_, true, true);
        doc.Touch(sheet_);
    }

    void ClearFormats() override
    {
        Document &doc = Doc();
        Model().store.Clear(rect_, false, true);
        doc.Touch(sheet_);
    }

    void SetNumberFormat(const std::string &format) override
    {
        Document &doc = Doc();
        CellStore &store = Model().store;
        Styles &styles = doc.CellFormats();
        CheckArea();
        for (uint32_t r = rect_.top; r <= rect_.bottom; ++r)
            for (uint32_t c = rect_.left; c <= rect_.right; ++c)
                store.SetStyle(r, c, styles.WithNumberFormat(store.StyleOf(r, c), format));
        doc.Touch(sheet_);
    }

    automation::Variant GetValue2() override
    {
        Document &doc = Doc();
        const CellStore &store = Model().store;
        if (rect_.Rows() == 1 && rect_.Columns() == 1) {
            automation::Variant v;
            if (const Cell *c = store.Find(rect_.top, rect_.left)) FillVariant(*v.Out(), *c, doc.Strings());
            return v;
        }
        uint64_t rows = rect_.Rows(), cols = rect_.Columns();
        if (rows * cols > limits::kMaxArrayElements)
            Fail(E_OUTOFMEMORY, "range " + RangeAddress(rect_) + " is too large to read as one array");
        SAFEARRAYBOUND bounds[2] = {{static_cast<ULONG>(rows), 1}, {static_cast<ULONG>(cols), 1}};
        automation::SafeArray array(SafeArrayCreate(VT_VARIANT, 2, bounds));
        if (!array.Get()) Fail(E_OUTOFMEMORY, "no memory for the values of " + RangeAddress(rect_));
        void *raw = nullptr;
        automation::ThrowIfFailed(SafeArrayAccessData(array.Get(), &raw), "cannot fill the value array");
        auto *data = static_cast<VARIANT *>(raw);
        const StringPool &strings = doc.Strings();
        // Elements lie column after column: the first index runs fastest.
        store.ForEach(rect_, [&](uint32_t row, const Cell &cell) {
            FillVariant(data[uint64_t{cell.column - rect_.left} * rows + (row - rect_.top)], cell, strings);
        });
        SafeArrayUnaccessData(array.Get());
        return automation::Variant::Array(VT_VARIANT, array.Detach());
    }

    void SetValue2(const VARIANT &value) override { Put(value, false); }
    void SetValue(const VARIANT &value) override { Put(value, true); }

    automation::Variant GetText() override
    {
        Document &doc = Doc();
        const CellStore &store = Model().store;
        CheckArea();
        std::string first = Displayed(doc, store.Find(rect_.top, rect_.left));
        for (uint32_t r = rect_.top; r <= rect_.bottom; ++r)
            for (uint32_t c = rect_.left; c <= rect_.right; ++c)
                if ((r != rect_.top || c != rect_.left) && Displayed(doc, store.Find(r, c)) != first) {
                    automation::Variant differ;
                    differ.Out()->vt = VT_NULL;  // cells showing different texts
                    return differ;
                }
        return automation::Variant::String(first);
    }

    int32_t Count() override
    {
        Doc();
        uint64_t n = byColumns_ ? rect_.Columns() : rect_.Rows() * rect_.Columns();
        if (n > INT32_MAX) Fail(DISP_E_OVERFLOW, "the range holds more cells than Count can tell");
        return static_cast<int32_t>(n);
    }

    int32_t Row() override
    {
        Doc();
        return static_cast<int32_t>(rect_.top);
    }

    int32_t Column() override
    {
        Doc();
        return static_cast<int32_t>(rect_.left);
    }

private:
    Document &Doc()
    {
        session_->CheckLive(*book_);
        return *book_->doc;
    }
    SheetModel &Model() { return book_->doc->Worksheet(sheet_).model; }

    // Guards loops over every position of the rectangle.
    void CheckArea() const
    {
        if (rect_.Rows() * rect_.Columns() > limits::kMaxArrayElements)
            Fail(E_OUTOFMEMORY, "range " + RangeAddress(rect_) + " is too large for this call");
    }

    std::string Displayed(Document &doc, const Cell *cell)
    {
        if (!cell || cell->kind == CellKind::Empty) return {};
        return format_bridge::DisplayText(ValueOf(cell, doc.Strings()),
                                          doc.CellFormats().NumberFormatOf(cell->style), doc.Date1904());
    }

    void Put(const VARIANT &value, bool asValue)
    {
        Document &doc = Doc();
        CheckArea();
        bool isArray = (value.vt & VT_ARRAY) != 0;
        if (!isArray) {
            PutValue v = FromVariant(value);
            for (uint32_t r = rect_.top; r <= rect_.bottom; ++r)
                for (uint32_t c = rect_.left; c <= rect_.right; ++c) Store(doc, r, c, v, asValue);
            doc.Touch(sheet_);
            return;
        }
        SAFEARRAY *sa = (value.vt & VT_BYREF) ? *static_cast<SAFEARRAY **>(value.byref) : value.parray;
        if (!sa) Fail(E_INVALIDARG, "a null array can't go into cells");
        UINT dims = SafeArrayGetDim(sa);
        if (dims < 1 || dims > 2) Fail(E_INVALIDARG, "only arrays of one or two dimensions go into cells");
        VARTYPE type = VT_EMPTY;
        automation::ThrowIfFailed(SafeArrayGetVartype(sa, &type), "cannot tell the array's element type");
        UINT size = SafeArrayGetElemsize(sa);
        LONG lo[2] = {0, 0}, hi[2] = {0, 0};
        for (UINT d = 0; d < dims; ++d) {
            automation::ThrowIfFailed(SafeArrayGetLBound(sa, d + 1, &lo[d]), "cannot read the array's bounds");
            automation::ThrowIfFailed(SafeArrayGetUBound(sa, d + 1, &hi[d]), "cannot read the array's bounds");
        }
        // A one-dimensional array is one row.
        uint64_t arrRows = dims == 2 ? static_cast<uint64_t>(hi[0] - lo[0] + 1) : 1;
        uint64_t arrCols = static_cast<uint64_t>(hi[dims - 1] - lo[dims - 1] + 1);
        for (uint32_t r = rect_.top; r <= rect_.bottom; ++r) {
            for (uint32_t c = rect_.left; c <= rect_.right; ++c) {
                uint64_t i = r - rect_.top, j = c - rect_.left;
                // As the object model does: a single row or column repeats
                // across the range; past the array's edge stands #N/A.
                if (arrRows == 1) i = 0;
                if (arrCols == 1) j = 0;
                if (i >= arrRows || j >= arrCols) {
                    PutValue na;
                    na.value = CellError::NA;
                    Store(doc, r, c, na, asValue);
                    continue;
                }
                LONG index[2];
                if (dims == 2) {
                    index[0] = lo[0] + static_cast<LONG>(i);
                    index[1] = lo[1] + static_cast<LONG>(j);
                } else {
                    index[0] = lo[0] + static_cast<LONG>(j);
                }
                void *element = nullptr;
                automation::ThrowIfFailed(SafeArrayPtrOfIndex(sa, index, &element), "cannot read an array element");
                PutValue v = type == VT_VARIANT ? FromVariant(*static_cast<const VARIANT *>(element))
                                                : FromVariant(ElementView(type, element, size));
                Store(doc, r, c, v, asValue);
            }
        }
        doc.Touch(sheet_);
    }

    void Store(Document &doc, uint32_t row, uint32_t column, const PutValue &in, bool asValue)
    {
        PutCell(doc, Model().store, row, column, in, asValue);
    }

    std::shared_ptr<Session> session_;
    std::shared_ptr<Book> book_;
    size_t sheet_;
    Rect rect_;
    bool byColumns_;
};

}  // namespace

std::shared_ptr<Range> MakeRange(std::shared_ptr<Session> session, std::shared_ptr<Book> book, size_t sheet,
                                 const Rect &rect, bool byColumns)
{
    return std::make_shared<RangeImpl>(std::move(session), std::move(book), sheet, rect, byColumns);
}

}  // namespace workbook
