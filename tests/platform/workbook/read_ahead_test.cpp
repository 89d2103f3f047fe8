// SPDX-License-Identifier: MIT
// The read-ahead ring: every byte in order whatever the speeds of the two
// sides, a producer's exception in place of the bytes after it, and a reader
// that stops early leaves no worker behind.
#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <stdexcept>
#include <string>
#include <thread>

#include "read_ahead.h"

namespace {

// Piece k holds bytes (k + i) % 251, of a size that varies, so that a piece
// handed twice, skipped or overwritten while read shows in the bytes.
struct NumberedPieces {
    size_t pieces = 0;
    size_t made = 0;
    size_t throwAt = SIZE_MAX;
    bool slow = false;

    size_t operator()(char *buffer, size_t capacity)
    {
        if (made == throwAt) throw std::runtime_error("piece " + std::to_string(made) + " is damaged");
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
            workbook::ReadAhead ahead(NumberedPieces{500, 0, SIZE_MAX, slowProducer}, kCapacity, ring);
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

TEST(ReadAhead, FailureArrivesAfterThePiecesBeforeIt)
{
    workbook::ReadAhead ahead(NumberedPieces{100, 0, 10, false}, 512, 3);
    for (size_t k = 0; k < 10; ++k) ExpectPiece(ahead.Next(), k, 512);
    try {
        ahead.Next();
        FAIL() << "the producer's failure was not raised";
    } catch (const std::runtime_error &e) {
        EXPECT_STREQ(e.what(), "piece 10 is damaged");
    }
}

TEST(ReadAhead, ReaderThatStopsEarlyEndsTheWorker)
{
    std::atomic<size_t> produced = 0;
    {
        workbook::ReadAhead ahead(
            [&](char *buffer, size_t) {
                buffer[0] = 'x';
                ++produced;
                return size_t{1};  // endless
            },
            64, 4);
        EXPECT_EQ(ahead.Next(), "x");
    }
    // The worker stopped at the ring's size: three pieces ahead at most.
    EXPECT_LE(produced.load(), 5u);
}

}  // namespace
