// SPDX-License-Identifier: MIT
#include "xls/compound_file.h"

#include <algorithm>
#include <utility>
#include <cctype>
#include <cstdint>
#include <optional>
#include <vector>

#include "errors.h"
#include "xls/little_endian.h"

namespace workbook::xls {
namespace {

constexpr std::string_view kSignature("\xD0\xCF\x11\xE0\xA1\xB1\x1A\xE1", 8);
constexpr uint32_t kEndOfChain = 0xFFFFFFFE;
constexpr uint32_t kFreeSector = 0xFFFFFFFF;
constexpr size_t kHeaderDifatEntries = 109;
constexpr size_t kDirectoryEntryBytes = 128;

[[noreturn]] void Damaged(const std::string &why) { Fail(kBadFile, "the binary workbook's container is damaged: " + why); }

class Container {
public:
    explicit Container(std::string_view file) : file_(file)
    {
        if (file.size() < 512) Damaged("it is cut off within its header");
        if (U16(file, 0x1C) != 0xFFFE) Damaged("its header has no valid byte order mark");
        const uint16_t shift = U16(file, 0x1E), miniShift = U16(file, 0x20);
        if (shift != 9 && shift != 12) Damaged("its sector size is neither 512 nor 4096 bytes");
        if (miniShift != 6) Damaged("its mini sector size is not 64 bytes");
        sectorSize_ = size_t{1} << shift;
        sectorCount_ = file.size() <= sectorSize_ ? 0 : (file.size() - sectorSize_ + sectorSize_ - 1) / sectorSize_;
        miniCutoff_ = U32(file, 0x38);
        ReadFat();
        ReadDirectory();
        ReadMiniFat();
    }

    // The stream of this name, in any case; nullopt when there is none.
    std::optional<std::string> Stream(std::u16string_view wanted) const
    {
        for (size_t at = 0; at + kDirectoryEntryBytes <= directory_.size(); at += kDirectoryEntryBytes) {
            const std::string_view entry(directory_.data() + at, kDirectoryEntryBytes);
            if (entry[66] != 2) continue;  // not a stream
            const uint16_t nameBytes = U16(entry, 64);
            if (nameBytes < 2 || nameBytes > 64 || size_t(nameBytes - 2) / 2 != wanted.size()) continue;
            bool same = true;
            for (size_t i = 0; i < wanted.size() && same; ++i) {
                const char16_t c = U16(entry, 2 * i);
                same = (c < 128 ? char16_t(std::tolower(c)) : c) == char16_t(std::tolower(wanted[i]));
            }
            if (!same) continue;
            const uint32_t start = U32(entry, 116);
            const uint64_t size = U32(entry, 120);  // the high half is unused in version 3 files
            if (size > file_.size()) Damaged("a stream claims more bytes than the file has");
            if (size < miniCutoff_) return Chain(miniStream_, 64, miniFat_, start, size, "mini stream");
            return Chain(file_, 0, fat_, start, size, "stream");
        }
        return std::nullopt;
    }

private:

    std::string_view Sector(uint32_t index) const
    {
        const uint64_t at = (uint64_t{index} + 1) * sectorSize_;
        if (at >= file_.size()) Damaged("it is cut off: sector " + std::to_string(index) + " lies beyond its end");
        return file_.substr(at, sectorSize_);
    }

    void ReadFat()
    {
        std::vector<uint32_t> fatSectors;
        for (size_t i = 0; i < kHeaderDifatEntries; ++i) fatSectors.push_back(U32(file_, 0x4C + 4 * i));
        uint32_t next = U32(file_, 0x44);
        for (size_t hops = 0; next != kEndOfChain && next != kFreeSector; ++hops) {
            if (hops > sectorCount_) Damaged("its table of allocation sectors loops");
            const std::string_view sector = Sector(next);
            for (size_t i = 0; i + 4 < sectorSize_; i += 4) fatSectors.push_back(U32(sector, i));
            next = U32(sector, sectorSize_ - 4);
        }
        const uint32_t declared = U32(file_, 0x2C);
        for (uint32_t i = 0; i < std::min<size_t>(declared, fatSectors.size()); ++i) {
            if (fatSectors[i] == kFreeSector || fatSectors[i] == kEndOfChain) continue;
            const std::string_view sector = Sector(fatSectors[i]);
            for (size_t at = 0; at < sectorSize_; at += 4) fat_.push_back(U32(sector, at));
            if (fat_.size() > sectorCount_ + sectorSize_) break;  // entries beyond the file's sectors are of no use
        }
    }

    void ReadDirectory()
    {
        directory_ = Chain(file_, 0, fat_, U32(file_, 0x30), UINT64_MAX, "directory");
        if (directory_.size() < kDirectoryEntryBytes) Damaged("it has no directory");
        const std::string_view root(directory_.data(), kDirectoryEntryBytes);
        const uint64_t miniSize = U32(root, 120);
        if (miniSize > file_.size()) Damaged("its mini stream claims more bytes than the file has");
        if (miniSize > 0) miniStream_ = Chain(file_, 0, fat_, U32(root, 116), miniSize, "mini stream");
    }

    void ReadMiniFat()
    {
        const uint32_t first = U32(file_, 0x3C);
        if (first == kEndOfChain || first == kFreeSector) return;
        const std::string bytes = Chain(file_, 0, fat_, first, UINT64_MAX, "mini allocation table");
        for (size_t at = 0; at + 4 <= bytes.size(); at += 4) miniFat_.push_back(U32(bytes, at));
    }

    // The bytes of the chain from start, at most size of them (UINT64_MAX: the
    // whole chain). base is the file (sector 0 after the header) or the mini
    // stream (sectors of 64 bytes from its start).
    std::string Chain(std::string_view base, size_t unit, const std::vector<uint32_t> &table, uint32_t start,
                      uint64_t size, const char *what) const
    {
        const bool mini = unit != 0;
        const size_t sectorBytes = mini ? unit : sectorSize_;
        std::string out;
        uint32_t at = start;
        for (size_t hops = 0; at != kEndOfChain && out.size() < size; ++hops) {
            if (at >= table.size() || hops > table.size())
                Damaged(std::string("its ") + what + (at >= table.size() ? " leads to a sector it doesn't have" : " loops"));
            const uint64_t offset = mini ? uint64_t{at} * unit : (uint64_t{at} + 1) * sectorSize_;
            if (offset >= base.size()) Damaged(std::string("it is cut off within its ") + what);
            out.append(base.substr(offset, sectorBytes));
            at = table[at];
        }
        if (size != UINT64_MAX) {
            if (out.size() < size) Damaged(std::string("its ") + what + " ends before its declared size");
            out.resize(size);
        }
        return out;
    }

    std::string_view file_;
    size_t sectorSize_ = 512;
    uint64_t sectorCount_ = 0;
    uint32_t miniCutoff_ = 4096;
    std::vector<uint32_t> fat_, miniFat_;
    std::string directory_, miniStream_;
};

}  // namespace

bool IsCompoundFile(std::string_view bytes) { return bytes.substr(0, kSignature.size()) == kSignature; }

std::string WorkbookStream(std::string_view file)
{
    const Container container(file);
    for (std::u16string_view name : {u"Workbook", u"Book"}) {
        if (std::optional<std::string> stream = container.Stream(name)) return std::move(*stream);
    }
    Fail(kBadFile, "the file is a compound document without a workbook stream (no spreadsheet, or one encrypted as a whole)");
}

}  // namespace workbook::xls
