// SPDX-License-Identifier: MIT
// Raw deflate of a part's bytes with ISA-L. A large part is cut into pieces
// that are packed at once on several threads, each its own run of deflate
// blocks ending byte-aligned, so that they join into one stream.
#pragma once

#include <string>
#include <string_view>

namespace workbook {

// The raw deflate of bytes, appended to out; false, out as it was, when it
// would not be smaller than bytes.
bool AppendDeflated(std::string &out, std::string_view bytes);

}  // namespace workbook
