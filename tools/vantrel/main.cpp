// SPDX-License-Identifier: MIT
// vantrel: runs the bridge module from the command line, as a host would.
//
//   vantrel inspect BOOK --spec SPEC [--strict] [--interactive] [--module PATH]
//   vantrel import BOOK --spec SPEC [--json] [--output FILE] [--strict] [--no-inspect] [--interactive] [--module PATH]
//   vantrel export SERIES BOOK --spec SPEC [--interactive] [--module PATH]
//   vantrel cells BOOK [--sheet N]
//   vantrel open-dialog [--json] [--output FILE] [--module PATH]
//   vantrel save-dialog SERIES [--spec SPEC] [--module PATH]
#include <cstdio>
#include <exception>
#include <iostream>
#include <string>
#include <vector>

#include "automation/automation.h"
#include "cells_command.h"
#include "export_command.h"
#include "import_command.h"
#include "inspect_command.h"
#include "open_dialog_command.h"
#include "registration_commands.h"
#include "save_dialog_command.h"

namespace {

constexpr const char kUsage[] =
    "usage: vantrel inspect BOOK --spec SPEC [--strict] [--interactive] [--module PATH]\n"
    "       vantrel import BOOK --spec SPEC [--json] [--output FILE] [--strict] [--no-inspect]\n"
    "                      [--interactive] [--module PATH]\n"
    "       vantrel export SERIES BOOK --spec SPEC [--interactive] [--module PATH]\n"
    "       vantrel cells BOOK [--sheet N]\n"
    "       vantrel open-dialog [--json] [--output FILE] [--module PATH]\n"
    "       vantrel save-dialog SERIES [--spec SPEC] [--module PATH]\n"
    "  inspect   runs every check of BOOK against the layout SPEC; prints \"fits\" or what\n"
    "            doesn't fit (\"could not open\" and the reason for a workbook that doesn't open)\n"
    "  import    inspects BOOK, then reads it by the layout SPEC and prints the series as CSV;\n"
    "            what the inspection refuses is not read\n"
    "  export    lays the series SERIES (CSV or JSON as import prints it; - for standard input)\n"
    "            out on the first sheet of BOOK; an empty SPEC takes the default layout\n"
    "  cells     prints every non-empty cell of worksheet N (default 1) of BOOK as JSON,\n"
    "            as the workbook engine reads it\n"
    "  open-dialog  shows the open dialog; after OK prints the imported series as import does\n"
    "  save-dialog  shows the save dialog over the series SERIES (as for export); after OK the\n"
    "            workbook is written, and its path and the specification string are printed\n"
    "  --json    print the series as one JSON object instead\n"
    "  --strict  any warning (\"warning: \" lines on standard error) makes the command fail;\n"
    "            a strict import that warns writes no series\n"
    "  --no-inspect  import without inspecting first\n"
    "  --output  write the series to FILE instead of standard output\n"
    "  --spec    the specification string, or @FILE to read it from a file\n"
    "  --interactive  let the bridge show its messages instead of staying silent\n"
    "  --module  the bridge module to load (default: the one beside this program)\n"
    "  --help    print this text\n"
    "exit status: 0 done (warnings allowed without --strict), 1 failed or refused, 2 usage error\n";

struct Options {
    std::string command;
    std::vector<std::string> files;
    std::string spec;
    bool haveSpec = false;
    bool interactive = false;
    std::string module;
    bool json = false;
    std::string output;
    bool strict = false;
    bool noInspect = false;
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
        } else if (arg == "--output" && i + 1 < argc) {
            options.output = argv[++i];
        } else if (arg == "--json") {
            options.json = true;
        } else if (arg == "--interactive") {
            options.interactive = true;
        } else if (arg == "--strict" && options.command != "export") {
            options.strict = true;
        } else if (arg == "--no-inspect" && options.command == "import") {
            options.noInspect = true;
        } else if (!arg.empty() && arg[0] == '-' && arg != "-") {
            return false;
        } else {
            options.files.push_back(arg);
        }
    }
    return true;
}

bool IsBridgeCommand(const std::string &command)
{
    return command == "inspect" || command == "import" || command == "export";
}

// export names the series before the workbook.
size_t FileCount(const std::string &command) { return command == "export" ? 2 : 1; }

bool AsksForHelp(int argc, char **argv)
{
    for (int i = 1; i < argc; ++i)
        if (std::string(argv[i]) == "--help" || std::string(argv[i]) == "-h") return true;
    return false;
}

}  // namespace

int main(int argc, char **argv)
{
    if (AsksForHelp(argc, argv)) {
        std::cout << kUsage;
        return 0;
    }
    if (const auto status = vantrel_cli::RunRegistrationCommand(argc, argv)) return *status;
    if (argc >= 2 && std::string(argv[1]) == "cells") return vantrel_cli::RunCells(argc, argv);
    const std::string progId = vantrel_cli::TakeProgIdOption(argc, argv);
    if (argc >= 2 && std::string(argv[1]) == "open-dialog")
        return vantrel_cli::RunOpenDialogCommand(argc, argv, progId);
    if (argc >= 2 && std::string(argv[1]) == "save-dialog")
        return vantrel_cli::RunSaveDialogCommand(argc, argv, progId);
    Options options;
    if (!ParseOptions(argc, argv, options) || !IsBridgeCommand(options.command) ||
        options.files.size() != FileCount(options.command) ||
        !options.haveSpec) {
        std::cerr << kUsage;
        return 2;
    }
    CoInitialize(nullptr);
    int status = 1;
    try {
        if (!progId.empty()) options.module = vantrel_cli::ModuleOfProgId(progId);
        const vantrel_cli::Request request{options.files.back(), options.spec,   options.interactive,
                                           options.module,       options.json,   options.output,
                                           options.strict,       options.noInspect};
        if (options.command == "export")
            status = vantrel_cli::RunExport(request, options.files[0]);
        else
            status = options.command == "import" ? vantrel_cli::RunImport(request) : vantrel_cli::RunInspect(request);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
    }
    CoUninitialize();
    return status;
}
