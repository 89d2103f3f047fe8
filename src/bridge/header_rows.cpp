// SPDX-License-Identifier: MIT
#include "bridge/header_rows.h"

int ComposeHeaderRows(const std::vector<std::string> &itemTypes, const std::vector<std::string> &units,
                      const std::vector<std::string> &valueTypes,
                      std::vector<std::vector<std::string>> &lists, int unitTypeRow, int unitRow,
                      int valueTypeRow)
{
    const size_t n = itemTypes.size();
    if (units.size() != n || valueTypes.size() != n) return 0;

    const bool typeIsUnit = unitTypeRow == unitRow;
    const bool typeIsValue = unitTypeRow == valueTypeRow;
    const bool unitIsValue = unitRow == valueTypeRow;
    const int count = typeIsUnit && typeIsValue ? 1 : (typeIsUnit || typeIsValue || unitIsValue) ? 2 : 3;
    lists.assign(size_t(count), {});
    for (auto &list : lists) list.reserve(n);

    for (size_t i = 0; i < n; ++i) {
        const std::string &t = itemTypes[i];
        const std::string &u = units[i];
        const std::string &v = valueTypes[i];
        if (count == 1) {
            lists[0].push_back(t + "[" + u + "]:" + v);
        } else if (typeIsUnit) {
            lists[0].push_back(t + "[" + u + "]");
            lists[1].push_back(v);
        } else if (typeIsValue) {
            lists[0].push_back(t + ":" + v);
            lists[1].push_back(u);
        } else if (unitIsValue) {
            lists[0].push_back(t);
            lists[1].push_back(u + ":" + v);
        } else {
            lists[0].push_back(t);
            lists[1].push_back(u);
            lists[2].push_back(v);
        }
    }
    return count;
}
