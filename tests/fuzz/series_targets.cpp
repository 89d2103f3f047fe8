// SPDX-License-Identifier: MIT
// libFuzzer targets for the series reader of `vantrel export`, built as the
// harness beside it is: FUZZ_TARGET names the function that runs. A series
// that reads must have one value an item for each time step and go into a
// host object or be refused with a reason; a crash or a hang is a finding.
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "vantrel/series_input.h"

namespace fuzz {

void Expect(bool condition, const char *what)
{
    if (condition) return;
    std::fprintf(stderr, "fuzz check failed: %s\n", what);
    std::abort();
}

void Take(vantrel_cli::SeriesTable (*read)(const std::string &), const uint8_t *data, size_t size)
{
    vantrel_cli::SeriesTable table;
    try {
        table = read(std::string(reinterpret_cast<const char *>(data), size));
    } catch (const std::runtime_error &) {
        return;  // refused, with its reason
    }
    for (const vantrel_cli::SeriesItem &item : table.items)
        Expect(item.values.size() == table.times.size(), "an item with another count of values than time steps");
    automation::ComPtr<IHostSeries> series;
    Expect(SUCCEEDED(HostSeriesCreate(series.Out())), "HostSeriesCreate failed");
    try {
        vantrel_cli::FillSeries(table, *series.Get());
    } catch (const std::runtime_error &) {
        return;  // an unknown item type, unit or value type
    }
    LONG items = -1;
    Expect(SUCCEEDED(series->GetItemCount(&items)) && size_t(items) == table.items.size(),
           "the host object holds another count of items than the series");
}

void SeriesCsv(const uint8_t *data, size_t size) { Take(vantrel_cli::ReadCsvSeries, data, size); }
void SeriesJson(const uint8_t *data, size_t size) { Take(vantrel_cli::ReadJsonSeries, data, size); }

}  // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    fuzz::FUZZ_TARGET(data, size);
    return 0;
}
