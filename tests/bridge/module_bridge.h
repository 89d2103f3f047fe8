// SPDX-License-Identifier: MIT
// The bridge as a host meets it: the built module loaded with dlopen and its
// class made through DllGetClassObject.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "module/loaded_module.h"
#include "support/expect_hr.h"
#include "support/message_boxes.h"
#include "support/test_host.h"

namespace bridge_testing {

inline std::string Fixture(const std::string &name)
{
    return std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/" + name;
}

inline automation::ComPtr<IVantrel> MakeModuleBridge()
{
    static testing_host::LoadedModule module;  // loaded once, kept until the program ends
    automation::ComPtr<IClassFactory> factory;
    EXPECT_HR(S_OK, module.getClassObject(testing_host::kClsidExcelVantrel, IID_IClassFactory, factory.OutVoid()));
    automation::ComPtr<IVantrel> bridge;
    if (factory) {
        EXPECT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    }
    return bridge;
}

// The outcome of one inspection.
struct Inspection {
    HRESULT hr = S_OK;
    SHORT fits = 0;
    std::vector<std::string> messages;
};

inline Inspection Inspect(const std::string &book, const std::string &spec, bool silent)
{
    auto series = testing_host::MakeSeries(book, spec, silent);
    auto bridge = MakeModuleBridge();
    Inspection result;
    testing_host::MessageBoxes boxes;
    bridge->SetHostSeries(series.Get());
    result.hr = bridge->InspectWorkbook(&result.fits);
    result.messages = boxes.texts;
    return result;
}

}  // namespace bridge_testing
