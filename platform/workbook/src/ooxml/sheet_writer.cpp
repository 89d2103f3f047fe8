// SPDX-License-Identifier: MIT
#include "ooxml/sheet_writer.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <vector>

#include "cells/cell_ref.h"
#include "errors.h"
#include "workbook/format/shortest_number.h"
#include "xml/xml_text.h"

namespace workbook {
namespace {

void AppendNumber(std::string &out, double d)
{
    char buf[32];
    out.append(buf, format::ShortestNumberChars(buf, buf + sizeof buf, d));
}

void AppendUint(std::string &out, uint64_t v)
{
    char buf[24];
    auto r = std::to_chars(buf, buf + sizeof buf, v);
    out.append(buf, r.ptr);
}

// The letters of a column (1 is A), without a string of their own: this
// runs for every cell written.
void AppendColumnName(std::string &out, uint32_t column)
{
    char letters[8];
    size_t n = 0;
    for (; column > 0 && n < sizeof letters; column = (column - 1) / 26)
        letters[n++] = static_cast<char>('A' + (column - 1) % 26);
    while (n > 0) out += letters[--n];
}

// Element names with the part's prefix, made once.
struct Names {
    explicit Names(std::string_view p)
        : row("<" + xml::Qualified(p, "row")), rowEnd("</" + xml::Qualified(p, "row") + ">"),
          c("<" + xml::Qualified(p, "c")), cEnd("</" + xml::Qualified(p, "c") + ">"),
          v("<" + xml::Qualified(p, "v") + ">"), vEnd("</" + xml::Qualified(p, "v") + ">")
    {
    }
    std::string row, rowEnd, c, cEnd, v, vEnd;
};

// The part's text as it is made. Once it holds a piece's worth, what it holds
// is handed on; positions count from the part's start all the same.
class PartText {
public:
    explicit PartText(const PieceSink &sink) : sink_(sink) { text_.reserve(kPieceSize + kPieceSlack); }
    std::string &Text() { return text_; }
    uint64_t Position() const { return handedOn_ + text_.size(); }
    void HandOnWhenFull()
    {
        if (text_.size() >= kPieceSize) HandOn();
    }
    void Finish()
    {
        if (!text_.empty()) HandOn();
    }

private:
    static constexpr size_t kPieceSize = size_t{4} << 20;
    static constexpr size_t kPieceSlack = size_t{1} << 20;  // a row begun before the piece was full

    void HandOn()
    {
        handedOn_ += text_.size();
        sink_(std::move(text_));
        text_ = std::string();
        text_.reserve(kPieceSize + kPieceSlack);
    }

