// SPDX-License-Identifier: MIT
#include "export_command.h"

#include <cmath>
#include <iostream>

#include "bridge_outcome.h"
#include "module_loader.h"
#include "series_input.h"

namespace vantrel_cli {

namespace {

// What a strict export refuses before the workbook is touched: values a cell
// can't hold, which the bridge would write as #NUM!. Empty when none.
std::string InfinityWarning(const SeriesTable &table)
{
    size_t count = 0, firstItem = 0, firstStep = 0;
    double first = 0;
    for (size_t i = 0; i < table.items.size(); ++i)
        for (size_t step = 0; step < table.items[i].values.size(); ++step)
            if (std::isinf(table.items[i].values[step]) && count++ == 0) {
                firstItem = i + 1;
                firstStep = step + 1;
                first = table.items[i].values[step];
            }
    if (count == 0) return {};
    std::string text = "item " + std::to_string(firstItem) + ", time step " + std::to_string(firstStep) +
                       ": the value " + (first < 0 ? "-inf" : "inf") +
                       " is beyond what a cell can hold and would be written as #NUM!";
    if (count > 1) text += " (and " + std::to_string(count - 1) + (count == 2 ? " more value)" : " more values)");
    return text;
}

void RefuseStrictly(const std::vector<std::string> &told)
{
    std::cerr << "vantrel: --strict: " << told.size() << (told.size() == 1 ? " warning" : " warnings")
              << ", nothing written\n";
}

}  // namespace

int RunExport(const Request &request, const std::string &seriesPath)
{
    // The series is read in full before the bridge is loaded: a text that
    // doesn't read leaves the workbook untouched.
    const SeriesTable table = ReadSeries(ReadSeriesText(seriesPath));
    std::vector<std::string> told;
    if (request.strict) {
        if (const std::string infinity = InfinityWarning(table); !infinity.empty()) {
            TellWarnings({infinity}, told, std::cerr);
            RefuseStrictly(told);
            return 1;
        }
    }
    BridgeModule module(request.module.empty() ? DefaultModulePath() : request.module);
    auto series = MakeSeries(request.book, ReadSpec(request.spec), !request.interactive);
    FillSeries(table, *series.Get());
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    // An export shows its faults in boxes; unless interactive, they are kept
    // here and told on stderr.
    CapturedMessages messages(request.interactive);
    SetErrorInfo(0, nullptr);
    const HRESULT hr = bridge->WriteData();
    if (FAILED(hr)) {
        std::string reason = ErrorInfoText();
        if (reason.empty() && !messages.Texts().empty()) reason = messages.Texts().back();
        std::cerr << (reason.empty() ? "the workbook could not be written" : reason) << "\n";
        return 1;
    }
    if (!request.interactive)
        for (const std::string &text : messages.Texts()) std::cerr << "vantrel: " << text << "\n";
    TellWarnings(BridgeWarnings(*bridge.Get()), told, std::cerr);
    return 0;
}

}  // namespace vantrel_cli
