// SPDX-License-Identifier: MIT
// Workbook, Worksheets and Worksheet.
#include <algorithm>
#include <bit>
#include <cmath>

#include "cells/cell_ref.h"
#include "cells/cell_values.h"
#include "objects/cell_put.h"
#include "automation/text.h"
#include "objects/session.h"
#include "workbook/cell_source.h"
#include "workbook/limits.h"

namespace workbook {
namespace {

class WorksheetImpl : public Worksheet, public CellSource, public CellSink {
public:
    WorksheetImpl(std::shared_ptr<Session> s, std::shared_ptr<Book> b, size_t index)
        : session_(std::move(s)), book_(std::move(b)), index_(index)
    {
    }

    std::shared_ptr<Range> UsedRange() override
    {
        session_->CheckLive(*book_);
        auto bounds = book_->doc->Worksheet(index_).model.store.Bounds();
        return MakeRange(session_, book_, index_, bounds ? *bounds : Rect{}, false);
    }

    std::shared_ptr<Range> GetRange(const std::string &cell1, const std::string &cell2) override
    {
        session_->CheckLive(*book_);
        auto a = ParseRangeAddress(cell1);
        if (!a) Fail(kRequestRefused, automation::MessageExcerpt(cell1) + " is not a cell address");
        Rect r = *a;
        if (!cell2.empty()) {
            auto b = ParseRangeAddress(cell2);
            if (!b) Fail(kRequestRefused, automation::MessageExcerpt(cell2) + " is not a cell address");
            r = Rect{std::min(r.top, b->top), std::min(r.left, b->left), std::max(r.bottom, b->bottom),
                     std::max(r.right, b->right)};
        }
        return MakeRange(session_, book_, index_, r, false);
    }

    void Clear() override
    {
        session_->CheckLive(*book_);
        book_->doc->ClearWorksheet(index_);
    }

    std::vector<UnreadableNumber> UnreadableNumbers() override
    {
        session_->CheckLive(*book_);
        return book_->doc->Worksheet(index_).model.unreadableNumbers;
    }

    CellContent GetCell(int32_t row, int32_t column) override
    {
        const Cell *cell = Find(row, column);
        return cell ? Content(*cell) : CellContent{};
    }

    void ForEachValue(const std::function<void(int32_t row, int32_t column, const CellContent &cell)> &visit) override
    {
        session_->CheckLive(*book_);
        for (const Row &row : book_->doc->Worksheet(index_).model.store.Rows())
            for (const Cell &cell : row.cells)
                if (cell.kind != CellKind::Empty) visit(int32_t(row.index), int32_t(cell.column), Content(cell));
    }

    void ReadNumbers(int32_t firstRow, int32_t rowCount, int32_t firstColumn, int32_t columnCount, double *out,
                     double empty,
                     const std::function<double(int32_t row, int32_t column, const CellContent &cell)> &other) override
    {
        session_->CheckLive(*book_);
        if (rowCount <= 0 || columnCount <= 0) return;
        CheckOnGrid(firstRow, firstColumn);
        std::fill_n(out, size_t(rowCount) * size_t(columnCount), empty);
        const Rect r{uint32_t(firstRow), uint32_t(firstColumn),
                     uint32_t(std::min<int64_t>(int64_t{firstRow} + rowCount - 1, limits::kMaxRows)),
                     uint32_t(std::min<int64_t>(int64_t{firstColumn} + columnCount - 1, limits::kMaxColumns))};
        book_->doc->Worksheet(index_).model.store.ForEach(r, [&](uint32_t row, const Cell &cell) {
            const size_t at = size_t(cell.column - r.left) * size_t(rowCount) + size_t(row - r.top);
            if (cell.kind == CellKind::Number) out[at] = cell.Number();
            else if (cell.kind != CellKind::Empty) out[at] = other(int32_t(row), int32_t(cell.column), Content(cell));
        });
    }

    int32_t CountFilledDown(int32_t row, int32_t column, int32_t lastRow) override
    {
        session_->CheckLive(*book_);
        if (row < 1 || column < 1 || row > lastRow) return 0;
        const CellStore &store = book_->doc->Worksheet(index_).model.store;
        CellStore::FindHint hint;  // row after row: each next cell is found without a search
        int32_t count = 0;
        for (; int64_t{row} + count <= lastRow; ++count) {
            const Cell *cell = store.Find(uint32_t(row + count), uint32_t(column), hint);
            if (!cell || cell->kind == CellKind::Empty) break;
        }
        return count;
    }

    bool IsEmpty(int32_t row, int32_t column) override
    {
        const Cell *cell = Find(row, column);
        return !cell || cell->kind == CellKind::Empty;
    }

    UsedBounds GetUsedBounds() override
    {
        session_->CheckLive(*book_);
        const Rect r = book_->doc->Worksheet(index_).model.store.Bounds().value_or(Rect{});
        return UsedBounds{int32_t(r.top), int32_t(r.left), int32_t(r.bottom), int32_t(r.right)};
    }

