// SPDX-License-Identifier: MIT
// Workbook files made to hurt a reader: zips that lie about their entries,
// a sheet that inflates to gigabytes from a few MB on disk, and packages whose
// parts or relationships are missing or point away. Shared by the engine's
// tests and the end-to-end tests of the command-line host.
#pragma once

#include <zlib.h>

#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

#include "engine_test_support.h"

namespace hostile {

using engine_test::Parts;

// One entry of a hand-made zip: its name, its stored bytes, and what the
// headers say about them.
struct ZipEntry {
    std::string name;
    std::string stored;
    uint16_t method = 0;  // 0 stored, 8 deflated
    uint32_t crc = 0;
    uint64_t inflatedSize = 0;
    uint32_t claimedPacked = 0;  // what the headers say is stored; 0: the truth
};

// Little-endian fields of 2 or 4 bytes.
inline void Put16(std::string &out, uint32_t v) { out += {static_cast<char>(v & 0xFF), static_cast<char>((v >> 8) & 0xFF)}; }
inline void Put32(std::string &out, uint32_t v) { Put16(out, v & 0xFFFF), Put16(out, v >> 16); }

// A zip file written byte by byte, so that its headers say exactly what a
// test wants them to say (sizes below 4 GiB: no zip64); localExtra goes into
// the local headers only.
inline std::string HandMadeZip(const std::vector<ZipEntry> &entries, const std::string &localExtra = {})
{
    std::string out, directory;
    for (const ZipEntry &e : entries) {
        const auto offset = static_cast<uint32_t>(out.size());
        const auto packed = e.claimedPacked ? e.claimedPacked : static_cast<uint32_t>(e.stored.size());
        const auto inflated = static_cast<uint32_t>(e.inflatedSize);
        Put32(out, 0x04034b50);
        Put16(out, 20), Put16(out, 0), Put16(out, e.method), Put16(out, 0), Put16(out, 0x21);
        Put32(out, e.crc), Put32(out, packed), Put32(out, inflated);
        Put16(out, static_cast<uint32_t>(e.name.size())), Put16(out, static_cast<uint32_t>(localExtra.size()));
        out += e.name;
        out += localExtra;
        out += e.stored;
        Put32(directory, 0x02014b50);
        Put16(directory, 20), Put16(directory, 20), Put16(directory, 0), Put16(directory, e.method);
        Put16(directory, 0), Put16(directory, 0x21);
        Put32(directory, e.crc), Put32(directory, packed), Put32(directory, inflated);
        Put16(directory, static_cast<uint32_t>(e.name.size()));
        Put16(directory, 0), Put16(directory, 0), Put16(directory, 0), Put16(directory, 0);
        Put32(directory, 0), Put32(directory, offset);
        directory += e.name;
    }
    const auto directoryAt = static_cast<uint32_t>(out.size());
    out += directory;
    Put32(out, 0x06054b50);
    Put16(out, 0), Put16(out, 0);
    Put16(out, static_cast<uint32_t>(entries.size())), Put16(out, static_cast<uint32_t>(entries.size()));
    Put32(out, static_cast<uint32_t>(directory.size())), Put32(out, directoryAt);
    Put16(out, 0);
    return out;
}

// Raw deflate (zip method 8) of pieces, each ended with the given flush.
class Deflater {
public:
    Deflater()
    {
        if (deflateInit2(&z_, 9, Z_DEFLATED, -15, 9, Z_DEFAULT_STRATEGY) != Z_OK)
            throw std::runtime_error("deflateInit2 failed");
    }
    ~Deflater() { deflateEnd(&z_); }
    Deflater(const Deflater &) = delete;
    Deflater &operator=(const Deflater &) = delete;

