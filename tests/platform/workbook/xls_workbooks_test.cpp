// SPDX-License-Identifier: MIT
// Binary workbooks made for the purpose: what the real files of the corpus
// don't hold (booleans, errors, a formula's text, packed numbers, a date in
// the 1904 system) reads as it should, and hostile ones are read for what
// they really hold or refused with their fault, never with a crash or a hang.
#include <cstring>

#include "engine_test_support.h"
#include "files.h"
#include "temp_dir.h"

namespace {

std::string Le(uint64_t value, int bytes)
{
    std::string out;
    for (int i = 0; i < bytes; ++i) out += char((value >> (8 * i)) & 0xFF);
    return out;
}
std::string U16(uint16_t v) { return Le(v, 2); }
std::string U32(uint32_t v) { return Le(v, 4); }
std::string F64(double v)
{
    uint64_t bits;
    std::memcpy(&bits, &v, 8);
    return Le(bits, 8);
}
std::string Rec(uint16_t type, const std::string &data) { return U16(type) + U16(uint16_t(data.size())) + data; }
std::string Cell(uint16_t row, uint16_t column, uint16_t xf = 0) { return U16(row) + U16(column) + U16(xf); }
const std::string kEof = Rec(0x000A, "");
std::string Bof(uint16_t kind) { return Rec(0x0809, U16(0x0600) + U16(kind)); }

// A workbook of one sheet "S" over the given globals and sheet records.
std::string Book(const std::string &globals, const std::string &sheet)
{
    const std::string head = Bof(0x0005) + globals;
    const uint32_t sheetAt = uint32_t(head.size() + 13 + kEof.size());  // after the BOUNDSHEET of 4 + 9 bytes
    return head + Rec(0x0085, U32(sheetAt) + std::string("\0\0\1\0S", 5)) + kEof + Bof(0x0010) + sheet + kEof;
}
const std::string kSharedHi = Rec(0x00FC, U32(0xFFFFFFFF) + U32(0xFFFFFFFF) + U16(2) + std::string("\0hi", 3));

// A compound file whose one allocation sector chains its directory to itself.
std::string LoopingContainer()
{
    std::string header = "\xD0\xCF\x11\xE0\xA1\xB1\x1A\xE1" + std::string(16, '\0') + U16(0x3E) + U16(3) +
                         U16(0xFFFE) + U16(9) + U16(6) + std::string(10, '\0') + U32(1) + U32(1) + U32(0) +
                         U32(4096) + U32(0xFFFFFFFE) + U32(0) + U32(0xFFFFFFFE) + U32(0) + U32(0);
    header += std::string(512 - header.size(), '\xFF');
    return header + U32(0xFFFFFFFD) + U32(1) + std::string(504, '\xFF') + std::string(512, '\0');
}

struct Hostile {
    const char *name;
    std::string bytes;
    const char *reason;  // nullptr: opens, and A1 shows `shows`
    const char *shows = nullptr;
};

TEST(XlsWorkbooks, HostileOnesAreReadForWhatTheyHoldOrRefusedWithTheirFault)
{
    const std::string oneNumber = Bof(0x0010) + Rec(0x0203, Cell(0, 0) + F64(1.5)) + kEof;
    const Hostile cases[] = {
        {"two-billion-rows.xls",
         Bof(0x0010) + Rec(0x0200, U32(0) + U32(2000000000) + U16(0) + U16(256) + U16(0)) +
             Rec(0x0203, Cell(0, 0) + F64(1.5)) + kEof,
         nullptr, "1.5"},
        {"four-billion-strings.xls", Book(kSharedHi, Rec(0x00FD, Cell(0, 0) + U32(0))), nullptr, "hi"},
        {"string-out-of-range.xls", Book(kSharedHi, Rec(0x00FD, Cell(0, 0) + U32(7))),
         "a cell refers to shared string 7 of 1"},
        {"cut-record.xls", Bof(0x0010) + U16(0x0203) + U16(14) + "abc",
         "the workbook stream is cut off within a record at byte 8"},
        {"encrypted.xls", Book(Rec(0x002F, U16(1)), ""),
         "the workbook is encrypted (a password protects it): save it without the password to read it"},
        {"cut-container.xls", LoopingContainer().substr(0, 300),
         "the binary workbook's container is damaged: it is cut off within its header"},
        {"looping-container.xls", LoopingContainer(), "the binary workbook's container is damaged: its directory loops"},
        {"binary-named.xlsx", oneNumber,
         "the file holds a binary workbook (.xls), not what its name says: give it the extension of what it holds"},
    };
    testing_host::TempDir dir;
    for (const Hostile &c : cases) {
        SCOPED_TRACE(c.name);
        const std::string path = dir.File(c.name);
        testing_host::WriteFile(path, c.bytes);
        auto app = workbook::CreateApplication();
        try {
            auto book = app->GetWorkbooks()->Open(path);
            EXPECT_EQ(c.reason, nullptr) << "opened";
            auto sheet = book->GetWorksheets()->Item(1);
            EXPECT_EQ(engine_test::Utf8(sheet->GetRange("A1")->GetText()), c.shows ? c.shows : "");
            EXPECT_EQ(sheet->UsedRange()->Count(), 1);
        } catch (const automation::ComError &e) {
            EXPECT_EQ(std::string(e.what()), path + ": " + (c.reason ? c.reason : "(none)"));
        }
    }
}

TEST(XlsWorkbooks, CellsOfEveryKindReadAsTheFileHoldsThem)
{
    const std::string globals = Rec(0x0022, U16(1)) + Rec(0x041E, U16(164) + U16(10) + '\0' + "yyyy-mm-dd") +
                                Rec(0x00E0, U16(0) + U16(0) + std::string(16, '\0')) +
                                Rec(0x00E0, U16(0) + U16(164) + std::string(16, '\0'));
    const std::string cells =
        Rec(0x0205, Cell(0, 0) + std::string("\1\0", 2)) + Rec(0x0205, Cell(0, 1) + "\x07\1") +
        Rec(0x0006, Cell(0, 2) + std::string("\0\0\0\0\0\0\xFF\xFF", 8) + U16(0) + U32(0)) + Rec(0x04BC, "") +
        Rec(0x0207, U16(3) + '\1' + std::string("x\0y\0\x3D\xD8", 6)) + Rec(0x027E, Cell(0, 3) + U32(150 << 2 | 3)) +
        Rec(0x0203, Cell(0, 4, 1) + F64(1.0)) + Rec(0x00BD, U16(1) + U16(1) + U16(0) + U32(7 << 2 | 2) + U16(0) + U32(0x3FF00000) + U16(2));
    testing_host::TempDir dir;
    const std::string path = dir.File("kinds.xls");
    testing_host::WriteFile(path, Book(globals, cells));
    auto app = workbook::CreateApplication();
    auto sheet = app->GetWorkbooks()->Open(path)->GetWorksheets()->Item(1);
    std::string shown;
    for (const char *address : {"A1", "B1", "C1", "D1", "E1", "B2", "C2"})
        shown += engine_test::Utf8(sheet->GetRange(address)->GetText()) + "|";
    // The formula's text ends in half a surrogate pair, shown as the replacement character.
    EXPECT_EQ(shown, "TRUE|#DIV/0!|xy\xEF\xBF\xBD|1.5|1904-01-02|7|1|");
    EXPECT_EQ(sheet->GetRange("E1")->GetValue2().Raw().dblVal, 1.0);
}

}  // namespace
