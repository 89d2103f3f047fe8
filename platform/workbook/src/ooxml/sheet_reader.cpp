// SPDX-License-Identifier: MIT
#include "ooxml/sheet_reader.h"

#include <cctype>
#include <charconv>
#include <cstring>
#include <optional>

#include "cells/cell_ref.h"
#include "cells/date_serial.h"
#include "cells/stored_number.h"
#include "automation/text.h"
#include "errors.h"
#include "ooxml/sheet_data_scanner.h"
#include "workbook/limits.h"
#include "xml/namespaces.h"
#include "xml/xml_text.h"

namespace workbook {
namespace {

enum class Capture : uint8_t { None, Value, Formula, InlineText };

// The cell type attribute t.
enum class CellType : uint8_t { Number, Shared, Str, Inline, Bool, Error, Date };

CellType TypeOf(std::optional<std::string_view> t)
{
    if (!t) return CellType::Number;
    std::string_view s = *t;
    if (s == "s") return CellType::Shared;
    if (s == "str") return CellType::Str;
    if (s == "inlineStr") return CellType::Inline;
    if (s == "b") return CellType::Bool;
    if (s == "e") return CellType::Error;
    if (s == "d") return CellType::Date;
    return CellType::Number;
}

bool ParseUint(std::string_view s, uint32_t &out)
{
    auto r = std::from_chars(s.data(), s.data() + s.size(), out);
    return r.ec == std::errc() && r.ptr == s.data() + s.size();
}

// Trims the white space a pretty-printing producer leaves around numbers.
std::string_view Trimmed(std::string_view s)
{
    while (!s.empty() && (s.front() == ' ' || s.front() == '\n' || s.front() == '\r' || s.front() == '\t'))
        s.remove_prefix(1);
    while (!s.empty() && (s.back() == ' ' || s.back() == '\n' || s.back() == '\r' || s.back() == '\t'))
        s.remove_suffix(1);
    return s;
}

bool AttrIs(const char *name, char a, char b = '\0')
{
    return name[0] == a && name[1] == b && (b == '\0' || name[2] == '\0');
}

class SheetReader : public xml::ShapeTracker, public PlainCellHandler {
public:
    SheetReader(const SheetContext &ctx, const std::string &entry) : ctx_(ctx), entry_(entry)
    {
        model.store.LimitCells(ctx.cellLimit);
    }
    SheetModel model;

    // What OnStart(c), OnStart(v), OnText, OnEnd(v) and OnEnd(c) of a cell
    // directly inside a row do, in one call.
    void OnPlainCell(const PlainCell &cell) override
    {
        uint32_t style = 0;
        if (cell.style) ParseUint(*cell.style, style);
        StartCellWith(cell.ref, cell.type, style);
        if (cell.hasValue) {
            hasValue_ = true;
            if (cell.value.size() > limits::kMaxCellTextBytes) RefuseLongText();
        }
        // The value is read where it stands; only a text to decode is copied.
        EndCellWith(cell.value);
    }

    void OnStart(const xml::Name &name, const xml::Attributes &attrs) override
    {
        TrackStart(name);
        int depth = Depth();
        if (depth == 2) {
            // The declarations made on this element are its own.
            ownPrefixes_ = std::move(nextPrefixes_);
            nextPrefixes_.clear();
        }
        if (depth == 1) {
            if (!ns::IsMain(name.ns) || (name.local != "worksheet" && name.local != "dialogsheet" &&
                                         name.local != "macrosheet"))
                Refuse("has no worksheet element");
            return;
        }
        if (depth > 8 || !ns::IsMain(name.ns)) return;
        if (inSheetData_) {
            if (depth == 3 && name.local == "row") StartRow(attrs);
            else if (depth == 4 && name.local == "c") StartCell(attrs);
            else if (inCell_) StartInCell(name, attrs, depth);
            return;
        }
        if (depth == 2) StartTopLevel(name, attrs);
        else if (depth == 3 && inCols_ && name.local == "col") ReadCol(attrs);
    }

