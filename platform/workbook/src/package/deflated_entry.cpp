// SPDX-License-Identifier: MIT
#include "package/deflated_entry.h"

#include <isa-l/igzip_lib.h>
#include <zip.h>

#include <algorithm>
#include <cstdint>

#include "errors.h"

namespace workbook {
namespace {

// Raw bytes are read in pieces of this size.
constexpr size_t kInputPiece = size_t{256} << 10;

}  // namespace

struct DeflatedEntry::State {
    inflate_state inflate;
};

std::unique_ptr<DeflatedEntry> DeflatedEntry::Open(zip *archive, uint64_t index, const struct zip_stat &stat,
                                                   const std::string &entry)
{
    constexpr zip_uint64_t kNeeded = ZIP_STAT_COMP_METHOD | ZIP_STAT_ENCRYPTION_METHOD | ZIP_STAT_CRC;
    if ((stat.valid & kNeeded) != kNeeded || stat.comp_method != ZIP_CM_DEFLATE ||
        stat.encryption_method != ZIP_EM_NONE)
        return nullptr;
    zip_file_t *file = zip_fopen_index(archive, index, ZIP_FL_COMPRESSED);
    if (!file) Fail(kBadFile, "cannot read part '" + entry + "': " + zip_strerror(archive));
    return std::unique_ptr<DeflatedEntry>(new DeflatedEntry(file, stat.crc, entry));
}

DeflatedEntry::DeflatedEntry(zip_file *file, uint32_t crc, std::string entry)
    : file_(file), statedCrc_(crc), entry_(std::move(entry)), state_(std::make_unique<State>()),
      input_(kInputPiece)
{
    isal_inflate_init(&state_->inflate);
    // Raw deflate, as a zip holds it, with the CRC-32 of what comes out.
    state_->inflate.crc_flag = ISAL_GZIP_NO_HDR;
}

DeflatedEntry::~DeflatedEntry() { zip_fclose(file_); }

void DeflatedEntry::Damaged(const std::string &why) const
{
    Fail(kBadFile, "part '" + entry_ + "' is damaged: " + why);
}

void DeflatedEntry::Refill()
{
    const zip_int64_t got = zip_fread(file_, input_.data(), input_.size());
    if (got < 0) Damaged(zip_file_strerror(file_));
    state_->inflate.next_in = input_.data();
    state_->inflate.avail_in = static_cast<uint32_t>(got);
    inputEnded_ = got == 0;
}

size_t DeflatedEntry::Read(char *buffer, size_t capacity)
{
    inflate_state &s = state_->inflate;
    size_t made = 0;
    while (!finished_ && made < capacity) {
        if (s.avail_in == 0 && !inputEnded_) Refill();
        const uint32_t room = static_cast<uint32_t>(std::min<size_t>(capacity - made, UINT32_MAX));
        s.next_out = reinterpret_cast<uint8_t *>(buffer + made);
        s.avail_out = room;
        const int result = isal_inflate(&s);
        const uint32_t produced = room - s.avail_out;
        made += produced;
        if (result != ISAL_DECOMP_OK) Damaged("its compressed data is not valid");
        if (s.block_state == ISAL_BLOCK_FINISH) {
            finished_ = true;
            // In libzip's words.
            if (s.crc != statedCrc_) Damaged("CRC error");
        } else if (inputEnded_ && s.avail_in == 0 && produced == 0) {
            Damaged("its compressed data ends early");
        }
    }
    return made;
}

}  // namespace workbook
