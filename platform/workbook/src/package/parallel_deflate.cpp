// SPDX-License-Identifier: MIT
#include "package/parallel_deflate.h"

#include <isa-l/igzip_lib.h>

#include <algorithm>
#include <atomic>
#include <cstdint>
#include <exception>
#include <memory>
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

}  // namespace workbook