    void OnEnd(const xml::Name &name) override
    {
        int depth = Depth();
        if (depth <= 8 && ns::IsMain(name.ns)) {
            if (inSheetData_) {
                if (depth == 4 && inCell_) EndCell();
                else if (inCell_) EndInCell(name, depth);
                else if (depth == 2) EndTopLevel(name);
            } else if (depth == 2) {
                EndTopLevel(name);
            }
        }
        TrackEnd();
        if (depth == 1) model.layout.root = Root();
    }

    void OnNamespace(std::string_view prefix, std::string_view uri) override
    {
        // Only the root's declarations and those of sheetData stay in scope
        // for the rows; a declaration on another element goes with it.
        if (Depth() == 0) rootPrefixes_.emplace_back(prefix, uri);
        else if (Depth() == 1) nextPrefixes_.emplace_back(prefix, uri);
    }

    // Whether the reader stands right inside a sheetData start tag that ends
    // at byte `at`, so that another reader may read the rows that follow.
    bool OpenedSheetDataAt(uint64_t at) const
    {
        return inSheetData_ && Depth() == 2 && model.layout.sheetData.end == at && !inCell_;
    }
    const std::string &SheetDataNs() const { return sheetDataNs_; }
    // The prefixes in scope inside sheetData, later ones over earlier ones.
    std::vector<std::pair<std::string, std::string>> SheetDataPrefixes() const
    {
        std::vector<std::pair<std::string, std::string>> all = rootPrefixes_;
        all.insert(all.end(), sheetDataPrefixes_.begin(), sheetDataPrefixes_.end());
        return all;
    }

    void OnText(std::string_view s) override
    {
        if (capture_ == Capture::None) return;
        if (capture_ == Capture::InlineText && phonetic_ > 0) return;
        std::string &target = capture_ == Capture::Formula ? formulaText_ : text_;
        if (target.size() + s.size() > limits::kMaxCellTextBytes) RefuseLongText();
        target.append(s);
    }

private:
    [[noreturn]] void Refuse(const std::string &why)
    {
        throw automation::ComError(kBadFile, "sheet part '" + entry_ + "' " + why);
    }

    [[noreturn]] void RefuseLongText()
    {
        Refuse("has cell " + CellAddress(lastRow_, lastColumn_) + " with a text longer than " +
               std::to_string(limits::kMaxCellTextBytes) + " bytes");
    }

    void StartTopLevel(const xml::Name &name, const xml::Attributes &attrs)
    {
        xml::Span tag = parser_->CurrentTag();
        SheetLayout &l = model.layout;
        std::string_view local = name.local;
        if (local == "sheetData") {
            l.sheetData = tag;
            inSheetData_ = true;
            sheetDataNs_ = std::string(name.ns);
            sheetDataPrefixes_ = ownPrefixes_;
        } else if (local == "dimension") {
            l.dimension = tag;
            CheckDimension(attrs.Find("ref"));
        } else if (local == "cols") {
            l.cols = tag;
            inCols_ = true;
        }
        currentTop_ = tag;
    }

    void EndTopLevel(const xml::Name &name)
    {
        xml::Span tag = parser_->CurrentTag();
        uint64_t end = tag.Found() ? tag.end : currentTop_.end;
        SheetLayout &l = model.layout;
        std::string_view local = name.local;
        if (local == "sheetData") {
            l.sheetData.end = tag.Found() ? tag.end : l.sheetData.end;
            inSheetData_ = false;
        } else if (local == "dimension") {
            l.dimension.end = end;
        } else if (local == "cols") {
            l.cols.end = end;
            inCols_ = false;
        }
        if (local == "sheetPr") l.dimensionAt = end;
        if (local == "sheetPr" || local == "dimension" || local == "sheetViews" || local == "sheetFormatPr")
            l.colsAt = end;
    }