    void PutNumber(int32_t row, int32_t column, double value) override
    {
        session_->CheckLive(*book_);
        CheckOnGrid(row, column);
        // What the put of a VT_R8 comes to: a number (a NaN or an infinity is
        // #NUM!), and no format change, so the cell's style is not looked up.
        CellStore &store = book_->doc->Worksheet(index_).model.store;
        if (std::isfinite(value))
            store.SetValue(uint32_t(row), uint32_t(column), CellKind::Number, std::bit_cast<uint64_t>(value));
        else
            store.SetValue(uint32_t(row), uint32_t(column), CellKind::Error, static_cast<uint64_t>(CellError::Num));
        book_->doc->Touch(index_);
    }

    void PutVariant(int32_t row, int32_t column, const VARIANT &value, bool asValue) override
    {
        session_->CheckLive(*book_);
        CheckOnGrid(row, column);
        const PutValue in = FromVariant(value);
        Document &doc = *book_->doc;
        PutCell(doc, doc.Worksheet(index_).model.store, uint32_t(row), uint32_t(column), in, asValue);
        doc.Touch(index_);
    }

private:
    static void CheckOnGrid(int32_t row, int32_t column)
    {
        if (row < 1 || column < 1 || uint32_t(row) > limits::kMaxRows || uint32_t(column) > limits::kMaxColumns)
            Fail(kRequestRefused, "row " + std::to_string(row) + ", column " + std::to_string(column) +
                                      " lies outside the sheet");
    }

    // What Value2 gives for a stored cell.
    CellContent Content(const Cell &cell)
    {
        CellContent out;
        switch (cell.kind) {
        case CellKind::Number:
            out.kind = CellContent::Kind::Number;
            out.number = cell.Number();
            break;
        case CellKind::String:
            out.kind = CellContent::Kind::Text;
            out.text = book_->doc->Strings().Get(cell.StringIndex());
            break;
        case CellKind::Boolean:
            out.kind = CellContent::Kind::Boolean;
            out.boolean = cell.Boolean();
            break;
        case CellKind::Error:
            out.kind = CellContent::Kind::Error;
            out.error = ErrorScode(cell.Error()) & 0xFFFF;
            break;
        case CellKind::Empty:
            break;
        }
        return out;
    }

    const Cell *Find(int32_t row, int32_t column)
    {
        session_->CheckLive(*book_);
        if (row < 1 || column < 1) return nullptr;
        return book_->doc->Worksheet(index_).model.store.Find(uint32_t(row), uint32_t(column), hint_);
    }

    std::shared_ptr<Session> session_;
    std::shared_ptr<Book> book_;
    size_t index_;
    CellStore::FindHint hint_;  // where the last read was: reads in order skip the searches
};

class WorksheetsImpl : public Worksheets {
public:
    WorksheetsImpl(std::shared_ptr<Session> s, std::shared_ptr<Book> b) : session_(std::move(s)), book_(std::move(b)) {}

    int32_t Count() override
    {
        session_->CheckLive(*book_);
        return static_cast<int32_t>(book_->doc->WorksheetCount());
    }

    std::shared_ptr<Worksheet> Item(int32_t index) override
    {
        int32_t count = Count();
        if (index < 1 || index > count)
            Fail(DISP_E_BADINDEX, "worksheet " + std::to_string(index) + " does not exist: the workbook has " +
                                      std::to_string(count));
        return std::make_shared<WorksheetImpl>(session_, book_, static_cast<size_t>(index - 1));
    }

private:
    std::shared_ptr<Session> session_;
    std::shared_ptr<Book> book_;
};

class WorkbookImpl : public Workbook {
public:
    WorkbookImpl(std::shared_ptr<Session> s, std::shared_ptr<Book> b) : session_(std::move(s)), book_(std::move(b)) {}

    std::shared_ptr<Worksheets> GetWorksheets() override
    {
        session_->CheckLive(*book_);
        return std::make_shared<WorksheetsImpl>(session_, book_);
    }

    bool Date1904() override
    {
        session_->CheckLive(*book_);
        return book_->doc->Date1904();
    }

    std::vector<SheetTab> Tabs() override
    {
        session_->CheckLive(*book_);
        return book_->doc->Tabs();
    }

    void Save() override
    {
        session_->CheckLive(*book_);
        book_->doc->Save();
    }

    void SaveAs(const std::string &filename) override
    {
        session_->CheckLive(*book_);
        if (filename.empty()) Fail(E_INVALIDARG, "SaveAs needs a file name");
        book_->doc->SaveAs(filename);
    }

    void Close(bool saveChanges) override
    {
        session_->CheckLive(*book_);
        if (saveChanges) book_->doc->Save();
        book_->Close();
        session_->Forget(book_.get());
    }

private:
    std::shared_ptr<Session> session_;
    std::shared_ptr<Book> book_;
};

}  // namespace

std::shared_ptr<Workbook> MakeWorkbook(std::shared_ptr<Session> session, std::shared_ptr<Book> book)
{
    return std::make_shared<WorkbookImpl>(std::move(session), std::move(book));
}

}  // namespace workbook
