// SPDX-License-Identifier: MIT
#include "open_dialog_command.h"

#include <iostream>

#include "host_series.h"
#include "module_loader.h"
#include "output_file.h"
#include "series_output.h"

namespace vantrel_cli {

int RunOpenDialogCommand(const Request &options)
{
    BridgeModule module(options.module.empty() ? DefaultModulePath() : options.module);
    // A person is at the dialog: the bridge may speak. The dialog starts from
    // its own defaults, so the host object starts empty.
    auto series = MakeSeries("", "", false);
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    SetErrorInfo(0, nullptr);
    const HRESULT hr = bridge->OpenDialog();
    if (hr == E_ABORT) {
        std::cerr << "the dialog was cancelled\n";
        return 1;
    }
    if (FAILED(hr)) {
        const std::string reason = ErrorInfoText();
        std::cerr << (reason.empty() ? "the workbook could not be read" : reason) << "\n";
        return 1;
    }
    const SeriesTable table = TakeSeries(*series.Get());
    if (const std::string nan = NotANumberWarning(table); !nan.empty()) std::cerr << "warning: " << nan << "\n";
    WriteOutput(options.output, [&](std::ostream &out) {
        if (options.json) WriteJson(table, out);
        else WriteCsv(table, out);
    });
    return 0;
}

}  // namespace vantrel_cli
