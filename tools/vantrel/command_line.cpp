// SPDX-License-Identifier: MIT
// The commands and options of vantrel, parsed by CLI11. The usage text is
// made from the same definitions, so that it names every command and option
// the parser takes.
#include "command_line.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <climits>
#include <exception>
#include <iostream>
#include <set>
#include <string>
#include <vector>

#include "automation/automation.h"
#include "automation/text.h"
#include "cells_command.h"
#include "export_command.h"
#include "import_command.h"
#include "inspect_command.h"
#include "open_dialog_command.h"
#include "registration_commands.h"
#include "save_dialog_command.h"
#include "sheets_command.h"

#ifndef VANTREL_VERSION
#error "VANTREL_VERSION is the project version, given by the build"
#endif

namespace vantrel_cli {
namespace {

// What one command line asks for; every command's options bind here.
struct Invocation {
    Request request;
    std::string series;  // export and save-dialog
    std::string progId;  // when given, the module is the one registered under it
    int sheet = 1;       // cells
    std::string registrationModule;
};

struct CommandText {
    const char *name;
    // After "vantrel "; a line break goes on under the first word's column.
    const char *synopsis;
    const char *summary;  // lines, each begun by two blanks where printed
};

constexpr CommandText kCommands[] = {
    {"inspect", "inspect BOOK --spec SPEC [--strict] [--interactive] [--module PATH] [--progid NAME]",
     "runs every check of BOOK against the layout SPEC; prints \"fits\" or what doesn't fit\n"
     "(\"could not open\" and the reason for a workbook that doesn't open)"},
    {"import",
     "import BOOK --spec SPEC [--json] [--output FILE] [--strict] [--no-inspect]\n"
     "               [--interactive] [--module PATH] [--progid NAME]",
     "inspects BOOK, then reads it by the layout SPEC and prints the series as CSV (or JSON);\n"
     "what the inspection refuses is not read"},
    {"export", "export SERIES BOOK --spec SPEC [--strict] [--interactive] [--module PATH] [--progid NAME]",
     "lays the series SERIES (CSV or JSON as import prints it; - for standard input) out on\n"
     "the first sheet of BOOK; an empty SPEC takes the default layout"},
    {"sheets", "sheets BOOK [--json]",
     "lists the sheets of BOOK: the number ExcelSheet takes, the name, the kind, the\n"
     "visibility and the used range"},
    {"cells", "cells BOOK [--sheet N]",
     "prints every non-empty cell of worksheet N (default 1) of BOOK as JSON, as the\n"
     "workbook engine reads it"},
    {"open-dialog", "open-dialog [--json] [--output FILE] [--module PATH] [--progid NAME]",
     "shows the open dialog; after OK prints the imported series as import does"},
    {"save-dialog", "save-dialog SERIES [--spec SPEC] [--module PATH] [--progid NAME]",
     "shows the save dialog over the series SERIES (as for export); after OK the workbook\n"
     "is written, and its path and the specification string are printed"},
    {"register", "register [MODULE]",
     "enters MODULE's class in the registry and its bridge in the host's tree"},
    {"unregister", "unregister [MODULE]", "removes them again"},
};

constexpr const char kExitStatus[] =
    "exit status: 0 done (warnings allowed without --strict), 1 failed or refused, 2 usage error\n";

const CommandText *FindCommand(const std::string &name)
{
    for (const CommandText &command : kCommands)
        if (name == command.name) return &command;
    return nullptr;
}

std::string Indented(const std::string &lines, const std::string &indent)
{
    std::string text = indent;
    for (const char c : lines) {
        text += c;
        if (c == '\n') text += indent;
    }
    return text + "\n";
}

// "  --spec SPEC   what it is", the descriptions lined up.
std::string OptionLines(const std::vector<const CLI::Option *> &options)
{
    std::vector<std::pair<std::string, std::string>> lines;
    size_t width = 0;
    for (const CLI::Option *option : options) {
        std::string name = option->get_name(false, true);
        if (option->get_type_size() > 0 && !option->get_positional()) name += " " + option->get_type_name();
        width = std::max(width, name.size());
        lines.emplace_back(name, option->get_description());
    }
    std::string text;
    for (const auto &[name, description] : lines) {
        const std::string pad(width + 2 - name.size(), ' ');
        std::string wrapped;
        for (const char c : description) wrapped += c == '\n' ? "\n" + std::string(width + 4, ' ') : std::string(1, c);
        text += "  " + name + pad + wrapped + "\n";
    }
    return text;
}

// The usage of one command, or of all of them for the program itself.
std::string Usage(const CLI::App &app, const CLI::App *command)
{
    std::string text;
    std::vector<const CLI::Option *> options;
    std::set<std::string> seen;
    const auto take = [&](const CLI::App &from) {
        for (const CLI::Option *option : from.get_options())
            if (seen.insert(option->get_name(false, true)).second) options.push_back(option);
    };
    if (command) {
        const CommandText &described = *FindCommand(command->get_name());
        text = "usage: vantrel " + std::string(described.synopsis) + "\n" + Indented(described.summary, "  ");
        take(*command);
        text += "options:\n" + OptionLines(options);
    } else {
        for (const CommandText &described : kCommands)
            text += (text.empty() ? "usage: vantrel " : "       vantrel ") + std::string(described.synopsis) + "\n";
        text += "       vantrel --version\ncommands:\n";
        for (const CommandText &described : kCommands) {
            const std::string name = described.name;
            const std::string summary = Indented(described.summary, std::string(15, ' '));
            text += "  " + name + std::string(13 - name.size(), ' ') + summary.substr(15);
        }
        // The operands are told with their commands.
        for (const CLI::App *sub : app.get_subcommands([](const CLI::App *) { return true; })) take(*sub);
        std::erase_if(options, [](const CLI::Option *option) { return option->get_positional(); });
        take(app);
        text += "options:\n" + OptionLines(options);
    }
    return text + kExitStatus;
}

CLI::App *AddCommand(CLI::App &app, const char *name)
{
    CLI::App *command = app.add_subcommand(name, FindCommand(name)->summary);
    return command;
}

void AddBridgeOptions(CLI::App &command, Invocation &invocation)
{
    command.add_flag("--interactive", invocation.request.interactive,
                     "let the bridge show its messages instead of staying silent");
    CLI::Option *module = command.add_option("--module", invocation.request.module,
                                             "the bridge module to load (default: the one beside this program)");
    module->type_name("PATH");
    command.add_option("--progid", invocation.progId, "load the module registered for this ProgID instead")
        ->type_name("NAME")
        ->excludes(module);
}

void AddSpecOption(CLI::App &command, Invocation &invocation, bool required)
{
    command.add_option("--spec", invocation.request.spec,
                       "the specification string, or @FILE to read it from a file\n(@- standard input)")
        ->type_name("SPEC")
        ->required(required);
}

void AddOutputOptions(CLI::App &command, Invocation &invocation)
{
    command.add_flag("--json", invocation.request.json, "print the series as one JSON object instead");
    command.add_option("--output", invocation.request.output, "write the series to FILE (- standard output)")
        ->type_name("FILE");
}

void AddStrictOption(CLI::App &command, Invocation &invocation)
{
    command.add_flag("--strict", invocation.request.strict,
                     "any warning (\"warning: \" lines on standard error) makes the command fail;\n"
                     "a strict import that warns writes no series, a strict export no workbook");
}

// The commands that drive the bridge run between CoInitialize and
// CoUninitialize; a failure outside the bridge is told on stderr.
int RunBridgeCommand(Invocation &invocation, const std::string &command)
{
    CoInitialize(nullptr);
    int status = 1;
    try {
        if (!invocation.progId.empty()) invocation.request.module = ModuleOfProgId(invocation.progId);
        const Request &request = invocation.request;
        if (command == "inspect") status = RunInspect(request);
        else if (command == "import") status = RunImport(request);
        else if (command == "export") status = RunExport(request, invocation.series);
        else if (command == "open-dialog") status = RunOpenDialogCommand(request);
        else status = RunSaveDialogCommand(request, invocation.series);
    } catch (const std::exception &e) {
        std::cerr << "vantrel: " << e.what() << "\n";
    }
    CoUninitialize();
    return status;
}

// Standard input can be read once: by the series or by the string, not both.
bool ReadsStandardInputTwice(const Invocation &invocation)
{
    return invocation.series == "-" && invocation.request.spec == "@-";
}

// The parser's message with each argument it quotes that is long or holds
// bytes no terminal shows cut to an excerpt, as every other message quotes
// its input.
std::string WithExcerpts(std::string message, int argc, char **argv)
{
    for (int i = 1; i < argc; ++i) {
        const std::string_view argument = argv[i];
        const std::string excerpt = automation::MessageExcerpt(argument);
        if (argument.empty() || excerpt.size() == argument.size() + 2) continue;  // only quoted: shown as it is
        for (size_t at = message.find(argument); at != std::string::npos; at = message.find(argument, at + excerpt.size()))
            message.replace(at, argument.size(), excerpt);
    }
    return message;
}

int UsageError(const CLI::App &app, const CLI::App *command, const std::string &what)
{
    std::cerr << "vantrel: " << what << "\n" << Usage(app, command);
    return 2;
}

}  // namespace

int RunCommandLine(int argc, char **argv)
{
    Invocation invocation;
    CLI::App app("vantrel", "vantrel");
    app.set_help_flag("-h,--help", "print this text (after a command: the command's own)");
    app.set_version_flag("--version", "vantrel " VANTREL_VERSION, "print the version");
    app.require_subcommand(1);

    CLI::App *inspect = AddCommand(app, "inspect");
    inspect->add_option("BOOK", invocation.request.book, "the workbook")->required();
    AddSpecOption(*inspect, invocation, true);
    AddStrictOption(*inspect, invocation);
    AddBridgeOptions(*inspect, invocation);

    CLI::App *import = AddCommand(app, "import");
    import->add_option("BOOK", invocation.request.book, "the workbook")->required();
    AddSpecOption(*import, invocation, true);
    AddOutputOptions(*import, invocation);
    AddStrictOption(*import, invocation);
    import->add_flag("--no-inspect", invocation.request.noInspect, "import without inspecting first");
    AddBridgeOptions(*import, invocation);

    CLI::App *exporting = AddCommand(app, "export");
    exporting->add_option("SERIES", invocation.series, "the series, CSV or JSON (- standard input)")->required();
    exporting->add_option("BOOK", invocation.request.book, "the workbook, made when it is missing")->required();
    AddSpecOption(*exporting, invocation, true);
    AddStrictOption(*exporting, invocation);
    AddBridgeOptions(*exporting, invocation);

    CLI::App *sheets = AddCommand(app, "sheets");
    sheets->add_option("BOOK", invocation.request.book, "the workbook")->required();
    sheets->add_flag("--json", invocation.request.json, "print one JSON list of the sheets instead");

    CLI::App *cells = AddCommand(app, "cells");
    cells->add_option("BOOK", invocation.request.book, "the workbook")->required();
    cells->add_option("--sheet", invocation.sheet, "the worksheet, counted from 1 as ExcelSheet counts")
        ->check(CLI::Range(1, INT_MAX).description(""))
        ->type_name("N");

    CLI::App *openDialog = AddCommand(app, "open-dialog");
    AddOutputOptions(*openDialog, invocation);
    AddBridgeOptions(*openDialog, invocation);

    CLI::App *saveDialog = AddCommand(app, "save-dialog");
    saveDialog->add_option("SERIES", invocation.series, "the series, CSV or JSON (- standard input)")->required();
    saveDialog
        ->add_option("--spec", invocation.request.spec,
                     "the host object's string beforehand, or @FILE (the dialog starts from its own\n"
                     "defaults and replaces it on OK)")
        ->type_name("SPEC");
    AddBridgeOptions(*saveDialog, invocation);

    for (const char *name : {"register", "unregister"})
        AddCommand(app, name)->add_option("MODULE", invocation.registrationModule,
                                          "the bridge module (default: the one beside this program)");

    if (argc >= 2 && argv[1][0] != '-' && !FindCommand(argv[1]))
        return UsageError(app, nullptr, "unknown command " + automation::MessageExcerpt(argv[1]));
    try {
        app.parse(argc, argv);
    } catch (const CLI::CallForHelp &) {
        const auto chosen = app.get_subcommands();
        std::cout << Usage(app, chosen.empty() ? nullptr : chosen.front());
        return 0;
    } catch (const CLI::CallForVersion &e) {
        std::cout << e.what() << "\n";
        return 0;
    } catch (const CLI::ParseError &e) {
        const auto chosen = app.get_subcommands();
        const std::string what = argc < 2 ? "no command given" : WithExcerpts(e.what(), argc, argv);
        return UsageError(app, chosen.empty() ? nullptr : chosen.front(), what);
    }
    CLI::App *command = app.get_subcommands().front();
    const std::string name = command->get_name();
    if (invocation.request.book == "-")
        return UsageError(app, command, "a workbook is read from its file, not from standard input");
    if (ReadsStandardInputTwice(invocation))
        return UsageError(app, command, "standard input can't be both the series and the specification string");
    if (name == "register" || name == "unregister")
        return RunRegistration(name == "register", invocation.registrationModule);
    if (name == "cells") return RunCells(invocation.request.book, invocation.sheet);
    if (name == "sheets") return RunSheets(invocation.request.book, invocation.request.json);
    return RunBridgeCommand(invocation, name);
}

}  // namespace vantrel_cli
