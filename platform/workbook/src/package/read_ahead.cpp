// SPDX-License-Identifier: MIT
#include "package/read_ahead.h"

#include <system_error>

namespace workbook {

ReadAhead::ReadAhead(Producer produce, size_t pieceSize, size_t pieces)
    : produce_(std::move(produce)), pieces_(pieces < 2 ? 2 : pieces)
{
    for (Piece &piece : pieces_) piece.bytes.resize(pieceSize);
    try {
        worker_ = std::thread([this] { Work(); });
    } catch (const std::system_error &) {
        inline_ = true;  // out of threads: the reader produces each piece itself
    }
}

ReadAhead::~ReadAhead()
{
    {
        std::lock_guard lock(mutex_);
        stopping_ = true;
    }
    changed_.notify_all();
    if (worker_.joinable()) worker_.join();
}

std::string_view ReadAhead::Next()
{
    if (inline_) {
        Piece &piece = pieces_.front();
        const size_t got = produce_(piece.bytes.data(), piece.bytes.size());
        return {piece.bytes.data(), got};
    }
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [this] { return filled_ > read_ || ended_; });
    if (filled_ > read_) {
        Piece &piece = pieces_[read_ % pieces_.size()];
        ++read_;  // frees the piece read before this one for the worker
        lock.unlock();
        changed_.notify_all();
        return {piece.bytes.data(), piece.size};
    }
    if (failure_) std::rethrow_exception(failure_);
    return {};
}

void ReadAhead::Work()
{
    const size_t n = pieces_.size();
    for (;;) {
        std::unique_lock lock(mutex_);
        // The piece the reader holds (read_ - 1) stays out of reach.
        changed_.wait(lock, [&] { return stopping_ || filled_ + 1 < read_ + n; });
        if (stopping_) return;
        Piece &piece = pieces_[filled_ % n];
        lock.unlock();
        size_t got = 0;
        std::exception_ptr failure;
        try {
            got = produce_(piece.bytes.data(), piece.bytes.size());
        } catch (...) {
            failure = std::current_exception();
        }
        lock.lock();
        if (failure || got == 0) {
            failure_ = failure;
            ended_ = true;
        } else {
            piece.size = got;
            ++filled_;
        }
        lock.unlock();
        changed_.notify_all();
        if (failure || got == 0) return;
    }
}

}  // namespace workbook
