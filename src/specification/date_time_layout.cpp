// SPDX-License-Identifier: MIT
// The layout of the date/time columns that a specification string names.
#include <array>

#include "datetime/format_text.h"
#include "specification/specification.h"

namespace {

struct LayoutKey {
    PARSINGTYPE columnKey;
    int mode;
    PARSINGTYPE formatKey;
};

// Tried in this order; the first key present decides. The modes number the
// split layouts the other way round from an open record's DataTimeType.
constexpr std::array<LayoutKey, 3> kLayoutKeys = {{
    {DateTimeCol, 0, DateTimeFormat},
    {TimeCol, 2, TimeFormat},
    {DateCol, 1, DateFormat},
}};

}  // namespace

bool CSpecification::GetDateTimeLayout(const std::string &specification, int &column,
                                       int &columnCount, int &mode, std::string &format) const
{
    for (const LayoutKey &layout : kLayoutKeys) {
        int keyColumn = 0;
        if (!GetKeyValueInt(specification, layout.columnKey, keyColumn)) continue;
        column = keyColumn;
        mode = layout.mode;
        if (!GetKeyValue(specification, layout.formatKey, format)) format.clear();
        break;
    }
    columnCount = vantrel::datetime::CountFormatColumns(format);
    return true;
}
