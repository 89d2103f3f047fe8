// SPDX-License-Identifier: MIT
// Loads the bridge module as a host does and makes its class.
#pragma once

#include <string>

#include "automation/com_ptr.h"
#include "hostseries/hostseries.h"

namespace vantrel_cli {

class BridgeModule {
public:
    // Loads the module at path; throws std::runtime_error with dlerror's text.
    explicit BridgeModule(const std::string &path);
    ~BridgeModule();
    BridgeModule(const BridgeModule &) = delete;
    BridgeModule &operator=(const BridgeModule &) = delete;

    // A new bridge object through the module's class object.
    automation::ComPtr<IVantrel> CreateBridge() const;
    // Whether the module says it may be unloaded.
    bool CanUnload() const;

private:
    void *handle_;
    HRESULT (*getClassObject_)(REFCLSID, REFIID, void **) = nullptr;
    HRESULT (*canUnloadNow_)() = nullptr;
};

// The module beside the running program.
std::string DefaultModulePath();

}  // namespace vantrel_cli
