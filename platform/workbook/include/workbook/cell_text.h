// SPDX-License-Identifier: MIT
// The size a cell text takes in a sheet part, measured as the reader measures
// it against limits::kMaxCellTextBytes: a writer that checks a text by it
// writes only what the engine reads back.
#pragma once

#include <cstddef>
#include <string_view>

namespace workbook {

// The bytes of text as written into a part, each character written as an
// _xHHHH_ escape counted with the seven bytes of its escape.
size_t StoredCellTextBytes(std::string_view text);

}  // namespace workbook
