// SPDX-License-Identifier: MIT
// While it lives, the workbook engine starts through the given factory (by
// default the usual one) and every start is counted; the usual factory comes
// back afterwards.
#pragma once

#include <memory>
#include <utility>

#include "automation/com_error.h"
#include "workbook/engine.h"
#include "workbook/excel_obj.h"

namespace testing_host {

class EngineGuard {
public:
    explicit EngineGuard(CExcelObj::ApplicationFactory factory = workbook::CreateApplication)
    {
        CExcelObj::SetApplicationFactory([this, factory = std::move(factory)] {
            ++starts;
            return factory();
        });
    }
    ~EngineGuard() { CExcelObj::ResetApplicationFactory(); }
    EngineGuard(const EngineGuard &) = delete;
    EngineGuard &operator=(const EngineGuard &) = delete;

    // A factory that fails as a machine without the engine does.
    static std::shared_ptr<workbook::Application> Missing()
    {
        throw automation::ComError(REGDB_E_CLASSNOTREG, "no engine");
    }

    int starts = 0;
};

}  // namespace testing_host
