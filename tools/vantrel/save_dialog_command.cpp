// SPDX-License-Identifier: MIT
#include "save_dialog_command.h"

#include <iostream>

#include "automation/values.h"
#include "host_series.h"
#include "module_loader.h"
#include "series_input.h"

namespace vantrel_cli {
namespace {

std::string Text(IHostConnection &connection, HRESULT (IHostConnection::*get)(BSTR *))
{
    automation::Bstr text;
    (connection.*get)(text.Out());
    return text.Utf8();
}

}  // namespace

int RunSaveDialogCommand(const Request &options, const std::string &seriesPath)
{
    // The series is read in full first: a text that doesn't read shows no window.
    const SeriesTable table = ReadSeries(ReadSeriesText(seriesPath));
    BridgeModule module(options.module.empty() ? DefaultModulePath() : options.module);
    // A person is at the dialog: the bridge may speak.
    auto series = MakeSeries("", ReadSpec(options.spec), false);
    FillSeries(table, *series.Get());
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    SetErrorInfo(0, nullptr);
    const HRESULT hr = bridge->SaveDialog();
    if (hr == E_ABORT) {
        std::cerr << "the dialog was cancelled\n";
        return 1;
    }
    if (FAILED(hr)) {
        const std::string reason = ErrorInfoText();
        std::cerr << (reason.empty() ? "the workbook could not be written" : reason) << "\n";
        return 1;
    }
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    std::cout << Text(*connection.Get(), &IHostConnection::GetFilePath) << "\n"
              << Text(*connection.Get(), &IHostConnection::GetSpecification) << "\n";
    return 0;
}

}  // namespace vantrel_cli
