// SPDX-License-Identifier: MIT
#include "package/zip_writer.h"

#include <zip.h>

#include "errors.h"

namespace workbook {
namespace {

// Deflate levels: the usual one, and a fast one for big parts, so that a sheet
// of a million rows is written in seconds.
constexpr zip_uint32_t kDeflateLevel = 6;
constexpr zip_uint32_t kFastDeflateLevel = 1;
constexpr size_t kBigPart = size_t{8} << 20;

}  // namespace

ZipBuilder::ZipBuilder()
{
    zip_error_t err;
    zip_error_init(&err);
    buffer_ = zip_source_buffer_create(nullptr, 0, 0, &err);
    if (!buffer_) Fail(E_OUTOFMEMORY, "cannot create the package buffer");
    zip_source_keep(buffer_);
    archive_ = zip_open_from_source(buffer_, ZIP_TRUNCATE, &err);
    if (!archive_) {
        std::string text = zip_error_strerror(&err);
        zip_error_fini(&err);
        zip_source_free(buffer_);
        Fail(E_FAIL, "cannot create the package: " + text);
    }
    zip_error_fini(&err);
}

ZipBuilder::~ZipBuilder()
{
    if (archive_) zip_discard(archive_);
    if (buffer_) zip_source_free(buffer_);
}

void ZipBuilder::AddBytes(const std::string &name, std::string bytes)
{
    keep_.push_back(std::move(bytes));
    const std::string &data = keep_.back();
    zip_source_t *src = zip_source_buffer(archive_, data.data(), data.size(), 0);
    if (!src) Fail(E_OUTOFMEMORY, "cannot add part '" + name + "'");
    zip_int64_t idx = zip_file_add(archive_, name.c_str(), src, ZIP_FL_ENC_UTF_8);
    if (idx < 0) {
        zip_source_free(src);
        Fail(E_FAIL, "cannot add part '" + name + "': " + zip_strerror(archive_));
    }
    zip_set_file_compression(archive_, static_cast<zip_uint64_t>(idx), ZIP_CM_DEFLATE,
                             data.size() > kBigPart ? kFastDeflateLevel : kDeflateLevel);
}

void ZipBuilder::AddCopy(const PackageSource &source, const std::string &name)
{
    if (const std::string *mem = source.MemoryPart(name)) {
        AddBytes(name, *mem);
        return;
    }
    int64_t idx = source.IndexOf(name);
    if (idx < 0 || !source.Archive()) Fail(E_FAIL, "the package has no part '" + name + "'");
    // Taken from the source archive as stored: libzip copies the compressed
    // data without inflating it again.
    zip_source_t *src =
        zip_source_zip(archive_, source.Archive(), static_cast<zip_uint64_t>(idx), 0, 0, -1);
    if (!src) Fail(E_FAIL, "cannot copy part '" + name + "': " + zip_strerror(archive_));
    zip_int64_t added = zip_file_add(archive_, name.c_str(), src, ZIP_FL_ENC_UTF_8);
    if (added < 0) {
        zip_source_free(src);
        Fail(E_FAIL, "cannot copy part '" + name + "': " + zip_strerror(archive_));
    }
    // A stored entry stays stored; a deflated one is taken as it is.
    zip_stat_t st;
    if (zip_stat_index(source.Archive(), static_cast<zip_uint64_t>(idx), 0, &st) == 0 &&
        (st.valid & ZIP_STAT_COMP_METHOD) && st.comp_method == ZIP_CM_STORE)
        zip_set_file_compression(archive_, static_cast<zip_uint64_t>(added), ZIP_CM_STORE, 0);
}

std::string ZipBuilder::Finish()
{
    if (zip_close(archive_) != 0) {
        std::string text = zip_strerror(archive_);
        Fail(E_FAIL, "cannot assemble the package: " + text);
    }
    archive_ = nullptr;
    keep_.clear();
    std::string out;
    zip_stat_t st;
    if (zip_source_stat(buffer_, &st) != 0 || zip_source_open(buffer_) != 0)
        Fail(E_FAIL, "cannot read the assembled package");
    out.resize(static_cast<size_t>(st.size));
    zip_int64_t got = zip_source_read(buffer_, out.data(), out.size());
    zip_source_close(buffer_);
    if (got < 0 || static_cast<size_t>(got) != out.size())
        Fail(E_FAIL, "cannot read the assembled package");
    return out;
}

}  // namespace workbook
