// SPDX-License-Identifier: MIT
#include "import_command.h"

#include <fstream>
#include <iostream>
#include <stdexcept>

#include "module_loader.h"
#include "series_output.h"

namespace vantrel_cli {

int RunImport(const Request &request)
{
    BridgeModule module(request.module.empty() ? DefaultModulePath() : request.module);
    auto series = MakeSeries(request.book, ReadSpec(request.spec), !request.interactive);
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    // The bridge shows a time axis fault in a box: silent, we keep it to ourselves.
    CapturedMessages messages(request.interactive);
    SetErrorInfo(0, nullptr);
    if (FAILED(bridge->ReadData())) {
        std::string reason = ErrorInfoText();
        if (reason.empty() && !messages.Texts().empty()) reason = messages.Texts().back();
        std::cerr << (reason.empty() ? "the workbook could not be read" : reason) << "\n";
        return 1;
    }
    const SeriesTable table = TakeSeries(*series.Get());
    std::ofstream file;
    if (!request.output.empty()) {
        file.open(request.output, std::ios::binary);
        if (!file) throw std::runtime_error("cannot write " + request.output);
    }
    std::ostream &out = request.output.empty() ? std::cout : file;
    if (request.json) WriteJson(table, out);
    else WriteCsv(table, out);
    out.flush();
    if (!out) throw std::runtime_error("cannot write the output");
    return 0;
}

}  // namespace vantrel_cli
