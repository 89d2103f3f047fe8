// SPDX-License-Identifier: MIT
#include "dialogs/sorted_entries.h"

#include <algorithm>
#include <cctype>

namespace vantrel::dialogs {
namespace {

unsigned char Lower(char c) { return static_cast<unsigned char>(std::tolower(static_cast<unsigned char>(c))); }

bool SortsBefore(const std::string &a, const std::string &b)
{
    return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(),
                                        [](char x, char y) { return Lower(x) < Lower(y); });
}

}  // namespace

bool EqualIgnoringCase(const std::string &a, const std::string &b)
{
    return a.size() == b.size() &&
           std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) { return Lower(x) == Lower(y); });
}

size_t SortedInsertPlace(const std::vector<std::string> &entries, const std::string &entry)
{
    size_t place = 0;
    while (place < entries.size() && !SortsBefore(entry, entries[place])) ++place;
    return place;
}

int FindExactEntry(const std::vector<std::string> &entries, const std::string &text)
{
    for (size_t i = 0; i < entries.size(); ++i)
        if (EqualIgnoringCase(entries[i], text)) return int(i);
    return -1;
}

int FindPrefixEntry(const std::vector<std::string> &entries, const std::string &prefix)
{
    for (size_t i = 0; i < entries.size(); ++i)
        if (entries[i].size() >= prefix.size() && EqualIgnoringCase(entries[i].substr(0, prefix.size()), prefix))
            return int(i);
    return -1;
}

}  // namespace vantrel::dialogs