    void CheckDimension(const char *ref)
    {
        if (!ref) return;
        std::string_view s(ref);
        size_t colon = s.find(':');
        for (std::string_view part : {s.substr(0, colon), colon == std::string_view::npos ? std::string_view() : s.substr(colon + 1)}) {
            if (part.empty()) continue;
            auto p = ParseCellRef(part);
            if (p && (p->row > limits::kMaxRows || p->column > limits::kMaxColumns))
                Refuse("claims dimensions beyond the sheet grid (" + std::string(s) + ")");
        }
    }

    void ReadCol(const xml::Attributes &attrs)
    {
        ColumnSpec col;
        for (const char **a = attrs.Raw(); *a; a += 2) {
            std::string_view n(a[0]);
            const char *v = a[1];
            uint32_t u = 0;
            if (n == "min" && ParseUint(v, u)) col.min = u;
            else if (n == "max" && ParseUint(v, u)) col.max = u;
            else if (n == "style" && ParseUint(v, u)) col.style = u;
            else if (n == "width") std::from_chars(v, v + std::strlen(v), col.width);
            else if (n == "customWidth") col.customWidth = v[0] == '1' || v[0] == 't';
            else if (n == "bestFit") col.bestFit = v[0] == '1' || v[0] == 't';
            else if (n == "hidden") col.hidden = v[0] == '1' || v[0] == 't';
            else if (n.find('\x01') == std::string_view::npos) {
                col.otherAttributes += ' ';
                col.otherAttributes += n;
                col.otherAttributes += "=\"";
                xml::AppendEscaped(col.otherAttributes, v);
                col.otherAttributes += '"';
            }
        }
        if (col.min < 1 || col.max < col.min || col.max > limits::kMaxColumns)
            Refuse("has a column entry beyond the sheet grid");
        model.columns.push_back(std::move(col));
    }

    void StartRow(const xml::Attributes &attrs)
    {
        uint32_t index = lastRow_ + 1;
        RowAttributes ra;
        for (const char **a = attrs.Raw(); *a; a += 2) {
            const char *n = a[0];
            const char *v = a[1];
            if (AttrIs(n, 'r')) {
                if (!ParseUint(v, index)) Refuse("has a row with a bad number " + automation::MessageExcerpt(v));
            } else if (AttrIs(n, 's')) {
                ParseUint(v, ra.style);
            } else if (std::strcmp(n, "ht") == 0) {
                std::from_chars(v, v + std::strlen(v), ra.height);
            } else if (std::strcmp(n, "customHeight") == 0) {
                ra.customHeight = v[0] == '1' || v[0] == 't';
            } else if (std::strcmp(n, "customFormat") == 0) {
                ra.customFormat = v[0] == '1' || v[0] == 't';
            } else if (std::strcmp(n, "hidden") == 0) {
                ra.hidden = v[0] == '1' || v[0] == 't';
            } else if (std::strcmp(n, "collapsed") == 0) {
                ra.collapsed = v[0] == '1' || v[0] == 't';
            } else if (std::strcmp(n, "outlineLevel") == 0) {
                uint32_t lvl = 0;
                ParseUint(v, lvl);
                ra.outlineLevel = static_cast<uint8_t>(lvl > 7 ? 7 : lvl);
            }
        }
        if (index < 1 || index > limits::kMaxRows)
            Refuse("has a row beyond the sheet grid (row " + std::to_string(index) + ")");
        SetRow(index);
        row_ = &model.store.AppendRow(index);
        row_->attributes = ra;
    }

    void StartCell(const xml::Attributes &attrs)
    {
        std::optional<std::string_view> ref, type;
        uint32_t style = 0;
        for (const char **a = attrs.Raw(); *a; a += 2) {
            const char *n = a[0];
            if (AttrIs(n, 'r')) ref = a[1];
            else if (AttrIs(n, 't')) type = a[1];
            else if (AttrIs(n, 's')) ParseUint(a[1], style);
        }
        StartCellWith(ref, type, style);
    }

