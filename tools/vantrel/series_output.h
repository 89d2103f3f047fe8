// SPDX-License-Identifier: MIT
// A host object written out as text: a CSV table (header lines, then one
// line a time step) or one JSON object.
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "automation/automation.h"
#include "hostseries/hostseries.h"

namespace vantrel_cli {

struct SeriesItem {
    std::string title;
    std::string itemType;   // catalogue name; empty when unset
    std::string unit;       // catalogue name; empty when unset
    std::string valueType;  // name, or the number when it has none
    int dataType = 0;
    std::vector<double> values;
};

struct SeriesTable {
    double deleteValue = 0.0;
    std::vector<DATE> times;
    std::vector<SeriesItem> items;
};

SeriesTable TakeSeries(IHostSeries &series);

// "YYYY-MM-DD HH:MM:SS", with ".fff" when the time has milliseconds.
std::string FormatTime(DATE time);
// The shortest text that reads back as the same 32-bit float.
std::string FloatText(float value);
// The most bytes WriteTime writes.
inline constexpr size_t kMaxTimeText = 64;
// Writes the time text at out, which has room for kMaxTimeText bytes; returns
// its end (WriteShortestFloat writes the other texts of a line).
char *WriteTime(char *out, DATE time);

// The warning for values that are NaN but not the delete value (a host may
// hold them; an import never makes them): they are written as nan, which the
// series reader of an export takes as missing in CSV and refuses in JSON.
// Empty when there are none.
std::string NotANumberWarning(const SeriesTable &table);

void WriteCsv(const SeriesTable &table, std::ostream &out);
void WriteJson(const SeriesTable &table, std::ostream &out);

}  // namespace vantrel_cli
