// SPDX-License-Identifier: MIT
#include "save_dialog_command.h"

#include <exception>
#include <iostream>

#include "automation/values.h"
#include "host_series.h"
#include "module_loader.h"
#include "registration_commands.h"
#include "series_input.h"

namespace vantrel_cli {
namespace {

constexpr const char kUsage[] =
    "usage: vantrel save-dialog SERIES [--spec SPEC] [--module PATH]\n"
    "  shows the bridge's save dialog over SERIES (CSV or JSON as import prints it; - for standard\n"
    "  input); after OK the bridge writes the workbook, and the path and the specification string\n"
    "  are printed\n"
    "  --spec    the host object's string beforehand, or @FILE (the dialog starts from its own\n"
    "            defaults and replaces it on OK)\n";

struct DialogOptions {
    std::string series;
    std::string spec;
    std::string module;
};

bool Parse(int argc, char **argv, DialogOptions &options)
{
    bool haveSeries = false;
    for (int i = 2; i < argc; ++i) {
        const std::string arg = argv[i];
        if (arg == "--spec" && i + 1 < argc) {
            options.spec = argv[++i];
        } else if (arg == "--module" && i + 1 < argc) {
            options.module = argv[++i];
        } else if ((arg.empty() || arg[0] != '-' || arg == "-") && !haveSeries) {
            options.series = arg;
            haveSeries = true;
        } else {
            return false;
        }
    }
    return haveSeries;
}

std::string Text(IHostConnection &connection, HRESULT (IHostConnection::*get)(BSTR *))
{
    automation::Bstr text;
    (connection.*get)(text.Out());
    return text.Utf8();
}

int Run(const DialogOptions &options)
{
    // The series is read in full first: a text that doesn't read shows no window.
    const SeriesTable table = ReadSeries(ReadSeriesText(options.series));
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

}  // namespace

int RunSaveDialogCommand(int argc, char **argv, const std::string &progId)
{
    DialogOptions options;
    if (!Parse(argc, argv, options)) {
        std::cerr << kUsage;
        return 2;
    }
    CoInitialize(nullptr);
    int status = 1;
    try {
        if (!progId.empty()) options.module = ModuleOfProgId(progId);
        status = Run(options);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
    }
    CoUninitialize();
    return status;
}

}  // namespace vantrel_cli
