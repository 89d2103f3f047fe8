// SPDX-License-Identifier: MIT
#include "bridge_outcome.h"

#include <algorithm>

#include "automation/values.h"
#include "bridge/vantrel_report.h"

namespace vantrel_cli {

namespace {

std::vector<std::string> Lines(const std::string &text)
{
    std::vector<std::string> lines;
    size_t start = 0;
    while (start < text.size()) {
        size_t end = text.find('\n', start);
        if (end == std::string::npos) end = text.size();
        if (end > start) lines.push_back(text.substr(start, end - start));
        start = end + 1;
    }
    return lines;
}

void TakeReport(IVantrel &bridge, BridgeOutcome &outcome)
{
    automation::ComPtr<IVantrelReport> report;
    if (FAILED(bridge.QueryInterface(IID_IVantrelReport, report.OutVoid())) || !report) return;
    automation::Bstr warnings, openMessage;
    if (SUCCEEDED(report->GetWarnings(warnings.Out()))) outcome.warnings = Lines(warnings.Utf8());
    LONG sheet = 0, row = 0;
    if (SUCCEEDED(report->GetFailurePlace(&sheet, &row))) {
        outcome.failureSheet = sheet;
        outcome.failureRow = row;
    }
    VARIANT_BOOL opened = VARIANT_TRUE;
    if (SUCCEEDED(report->GetOpenOutcome(&opened, openMessage.Out()))) {
        outcome.openMessage = openMessage.Utf8();
        outcome.openFailed = opened != VARIANT_TRUE && !outcome.openMessage.empty();
    }
}

}  // namespace

std::string BridgeOutcome::PlacedReason(const std::string &fallback) const
{
    const std::string text = reason.empty() ? fallback : reason;
    if (failureSheet < 1 || failureRow < 1) return text;
    return "sheet " + std::to_string(failureSheet) + ", row " + std::to_string(failureRow) + ": " + text;
}

BridgeOutcome RunOperation(IVantrel &bridge, bool echo, const std::function<HRESULT(IVantrel &)> &operation)
{
    CapturedMessages messages(echo);
    SetErrorInfo(0, nullptr);
    BridgeOutcome outcome;
    outcome.ok = SUCCEEDED(operation(bridge));
    outcome.reason = ErrorInfoText();
    if (outcome.reason.empty() && !messages.Texts().empty()) outcome.reason = messages.Texts().back();
    TakeReport(bridge, outcome);
    return outcome;
}

BridgeOutcome InspectAloud(const BridgeModule &module, const Request &request, const std::string &spec)
{
    auto series = MakeSeries(request.book, spec, false);
    auto bridge = module.CreateBridge();
    bridge->SetHostSeries(series.Get());
    return RunOperation(*bridge.Get(), request.interactive, [](IVantrel &inspected) {
        SHORT fits = 0;
        const HRESULT hr = inspected.InspectWorkbook(&fits);
        return SUCCEEDED(hr) && fits != SHORT(VARIANT_TRUE) ? E_FAIL : hr;
    });
}

std::vector<std::string> BridgeWarnings(IVantrel &bridge)
{
    BridgeOutcome outcome;
    TakeReport(bridge, outcome);
    return outcome.warnings;
}

void TellWarnings(const std::vector<std::string> &warnings, std::vector<std::string> &told, std::ostream &out)
{
    for (const std::string &warning : warnings) {
        if (std::find(told.begin(), told.end(), warning) != told.end()) continue;
        out << "warning: " << warning << "\n";
        told.push_back(warning);
    }
}

}  // namespace vantrel_cli
