// SPDX-License-Identifier: MIT
// The shortest text that reads back as the same 32-bit float, exactly as
// std::to_chars writes it, made faster for the short decimals that measured
// series are full of.
#pragma once

#include <cstddef>
#include <string>

namespace vantrel_cli {

// The most bytes WriteShortestFloat writes.
inline constexpr size_t kMaxFloatText = 24;

// Writes the text at out, which has room for kMaxFloatText bytes; returns its end.
char *WriteShortestFloat(char *out, float value);
void AppendShortestFloat(std::string &out, float value);

}  // namespace vantrel_cli
