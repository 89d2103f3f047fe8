// SPDX-License-Identifier: MIT
// The bridge made in this process, as its class object would make it.
#pragma once

#include "automation/com_ptr.h"
#include "bridge/excel_vantrel.h"
#include "support/expect_hr.h"

namespace testing_host {

inline automation::ComPtr<IVantrel> MakeBridge()
{
    automation::ComPtr<IVantrel> bridge;
    EXPECT_HR(S_OK, CExcelVantrel::CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    return bridge;
}

}  // namespace testing_host
