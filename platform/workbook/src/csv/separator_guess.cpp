// SPDX-License-Identifier: MIT
#include "csv/separator_guess.h"

#include <algorithm>
#include <vector>

#include "automation/com_error.h"
#include "csv/delimited_parser.h"

namespace workbook::csv {
namespace {

constexpr size_t kSampleRecords = 100;

struct Record {
    uint64_t fields = 0;
    bool blank = true;
};

// The field counts of the sample's whole records under one separator; none
// when the sample doesn't split under it (a quote that never closes).
std::vector<Record> RecordsUnder(char separator, std::string_view sample, bool whole)
{
    std::vector<Record> records;
    DelimitedParser parser(separator, [&](const Field &field) {
        if (field.column == 1) records.emplace_back();
        records.back().fields = field.column;
        records.back().blank = records.back().blank && field.text.empty();
    });
    try {
        parser.Feed(sample);
        if (whole) parser.Finish();
    } catch (const automation::ComError &) {
        return {};
    }
    // The last record may go on beyond the sample.
    records.resize(std::min<size_t>({records.size(), size_t(parser.CompleteRecords()), kSampleRecords}));
    std::erase_if(records, [](const Record &r) { return r.blank; });
    return records;
}

}  // namespace

char GuessSeparator(std::string_view sample, bool whole)
{
    constexpr char kPreferred[] = {'\t', ';', ','};
    char mostSplit = ',';
    size_t mostSplitLines = 0;
    for (const char separator : kPreferred) {
        const std::vector<Record> records = RecordsUnder(separator, sample, whole);
        if (records.empty()) continue;
        const bool alike = std::all_of(records.begin(), records.end(),
                                       [&](const Record &r) { return r.fields == records.front().fields; });
        if (alike && records.front().fields > 1) return separator;
        const size_t split = size_t(std::count_if(records.begin(), records.end(), [](const Record &r) { return r.fields > 1; }));
        if (split > mostSplitLines) {
            mostSplitLines = split;
            mostSplit = separator;
        }
    }
    return mostSplit;
}

}  // namespace workbook::csv
