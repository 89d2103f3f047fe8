// SPDX-License-Identifier: MIT
#include "datetime/format_presets.h"

namespace vantrel::datetime {

const std::vector<std::string> &DatePresetList()
{
    static const std::vector<std::string> presets = {
        "YYYY-MM-DD", "DD-MM-YYYY", "YYYY/MM/DD", "DD/MM/YYYY", "YYYY|MM|DD",
    };
    return presets;
}

const std::vector<std::string> &TimePresetList()
{
    static const std::vector<std::string> presets = {
        "HH:mm:ss", "HH-mm-ss", "HH/mm/ss", "HH|mm|ss",
    };
    return presets;
}

namespace {

// A date and a time joined by a blank, a T or a bar. Only the pairs that read
// naturally are offered, not every combination of the two lists.
const std::vector<std::string> &DateTimePresetList()
{
    static const std::vector<std::string> presets = {
        "YYYY-MM-DD HH:mm:ss", "YYYY-MM-DD HH-mm-ss", "DD-MM-YYYY HH:mm:ss",
        "DD-MM-YYYY HH-mm-ss", "YYYY/MM/DD HH:mm:ss", "YYYY/MM/DD HH/mm/ss",
        "DD/MM/YYYY HH:mm:ss", "DD/MM/YYYY HH/mm/ss", "YYYY-MM-DDTHH:mm:ss",
        "YYYY|MM|DD|HH|mm|ss",
    };
    return presets;
}

}  // namespace

const std::vector<std::string> &FormatPresets(int kind)
{
    static const std::vector<std::string> none;
    switch (kind) {
    case FormatPresetDateTime:
        return DateTimePresetList();
    case FormatPresetDate:
        return DatePresetList();
    case FormatPresetTime:
        return TimePresetList();
    default:
        return none;
    }
}

}  // namespace vantrel::datetime
