// SPDX-License-Identifier: MIT
#include "host_series.h"

#include <iostream>
#include <stdexcept>

#include "automation/values.h"
#include "specification/bounded_file.h"

namespace vantrel_cli {

std::string ReadSpec(const std::string &value)
{
    if (value.empty() || value[0] != '@') return value;
    // A specification is a line of settings; the bound refuses a device or a
    // huge file before it fills memory.
    constexpr size_t kMaxSpecBytes = 1u << 20;
    std::string text;
    if (value == "@-") {
        // Read no more than one byte past the bound.
        text.resize(kMaxSpecBytes + 1);
        std::cin.read(text.data(), std::streamsize(text.size()));
        text.resize(size_t(std::cin.gcount()));
        if (text.size() > kMaxSpecBytes)
            throw std::runtime_error("the specification string on standard input is longer than 1 MiB");
    } else if (std::string reason; !vantrel::ReadBoundedFile(value.substr(1), kMaxSpecBytes, text, reason)) {
        throw std::runtime_error("cannot read the specification file " + value.substr(1) + ": " + reason);
    }
    while (!text.empty() && (text.back() == '\n' || text.back() == '\r')) text.pop_back();
    return text;
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

std::string ErrorInfoText()
{
    automation::ComPtr<IErrorInfo> info;
    if (GetErrorInfo(0, info.Out()) != S_OK || !info) return std::string();
    automation::Bstr description;
    info->GetDescription(description.Out());
    return description.Utf8();
}

CapturedMessages::CapturedMessages(bool echo)
    : sink_([this, echo](std::string_view text, std::string_view caption) {
          texts_.emplace_back(text);
          if (echo) std::cerr << caption << ": " << text << "\n";
      })
{
}

}  // namespace vantrel_cli