    std::string Piece(const std::string &in, int flush)
    {
        std::string out(deflateBound(&z_, static_cast<uLong>(in.size())) + 64, '\0');
        z_.next_in = reinterpret_cast<Bytef *>(const_cast<char *>(in.data()));
        z_.avail_in = static_cast<uInt>(in.size());
        z_.next_out = reinterpret_cast<Bytef *>(out.data());
        z_.avail_out = static_cast<uInt>(out.size());
        const int result = deflate(&z_, flush);
        if ((result != Z_OK && result != Z_STREAM_END) || z_.avail_in != 0) throw std::runtime_error("deflate failed");
        out.resize(out.size() - z_.avail_out);
        return out;
    }

private:
    z_stream z_{};
};

inline uint32_t Crc(const std::string &s)
{
    return static_cast<uint32_t>(crc32(0, reinterpret_cast<const Bytef *>(s.data()), static_cast<uInt>(s.size())));
}

inline ZipEntry DeflatedEntry(const std::string &name, const std::string &bytes)
{
    Deflater deflater;
    return ZipEntry{name, deflater.Piece(bytes, Z_FINISH), 8, Crc(bytes), bytes.size()};
}

// head + unit repeated to about inflatedBytes + tail, deflated in a moment:
// the repeated megabyte is compressed once after a full flush (which forgets
// all history) and its compressed form copied, so the stream stays valid while
// costing a few MB for gigabytes.
inline ZipEntry RepeatedDeflatedEntry(const std::string &name, const std::string &head, const std::string &unit,
                                      uint64_t inflatedBytes, const std::string &tail)
{
    std::string chunk;
    while (chunk.size() + unit.size() <= (size_t{1} << 20)) chunk += unit;
    const uint64_t repeats = (inflatedBytes + chunk.size() - 1) / chunk.size();
    Deflater deflater;
    const std::string headPacked = deflater.Piece(head, Z_FULL_FLUSH);
    const std::string chunkPacked = deflater.Piece(chunk, Z_FULL_FLUSH);
    const std::string tailPacked = deflater.Piece(tail, Z_FINISH);

    uLong crc = Crc(head);
    ZipEntry e{name, headPacked, 8, 0, head.size() + repeats * chunk.size() + tail.size()};
    e.stored.reserve(headPacked.size() + repeats * chunkPacked.size() + tailPacked.size());
    for (uint64_t i = 0; i < repeats; ++i) {
        e.stored += chunkPacked;
        crc = crc32_combine(crc, Crc(chunk), static_cast<z_off_t>(chunk.size()));
    }
    e.stored += tailPacked;
    e.crc = static_cast<uint32_t>(crc32_combine(crc, Crc(tail), static_cast<z_off_t>(tail.size())));
    return e;
}

inline const std::string kOkSheet = "<sheetData><row r=\"1\"><c r=\"A1\"><v>1</v></c></row></sheetData>";

// A sound package, deflated, its sheet part replaced by head + unit repeated
// to about inflatedBytes + tail, and named by `sheets` sheets of the workbook.
inline std::string InflatingSheet(const std::string &head, const std::string &unit, uint64_t inflatedBytes,
                                  const std::string &tail, int sheets = 1)
{
    const std::string tab = "<sheet name=\"Data\" sheetId=\"1\" r:id=\"rId1\"/>";
    std::string tabs = tab;
    for (int i = 2; i <= sheets; ++i)
        tabs += "<sheet name=\"Data" + std::to_string(i) + "\" sheetId=\"" + std::to_string(i) + "\" r:id=\"rId1\"/>";
    std::vector<ZipEntry> entries;
    for (auto [name, bytes] : engine_test::MinimalPackage(kOkSheet))
        entries.push_back(name == "xl/workbook.xml" ? DeflatedEntry(name, bytes.replace(bytes.find(tab), tab.size(), tabs))
                          : name == "xl/worksheets/sheet1.xml"
                              ? RepeatedDeflatedEntry(name, std::string("<?xml version=\"1.0\"?><worksheet xmlns=\"") +
                                                                engine_test::kMainNs + "\">" + head,
                                                      unit, inflatedBytes, tail + "</worksheet>")
                              : DeflatedEntry(name, bytes));
    return HandMadeZip(entries);
}

// A worksheet that goes on and on with comments (a lean stream for the
// parser: nothing in it is kept).
inline std::string GigabyteSheet(uint64_t inflatedBytes)
{
    return InflatingSheet(kOkSheet, "<!-- filler -->\n", inflatedBytes, "");
}

// A sound package whose entry `name` claims, in both its headers, the sizes
// given instead of its own (0 leaves a size as it is).
inline std::string LyingSizes(const std::string &name, uint32_t claimedPacked, uint32_t claimedInflated)
{
    std::vector<ZipEntry> entries;
    for (const auto &[part, bytes] : engine_test::MinimalPackage(kOkSheet)) {
        entries.push_back(DeflatedEntry(part, bytes));
        if (part != name) continue;
        entries.back().claimedPacked = claimedPacked;
        if (claimedInflated) entries.back().inflatedSize = claimedInflated;
    }
    return HandMadeZip(entries);
}

// The part editors, for the end-to-end tests that name them here.
using engine_test::Edit;
using engine_test::PartOf;
using engine_test::Replace;
using engine_test::Without;

// An entity bomb: a billion laughs in ten levels, were it ever expanded.
inline std::string EntityBomb(const std::string &root, const std::string &use)
{
    std::string doctype = "<?xml version=\"1.0\"?><!DOCTYPE " + root + " [<!ENTITY l0 \"lol\">";
    for (int level = 1; level < 10; ++level) {
        doctype += "<!ENTITY l" + std::to_string(level) + " \"";
        for (int i = 0; i < 10; ++i) doctype += "&l" + std::to_string(level - 1) + ";";
        doctype += "\">";
    }
    return doctype + "]>" + use;
}

}  // namespace hostile
