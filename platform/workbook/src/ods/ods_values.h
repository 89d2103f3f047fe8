// SPDX-License-Identifier: MIT
// The typed values of OpenDocument cells, as the attributes spell them.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace workbook::ods {

// A number attribute (office:value): a decimal in the C locale, nothing else.
std::optional<double> ParseNumber(std::string_view text);

// A whole count (table:number-rows-repeated, text:c): 1 and up.
std::optional<uint64_t> ParseCount(std::string_view text);

// office:date-value, "2007-06-16" or "2007-06-16T12:30:00.5", as a serial of
// the 1900 date system: such dates name their day, whatever the file's null date.
std::optional<double> ParseDateValue(std::string_view text);

// office:time-value, a duration such as "PT12H30M00S" or "P1DT2H", in days.
std::optional<double> ParseDuration(std::string_view text);

}  // namespace workbook::ods
