// SPDX-License-Identifier: MIT
// Write side of the zip container: assembles a new package in memory. Parts
// that did not change are copied from the source package as they stand.
#pragma once

#include <deque>
#include <string>

#include "package/zip_source.h"

struct zip;
struct zip_source;

namespace workbook {

class ZipBuilder {
public:
    ZipBuilder();
    ~ZipBuilder();
    ZipBuilder(const ZipBuilder &) = delete;
    ZipBuilder &operator=(const ZipBuilder &) = delete;

    void AddBytes(const std::string &name, std::string bytes);
    // The entry of source, unchanged (its stored data when source is a zip).
    void AddCopy(const PackageSource &source, const std::string &name);
    // Closes the archive and hands out the bytes of the zip file.
    std::string Finish();

private:
    zip_source *buffer_ = nullptr;
    zip *archive_ = nullptr;
    std::deque<std::string> keep_;  // bytes the archive refers to until Finish
};

}  // namespace workbook
