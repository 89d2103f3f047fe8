// SPDX-License-Identifier: MIT
// What the runtime knows about each variant type.
#pragma once

#include <cstddef>

#include "automation/automation.h"

namespace automation::detail {

// Bytes of one array element of type vt; 0 when vt cannot be an element type.
size_t ElementSize(VARTYPE vt);

// True when vt may stand in a VARIANT: a plain type, an array of an element
// type, or a reference to either.
bool IsValidVariantType(VARTYPE vt);

}  // namespace automation::detail