    void StartCellWith(std::optional<std::string_view> ref, std::optional<std::string_view> type, uint32_t style)
    {
        if (!row_) StartRowImplicit();
        uint32_t column = lastColumn_ + 1;
        if (ref && !ColumnInRow(*ref, column)) {
            auto pos = ParseCellRef(*ref);
            if (!pos || pos->column == 0) Refuse("has a cell with a bad reference " + automation::MessageExcerpt(*ref));
            if (pos->row != 0 && pos->row != lastRow_) Refuse("has cell " + std::string(*ref) + " outside its row");
            column = pos->column;
        }
        if (column > limits::kMaxColumns)
            Refuse("has a cell beyond the sheet grid (column " + std::to_string(column) + ")");
        lastColumn_ = column;
        cellType_ = TypeOf(type);
        cellStyle_ = style;
        inCell_ = true;
        hasValue_ = false;
        hasFormula_ = false;
        text_.clear();
    }

    // A cell outside any <row>: not valid, but take it as the next row.
    void StartRowImplicit()
    {
        if (lastRow_ >= limits::kMaxRows) Refuse("has a row beyond the sheet grid");
        SetRow(lastRow_ + 1);
        row_ = &model.store.AppendRow(lastRow_);
    }

    void SetRow(uint32_t index)
    {
        lastRow_ = index;
        lastColumn_ = 0;
        rowDigits_ = static_cast<uint8_t>(std::to_chars(rowText_, rowText_ + sizeof rowText_, index).ptr - rowText_);
    }

    // The common reference, up to three capital letters and then the row's own
    // number as it is written: its column, without the general parse.
    bool ColumnInRow(std::string_view ref, uint32_t &column) const
    {
        uint32_t c = 0;
        size_t letters = 0;
        for (; letters < ref.size() && letters < 3 && ref[letters] >= 'A' && ref[letters] <= 'Z'; ++letters)
            c = c * 26 + static_cast<uint32_t>(ref[letters] - 'A' + 1);
        if (letters == 0 || ref.size() - letters != rowDigits_ ||
            std::memcmp(ref.data() + letters, rowText_, rowDigits_) != 0)
            return false;
        column = c;
        return true;
    }

    void StartInCell(const xml::Name &name, const xml::Attributes &attrs, int depth)
    {
        std::string_view local = name.local;
        if (depth == 5) {
            if (local == "v") {
                capture_ = Capture::Value;
                hasValue_ = true;
            } else if (local == "f") {
                capture_ = Capture::Formula;
                hasFormula_ = true;
                formulaText_.clear();
                formulaAttrs_.clear();
                formulaShared_ = -1;
                formulaMaster_ = false;
                formulaArray_ = false;
                bool shared = false;
                for (const char **a = attrs.Raw(); *a; a += 2) {
                    if (std::strchr(a[0], '\x01')) continue;
                    formulaAttrs_ += ' ';
                    formulaAttrs_ += a[0];
                    formulaAttrs_ += "=\"";
                    xml::AppendEscaped(formulaAttrs_, a[1]);
                    formulaAttrs_ += '"';
                    std::string_view n(a[0]);
                    if (n == "t") {
                        shared = std::string_view(a[1]) == "shared";
                        formulaArray_ = std::string_view(a[1]) == "array" || std::string_view(a[1]) == "dataTable";
                    }
                    if (n == "si") {
                        uint32_t si = 0;
                        if (ParseUint(a[1], si)) formulaShared_ = si;
                    }
                    if (n == "ref") formulaMaster_ = true;
                }
                if (!shared) {
                    formulaShared_ = -1;
                    formulaMaster_ = false;
                }
            } else if (local == "is") {
                hasValue_ = true;
            }
        } else if (local == "rPh") {
            ++phonetic_;
        } else if (local == "t") {
            capture_ = Capture::InlineText;
        }
    }

    void EndInCell(const xml::Name &name, int depth)
    {
        std::string_view local = name.local;
        if (depth == 5 && (local == "v" || local == "f")) capture_ = Capture::None;
        else if (local == "rPh" && phonetic_ > 0) --phonetic_;
        else if (local == "t") capture_ = Capture::None;
    }

