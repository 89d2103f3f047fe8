// SPDX-License-Identifier: MIT
// Raw deflate of a part's bytes with ISA-L. A large part is cut into pieces
// that are packed at once on several threads, each its own run of deflate
// blocks ending byte-aligned, so that they join into one stream. A part made
// piece by piece is packed on a second thread while its next piece is made.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace workbook {

// The raw deflate of bytes, appended to out; false, out as it was, when it
// would not be smaller than bytes.
bool AppendDeflated(std::string &out, std::string_view bytes);

// Hands on the pieces of a part, in order, as they are made.
using PieceSink = std::function<void(std::string &&piece)>;

struct DeflatedPart {
    std::vector<std::string> packed;  // joined in order, one raw deflate stream
    uint64_t size = 0;                // of the part itself
    uint64_t packedSize = 0;
    uint32_t crc = 0;  // CRC-32 of the part
};

// Calls make with a sink for the part's pieces and packs each piece on a
// second thread meanwhile. The thread ends before this returns; an exception
// of either side is raised here.
DeflatedPart DeflateAsMade(const std::function<void(const PieceSink &)> &make);

}  // namespace workbook
