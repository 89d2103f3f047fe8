// SPDX-License-Identifier: MIT
#include "xls/xls_reader.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <fstream>

#include "errors.h"
#include "workbook/limits.h"
#include "xls/biff_records.h"
#include "xls/compound_file.h"
#include "xls/little_endian.h"
#include "xls/sheet_cells.h"
#include "xls/workbook_globals.h"

namespace workbook::xls {
namespace {

constexpr uint16_t kWorksheetKind = 0x0010;

// The whole file; a binary workbook is read at once, so its size is bounded.
std::string ReadWholeFile(const std::string &path)
{
    std::ifstream file(path, std::ios::binary | std::ios::ate);
    if (!file) Fail(kBadFile, std::string("the file can't be read: ") + std::strerror(errno));
    const std::streamoff size = file.tellg();
    if (size < 0) Fail(kBadFile, "the file's size can't be told");
    if (uint64_t(size) > limits::kMaxPartBytes) Fail(kBadFile, "the file is larger than 1 GiB, more than a binary workbook holds");
    std::string bytes(size_t(size), '\0');
    file.seekg(0);
    if (!file.read(bytes.data(), size)) Fail(kBadFile, "the file can't be read whole");
    return bytes;
}

// Where each worksheet's records start: where the workbook says, when a sheet
// starts there, else the sheet in the same place in the stream's order (some
// writers get the offsets wrong).
std::vector<size_t> SheetOffsets(std::string_view stream, const WorkbookGlobals &globals)
{
    const std::vector<size_t> found = SubstreamOffsets(stream, globals.sheetsFrom);
    std::vector<size_t> offsets;
    for (size_t i = 0; i < globals.sheets.size(); ++i) {
        const size_t declared = globals.sheets[i].streamOffset;
        if (std::binary_search(found.begin(), found.end(), declared)) offsets.push_back(declared);
        else if (i < found.size()) offsets.push_back(found[i]);
        else Fail(kBadFile, "the records of sheet '" + globals.sheets[i].name + "' are missing (the file may be cut off)");
    }
    return offsets;
}

bool IsWorksheet(std::string_view stream, size_t offset)
{
    RecordReader records(stream, offset);
    const std::optional<Record> bof = records.Next();
    return bof && bof->IsBof() && (bof->type != record::kBof8 || U16(bof->data(), 2) == kWorksheetKind);
}

void PutSheet(std::string_view stream, size_t offset, const WorkbookGlobals &globals, ConvertedBook &book)
{
    const SheetCells sheet = ReadSheetCells(stream, offset, globals);
    for (const SheetCell &cell : sheet.cells) {
        const std::string &format = cell.xf < globals.numberFormatOfXf.size() ? globals.numberFormatOfXf[cell.xf] : std::string();
        // A text shows as itself whatever the cell's format says about numbers.
        const bool number = cell.kind == SheetCell::Kind::Number;
        CellValue value = sheet.ValueOf(cell, globals);
        if (const std::string *text = std::get_if<std::string>(&value); text && text->empty()) continue;  // shows nothing
        book.Put(cell.row + 1, uint32_t(cell.column) + 1, value, number ? std::string_view(format) : std::string_view());
    }
}

}  // namespace

void ReadBinaryWorkbook(const std::string &path, ConvertedBook &book)
{
    std::string file = ReadWholeFile(path);
    const std::string stream = IsCompoundFile(file) ? WorkbookStream(file) : std::move(file);
    std::string().swap(file);
    const WorkbookGlobals globals = ReadGlobals(stream);
    book.SetDate1904(globals.date1904);
    if (!globals.hasGlobals) {  // the records of one worksheet and nothing else
        book.AddSheet("Sheet1");
        PutSheet(stream, 0, globals, book);
        return;
    }
    const std::vector<size_t> offsets = SheetOffsets(stream, globals);
    for (size_t i = 0; i < globals.sheets.size(); ++i) {
        if (!IsWorksheet(stream, offsets[i])) continue;  // a chart or macro sheet listed as a worksheet
        book.AddSheet(globals.sheets[i].name);
        PutSheet(stream, offsets[i], globals, book);
    }
}

}  // namespace workbook::xls
