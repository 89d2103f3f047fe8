// SPDX-License-Identifier: MIT
// The texts of a workbook, kept end to end in one buffer: a cell holds only an
// index into the pool.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace workbook {

class StringPool {
public:
    // Appends a text and returns its index. Raises ComError past limits::kMaxStrings.
    uint32_t Add(std::string_view text);
    // Like Add, but a text the program put in earlier is found again.
    uint32_t Intern(std::string_view text);

    std::string_view Get(uint32_t index) const
    {
        uint64_t begin = index == 0 ? 0 : ends_[index - 1];
        return std::string_view(blob_).substr(begin, ends_[index] - begin);
    }
    uint32_t Size() const { return static_cast<uint32_t>(ends_.size()); }

private:
    std::string blob_;
    std::vector<uint64_t> ends_;
    std::unordered_map<std::string, uint32_t> interned_;
};

}  // namespace workbook
