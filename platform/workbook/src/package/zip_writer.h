// SPDX-License-Identifier: MIT
// Write side of the zip container: assembles a new package in memory, entry
// after entry. New parts are deflated with ISA-L; parts that did not change
// are copied from the source package as they are stored, without inflating
// them. Sizes and offsets beyond 4 GiB take the zip64 records.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "package/parallel_deflate.h"
#include "package/zip_source.h"

namespace workbook {

class ZipBuilder {
public:
    ZipBuilder();

    void AddBytes(const std::string &name, std::string_view bytes);
    // The entry whose bytes make hands to its sink piece by piece, deflated
    // meanwhile; it stays deflated even in the rare case that this doesn't
    // make it smaller, as its bytes are never all kept.
    void AddMade(const std::string &name, const std::function<void(const PieceSink &)> &make);
    // The entry of source, unchanged (its stored data when source is a zip).
    void AddCopy(const PackageSource &source, const std::string &name);
    // Writes the central directory and hands out the bytes of the zip file.
    std::string Finish();

private:
    struct Entry {
        std::string name;
        uint16_t method;
        uint16_t dosTime;
        uint16_t dosDate;
        uint32_t crc;
        uint64_t compressedSize;
        uint64_t size;
        uint64_t offset;
    };
    // The local header of entry, its data to follow at once.
    void AddLocalHeader(const Entry &entry);

    std::string out_;
    std::vector<Entry> entries_;
    uint16_t dosTime_ = 0;
    uint16_t dosDate_ = 0;
};

}  // namespace workbook
