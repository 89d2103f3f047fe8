// SPDX-License-Identifier: MIT
// What every exported function of the store shares: no exception crosses the
// binary interface, and the thread keeps the text of its last failure.
#pragma once

#include <string>
#include <string_view>

#include "registry/registry.h"

namespace registry {

void SetLastFailure(std::string text);

// Runs body and returns its result; a Failure becomes its code, anything else
// REGISTRY_IO_FAILED, each with its text kept for RegistryLastFailure.
template <typename Body>
LONG Boundary(Body &&body) noexcept;

// Copies text with its zero into buffer of *size bytes, the way the store's
// functions hand out text.
LONG CopyOut(std::string_view text, char *buffer, DWORD *size);

// A required text argument: throws Failure(REGISTRY_BAD_ARGUMENT) for NULL.
const char *Required(const char *text, const char *what);

}  // namespace registry

#include "failure.h"

template <typename Body>
LONG registry::Boundary(Body &&body) noexcept
{
    try {
        SetLastFailure(std::string());
        return body();
    } catch (const Failure &failure) {
        SetLastFailure(failure.what());
        return failure.Code();
    } catch (const std::exception &other) {
        SetLastFailure(other.what());
        return REGISTRY_IO_FAILED;
    } catch (...) {
        SetLastFailure("an unknown failure");
        return REGISTRY_IO_FAILED;
    }
}