    const PieceSink &sink_;
    std::string text_;
    uint64_t handedOn_ = 0;
};

char *Put(char *at, std::string_view text)
{
    std::memcpy(at, text.data(), text.size());
    return at + text.size();
}

// A number in a buffer of its own.
template <typename T>
struct NumberText {
    explicit NumberText(T value) : end(Write(value)) {}
    char *Write(uint32_t value) { return std::to_chars(digits, digits + sizeof digits, value).ptr; }
    char *Write(double value) { return format::ShortestNumberChars(digits, digits + sizeof digits, value); }
    std::string_view View() const { return {digits, static_cast<size_t>(end - digits)}; }
    char digits[32];
    char *end;
};

// A number cell without a formula, by far the most common, made in a buffer
// of its own and appended at once: one append instead of a dozen small ones.
// False, nothing appended, when the element names are too long for it.
bool AppendNumberCell(std::string &out, uint32_t rowIndex, const Cell &cell, const Names &n)
{
    const NumberText row(rowIndex);
    const NumberText style(cell.style);
    const NumberText number(cell.Number());
    char letters[8];
    size_t count = 0;
    for (uint32_t column = cell.column; column > 0 && count < sizeof letters; column = (column - 1) / 26)
        letters[count++] = static_cast<char>('A' + (column - 1) % 26);
    constexpr std::string_view kReference = " r=\"", kStyle = "\" s=\"", kEndTag = "\">";
    const size_t bytes = n.c.size() + kReference.size() + count + row.View().size() +
                         (cell.style ? kStyle.size() + style.View().size() : 0) + kEndTag.size() + n.v.size() +
                         number.View().size() + n.vEnd.size() + n.cEnd.size();
    char buffer[256];
    if (bytes > sizeof buffer) return false;
    char *at = Put(buffer, n.c);
    at = Put(at, kReference);
    while (count > 0) *at++ = letters[--count];
    at = Put(at, row.View());
    if (cell.style) {
        at = Put(at, kStyle);
        at = Put(at, style.View());
    }
    at = Put(at, kEndTag);
    at = Put(at, n.v);
    at = Put(at, number.View());
    at = Put(at, n.vEnd);
    at = Put(at, n.cEnd);
    out.append(buffer, at);
    return true;
}

void AppendCell(std::string &out, uint32_t rowIndex, const Cell &cell, const SheetModel &sheet,
                const SheetWriteContext &ctx, const Names &n)
{
    if (cell.kind == CellKind::Number && !(cell.flags & Cell::kHasFormula) && AppendNumberCell(out, rowIndex, cell, n))
        return;
    out += n.c;
    out += " r=\"";
    AppendColumnName(out, cell.column);
    AppendUint(out, rowIndex);
    out += '"';
    if (cell.style) {
        out += " s=\"";
        AppendUint(out, cell.style);
        out += '"';
    }
    const Formula *f = (cell.flags & Cell::kHasFormula) ? sheet.store.FormulaOf(rowIndex, cell.column) : nullptr;
    switch (cell.kind) {
    case CellKind::String: out += f ? " t=\"str\"" : " t=\"s\""; break;
    case CellKind::Boolean: out += " t=\"b\""; break;
    case CellKind::Error: out += " t=\"e\""; break;
    default: break;
    }
    if (cell.kind == CellKind::Empty && !f) {
        out += "/>";
        return;
    }
    out += '>';
    if (f) out += f->xml;
    if (cell.kind != CellKind::Empty) {
        out += n.v;
        switch (cell.kind) {
        case CellKind::Number: AppendNumber(out, cell.Number()); break;
        case CellKind::String:
            if (f)
                xml::AppendCellText(out, ctx.strings.Get(cell.StringIndex()));
            else
                AppendUint(out, ctx.sharedIndexOf(cell.StringIndex()));
            break;
        case CellKind::Boolean: out += cell.Boolean() ? '1' : '0'; break;
        case CellKind::Error: out += ErrorText(cell.Error()); break;
        case CellKind::Empty: break;
        }
        out += n.vEnd;
    }
    out += n.cEnd;
}

void AppendRowStart(std::string &out, const Row &row, const Names &n)
{
    out += n.row;
    out += " r=\"";
    AppendUint(out, row.index);
    out += '"';
    const RowAttributes &a = row.attributes;
    if (a.style) {
        out += " s=\"";
        AppendUint(out, a.style);
        out += '"';
    }
    if (a.customFormat) out += " customFormat=\"1\"";
    if (a.height > 0) {
        out += " ht=\"";
        AppendNumber(out, a.height);
        out += '"';
    }
    if (a.customHeight) out += " customHeight=\"1\"";
    if (a.hidden) out += " hidden=\"1\"";
    if (a.outlineLevel) {
        out += " outlineLevel=\"";
        AppendUint(out, a.outlineLevel);
        out += '"';
    }
    if (a.collapsed) out += " collapsed=\"1\"";
}

std::string DimensionXml(const SheetModel &sheet, std::string_view prefix)
{
    auto bounds = sheet.store.Bounds();
    return "<" + xml::Qualified(prefix, "dimension") + " ref=\"" +
           (bounds ? RangeAddress(*bounds) : std::string("A1")) + "\"/>";
}

std::string ColsXml(const SheetModel &sheet, std::string_view prefix)
{
    if (sheet.columns.empty()) return {};
    std::string q = xml::Qualified(prefix, "col");
    std::string out = "<" + xml::Qualified(prefix, "cols") + ">";
    for (const auto &c : sheet.columns) {
        out += "<" + q + " min=\"" + std::to_string(c.min) + "\" max=\"" + std::to_string(c.max) + "\"";
        if (c.width > 0) {
            out += " width=\"";
            AppendNumber(out, c.width);
            out += '"';
        }
        if (c.style) out += " style=\"" + std::to_string(c.style) + "\"";
        if (c.customWidth) out += " customWidth=\"1\"";
        if (c.bestFit) out += " bestFit=\"1\"";
        if (c.hidden) out += " hidden=\"1\"";
        out += c.otherAttributes;
        out += "/>";
    }
    out += "</" + xml::Qualified(prefix, "cols") + ">";
    return out;
}

enum class Piece { Dimension, Cols, SheetData };

struct Edit {
    uint64_t begin, end;
    Piece piece;
};

// A stretch of the old part copied into the new one.
struct Copied {
    uint64_t oldBegin, oldEnd, newBegin;
};

uint64_t MapOffset(const std::vector<Copied> &copies, uint64_t old)
{
    for (const auto &c : copies)
        if (old >= c.oldBegin && old <= c.oldEnd) return c.newBegin + (old - c.oldBegin);
    return old;
}

xml::Span MapSpan(const std::vector<Copied> &copies, xml::Span s)
{
    if (!s.Found()) return s;
    return {MapOffset(copies, s.begin), MapOffset(copies, s.end)};
}

// The <sheetData> element, from the sheet store.
void AppendSheetData(PartText &part, const SheetModel &sheet, const SheetWriteContext &ctx, std::string_view prefix)
{
    Names n(prefix);
    std::string q = xml::Qualified(prefix, "sheetData");
    bool any = false;
    part.Text() += "<" + q + ">";
    for (const Row &row : sheet.store.Rows()) {
        if (row.cells.empty() && row.attributes.Plain()) continue;
        std::string &out = part.Text();
        any = true;
        AppendRowStart(out, row, n);
        if (row.cells.empty()) {
            out += "/>";
            continue;
        }
        out += '>';
        for (const Cell &cell : row.cells) AppendCell(out, row.index, cell, sheet, ctx, n);
        out += n.rowEnd;
        part.HandOnWhenFull();
    }
    std::string &out = part.Text();
    if (!any) {
        out.resize(out.size() - 1);  // nothing handed on since the start tag
        out += "/>";
        return;
    }
    out += "</" + q + ">";
}

}  // namespace

void WriteSheet(const PackageSource &source, const std::string &entry, const SheetModel &sheet,
                const SheetWriteContext &ctx, SheetLayout &newLayout, const PieceSink &sink)
{
    const SheetLayout &old = sheet.layout;
    const std::string &prefix = old.root.prefix;
    uint64_t headEnd = old.root.start.end;
    std::vector<Edit> edits;
    edits.push_back(old.dimension.Found() ? Edit{old.dimension.begin, old.dimension.end, Piece::Dimension}
                                          : Edit{old.dimensionAt ? old.dimensionAt : headEnd,
                                                 old.dimensionAt ? old.dimensionAt : headEnd, Piece::Dimension});
    uint64_t colsAt = old.colsAt ? old.colsAt : headEnd;
    if (old.cols.Found())
        edits.push_back({old.cols.begin, old.cols.end, Piece::Cols});
    else if (!sheet.columns.empty())
        edits.push_back({colsAt, colsAt, Piece::Cols});
    if (old.sheetData.Found()) {
        edits.push_back({old.sheetData.begin, old.sheetData.end, Piece::SheetData});
    } else {
        uint64_t at = old.cols.Found() ? old.cols.end : colsAt;
        edits.push_back({at, at, Piece::SheetData});
    }
    std::stable_sort(edits.begin(), edits.end(), [](const Edit &a, const Edit &b) {
        return a.begin != b.begin ? a.begin < b.begin : static_cast<int>(a.piece) < static_cast<int>(b.piece);
    });

    PartText part(sink);
    std::vector<Copied> copies;
    SheetLayout next;
    size_t nextEdit = 0;
    uint64_t offset = 0;  // of the old part
    bool inEdit = false;

    auto emit = [&](const Edit &e) {
        xml::Span span{part.Position(), part.Position()};
        switch (e.piece) {
        case Piece::Dimension: part.Text() += DimensionXml(sheet, prefix); break;
        case Piece::Cols: part.Text() += ColsXml(sheet, prefix); break;
        case Piece::SheetData: AppendSheetData(part, sheet, ctx, prefix); break;
        }
        span.end = part.Position();
        if (e.piece == Piece::Dimension) next.dimension = span;
        if (e.piece == Piece::Cols) next.cols = span;
        if (e.piece == Piece::SheetData) next.sheetData = span;
    };
    auto copy = [&](const char *data, uint64_t from, uint64_t to, uint64_t chunkBase) {
        if (to <= from) return;
        if (!copies.empty() && copies.back().oldEnd == from &&
            copies.back().newBegin + (from - copies.back().oldBegin) == part.Position())
            copies.back().oldEnd = to;
        else
            copies.push_back({from, to, part.Position()});
        part.Text().append(data + (from - chunkBase), to - from);
        part.HandOnWhenFull();
    };

    source.Read(entry, [&](const char *data, size_t size) {
        uint64_t chunkBase = offset;
        uint64_t chunkEnd = offset + size;
        uint64_t pos = offset;
        while (pos < chunkEnd) {
            if (inEdit) {
                uint64_t end = edits[nextEdit].end;
                if (end > chunkEnd) {
                    pos = chunkEnd;
                    break;
                }
                pos = end;
                inEdit = false;
                ++nextEdit;
                continue;
            }
            if (nextEdit < edits.size() && edits[nextEdit].begin < chunkEnd) {
                const Edit &e = edits[nextEdit];
                copy(data, pos, e.begin, chunkBase);
                pos = std::max(pos, e.begin);
                emit(e);
                if (e.end > e.begin) {
                    inEdit = true;
                } else {
                    ++nextEdit;
                }
                continue;
            }
            copy(data, pos, chunkEnd, chunkBase);
            pos = chunkEnd;
        }
        offset = chunkEnd;
    });
    // Insertions at the very end of the part (a truncated layout) still happen.
    while (nextEdit < edits.size()) {
        if (!inEdit) emit(edits[nextEdit]);
        inEdit = false;
        ++nextEdit;
    }

    next.root = old.root;
    next.root.start = MapSpan(copies, old.root.start);
    next.root.end = MapSpan(copies, old.root.end);
    next.dimensionAt = old.dimensionAt ? MapOffset(copies, old.dimensionAt) : 0;
    next.colsAt = old.colsAt ? MapOffset(copies, old.colsAt) : 0;
    part.Finish();
    newLayout = next;
}

}  // namespace workbook
