// SPDX-License-Identifier: MIT
// The IUnknown part shared by every object of the library: one interface an
// object, a counted reference, deletion at zero, and a count of live objects
// so that tests can see that nothing leaks.
#pragma once

#include <atomic>

#include "automation/automation.h"

namespace hostseries::detail {

// Objects of this library alive now.
std::atomic<long> &LiveObjects() noexcept;

template <typename Interface>
class ComObject : public Interface {
public:
    ComObject(const ComObject &) = delete;
    ComObject &operator=(const ComObject &) = delete;

    HRESULT QueryInterface(REFIID riid, void **ppv) override
    {
        if (!ppv) return E_POINTER;
        if (riid == IID_IUnknown || riid == iid_) {
            *ppv = static_cast<Interface *>(this);
            AddRef();
            return S_OK;
        }
        *ppv = nullptr;
        return E_NOINTERFACE;
    }
    ULONG AddRef() override { return ++refs_; }
    ULONG Release() override
    {
        const ULONG left = --refs_;
        if (left == 0) delete this;
        return left;
    }

protected:
    // The object starts with one reference, the creator's.
    explicit ComObject(const IID &iid) noexcept : iid_(iid) { ++LiveObjects(); }
    virtual ~ComObject() { --LiveObjects(); }

private:
    const IID &iid_;
    std::atomic<ULONG> refs_{1};
};

}  // namespace hostseries::detail
