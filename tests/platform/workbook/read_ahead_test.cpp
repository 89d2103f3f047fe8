// SPDX-License-Identifier: MIT
// The read-ahead ring: every byte in order whatever the speeds of the two
// sides. (A producer's failure and a reader that stops early are met end to
// end by the hostile workbooks of some MB, which go through the ring.)
#include <gtest/gtest.h>

#include <chrono>
#include <string>
#include <thread>

#include "package/read_ahead.h"

namespace {

// Piece k holds bytes (k + i) % 251, of a size that varies, so that a piece
// handed twice, skipped or overwritten while read shows in the bytes.
struct NumberedPieces {
    size_t pieces = 0;
    size_t made = 0;
    bool slow = false;

    size_t operator()(char *buffer, size_t capacity)
    {
        if (made == pieces) return 0;
        if (slow && made % 7 == 0) std::this_thread::sleep_for(std::chrono::microseconds(200));
        const size_t size = 1 + (made * 37) % capacity;
        for (size_t i = 0; i < size; ++i) buffer[i] = static_cast<char>((made + i) % 251);
        ++made;
        return size;
    }
};

void ExpectPiece(std::string_view piece, size_t k, size_t capacity)
{
    ASSERT_EQ(piece.size(), 1 + (k * 37) % capacity) << "piece " << k;
    for (size_t i = 0; i < piece.size(); ++i)
        ASSERT_EQ(piece[i], static_cast<char>((k + i) % 251)) << "piece " << k << " byte " << i;
}

TEST(ReadAhead, EveryPieceInOrderAtAnyPace)
{
    constexpr size_t kCapacity = 4096;
    for (const bool slowProducer : {false, true}) {
        for (const size_t ring : {1, 2, 3, 8}) {
            SCOPED_TRACE("ring of " + std::to_string(ring) + (slowProducer ? ", slow producer" : ""));
            workbook::ReadAhead ahead(NumberedPieces{500, 0, slowProducer}, kCapacity, ring);
            for (size_t k = 0; k < 500; ++k) {
                const std::string_view piece = ahead.Next();
                ExpectPiece(piece, k, kCapacity);
                // A slow reader now and then: the worker fills the ring meanwhile
                // and must not write into the piece still being read.
                if (!slowProducer && k % 50 == 0) std::this_thread::sleep_for(std::chrono::milliseconds(1));
                ExpectPiece(piece, k, kCapacity);
            }
            EXPECT_TRUE(ahead.Next().empty());
            EXPECT_TRUE(ahead.Next().empty());
        }
    }
}

}  // namespace
