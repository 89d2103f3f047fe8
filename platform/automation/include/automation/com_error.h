// SPDX-License-Identifier: MIT
// The exception of a failed automation call, and the wrapper that keeps
// exceptions from crossing the binary interface.
#pragma once

#include <new>
#include <stdexcept>
#include <string>

#include "automation/automation.h"

namespace automation {

// A failed call: the HRESULT and a text that says what failed.
class AUTOMATION_CXX_API ComError : public std::runtime_error {
public:
    ComError(HRESULT hr, const std::string &what) : std::runtime_error(what), hr_(hr) {}
    HRESULT Code() const noexcept { return hr_; }

private:
    HRESULT hr_;
};

// Throws ComError when hr is a failure.
inline void ThrowIfFailed(HRESULT hr, const char *what)
{
    if (FAILED(hr)) throw ComError(hr, what);
}

// Runs body and turns any exception into an HRESULT, for every function
// and method that a caller outside this binary can reach.
template <typename Body>
HRESULT ComBoundary(Body &&body) noexcept
{
    try {
        return body();
    } catch (const ComError &e) {
        return e.Code();
    } catch (const std::bad_alloc &) {
        return E_OUTOFMEMORY;
    } catch (...) {
        return E_FAIL;
    }
}

}  // namespace automation
