// SPDX-License-Identifier: MIT
#include "package/parallel_deflate.h"

#include <isa-l/crc.h>
#include <isa-l/igzip_lib.h>

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <deque>
#include <exception>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

#include "errors.h"

namespace workbook {
namespace {

// ISA-L's level 2 packs sheets of numbers within a few percent of zlib's
// default level, at several times its speed.
constexpr uint32_t kDeflateLevel = 2;
constexpr uint32_t kLevelBufferSize = ISAL_DEF_LVL2_DEFAULT;
// Pieces this long lose a negligible share of matches at their starts, and
// a part of a few of them is already worth a second thread.
constexpr size_t kPieceSize = size_t{4} << 20;
constexpr unsigned kMostThreads = 4;
// Pieces made and not yet packed: enough to keep both threads busy, few
// enough that a large part is never whole in memory.
constexpr size_t kPiecesWaiting = 3;

// One thread's stream memory, used again for each piece it packs.
class PieceDeflater {
public:
    PieceDeflater() : levelBuffer_(new uint8_t[kLevelBufferSize]) {}

    // Packs piece into out (replacing it): the last piece ends the stream,
    // any other ends on a byte boundary after an empty stored block.
    void Deflate(std::string_view piece, bool last, std::string &out)
    {
        isal_zstream stream{};  // the fields the caller owns start empty: init leaves them
        isal_deflate_init(&stream);
        stream.level = kDeflateLevel;
        stream.level_buf = levelBuffer_.get();
        stream.level_buf_size = kLevelBufferSize;
        stream.flush = last ? NO_FLUSH : SYNC_FLUSH;
        stream.end_of_stream = last ? 1 : 0;
        stream.next_in = reinterpret_cast<uint8_t *>(const_cast<char *>(piece.data()));
        stream.avail_in = static_cast<uint32_t>(piece.size());
        // Room for what the piece can grow to; more only in case it grows further.
        out.resize(piece.size() + piece.size() / 8 + 1024);
        size_t written = 0;
        for (;;) {
            stream.next_out = reinterpret_cast<uint8_t *>(out.data() + written);
            stream.avail_out = static_cast<uint32_t>(out.size() - written);
            if (isal_deflate(&stream) != COMP_OK) Fail(E_FAIL, "cannot compress a part of the package");
            written = out.size() - stream.avail_out;
            const bool done = last ? stream.internal_state.state == ZSTATE_END
                                   : stream.avail_in == 0 && stream.internal_state.state == ZSTATE_NEW_HDR;
            if (done) break;
            if (stream.avail_out == 0) out.resize(out.size() + out.size() / 2);
        }
        out.resize(written);
    }

private:
    std::unique_ptr<uint8_t[]> levelBuffer_;
};

// Calls pack(piece index) for every piece on this thread and on helpers,
// each taking the next piece left. The helpers are joined before it returns,
// and the first exception any of them raised is raised here.
template <typename Pack>
void ForEachPiece(size_t pieces, Pack &&pack)
{
    std::atomic<size_t> next{0};
    std::atomic<bool> failed{false};
    auto work = [&](std::exception_ptr &error) {
        try {
            PieceDeflater deflater;
            for (size_t i = next++; i < pieces && !failed; i = next++) pack(deflater, i);
        } catch (...) {
            error = std::current_exception();
            failed = true;
        }
    };
    const unsigned helpers =
        static_cast<unsigned>(std::min<size_t>({pieces, std::max(2u, std::thread::hardware_concurrency()), kMostThreads})) - 1;
    std::vector<std::exception_ptr> errors(helpers + 1);
    {
        std::vector<std::jthread> threads;
        threads.reserve(helpers);
        for (unsigned t = 0; t < helpers; ++t) threads.emplace_back([&, t] { work(errors[t + 1]); });
        work(errors[0]);
    }  // joined here
    for (const auto &error : errors)
        if (error) std::rethrow_exception(error);
}

}  // namespace

bool AppendDeflated(std::string &out, std::string_view bytes)
{
    if (bytes.empty()) return false;
    const size_t pieces = (bytes.size() + kPieceSize - 1) / kPieceSize;
    // Each thread reads only its own pieces of bytes (shared, never written
    // while packing) and writes only its own slots of packed; `next` hands
    // out the indexes. The joins order every write before the joining below.
    std::vector<std::string> packed(pieces);
    ForEachPiece(pieces, [&](PieceDeflater &deflater, size_t i) {
        const std::string_view piece = bytes.substr(i * kPieceSize, kPieceSize);
        deflater.Deflate(piece, i + 1 == pieces, packed[i]);
    });
    size_t total = 0;
    for (const auto &p : packed) total += p.size();
    if (total >= bytes.size()) return false;
    out.reserve(out.size() + total);
    for (const auto &p : packed) out += p;
    return true;
}

namespace {

// The pieces between the thread that makes them and the one that packs them.
// Shared: only `waiting`, `ended`, `stopped` and `error`, all under `lock`.
// The packing thread alone touches the DeflatedPart until it is joined.
struct PieceQueue {
    std::mutex lock;
    std::condition_variable changed;
    std::deque<std::string> waiting;
    bool ended = false;    // no piece follows those waiting
    bool stopped = false;  // a side failed: the other stops too
    std::exception_ptr error;

