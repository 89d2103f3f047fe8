// SPDX-License-Identifier: MIT
// What the commands that read a workbook with the engine directly share.
#pragma once

#include <cstdint>
#include <memory>
#include <ostream>
#include <string>

#include "workbook/engine.h"

namespace vantrel_cli {

// Opens the workbook at path for reading. When it doesn't open, tells err the
// message a session gives for that, with the engine's reason on its own line,
// and returns null.
std::shared_ptr<workbook::Workbook> OpenForReading(workbook::Application &app, const std::string &path,
                                                   std::ostream &err);

// Reads the sheet. When it can't be read, tells err as OpenForReading does
// and returns false.
bool ReadsWhole(workbook::Worksheet &sheet, std::ostream &err);

// "A", "Z", "AA", ... for columns from 1.
std::string ColumnName(int32_t column);

}  // namespace vantrel_cli
