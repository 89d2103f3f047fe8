// SPDX-License-Identifier: MIT
#include "package/zip_source.h"

#include <zip.h>

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <fstream>
#include <optional>

#include "errors.h"
#include "package/deflated_entry.h"
#include "package/read_ahead.h"
#include "workbook/limits.h"

namespace workbook {
namespace {

constexpr size_t kReadChunk = size_t{1} << 20;
// Parts from this size on are read ahead, in pieces small enough to be read
// while still in the cache they were written to.
constexpr uint64_t kReadAheadFrom = uint64_t{4} << 20;
constexpr size_t kAheadPiece = size_t{256} << 10;
constexpr size_t kAheadPieces = 6;

std::string Lower(std::string_view s)
{
    std::string r(s);
    std::transform(r.begin(), r.end(), r.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return r;
}

std::string ZipErrorText(int code)
{
    zip_error_t err;
    zip_error_init_with_code(&err, code);
    std::string text = zip_error_strerror(&err);
    zip_error_fini(&err);
    return text;
}

// Where the package inside the file ends when bytes follow its end of central
// directory record (a signature some producers append): the end of the last
// such record, within the last 64 KiB, whose central directory lies before
// it. Other readers open such a file; none when there is no such record.
std::optional<uint64_t> PackageEnd(const std::string &path)
{
    constexpr size_t kRecord = 22;
    constexpr uint64_t kSearch = 65536 + kRecord;
    std::ifstream in(path, std::ios::binary | std::ios::ate);
    if (!in) return std::nullopt;
    const auto size = static_cast<uint64_t>(static_cast<std::streamoff>(in.tellg()));
    const uint64_t from = size > kSearch ? size - kSearch : 0;
    std::string tail(static_cast<size_t>(size - from), '\0');
    in.seekg(static_cast<std::streamoff>(from));
    if (!in.read(tail.data(), static_cast<std::streamsize>(tail.size()))) return std::nullopt;
    auto u16 = [&](size_t at) { return uint64_t{uint8_t(tail[at])} | uint64_t{uint8_t(tail[at + 1])} << 8; };
    auto u32 = [&](size_t at) { return u16(at) | u16(at + 2) << 16; };
    constexpr std::string_view kSignature("PK\x05\x06", 4);
    for (size_t at = tail.rfind(kSignature); at != std::string::npos;
         at = at == 0 ? std::string::npos : tail.rfind(kSignature, at - 1)) {
        if (tail.size() - at < kRecord) continue;
        const uint64_t end = from + at + kRecord + u16(at + 20);
        const uint64_t directoryEnd = u32(at + 16) + u32(at + 12);
        if (end <= size && directoryEnd <= from + at) return end;
    }
    return std::nullopt;
}

// Opens the first `length` bytes of the file as the package, with the checks
// of OpenFile.
zip_t *OpenPrefix(const std::string &path, uint64_t length)
{
    zip_error_t error;
    zip_error_init(&error);
    zip_source_t *source = zip_source_file_create(path.c_str(), 0, static_cast<zip_int64_t>(length), &error);
    zip_t *za = source ? zip_open_from_source(source, ZIP_RDONLY | ZIP_CHECKCONS, &error) : nullptr;
    if (source && !za) zip_source_free(source);
    zip_error_fini(&error);
    return za;
}

}  // namespace

std::unique_ptr<PackageSource> PackageSource::OpenFile(const std::string &path)
{
    int code = 0;
    // The stricter checks hold each entry's headers and data to the bounds of
    // the file, so an entry cannot claim data beyond it.
    zip_t *za = zip_open(path.c_str(), ZIP_RDONLY | ZIP_CHECKCONS, &code);
    if (!za && (code == ZIP_ER_INCONS || code == ZIP_ER_NOZIP)) {
        const std::optional<uint64_t> end = PackageEnd(path);
        if (end) za = OpenPrefix(path, *end);
    }
    if (!za) {
        // The caller names the file: the reason alone goes here.
        if (code == ZIP_ER_NOENT) Fail(kBadFile, "no such file");
        std::error_code ignored;
        if (std::filesystem::is_directory(path, ignored)) Fail(kBadFile, "it is a folder, not a file");
        if (code == ZIP_ER_OPEN) Fail(kBadFile, "cannot open the file: " + ZipErrorText(code));
        Fail(kBadFile, "the file is not a workbook package: " + ZipErrorText(code));
    }
    std::unique_ptr<PackageSource> src(new PackageSource);
    src->path_ = path;
    src->archive_ = za;
    src->Index();
    return src;
}

std::unique_ptr<PackageSource> PackageSource::FromParts(
    std::vector<std::pair<std::string, std::string>> parts)
{
    std::unique_ptr<PackageSource> src(new PackageSource);
    for (auto &[name, bytes] : parts) {
        src->names_.push_back(name);
        src->memory_[name] = std::move(bytes);
    }
    return src;
}

PackageSource::~PackageSource()
{
    if (archive_) zip_discard(archive_);
}

void PackageSource::Index()
{
    zip_int64_t n = zip_get_num_entries(archive_, 0);
    if (n < 0 || static_cast<uint64_t>(n) > limits::kMaxPackageEntries)
        Fail(kBadFile, "the package holds too many entries");
    for (zip_int64_t i = 0; i < n; ++i) {
        const char *name = zip_get_name(archive_, static_cast<zip_uint64_t>(i), ZIP_FL_ENC_GUESS);
        if (!name) continue;
        std::string s(name);
        if (s.empty() || s.back() == '/') continue;
        names_.push_back(s);
        index_[s] = i;
    }
}

std::string PackageSource::Find(std::string_view partName) const
{
    std::string want(partName);
    if (index_.count(want) || memory_.count(want)) return want;
    std::string low = Lower(want);
    for (const auto &n : names_)
        if (Lower(n) == low) return n;
    return {};
}

int64_t PackageSource::IndexOf(const std::string &entry) const
{
    auto it = index_.find(entry);
    return it == index_.end() ? -1 : it->second;
}

const std::string *PackageSource::MemoryPart(const std::string &entry) const
{
    auto it = memory_.find(entry);
    return it == memory_.end() ? nullptr : &it->second;
}

uint64_t PackageSource::InflatedSizeBound(const std::string &entry) const
{
    if (const std::string *mem = MemoryPart(entry)) return mem->size();
    const int64_t idx = IndexOf(entry);
    zip_stat_t claimed;
    zip_stat_init(&claimed);
    if (idx < 0 || zip_stat_index(archive_, static_cast<zip_uint64_t>(idx), 0, &claimed) != 0 ||
        !(claimed.valid & ZIP_STAT_SIZE))
        return limits::kMaxPartBytes;
    return std::min<uint64_t>(claimed.size, limits::kMaxPartBytes);
}

void PackageSource::Read(const std::string &entry, const Sink &sink) const
{
    if (const std::string *mem = MemoryPart(entry)) {
        sink(mem->data(), mem->size());
        return;
    }
    int64_t idx = IndexOf(entry);
    if (idx < 0) Fail(kBadFile, "the package has no part '" + entry + "'");
    zip_stat_t claimed;
    zip_stat_init(&claimed);
    if (zip_stat_index(archive_, static_cast<zip_uint64_t>(idx), 0, &claimed) != 0)
        Fail(kBadFile, "cannot read part '" + entry + "': " + zip_strerror(archive_));
    // Deflated entries (nearly all) inflate with ISA-L; libzip reads the rest.
    std::unique_ptr<DeflatedEntry> deflated =
        DeflatedEntry::Open(archive_, static_cast<zip_uint64_t>(idx), claimed, entry);
    zip_file_t *zf = nullptr;
    if (!deflated) {
        zf = zip_fopen_index(archive_, static_cast<zip_uint64_t>(idx), 0);
        if (!zf) Fail(kBadFile, "cannot read part '" + entry + "': " + zip_strerror(archive_));
    }
    struct Closer {
        zip_file_t *f;
        ~Closer()
        {
            if (f) zip_fclose(f);
        }
    } closer{zf};
    const auto inflate = [&](char *buffer, size_t capacity) -> size_t {
        if (deflated) return deflated->Read(buffer, capacity);
        zip_int64_t got = zip_fread(zf, buffer, capacity);
        if (got < 0) Fail(kBadFile, "part '" + entry + "' is damaged: " + zip_file_strerror(zf));
        return static_cast<size_t>(got);
    };
    // A big part inflates on a second thread while the sink reads the piece
    // before; the sink never touches the archive, so the two don't meet.
    std::optional<ReadAhead> ahead;
    std::string buf;
    if ((claimed.valid & ZIP_STAT_SIZE) && claimed.size >= kReadAheadFrom)
        ahead.emplace(inflate, kAheadPiece, kAheadPieces);
    else
        buf.resize(kReadChunk);
    // The size an entry claims is never trusted: the buffers are fixed and the
    // total is counted on what actually inflates.
    uint64_t total = 0;
    for (;;) {
        std::string_view piece = ahead ? ahead->Next() : std::string_view(buf.data(), inflate(buf.data(), buf.size()));
        if (piece.empty()) break;
        total += piece.size();
        if ((claimed.valid & ZIP_STAT_SIZE) && total > claimed.size) break;
        if (total > limits::kMaxPartBytes)
            Fail(kBadFile, "part '" + entry + "' inflates beyond the limit of 1 GiB");
        sink(piece.data(), piece.size());
    }
    // An entry that inflates to other than its stated size is damaged, even
    // when what inflates is sound.
    if ((claimed.valid & ZIP_STAT_SIZE) && total != claimed.size)
        Fail(kBadFile, "part '" + entry + "' is damaged: it inflates to " +
                           (total > claimed.size ? "more than " : "") + std::to_string(total) +
                           " bytes, its header says " + std::to_string(claimed.size));
}

std::string PackageSource::ReadAll(const std::string &entry) const
{
    std::string out;
    Read(entry, [&](const char *d, size_t n) { out.append(d, n); });
    return out;
}

}  // namespace workbook
