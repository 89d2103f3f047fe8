// SPDX-License-Identifier: MIT
#include "inspect_command.h"

#include <iostream>

#include "bridge_outcome.h"
#include "module_loader.h"

namespace vantrel_cli {

int RunInspect(const Request &request)
{
    BridgeModule module(request.module.empty() ? DefaultModulePath() : request.module);
    const BridgeOutcome outcome = InspectAloud(module, request, ReadSpec(request.spec));
    std::vector<std::string> told;
    TellWarnings(outcome.warnings, told, std::cerr);
    if (outcome.openFailed) {
        std::cout << "could not open: " << outcome.openMessage << "\n";
        return 1;
    }
    if (!outcome.ok) {
        std::cout << outcome.PlacedReason("the workbook does not fit the specification") << "\n";
        return 1;
    }
    if (request.strict && !told.empty()) {
        std::cout << "fits, but --strict refuses its " << told.size() << (told.size() == 1 ? " warning\n" : " warnings\n");
        return 1;
    }
    std::cout << "fits\n";
    return 0;
}

}  // namespace vantrel_cli
