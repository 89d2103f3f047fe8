// SPDX-License-Identifier: MIT
// Collects the message boxes shown while it lives, instead of showing them.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "shell/message_box.h"

namespace testing_host {

struct MessageBoxes {
    std::vector<std::string> texts;
    std::vector<std::string> captions;
    shell::ScopedMessageSink sink{[this](std::string_view text, std::string_view caption) {
        texts.emplace_back(text);
        captions.emplace_back(caption);
    }};
};

}  // namespace testing_host