    void EndCell() { EndCellWith(text_); }

    // Ends the cell whose <v> or inline text is `value`.
    void EndCellWith(std::string_view value)
    {
        inCell_ = false;
        capture_ = Capture::None;
        Cell cell;
        cell.column = static_cast<uint16_t>(lastColumn_);
        cell.style = cellStyle_;
        if (hasValue_) SetValue(cell, value);
        if (hasFormula_) {
            cell.flags |= Cell::kHasFormula;
            std::string q = xml::Qualified(Root().prefix, "f");
            Formula f;
            f.xml = "<" + q + formulaAttrs_;
            if (formulaText_.empty()) {
                f.xml += "/>";
            } else {
                f.xml += ">";
                xml::AppendEscaped(f.xml, formulaText_);
                f.xml += "</" + q + ">";
            }
            f.sharedIndex = formulaShared_;
            f.sharedMaster = formulaMaster_;
            model.store.SetFormula(lastRow_, lastColumn_, std::move(f));
            KeepFormulaSource(cell.kind == CellKind::Empty);
        }
        if (cell.kind == CellKind::Empty && cell.style == 0 && !hasFormula_) return;
        model.store.AppendCell(*row_, cell);
    }

    // What computing a formula without a result needs: its text, and the
    // text of the masters of shared formulas.
    void KeepFormulaSource(bool withoutResult)
    {
        if (!withoutResult && !formulaMaster_) return;
        FormulaSource source{lastRow_, lastColumn_, formulaText_, formulaShared_, formulaArray_};
        if (formulaMaster_) model.sharedMasters.push_back(source);
        if (withoutResult) model.formulasWithoutResult.push_back(std::move(source));
    }

    void SetValue(Cell &cell, std::string_view value)
    {
        switch (cellType_) {
        case CellType::Number: {
            std::string_view s = Trimmed(value);
            if (s.empty()) return;
            const StoredNumber number = ReadStoredNumber(s);
            if (number.kind != StoredNumber::Kind::Finite)
                model.unreadableNumbers.push_back({int32_t(lastRow_), int32_t(lastColumn_), automation::MessageExcerpt(s),
                                                   number.kind == StoredNumber::Kind::Underflow});
            if (number.kind == StoredNumber::Kind::Unreadable) {
                cell.kind = CellKind::Error;
                cell.payload = static_cast<uint64_t>(CellError::Num);
            } else {
                cell.kind = CellKind::Number;
                cell.payload = std::bit_cast<uint64_t>(number.value);
            }
            return;
        }
        case CellType::Shared: {
            uint32_t index = 0;
            if (!ParseUint(Trimmed(value), index) || index >= ctx_.sharedStringCount)
                Refuse("has cell " + CellAddress(lastRow_, lastColumn_) + " naming a shared string that doesn't exist");
            cell.kind = CellKind::String;
            cell.payload = index;
            return;
        }
        case CellType::Str:
        case CellType::Inline:
            if (value.data() != text_.data()) text_.assign(value);
            xml::DecodeCellEscapes(text_);
            cell.kind = CellKind::String;
            cell.payload = ctx_.strings.Add(text_);
            return;
        case CellType::Bool: {
            std::string_view s = Trimmed(value);
            cell.kind = CellKind::Boolean;
            cell.payload = (s == "1" || s == "true") ? 1 : 0;
            return;
        }
        case CellType::Error: {
            auto e = ErrorFromText(Trimmed(value));
            cell.kind = e ? CellKind::Error : CellKind::String;
            cell.payload = e ? static_cast<uint64_t>(*e) : ctx_.strings.Add(value);
            return;
        }
        case CellType::Date: {
            auto serial = IsoTextToSerial(Trimmed(value), ctx_.date1904);
            if (!serial)
                Refuse("has cell " + CellAddress(lastRow_, lastColumn_) + " with a bad date " + automation::MessageExcerpt(value));
            cell.kind = CellKind::Number;
            cell.payload = std::bit_cast<uint64_t>(*serial);
            return;
        }
        }
    }

