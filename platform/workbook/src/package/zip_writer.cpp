// SPDX-License-Identifier: MIT
#include "package/zip_writer.h"

#include <isa-l/crc.h>
#include <zip.h>

#include <algorithm>
#include <ctime>
#include <limits>

#include "errors.h"
#include "package/parallel_deflate.h"

namespace workbook {
namespace {

constexpr uint16_t kStored = 0;
constexpr uint16_t kDeflated = 8;
constexpr uint16_t kUtf8Names = 0x0800;
constexpr uint32_t kMax32 = 0xFFFFFFFFu;
constexpr uint16_t kMax16 = 0xFFFFu;

void Put16(std::string &out, uint64_t value)
{
    out.push_back(char(value & 0xFF));
    out.push_back(char((value >> 8) & 0xFF));
}
void Put32(std::string &out, uint64_t value)
{
    Put16(out, value & 0xFFFF);
    Put16(out, (value >> 16) & 0xFFFF);
}
void Put64(std::string &out, uint64_t value)
{
    Put32(out, value & kMax32);
    Put32(out, value >> 32);
}
uint32_t Narrow32(uint64_t value) { return value >= kMax32 ? kMax32 : uint32_t(value); }

}  // namespace

ZipBuilder::ZipBuilder()
{
    const std::time_t now = std::time(nullptr);
    std::tm local{};
    if (localtime_r(&now, &local) && local.tm_year >= 80) {
        dosTime_ = uint16_t((local.tm_hour << 11) | (local.tm_min << 5) | (local.tm_sec / 2));
        dosDate_ = uint16_t(((local.tm_year - 80) << 9) | ((local.tm_mon + 1) << 5) | local.tm_mday);
    }
}

void ZipBuilder::AddLocalHeader(const Entry &entry)
{
    if (entry.name.size() > kMax16) Fail(E_FAIL, "cannot add part '" + entry.name + "': its name is too long");
    const bool zip64 = entry.size >= kMax32 || entry.compressedSize >= kMax32;
    Put32(out_, 0x04034b50);
    Put16(out_, zip64 ? 45 : 20);
    Put16(out_, kUtf8Names);
    Put16(out_, entry.method);
    Put16(out_, entry.dosTime);
    Put16(out_, entry.dosDate);
    Put32(out_, entry.crc);
    Put32(out_, zip64 ? kMax32 : entry.compressedSize);
    Put32(out_, zip64 ? kMax32 : entry.size);
    Put16(out_, entry.name.size());
    Put16(out_, zip64 ? 20 : 0);
    out_ += entry.name;
    if (zip64) {
        Put16(out_, 0x0001);
        Put16(out_, 16);
        Put64(out_, entry.size);
        Put64(out_, entry.compressedSize);
    }
}

void ZipBuilder::AddBytes(const std::string &name, std::string_view bytes)
{
    const uint32_t crc = crc32_gzip_refl(0, reinterpret_cast<const unsigned char *>(bytes.data()), bytes.size());
    // Packed straight after its header, which takes the size as the bound of
    // the packed size (a part that doesn't shrink is stored), and learns the
    // packed size afterwards.
    Entry entry{name, kDeflated, dosTime_, dosDate_, crc, bytes.size(), bytes.size(), out_.size()};
    AddLocalHeader(entry);
    const size_t dataStart = out_.size();
    if (AppendDeflated(out_, bytes)) {
        entry.compressedSize = out_.size() - dataStart;
        if (entry.size >= kMax32) {
            std::string field;
            Put64(field, entry.compressedSize);
            out_.replace(dataStart - 8, 8, field);
        } else {
            std::string field;
            Put32(field, entry.compressedSize);
            out_.replace(entry.offset + 18, 4, field);
        }
    } else {
        entry.method = kStored;
        std::string field;
        Put16(field, kStored);
        out_.replace(entry.offset + 8, 2, field);
        out_.append(bytes);
    }
    entries_.push_back(std::move(entry));
}

void ZipBuilder::AddMade(const std::string &name, const std::function<void(const PieceSink &)> &make)
{
    DeflatedPart part = DeflateAsMade(make);
    Entry entry{name, kDeflated, dosTime_, dosDate_, part.crc, part.packedSize, part.size, out_.size()};
    AddLocalHeader(entry);
    out_.reserve(out_.size() + part.packedSize);
    for (std::string &packed : part.packed) {
        out_ += packed;
        std::string().swap(packed);  // no more memory held than the file needs
    }
    entries_.push_back(std::move(entry));
}

void ZipBuilder::AddCopy(const PackageSource &source, const std::string &name)
{
    if (const std::string *mem = source.MemoryPart(name)) {
        AddBytes(name, *mem);
        return;
    }
    const int64_t index = source.IndexOf(name);
    if (index < 0 || !source.Archive()) Fail(E_FAIL, "the package has no part '" + name + "'");
    zip_stat_t st;
    zip_stat_init(&st);
    constexpr zip_uint64_t kNeeded = ZIP_STAT_SIZE | ZIP_STAT_COMP_SIZE | ZIP_STAT_CRC | ZIP_STAT_COMP_METHOD;
    if (zip_stat_index(source.Archive(), zip_uint64_t(index), 0, &st) != 0 || (st.valid & kNeeded) != kNeeded)
        Fail(E_FAIL, "cannot copy part '" + name + "': " + zip_strerror(source.Archive()));
    if ((st.valid & ZIP_STAT_ENCRYPTION_METHOD) && st.encryption_method != ZIP_EM_NONE)
        Fail(E_FAIL, "cannot copy part '" + name + "': it is encrypted");
    // Taken as stored: the compressed data, not inflated again.
    zip_file_t *file = zip_fopen_index(source.Archive(), zip_uint64_t(index), ZIP_FL_COMPRESSED);
    if (!file) Fail(E_FAIL, "cannot copy part '" + name + "': " + zip_strerror(source.Archive()));
    Entry entry{name, uint16_t(st.comp_method), dosTime_, dosDate_, st.crc, st.comp_size, st.size, out_.size()};
    if (st.valid & ZIP_STAT_MTIME) {
        std::tm local{};
        if (localtime_r(&st.mtime, &local) && local.tm_year >= 80) {
            entry.dosTime = uint16_t((local.tm_hour << 11) | (local.tm_min << 5) | (local.tm_sec / 2));
            entry.dosDate = uint16_t(((local.tm_year - 80) << 9) | ((local.tm_mon + 1) << 5) | local.tm_mday);
        }
    }
    AddLocalHeader(entry);
    const size_t dataStart = out_.size();
    out_.resize(dataStart + st.comp_size);
    zip_uint64_t done = 0;
    while (done < st.comp_size) {
        const zip_int64_t got = zip_fread(file, out_.data() + dataStart + done, st.comp_size - done);
        if (got <= 0) {
            zip_fclose(file);
            out_.resize(entry.offset);
            Fail(E_FAIL, "cannot copy part '" + name + "': its stored data ends early");
        }
        done += zip_uint64_t(got);
    }
    zip_fclose(file);
    entries_.push_back(std::move(entry));
}

std::string ZipBuilder::Finish()
{
    const uint64_t directoryStart = out_.size();
    for (const Entry &entry : entries_) {
        std::string extra;
        if (entry.size >= kMax32) Put64(extra, entry.size);
        if (entry.compressedSize >= kMax32) Put64(extra, entry.compressedSize);
        if (entry.offset >= kMax32) Put64(extra, entry.offset);
        const bool zip64 = !extra.empty();
        Put32(out_, 0x02014b50);
        Put16(out_, zip64 ? 45 : 20);  // made by: MS-DOS attributes
        Put16(out_, zip64 ? 45 : 20);
        Put16(out_, kUtf8Names);
        Put16(out_, entry.method);
        Put16(out_, entry.dosTime);
        Put16(out_, entry.dosDate);
        Put32(out_, entry.crc);
        Put32(out_, Narrow32(entry.compressedSize));
        Put32(out_, Narrow32(entry.size));
        Put16(out_, entry.name.size());
        Put16(out_, zip64 ? extra.size() + 4 : 0);
        Put16(out_, 0);  // comment
        Put16(out_, 0);  // disk
        Put16(out_, 0);  // internal attributes
        Put32(out_, 0);  // external attributes
        Put32(out_, Narrow32(entry.offset));
        out_ += entry.name;
        if (zip64) {
            Put16(out_, 0x0001);
            Put16(out_, extra.size());
            out_ += extra;
        }
    }
    const uint64_t directorySize = out_.size() - directoryStart;
    const uint64_t count = entries_.size();
    if (count >= kMax16 || directorySize >= kMax32 || directoryStart >= kMax32) {
        const uint64_t record = out_.size();
        Put32(out_, 0x06064b50);
        Put64(out_, 44);
        Put16(out_, 45);
        Put16(out_, 45);
        Put32(out_, 0);
        Put32(out_, 0);
        Put64(out_, count);
        Put64(out_, count);
        Put64(out_, directorySize);
        Put64(out_, directoryStart);
        Put32(out_, 0x07064b50);
        Put32(out_, 0);
        Put64(out_, record);
        Put32(out_, 1);
    }
    Put32(out_, 0x06054b50);
    Put16(out_, 0);
    Put16(out_, 0);
    Put16(out_, std::min<uint64_t>(count, kMax16));
    Put16(out_, std::min<uint64_t>(count, kMax16));
    Put32(out_, Narrow32(directorySize));
    Put32(out_, Narrow32(directoryStart));
    Put16(out_, 0);
    entries_.clear();
    return std::move(out_);
}

}  // namespace workbook
