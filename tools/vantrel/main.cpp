// SPDX-License-Identifier: MIT
// vantrel: runs the bridge module from the command line, as a host would.
//
//   vantrel inspect BOOK --spec SPEC [--interactive] [--module PATH]
#include <cstdio>
#include <exception>
#include <iostream>
#include <string>
#include <vector>

#include "automation/values.h"
#include "module_loader.h"
#include "registration_commands.h"

namespace {

constexpr const char kUsage[] =
    "usage: vantrel inspect BOOK --spec SPEC [--interactive] [--module PATH]\n"
    "  inspect   checks BOOK against the layout SPEC; prints \"fits\" or what doesn't fit\n"
    "  --spec    the specification string, or @FILE to read it from a file\n"
    "  --interactive  let the bridge show its messages instead of staying silent\n"
    "  --module  the bridge module to load (default: the one beside this program)\n";

struct Options {
    std::string command;
    std::vector<std::string> files;
    std::string spec;
    bool haveSpec = false;
    bool interactive = false;
    std::string module;
};

bool ParseOptions(int argc, char **argv, Options &options)
{
    if (argc < 2) return false;
    options.command = argv[1];
    for (int i = 2; i < argc; ++i) {
        const std::string arg = argv[i];
        if ((arg == "--spec" || arg == "--module") && i + 1 < argc) {
            (arg == "--spec" ? options.spec : options.module) = argv[++i];
            options.haveSpec |= arg == "--spec";
        } else if (arg == "--interactive") {
            options.interactive = true;
        } else if (!arg.empty() && arg[0] == '-' && arg != "-") {
            return false;
        } else {
            options.files.push_back(arg);
        }
    }
    return true;
}

std::string ReadSpec(const std::string &value)
{
    if (value.empty() || value[0] != '@') return value;
    FILE *file = std::fopen(value.c_str() + 1, "rb");
    if (!file) throw std::runtime_error("cannot read the specification file " + value.substr(1));
    std::string text;
    char buffer[4096];
    size_t n;
    while ((n = std::fread(buffer, 1, sizeof buffer, file)) > 0) text.append(buffer, n);
    std::fclose(file);
    while (!text.empty() && (text.back() == '\n' || text.back() == '\r')) text.pop_back();
    return text;
}

std::string ErrorInfoText()
{
    automation::ComPtr<IErrorInfo> info;
    if (GetErrorInfo(0, info.Out()) != S_OK || !info) return std::string();
    automation::Bstr description;
    info->GetDescription(description.Out());
    return description.Utf8();
}

automation::ComPtr<IHostSeries> MakeSeries(const std::string &path, const std::string &spec, bool silent)
{
    automation::ComPtr<IHostSeries> series;
    if (FAILED(HostSeriesCreate(series.Out()))) throw std::runtime_error("cannot make a host series");
    automation::ComPtr<IHostConnection> connection;
    series->GetConnection(connection.Out());
    connection->SetFilePath(automation::Bstr(path).Get());
    connection->SetSpecification(automation::Bstr(spec).Get());
    HostSeriesSetSilent(series.Get(), silent ? VARIANT_TRUE : VARIANT_FALSE);
    return series;
}

int Inspect(const Options &options)
{
    vantrel_cli::BridgeModule module(options.module.empty() ? vantrel_cli::DefaultModulePath() : options.module);
    auto series = MakeSeries(options.files[0], ReadSpec(options.spec), !options.interactive);
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    SHORT fits = 0;
    const HRESULT hr = bridge->InspectWorkbook(&fits);
    if (SUCCEEDED(hr) && fits == SHORT(VARIANT_TRUE)) {
        std::cout << "fits\n";
        return 0;
    }
    const std::string reason = ErrorInfoText();
    std::cout << (reason.empty() ? "the workbook does not fit the specification" : reason) << "\n";
    return 1;
}

}  // namespace

int main(int argc, char **argv)
{
    if (const auto status = vantrel_cli::RunRegistrationCommand(argc, argv)) return *status;
    const std::string progId = vantrel_cli::TakeProgIdOption(argc, argv);
    Options options;
    if (!ParseOptions(argc, argv, options) || options.command != "inspect" || options.files.size() != 1 ||
        !options.haveSpec) {
        std::cerr << kUsage;
        return 2;
    }
    CoInitialize(nullptr);
    int status = 1;
    try {
        if (!progId.empty()) options.module = vantrel_cli::ModuleOfProgId(progId);
        status = Inspect(options);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
    }
    CoUninitialize();
    return status;
}
