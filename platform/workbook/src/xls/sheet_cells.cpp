// SPDX-License-Identifier: MIT
#include "xls/sheet_cells.h"

#include <algorithm>
#include <cstring>

#include "errors.h"
#include "workbook/limits.h"
#include "xls/biff_records.h"
#include "xls/biff_text.h"
#include "xls/little_endian.h"

namespace workbook::xls {
namespace {

namespace type {
constexpr uint16_t kNumber = 0x0203, kRk = 0x027E, kMulRk = 0x00BD, kLabelSst = 0x00FD, kLabel = 0x0204,
                   kRichLabel = 0x00D6, kBoolErr = 0x0205, kFormula = 0x0006, kFormula3 = 0x0206,
                   kFormula4 = 0x0406, kString = 0x0207;
// What may stand between a formula and the STRING record of its text result.
constexpr uint16_t kSharedFormula = 0x04BC, kArray = 0x0221, kTable = 0x0236;
// The cell records of the oldest version, with three bytes of attributes.
constexpr uint16_t kInteger2 = 0x0002, kNumber2 = 0x0003, kLabel2 = 0x0004, kBoolErr2 = 0x0005, kString2 = 0x0007;
}  // namespace type

// A number packed into 30 bits: an integer or the high bits of a double,
// either perhaps hundredfold.
double RkNumber(uint32_t rk)
{
    double value;
    if (rk & 0x02) {
        value = double(int32_t(rk) >> 2);
    } else {
        const uint64_t bits = uint64_t(rk & 0xFFFFFFFC) << 32;
        std::memcpy(&value, &bits, sizeof value);
    }
    return (rk & 0x01) ? value / 100 : value;
}

CellError ErrorOfCode(uint8_t code)
{
    switch (code) {
    case 0x00: return CellError::Null;
    case 0x07: return CellError::Div0;
    case 0x0F: return CellError::Value;
    case 0x17: return CellError::Ref;
    case 0x1D: return CellError::Name;
    case 0x24: return CellError::Num;
    case 0x2A: return CellError::NA;
    case 0x2B: return CellError::GettingData;
    default: break;
    }
    Fail(kBadFile, "a cell holds the unknown error code " + std::to_string(code));
}

class SheetReader {
public:
    SheetReader(const WorkbookGlobals &globals) : globals_(globals) {}

    void Read(const Record &record)
    {
        const std::string_view d = record.data();
        const uint16_t row = U16(d, 0), column = U16(d, 2), xf = U16(d, 4);
        PieceReader in(record.pieces);
        switch (record.type) {
        case type::kNumber: AddNumber(row, column, xf, F64(d, 6), d.size() >= 14); break;
        case type::kRk: AddNumber(row, column, xf, RkNumber(U32(d, 6)), d.size() >= 10); break;
        case type::kMulRk:
            for (size_t at = 4; at + 6 + 2 <= d.size(); at += 6)
                AddNumber(row, uint16_t(column + (at - 4) / 6), U16(d, at), RkNumber(U32(d, at + 2)), true);
            break;
        case type::kLabelSst:
            if (d.size() >= 10) Add(row, column, xf, SheetCell::Kind::SharedText, U32(d, 6), 0);
            break;
        case type::kLabel:
        case type::kRichLabel:
            in.Skip(6);
            AddText(row, column, xf, ReadText(in, 2));
            break;
        case type::kBoolErr:
            if (d.size() >= 8) AddBoolErr(row, column, xf, U8(d, 6), U8(d, 7));
            break;
        case type::kFormula:
        case type::kFormula3:
        case type::kFormula4: ReadFormula(record.type == type::kFormula && globals_.version == Version::Biff2To4 ? 7 : 6, d); break;
        case type::kString:
        case type::kString2:
            if (pendingString_) {
                pendingString_ = false;
                AddText(pending_.row, pending_.column, pending_.xf, ReadText(in, record.type == type::kString2 ? 1 : 2));
            }
            break;
        case type::kInteger2: AddNumber(row, column, 0, U16(d, 7), d.size() >= 9); break;
        case type::kNumber2: AddNumber(row, column, 0, F64(d, 7), d.size() >= 15); break;
        case type::kLabel2: {
            in.Skip(7);
            AddText(row, column, 0, ReadByteString(in, 1, *globals_.codePage));
            break;
        }
        case type::kBoolErr2:
            if (d.size() >= 9) AddBoolErr(row, column, 0, U8(d, 7), U8(d, 8));
            break;
        default: break;
        }
        const uint16_t t = record.type;
        if (t != type::kFormula && t != type::kFormula3 && t != type::kFormula4 && t != type::kSharedFormula &&
            t != type::kArray && t != type::kTable)
            pendingString_ = false;
    }

