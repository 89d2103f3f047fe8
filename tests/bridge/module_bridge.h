// SPDX-License-Identifier: MIT
// The bridge as a host meets it: the built module loaded with dlopen, its
// class made through DllGetClassObject, and the message boxes it shows.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"
#include "module/loaded_module.h"
#include "shell/message_box.h"
#include "support/expect_hr.h"
#include "support/test_host.h"

namespace bridge_testing {

inline std::string Fixture(const std::string &name)
{
    return std::string(VANTREL_SOURCE_DIR) + "/tests/data/bridge/" + name;
}

// One load for the whole test program: the module stays until it ends.
inline testing_host::LoadedModule &Module()
{
    static testing_host::LoadedModule module;
    return module;
}

inline automation::ComPtr<IVantrel> MakeModuleBridge()
{
    automation::ComPtr<IClassFactory> factory;
    EXPECT_HR(S_OK, Module().getClassObject(testing_host::kClsidExcelVantrel, IID_IClassFactory,
                                            factory.OutVoid()));
    automation::ComPtr<IVantrel> bridge;
    if (factory) {
        EXPECT_HR(S_OK, factory->CreateInstance(nullptr, IID_IVantrel, bridge.OutVoid()));
    }
    return bridge;
}

// Collects the message boxes shown while it lives.
struct MessageBoxes {
    std::vector<std::string> texts;
    shell::ScopedMessageSink sink{[this](std::string_view text, std::string_view) { texts.emplace_back(text); }};
};

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
    MessageBoxes boxes;
    bridge->SetHostSeries(series.Get());
    result.hr = bridge->InspectWorkbook(&result.fits);
    result.messages = boxes.texts;
    return result;
}

}  // namespace bridge_testing
