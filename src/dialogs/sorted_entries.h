// SPDX-License-Identifier: MIT
// The entries of a list that keeps itself sorted, as the format combos and
// the item type and unit lists do: entries compare without regard to case,
// and lookups ignore case too.
#pragma once

#include <string>
#include <vector>

namespace vantrel::dialogs {

// Where a new entry goes in a sorted list: behind every entry that doesn't
// sort after it, so equal entries keep the order of adding.
size_t SortedInsertPlace(const std::vector<std::string> &entries, const std::string &entry);

// The first entry equal to text, ignoring case; -1 when none is.
int FindExactEntry(const std::vector<std::string> &entries, const std::string &text);

// The first entry that begins with prefix, ignoring case; -1 when none does.
int FindPrefixEntry(const std::vector<std::string> &entries, const std::string &prefix);

bool EqualIgnoringCase(const std::string &a, const std::string &b);

}  // namespace vantrel::dialogs