    SheetCells Take()
    {
        // Rows rising, columns rising; of two records for one cell the later one counts.
        std::stable_sort(cells_.cells.begin(), cells_.cells.end(), [](const SheetCell &a, const SheetCell &b) {
            return a.row != b.row ? a.row < b.row : a.column < b.column;
        });
        auto &cells = cells_.cells;
        size_t kept = 0;
        for (size_t i = 0; i < cells.size(); ++i) {
            if (i + 1 < cells.size() && cells[i + 1].row == cells[i].row && cells[i + 1].column == cells[i].column) continue;
            cells[kept++] = cells[i];
        }
        cells.resize(kept);
        return std::move(cells_);
    }

private:
    std::string ReadText(PieceReader &in, int lengthBytes)
    {
        return globals_.version == Version::Biff8 ? ReadUnicodeString(in, lengthBytes)
                                                  : ReadByteString(in, lengthBytes, *globals_.codePage);
    }

    void Add(uint16_t row, uint16_t column, uint16_t xf, SheetCell::Kind kind, uint32_t text, double number)
    {
        if (cells_.cells.size() >= limits::kMaxCellsPerSheet)
            Fail(kBadFile, "a sheet has more than " + std::to_string(limits::kMaxCellsPerSheet) + " cells");
        cells_.cells.push_back({row, column, xf, kind, text, number});
    }

    void AddNumber(uint16_t row, uint16_t column, uint16_t xf, double number, bool whole)
    {
        if (whole) Add(row, column, xf, SheetCell::Kind::Number, 0, number);
    }

    void AddText(uint16_t row, uint16_t column, uint16_t xf, std::string text)
    {
        if (text.empty()) return;  // shows nothing, as an empty cell
        cells_.texts.push_back(std::move(text));
        Add(row, column, xf, SheetCell::Kind::OwnText, uint32_t(cells_.texts.size() - 1), 0);
    }

    void AddBoolErr(uint16_t row, uint16_t column, uint16_t xf, uint8_t value, uint8_t isError)
    {
        if (isError) Add(row, column, xf, SheetCell::Kind::Error, 0, double(ErrorOfCode(value)));
        else Add(row, column, xf, SheetCell::Kind::Boolean, 0, value ? 1 : 0);
    }

    // A formula's last result: a number, or a mark for a text (in the STRING
    // record that follows), a boolean, an error or the empty text.
    void ReadFormula(size_t resultAt, std::string_view d)
    {
        pendingString_ = false;
        if (d.size() < resultAt + 8) return;
        const uint16_t row = U16(d, 0), column = U16(d, 2), xf = resultAt == 6 ? U16(d, 4) : 0;
        if (U16(d, resultAt + 6) != 0xFFFF) {
            AddNumber(row, column, xf, F64(d, resultAt), true);
            return;
        }
        switch (U8(d, resultAt)) {
        case 0:
            pendingString_ = true;
            pending_ = {row, column, xf, SheetCell::Kind::OwnText, 0, 0};
            break;
        case 1: AddBoolErr(row, column, xf, U8(d, resultAt + 2), 0); break;
        case 2: AddBoolErr(row, column, xf, U8(d, resultAt + 2), 1); break;
        default: break;  // the empty text
        }
    }

    const WorkbookGlobals &globals_;
    SheetCells cells_;
    bool pendingString_ = false;
    SheetCell pending_;
};

}  // namespace

CellValue SheetCells::ValueOf(const SheetCell &cell, const WorkbookGlobals &globals) const
{
    switch (cell.kind) {
    case SheetCell::Kind::Number: return cell.number;
    case SheetCell::Kind::SharedText:
        if (cell.text >= globals.strings.size())
            Fail(kBadFile, "a cell refers to shared string " + std::to_string(cell.text) + " of " +
                               std::to_string(globals.strings.size()));
        return globals.strings[cell.text];
    case SheetCell::Kind::OwnText: return texts[cell.text];
    case SheetCell::Kind::Boolean: return cell.number != 0;
    case SheetCell::Kind::Error: return CellError(uint8_t(cell.number));
    }
    return {};
}

SheetCells ReadSheetCells(std::string_view stream, size_t offset, const WorkbookGlobals &globals)
{
    RecordReader records(stream, offset);
    SheetReader reader(globals);
    int depth = 0;  // 1 inside the sheet, more inside a chart embedded in it
    while (std::optional<Record> record = records.Next()) {
        if (record->IsBof()) ++depth;
        else if (record->type == record::kEof && --depth <= 0) break;
        else if (depth == 1) reader.Read(*record);
    }
    return reader.Take();
}

std::vector<size_t> SubstreamOffsets(std::string_view stream, size_t from)
{
    std::vector<size_t> offsets;
    RecordReader records(stream, from);
    int depth = 0;
    while (std::optional<Record> record = records.Next()) {
        if (record->IsBof() && depth++ == 0) offsets.push_back(record->offset);
        else if (record->type == record::kEof && depth > 0) --depth;
    }
    return offsets;
}

}  // namespace workbook::xls
