// SPDX-License-Identifier: MIT
#include "export_command.h"

#include <iostream>

#include "module_loader.h"
#include "series_input.h"

namespace vantrel_cli {

int RunExport(const Request &request, const std::string &seriesPath)
{
    // The series is read in full before the bridge is loaded: a text that
    // doesn't read leaves the workbook untouched.
    const SeriesTable table = ReadSeries(ReadSeriesText(seriesPath));
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
    return 0;
}

}  // namespace vantrel_cli
