// SPDX-License-Identifier: MIT
// Read side of the zip container: the entries of a package, either a zip file
// on disk or parts held in memory (a new workbook before its first save).
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

struct zip;

namespace workbook {

class PackageSource {
public:
    using Sink = std::function<void(const char *data, size_t size)>;

    // Opens a zip file; raises ComError when it is missing or not a readable zip.
    static std::unique_ptr<PackageSource> OpenFile(const std::string &path);
    // Parts by name, in the given order.
    static std::unique_ptr<PackageSource> FromParts(std::vector<std::pair<std::string, std::string>> parts);

    ~PackageSource();
    PackageSource(const PackageSource &) = delete;
    PackageSource &operator=(const PackageSource &) = delete;

    // Entry names in container order (folders left out).
    const std::vector<std::string> &EntryNames() const { return names_; }
    // The stored name of a part, matched without regard to case as part names
    // are; empty when the package has no such part.
    std::string Find(std::string_view partName) const;

    // Streams the inflated bytes of an entry in large pieces. Raises ComError
    // on a damaged entry or one that inflates beyond limits::kMaxPartBytes.
    void Read(const std::string &entry, const Sink &sink) const;
    std::string ReadAll(const std::string &entry) const;
    // The most bytes the entry inflates to: the size its header states (a
    // part that inflates beyond it is refused), or the bound on one part when
    // the header states none.
    uint64_t InflatedSizeBound(const std::string &entry) const;

    // The open zip file, or null for parts in memory.
    zip *Archive() const { return archive_; }
    // Index of an entry in Archive(), or the bytes of a part in memory.
    int64_t IndexOf(const std::string &entry) const;
    const std::string *MemoryPart(const std::string &entry) const;

private:
    PackageSource() = default;
    void Index();

    std::string path_;
    zip *archive_ = nullptr;
    std::vector<std::string> names_;
    std::map<std::string, int64_t> index_;
    std::map<std::string, std::string> memory_;
};

}  // namespace workbook
