// SPDX-License-Identifier: MIT
// A failed store operation: its result code and what went wrong in words.
#pragma once

#include <stdexcept>
#include <string>

#include "registry/registry.h"

namespace registry {

class Failure : public std::runtime_error {
public:
    Failure(LONG code, const std::string &text) : std::runtime_error(text), code_(code) {}
    LONG Code() const noexcept { return code_; }

private:
    LONG code_;
};

}  // namespace registry
