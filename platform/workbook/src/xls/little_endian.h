// SPDX-License-Identifier: MIT
// Little-endian integers and doubles at an offset of a byte buffer; a read
// past the end gives zeros, so the callers check lengths where it matters.
#pragma once

#include <cstdint>
#include <cstring>
#include <string_view>

namespace workbook::xls {

inline uint8_t U8(std::string_view bytes, size_t at) { return at < bytes.size() ? uint8_t(bytes[at]) : 0; }

inline uint16_t U16(std::string_view bytes, size_t at) { return uint16_t(U8(bytes, at) | U8(bytes, at + 1) << 8); }

inline uint32_t U32(std::string_view bytes, size_t at) { return uint32_t(U16(bytes, at)) | uint32_t(U16(bytes, at + 2)) << 16; }

inline double F64(std::string_view bytes, size_t at)
{
    const uint64_t bits = uint64_t(U32(bytes, at)) | uint64_t(U32(bytes, at + 4)) << 32;
    double value;
    std::memcpy(&value, &bits, sizeof value);
    return value;
}

}  // namespace workbook::xls
