// SPDX-License-Identifier: MIT
// Splitting text at separators where a run of separators counts as one and
// separators at the start are skipped, so that no piece is ever empty.
#pragma once

#include <string_view>
#include <vector>

namespace vantrel {

std::vector<std::string_view> SplitPieces(std::string_view text, std::string_view separators);

// The leading integer of a text by the rules of atoi: blanks skipped, an
// optional sign, digits up to the first other character; 0 if there are none.
// Values beyond the 32-bit range are clamped to it.
int LeadingInt(std::string_view text);

}  // namespace vantrel
