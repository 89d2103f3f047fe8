// SPDX-License-Identifier: MIT
#include "xls/biff_records.h"

#include <algorithm>
#include <string>

#include "errors.h"
#include "xls/biff_text.h"
#include "xls/little_endian.h"

namespace workbook::xls {

std::string_view RecordReader::Header(uint16_t &type)
{
    if (at_ + 4 > stream_.size()) {
        at_ = stream_.size();
        return {};
    }
    type = U16(stream_, at_);
    const uint16_t length = U16(stream_, at_ + 2);
    if (at_ + 4 + length > stream_.size())
        Fail(kBadFile, "the workbook stream is cut off within a record at byte " + std::to_string(at_));
    const std::string_view data = stream_.substr(at_ + 4, length);
    at_ += 4 + size_t{length};
    return data;
}

std::optional<Record> RecordReader::Next()
{
    if (at_ + 4 > stream_.size()) return std::nullopt;
    Record record;
    record.offset = at_;
    record.pieces.push_back(Header(record.type));
    while (at_ + 4 <= stream_.size() && U16(stream_, at_) == record::kContinue) {
        uint16_t type = 0;
        record.pieces.push_back(Header(type));
    }
    return record;
}

bool PieceReader::AtEnd()
{
    while (piece_ < pieces_.size() && at_ >= pieces_[piece_].size()) {
        ++piece_;
        at_ = 0;
    }
    return piece_ >= pieces_.size();
}

uint8_t PieceReader::Byte()
{
    if (AtEnd()) {
        short_ = true;
        return 0;
    }
    return uint8_t(pieces_[piece_][at_++]);
}

uint16_t PieceReader::U16()
{
    const uint8_t low = Byte();
    return uint16_t(low | Byte() << 8);
}

uint32_t PieceReader::U32()
{
    const uint16_t low = U16();
    return uint32_t(low) | uint32_t(U16()) << 16;
}

void PieceReader::Skip(uint64_t bytes)
{
    while (bytes > 0 && !AtEnd()) {
        const size_t step = size_t(std::min<uint64_t>(bytes, pieces_[piece_].size() - at_));
        at_ += step;
        bytes -= step;
    }
    if (bytes > 0) short_ = true;
}

std::string PieceReader::Characters(uint32_t count, bool wide)
{
    std::string out;
    while (count > 0) {
        if (piece_ < pieces_.size() && at_ >= pieces_[piece_].size()) {
            // The characters go on in the next piece, which says their width anew.
            if (AtEnd()) break;
            wide = (Byte() & 1) != 0;
            continue;
        }
        if (piece_ >= pieces_.size()) break;
        const std::string_view rest = pieces_[piece_].substr(at_);
        const size_t take = std::min<size_t>(count, rest.size() / (wide ? 2 : 1));
        if (take == 0) break;  // half a character at a piece's end
        const std::string_view bytes = rest.substr(0, take * (wide ? 2 : 1));
        out += wide ? Utf16ToUtf8(bytes) : Latin1ToUtf8(bytes);
        at_ += bytes.size();
        count -= uint32_t(take);
    }
    if (count > 0) short_ = true;
    return out;
}

}  // namespace workbook::xls
