// SPDX-License-Identifier: MIT
// One run of the bridge from the command line, inspection or read, and all
// it tells: the verdict, the reason, the warnings, where a time step failed
// and why the workbook didn't open.
#pragma once

#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "host_series.h"
#include "module_loader.h"

namespace vantrel_cli {

struct BridgeOutcome {
    bool ok = false;
    std::string reason;  // the error info, else the last message the bridge showed
    std::vector<std::string> warnings;
    long failureSheet = 0, failureRow = 0;
    bool openFailed = false;
    std::string openMessage;

    // The reason, led by the sheet and row where a time step failed.
    std::string PlacedReason(const std::string &fallback) const;
};

// Every check, the comparison between sheets included, on a bridge of its
// own; the bridge speaks aloud, into our hands (echoed with --interactive).
BridgeOutcome InspectAloud(const BridgeModule &module, const Request &request, const std::string &spec);

// Runs operation on bridge and takes the reason and the report.
BridgeOutcome RunOperation(IVantrel &bridge, bool echo, const std::function<HRESULT(IVantrel &)> &operation);

// The warnings of the bridge's last run, one a line.
std::vector<std::string> BridgeWarnings(IVantrel &bridge);

// Writes "warning: " lines for the warnings that aren't in told yet, and adds them there.
void TellWarnings(const std::vector<std::string> &warnings, std::vector<std::string> &told, std::ostream &out);

}  // namespace vantrel_cli
