// SPDX-License-Identifier: MIT
#include "workbook/format/date_format.h"

#include <algorithm>

#include "workbook/format/format_code.h"

namespace workbook::format {

bool IsDateFormat(std::string_view formatCode) {
    FormatCode code;
    try {
        code = ParseFormatCode(formatCode);
    } catch (const FormatCodeError &) {
        return false;
    }
    // The text section never shows a number, so it does not count.
    const size_t numeric = std::min<size_t>(code.sections.size(), 3);
    return std::any_of(code.sections.begin(), code.sections.begin() + static_cast<long>(numeric),
                       [](const FormatSection &s) { return s.kind == SectionKind::Date; });
}

}  // namespace workbook::format