    void Stop(std::exception_ptr e)
    {
        std::lock_guard guard(lock);
        if (!error) error = std::move(e);
        stopped = true;
        changed.notify_all();
    }
};

// Packs the pieces in order. A piece is taken only once the next one is there
// or the part has ended, so that the last one is known to be the last.
void PackPieces(PieceQueue &queue, DeflatedPart &part)
{
    PieceDeflater deflater;
    for (;;) {
        std::string piece;
        bool last = false;
        {
            std::unique_lock guard(queue.lock);
            queue.changed.wait(guard, [&] {
                return queue.stopped || queue.waiting.size() >= 2 || (queue.ended && !queue.waiting.empty());
            });
            if (queue.stopped) return;
            piece = std::move(queue.waiting.front());
            queue.waiting.pop_front();
            last = queue.ended && queue.waiting.empty();
            queue.changed.notify_all();
        }
        part.crc = crc32_gzip_refl(part.crc, reinterpret_cast<const unsigned char *>(piece.data()), piece.size());
        part.size += piece.size();
        std::string packed;
        deflater.Deflate(piece, last, packed);
        part.packedSize += packed.size();
        part.packed.push_back(std::move(packed));
        if (last) return;
    }
}

}  // namespace

DeflatedPart DeflateAsMade(const std::function<void(const PieceSink &)> &make)
{
    DeflatedPart part;
    PieceQueue queue;
    {
        std::jthread packer([&] {
            try {
                PackPieces(queue, part);
            } catch (...) {
                queue.Stop(std::current_exception());
            }
        });
        try {
            bool anyPiece = false;
            make([&](std::string &&piece) {
                std::unique_lock guard(queue.lock);
                queue.changed.wait(guard, [&] { return queue.stopped || queue.waiting.size() < kPiecesWaiting; });
                if (queue.stopped) std::rethrow_exception(queue.error);
                queue.waiting.push_back(std::move(piece));
                anyPiece = true;
                queue.changed.notify_all();
            });
            std::lock_guard guard(queue.lock);
            if (!anyPiece) queue.waiting.emplace_back();  // an empty part is one empty piece
            queue.ended = true;
            queue.changed.notify_all();
        } catch (...) {
            // The packer stops at its next piece and is joined below.
            queue.Stop(std::current_exception());
        }
    }  // joined: the packer has packed the last piece, or stopped
    if (queue.error) std::rethrow_exception(queue.error);
    return part;
}

}  // namespace workbook
