// SPDX-License-Identifier: MIT
// What the commands of the command-line host share: the request a command
// line makes, the host object it hands the bridge, and the reasons the bridge
// gives when it fails.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "shell/message_box.h"

namespace vantrel_cli {

struct Request {
    std::string book;
    std::string spec;  // as given: the string, or @FILE
    bool interactive = false;
    std::string module;  // empty: the module beside the program
    bool json = false;
    std::string output;  // empty: standard output
    bool strict = false;     // any warning fails the command
    bool noInspect = false;  // import without inspecting first
};

// The specification string: the text itself, or the content of FILE for @FILE
// and of standard input for @- (without its line end). Throws
// std::runtime_error when FILE can't be read.
std::string ReadSpec(const std::string &value);

// An in-memory host object with the workbook path, the string and the silent flag.
automation::ComPtr<IHostSeries> MakeSeries(const std::string &path, const std::string &spec, bool silent);

// The description of the thread's error info; empty when there is none.
std::string ErrorInfoText();

// Collects the bridge's message boxes while it lives; when echo is set they
// also go to stderr as the platform shows them.
class CapturedMessages {
public:
    explicit CapturedMessages(bool echo);
    const std::vector<std::string> &Texts() const { return texts_; }

private:
    std::vector<std::string> texts_;
    shell::ScopedMessageSink sink_;
};

}  // namespace vantrel_cli