    const SheetContext &ctx_;
    const std::string &entry_;
    bool inSheetData_ = false;
    bool inCols_ = false;
    bool inCell_ = false;
    xml::Span currentTop_;
    Row *row_ = nullptr;
    uint32_t lastRow_ = 0;
    uint32_t lastColumn_ = 0;
    char rowText_[10] = {};  // lastRow_ in decimal
    uint8_t rowDigits_ = 0;
    CellType cellType_ = CellType::Number;
    uint32_t cellStyle_ = 0;
    bool hasValue_ = false;
    bool hasFormula_ = false;
    Capture capture_ = Capture::None;
    int phonetic_ = 0;
    std::string text_;
    std::string formulaText_;
    std::string formulaAttrs_;
    int64_t formulaShared_ = -1;
    bool formulaMaster_ = false;
    bool formulaArray_ = false;
    std::string sheetDataNs_;
    std::vector<std::pair<std::string, std::string>> rootPrefixes_, nextPrefixes_, ownPrefixes_,
        sheetDataPrefixes_;
};

}  // namespace

// Hands the part to expat and, inside sheetData, to the scanner: expat reads
// up to the sheetData start tag, the scanner reads whole rows for as long as
// it can, and expat goes on from where the scanner stopped, told how many
// bytes and lines it didn't see.
struct SheetPartReader::Impl {
    Impl(const std::string &entry, const SheetContext &ctx, SheetScan scan)
        : entryName(entry), reader(ctx, entryName), parser(reader, "sheet part '" + entry + "'"),
          mode(scan == SheetScan::Fast ? Mode::BeforeRows : Mode::Expat)
    {
        reader.Attach(parser);
    }

    enum class Mode { BeforeRows, Rows, Expat };

    // Bytes held back from both readers: the scanner reads whole rows only.
    static constexpr size_t kMaxHeldBack = size_t{16} << 20;
    // How far a sheetData start tag may reach; past it expat reads the part.
    static constexpr size_t kMaxStartTag = size_t{64} << 10;

    void Feed(const char *data, size_t size)
    {
        if (mode == Mode::Expat) {
            parser.Feed(data, size, false);
            return;
        }
        held.append(data, size);
        if (mode == Mode::BeforeRows) FindRows();
        if (mode == Mode::Rows) ScanRows();
    }

    SheetModel Finish()
    {
        if (!held.empty()) ToExpat(0);
        parser.Feed(nullptr, 0, true);
        if (reader.Depth() != 0 || !reader.model.layout.root.start.Found())
            Fail(kBadFile, "sheet part '" + entryName + "' is incomplete");
        reader.model.store.FinishLoad();
        return std::move(reader.model);
    }

    // Gives expat the held bytes from `from` on, and everything after them.
    void ToExpat(size_t from)
    {
        mode = Mode::Expat;
        parser.Feed(held.data() + from, held.size() - from, false);
        held.clear();
        held.shrink_to_fit();
    }

    // Feeds expat the first n held bytes and drops them.
    void FeedHeld(size_t n)
    {
        parser.Feed(held.data(), n, false);
        fed += n;
        held.erase(0, n);
    }

    // Only a part in UTF-8 is for the scanner: no byte order mark of UTF-16,
    // no declared encoding but UTF-8.
    bool InUtf8() const
    {
        std::string_view head(held);
        if (head.starts_with("\xEF\xBB\xBF")) head.remove_prefix(3);
        if (!head.starts_with("<")) return false;
        if (!head.starts_with("<?xml")) return true;
        const size_t close = head.find("?>");
        if (close == std::string_view::npos) return false;
        const std::string_view declaration = head.substr(0, close);
        const size_t at = declaration.find("encoding");
        if (at == std::string_view::npos) return true;
        const size_t quote = declaration.find_first_of("\"'", at);
        if (quote == std::string_view::npos) return false;
        const size_t end = declaration.find(declaration[quote], quote + 1);
        if (end == std::string_view::npos) return false;
        std::string name(declaration.substr(quote + 1, end - quote - 1));
        for (char &c : name) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
        return name == "utf-8";
    }

