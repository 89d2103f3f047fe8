// SPDX-License-Identifier: MIT
#pragma once

#include <memory>

#include "automation/com_error.h"

namespace vantrel {

// A call on a session reference that holds nothing fails as an automation
// call would, instead of dereferencing null.
template <typename T>
T &Live(const std::shared_ptr<T> &ref)
{
    if (!ref) throw automation::ComError(E_UNEXPECTED, "the workbook session holds no such object");
    return *ref;
}

}  // namespace vantrel
