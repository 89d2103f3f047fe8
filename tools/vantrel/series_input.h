// SPDX-License-Identifier: MIT
// Reading a series back from the text that "vantrel import" prints (CSV or
// JSON) and laying it into an in-memory host object.
#pragma once

#include <istream>
#include <string>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "series_output.h"

namespace vantrel_cli {

// The text's form is told by its first character other than white space
// (after a byte-order mark): "{" is JSON, anything else CSV. The CSV may use
// a semicolon as its separator, mark a missing value by an empty field, NA or
// NaN, and carry the empty fields a spreadsheet program pads lines with.
// Throws std::runtime_error that names the line (CSV) or the field (JSON) at
// fault.
SeriesTable ReadSeries(const std::string &text);
SeriesTable ReadCsvSeries(const std::string &text);
SeriesTable ReadJsonSeries(const std::string &text);

// The whole of a file, or of standard input for "-".
std::string ReadSeriesText(const std::string &path);

// "YYYY-MM-DD HH:MM:SS" with an optional ".f" to ".fff" to an automation date;
// a 'T' may stand for the blank, and ":SS" may be left out.
// False for a text of another form or a field out of range.
bool ParseTime(const std::string &text, DATE &time);

// The item types, units and value types are looked up by name in the units
// catalogue and the value type names (a value type may also be a number), in
// any case, and a unit by its abbreviation too, as an import reads them; an
// empty name leaves the attribute unset. Throws for an unknown name.
void FillSeries(const SeriesTable &table, IHostSeries &series);

}  // namespace vantrel_cli
