// SPDX-License-Identifier: MIT
// Reads a stream on a second thread, a few pieces ahead of its reader, so that
// producing the bytes (inflating a zip entry) overlaps with what the reader
// does with them.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <exception>
#include <functional>
#include <mutex>
#include <string_view>
#include <thread>
#include <vector>

namespace workbook {

class ReadAhead {
public:
    // Fills the buffer with the next bytes and tells how many; 0 at the end.
    // It may raise: the exception reaches the reader in place of the bytes.
    using Producer = std::function<size_t(char *buffer, size_t capacity)>;

    ReadAhead(Producer produce, size_t pieceSize, size_t pieces);
    // Stops the worker and waits for it, whether or not all was read.
    ~ReadAhead();
    ReadAhead(const ReadAhead &) = delete;
    ReadAhead &operator=(const ReadAhead &) = delete;

    // The next piece, valid until the next call; empty at the end. Raises
    // what the producer raised.
    std::string_view Next();

private:
    struct Piece {
        std::vector<char> bytes;
        size_t size = 0;
    };
    void Work();

    Producer produce_;
    std::vector<Piece> pieces_;
    std::mutex mutex_;
    std::condition_variable changed_;
    // Pieces go round in order: the worker fills `filled_ % n`, the reader
    // reads `read_ % n`; read_ <= filled_ <= read_ + n - 1 keeps the piece
    // being read out of the worker's way.
    size_t filled_ = 0, read_ = 0;
    bool ended_ = false, stopping_ = false;
    std::exception_ptr failure_;
    bool inline_ = false;  // no second thread could be had: read in place
    std::thread worker_;
};

}  // namespace workbook