    // Looks for the sheetData start tag, feeding expat what comes before it.
    void FindRows()
    {
        constexpr std::string_view kStart = "<sheetData";
        if (!checkedEncoding) {
            if (held.size() < 512 && held.find("?>") == std::string::npos) return;  // the declaration is still coming
            checkedEncoding = true;
            if (!InUtf8()) return ToExpat(0);
        }
        for (;;) {
            const size_t at = held.find(kStart, searchFrom);
            if (at == std::string::npos) {
                // Keep a tail that may be the start of the tag.
                if (held.size() > kStart.size()) FeedHeld(held.size() - kStart.size());
                searchFrom = 0;
                return;
            }
            size_t p = at + kStart.size();
            if (p >= held.size()) {
                FeedHeld(at);
                searchFrom = 0;
                return;
            }
            if (!(held[p] == '>' || held[p] == '/' || held[p] == ' ' || held[p] == '\t' || held[p] == '\n' ||
                  held[p] == '\r')) {
                searchFrom = p;  // another name that starts alike
                continue;
            }
            char quote = 0;
            for (; p < held.size() && p - at < kMaxStartTag; ++p) {
                const char c = held[p];
                if (quote) {
                    if (c == quote) quote = 0;
                } else if (c == '"' || c == '\'') {
                    quote = c;
                } else if (c == '>') {
                    break;
                }
            }
            if (p - at >= kMaxStartTag) return ToExpat(0);
            if (p >= held.size()) {
                FeedHeld(at);
                searchFrom = 0;
                return;
            }
            // Expat reads the tag itself; the scanner goes on only when expat
            // took it for the sheet's sheetData (not one in a comment, say).
            FeedHeld(p + 1);
            if (!reader.OpenedSheetDataAt(fed)) return ToExpat(0);
            scanner.emplace(reader, reader, reader.SheetDataNs(), reader.SheetDataPrefixes());
            mode = Mode::Rows;
            return;
        }
    }

    void ScanRows()
    {
        const SheetDataScanner::Result r = scanner->Scan(held);
        parser.Skipped(std::string_view(held).substr(0, r.consumed));
        fed += r.consumed;
        if (r.stop != SheetDataScanner::Stop::NeedMore) return ToExpat(r.consumed);
        held.erase(0, r.consumed);
        if (held.size() > kMaxHeldBack) ToExpat(0);  // a row too big to hold: expat streams it
    }

    std::string entryName;
    SheetReader reader;
    xml::Parser parser;
    Mode mode;
    std::string held;        // bytes neither reader has had yet
    uint64_t fed = 0;        // bytes of the part before `held`
    size_t searchFrom = 0;   // where in `held` to look for the sheetData tag next
    bool checkedEncoding = false;
    std::optional<SheetDataScanner> scanner;
};

SheetPartReader::SheetPartReader(const std::string &entry, const SheetContext &ctx, SheetScan scan)
    : impl_(std::make_unique<Impl>(entry, ctx, scan))
{
}

SheetPartReader::~SheetPartReader() = default;

void SheetPartReader::Feed(const char *data, size_t size) { impl_->Feed(data, size); }

SheetModel SheetPartReader::Finish() { return impl_->Finish(); }

uint64_t SheetPartReader::RowsScanned() const { return impl_->scanner ? impl_->scanner->RowsRead() : 0; }

SheetModel ReadSheet(const PackageSource &source, const std::string &entry, const SheetContext &ctx, SheetScan scan)
{
    SheetPartReader reader(entry, ctx, scan);
    source.Read(entry, [&](const char *data, size_t size) { reader.Feed(data, size); });
    return reader.Finish();
}

}  // namespace workbook
