// SPDX-License-Identifier: MIT
#include "xls/workbook_globals.h"

#include <algorithm>
#include <map>

#include "errors.h"
#include "workbook/format/builtin_formats.h"
#include "workbook/limits.h"
#include "xls/biff_records.h"
#include "xls/little_endian.h"

namespace workbook::xls {
namespace {

constexpr uint16_t kBoundSheet = 0x0085, kSharedStrings = 0x00FC, kFormat = 0x041E, kCellFormat = 0x00E0,
                   kDateMode = 0x0022, kCodePage = 0x0042, kFilePass = 0x002F;
constexpr uint16_t kGlobalsKind = 0x0005;
constexpr uint8_t kWorksheetKind = 0;

struct Pending {
    std::map<uint16_t, std::string> formats;
    std::vector<uint16_t> formatOfXf;
};

void ReadSharedStrings(const Record &record, WorkbookGlobals &globals)
{
    PieceReader in(record.pieces);
    in.U32();  // references to the strings in the workbook
    const uint32_t unique = in.U32();
    uint64_t bytes = 0;
    for (std::string_view piece : record.pieces) bytes += piece.size();
    // Each string takes three bytes at least: a declared count can't reserve more.
    globals.strings.reserve(size_t(std::min<uint64_t>(unique, bytes / 3)));
    while (globals.strings.size() < unique && !in.AtEnd()) {
        if (globals.strings.size() >= limits::kMaxStrings)
            Fail(kBadFile, "the workbook has more than " + std::to_string(limits::kMaxStrings) + " shared strings");
        globals.strings.push_back(ReadUnicodeString(in, 2));
    }
}

void ReadRecord(const Record &record, WorkbookGlobals &globals, Pending &pending)
{
    const std::string_view data = record.data();
    const bool biff8 = globals.version == Version::Biff8;
    PieceReader in(record.pieces);
    switch (record.type) {
    case kFilePass:
        Fail(kBadFile, "the workbook is encrypted (a password protects it): save it without the password to read it");
    case kDateMode: globals.date1904 = U16(data, 0) == 1; break;
    case kCodePage:
        if (!biff8) globals.codePage = std::make_unique<CodePage>(U16(data, 0));
        break;
    case kBoundSheet: {
        const uint32_t offset = in.U32();
        in.Byte();  // visibility
        const bool worksheet = in.Byte() == kWorksheetKind;
        std::string name = biff8 ? ReadUnicodeString(in, 1) : ReadByteString(in, 1, *globals.codePage);
        if (worksheet) globals.sheets.push_back({std::move(name), offset});
        break;
    }
    case kSharedStrings: ReadSharedStrings(record, globals); break;
    case kFormat: {
        const uint16_t id = in.U16();
        pending.formats[id] = biff8 ? ReadUnicodeString(in, 2) : ReadByteString(in, 1, *globals.codePage);
        break;
    }
    case kCellFormat:
        if (pending.formatOfXf.size() >= limits::kMaxCellFormats)
            Fail(kBadFile, "the workbook has more than " + std::to_string(limits::kMaxCellFormats) + " cell formats");
        pending.formatOfXf.push_back(U16(data, 2));
        break;
    default: break;
    }
}

bool IsGeneral(std::string_view code)
{
    return code.empty() || (code.size() == 7 && std::equal(code.begin(), code.end(), "general", [](char a, char b) {
                                return std::tolower(static_cast<unsigned char>(a)) == b;
                            }));
}

}  // namespace

WorkbookGlobals ReadGlobals(std::string_view stream)
{
    WorkbookGlobals globals;
    RecordReader records(stream);
    std::optional<Record> bof = records.Next();
    if (!bof || !bof->IsBof()) Fail(kBadFile, "the file holds no workbook records");
    const uint16_t version = U16(bof->data(), 0), kind = U16(bof->data(), 2);
    if (bof->type != record::kBof8) globals.version = Version::Biff2To4;
    else globals.version = version == 0x0600 ? Version::Biff8 : Version::Biff5;
    if (bof->type != record::kBof8 || kind != kGlobalsKind) return globals;  // a lone worksheet

    globals.hasGlobals = true;
    Pending pending;
    while (std::optional<Record> record = records.Next()) {
        if (record->type == record::kEof) break;
        ReadRecord(*record, globals, pending);
    }
    globals.sheetsFrom = records.Offset();
    for (uint16_t id : pending.formatOfXf) {
        const auto own = pending.formats.find(id);
        const std::string code = own != pending.formats.end() ? own->second : format::BuiltinFormatCode(id);
        globals.numberFormatOfXf.push_back(IsGeneral(code) ? std::string() : code);
    }
    return globals;
}

}  // namespace workbook::xls
