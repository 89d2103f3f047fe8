// SPDX-License-Identifier: MIT
// The records of a workbook stream: a type, a length and the data, with the
// CONTINUE records that carry on a long record gathered as further pieces.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace workbook::xls {

namespace record {
inline constexpr uint16_t kBof8 = 0x0809, kBof4 = 0x0409, kBof3 = 0x0209, kBof2 = 0x0009, kEof = 0x000A;
inline constexpr uint16_t kContinue = 0x003C;
}  // namespace record

struct Record {
    uint16_t type = 0;
    size_t offset = 0;                     // of the record's header in the stream
    std::vector<std::string_view> pieces;  // the data, then each CONTINUE's data

    std::string_view data() const { return pieces.front(); }
    bool IsBof() const
    {
        return type == record::kBof8 || type == record::kBof4 || type == record::kBof3 || type == record::kBof2;
    }
};

class RecordReader {
public:
    explicit RecordReader(std::string_view stream, size_t from = 0) : stream_(stream), at_(from) {}

    // The next record, or nullopt at the end of the stream. Raises ComError
    // for a record cut off by the end of the stream.
    std::optional<Record> Next();
    size_t Offset() const { return at_; }

private:
    std::string_view Header(uint16_t &type);

    std::string_view stream_;
    size_t at_;
};

// The pieces of one record read as one run of bytes, except that a string's
// characters that go on in the next piece start there with a new flags byte.
class PieceReader {
public:
    explicit PieceReader(const std::vector<std::string_view> &pieces) : pieces_(pieces) {}

    bool AtEnd();
    uint8_t Byte();
    uint16_t U16();
    uint32_t U32();
    void Skip(uint64_t bytes);
    // count characters, one byte each (Latin-1) or two (UTF-16LE), as UTF-8.
    std::string Characters(uint32_t count, bool wide);
    // Whether the last read wanted more bytes than the pieces hold.
    bool Short() const { return short_; }

private:
    const std::vector<std::string_view> &pieces_;
    size_t piece_ = 0, at_ = 0;
    bool short_ = false;
};

}  // namespace workbook::xls
