// SPDX-License-Identifier: MIT
#include "import_command.h"

#include <iostream>

#include "bridge_outcome.h"
#include "module_loader.h"
#include "output_file.h"
#include "series_output.h"

namespace vantrel_cli {

int RunImport(const Request &request)
{
    BridgeModule module(request.module.empty() ? DefaultModulePath() : request.module);
    const std::string spec = ReadSpec(request.spec);
    std::vector<std::string> told;
    // What the inspection refuses is not read; a workbook that doesn't open
    // is left to the read, which tells why.
    if (!request.noInspect) {
        const BridgeOutcome inspection = InspectAloud(module, request, spec);
        TellWarnings(inspection.warnings, told, std::cerr);
        if (!inspection.ok && !inspection.openFailed) {
            std::cerr << inspection.PlacedReason("the workbook does not fit the specification") << "\n";
            return 1;
        }
    }
    // The read on a bridge of its own, so that it expands a template itself.
    auto series = MakeSeries(request.book, spec, !request.interactive);
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    const BridgeOutcome read = RunOperation(*bridge.Get(), request.interactive, [](IVantrel &reader) { return reader.ReadData(); });
    TellWarnings(read.warnings, told, std::cerr);
    if (!read.ok) {
        std::cerr << read.PlacedReason("the workbook could not be read") << "\n";
        return 1;
    }
    const SeriesTable table = TakeSeries(*series.Get());
    if (const std::string nan = NotANumberWarning(table); !nan.empty()) TellWarnings({nan}, told, std::cerr);
    if (request.strict && !told.empty()) {
        std::cerr << "vantrel: --strict: " << told.size() << (told.size() == 1 ? " warning" : " warnings")
                  << ", nothing written\n";
        return 1;
    }
    WriteOutput(request.output, [&](std::ostream &out) {
        if (request.json) WriteJson(table, out);
        else WriteCsv(table, out);
    });
    return 0;
}

}  // namespace vantrel_cli
