// SPDX-License-Identifier: MIT
#include "cells/string_pool.h"

#include "errors.h"
#include "workbook/limits.h"

namespace workbook {

uint32_t StringPool::Add(std::string_view text)
{
    if (ends_.size() >= limits::kMaxStrings) Fail(kBadFile, "the workbook holds too many texts");
    blob_.append(text);
    ends_.push_back(blob_.size());
    return static_cast<uint32_t>(ends_.size() - 1);
}

uint32_t StringPool::Intern(std::string_view text)
{
    std::string key(text);
    auto it = interned_.find(key);
    if (it != interned_.end()) return it->second;
    uint32_t index = Add(text);
    interned_.emplace(std::move(key), index);
    return index;
}

}  // namespace workbook
