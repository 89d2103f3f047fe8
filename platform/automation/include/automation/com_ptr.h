// SPDX-License-Identifier: MIT
// Owning smart pointer for counted interface references.
#pragma once

#include <utility>

#include "automation/automation.h"

namespace automation {

template <typename T>
class ComPtr {
public:
    ComPtr() noexcept = default;
    ComPtr(std::nullptr_t) noexcept {}
    // Takes a new reference to p.
    explicit ComPtr(T *p) noexcept : p_(p) { if (p_) p_->AddRef(); }
    ComPtr(const ComPtr &o) noexcept : ComPtr(o.p_) {}
    ComPtr(ComPtr &&o) noexcept : p_(std::exchange(o.p_, nullptr)) {}
    ~ComPtr() { Reset(); }

    ComPtr &operator=(ComPtr o) noexcept
    {
        std::swap(p_, o.p_);
        return *this;
    }

    // Takes over a reference that the caller already owns (does not AddRef).
    static ComPtr Attach(T *p) noexcept
    {
        ComPtr r;
        r.p_ = p;
        return r;
    }
    // Gives up ownership without releasing.
    T *Detach() noexcept { return std::exchange(p_, nullptr); }

    void Reset() noexcept
    {
        if (T *p = std::exchange(p_, nullptr)) p->Release();
    }

    // For out arguments: releases what is held and hands out the slot.
    T **Out() noexcept
    {
        Reset();
        return &p_;
    }
    void **OutVoid() noexcept { return reinterpret_cast<void **>(Out()); }

    T *Get() const noexcept { return p_; }
    T *operator->() const noexcept { return p_; }
    explicit operator bool() const noexcept { return p_ != nullptr; }

    template <typename U>
    HRESULT As(REFIID iid, ComPtr<U> &out) const
    {
        return p_ ? p_->QueryInterface(iid, out.OutVoid()) : E_POINTER;
    }

private:
    T *p_ = nullptr;
};

}  // namespace automation
