// SPDX-License-Identifier: MIT
#include "open_dialog_command.h"

#include <exception>
#include <fstream>
#include <iostream>
#include <stdexcept>

#include "host_series.h"
#include "module_loader.h"
#include "registration_commands.h"
#include "series_output.h"

namespace vantrel_cli {
namespace {

constexpr const char kUsage[] =
    "usage: vantrel open-dialog [--json] [--output FILE] [--module PATH]\n"
    "  shows the bridge's open dialog; after OK prints the imported series as import does\n";

struct DialogOptions {
    bool json = false;
    std::string output;
    std::string module;
};

bool Parse(int argc, char **argv, DialogOptions &options)
{
    for (int i = 2; i < argc; ++i) {
        const std::string arg = argv[i];
        if (arg == "--json") options.json = true;
        else if (arg == "--output" && i + 1 < argc) options.output = argv[++i];
        else if (arg == "--module" && i + 1 < argc) options.module = argv[++i];
        else return false;
    }
    return true;
}

int Run(const DialogOptions &options)
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
    std::ofstream file;
    if (!options.output.empty()) {
        file.open(options.output, std::ios::binary);
        if (!file) throw std::runtime_error("cannot write " + options.output);
    }
    std::ostream &out = options.output.empty() ? std::cout : file;
    if (options.json) WriteJson(table, out);
    else WriteCsv(table, out);
    out.flush();
    if (!out) throw std::runtime_error("cannot write the output");
    return 0;
}

}  // namespace

int RunOpenDialogCommand(int argc, char **argv, const std::string &progId)
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
