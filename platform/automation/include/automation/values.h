// SPDX-License-Identifier: MIT
// RAII owners of BSTRs, VARIANTs and SAFEARRAYs for the C++ side.
#pragma once

#include <string>
#include <string_view>
#include <utility>

#include "automation/automation.h"
#include "automation/text.h"

namespace automation {

// Owns one BSTR.
class Bstr {
public:
    Bstr() noexcept = default;
    explicit Bstr(std::string_view utf8) : b_(AllocBstr(utf8)) {}
    Bstr(const Bstr &) = delete;
    Bstr &operator=(const Bstr &) = delete;
    Bstr(Bstr &&o) noexcept : b_(std::exchange(o.b_, nullptr)) {}
    Bstr &operator=(Bstr &&o) noexcept
    {
        std::swap(b_, o.b_);
        return *this;
    }
    ~Bstr() { SysFreeString(b_); }

    static Bstr Attach(BSTR b) noexcept
    {
        Bstr r;
        r.b_ = b;
        return r;
    }
    BSTR Detach() noexcept { return std::exchange(b_, nullptr); }
    BSTR Get() const noexcept { return b_; }
    // For out arguments: frees what is held and hands out the slot.
    BSTR *Out() noexcept
    {
        SysFreeString(std::exchange(b_, nullptr));
        return &b_;
    }
    std::string Utf8() const { return BstrToUtf8(b_); }

private:
    BSTR b_ = nullptr;
};

// Owns one VARIANT; cleared on destruction.
class AUTOMATION_CXX_API Variant {
public:
    Variant() noexcept { VariantInit(&v_); }
    Variant(const Variant &o) : Variant() { Check(VariantCopy(&v_, &o.v_)); }
    Variant(Variant &&o) noexcept : v_(o.v_) { VariantInit(&o.v_); }
    Variant &operator=(Variant o) noexcept
    {
        std::swap(v_, o.v_);
        return *this;
    }
    ~Variant() { VariantClear(&v_); }

    static Variant Empty() { return Variant(); }
    static Variant I4(LONG v);
    static Variant I2(SHORT v);
    static Variant R4(FLOAT v);
    static Variant R8(DOUBLE v);
    static Variant Date(DATE v);
    static Variant Bool(bool v);
    static Variant Error(SCODE v);
    static Variant String(std::string_view utf8);
    // The marker of an omitted optional argument: VT_ERROR with DISP_E_PARAMNOTFOUND.
    static Variant Missing() { return Error(DISP_E_PARAMNOTFOUND); }
    // Takes over the array.
    static Variant Array(VARTYPE elementType, SAFEARRAY *psa) noexcept;

    VARTYPE Type() const noexcept { return v_.vt; }
    const VARIANT &Raw() const noexcept { return v_; }
    VARIANT *Out() noexcept
    {
        VariantClear(&v_);
        return &v_;
    }
    VARIANT *Ptr() noexcept { return &v_; }
    VARIANT Detach() noexcept
    {
        VARIANT r = v_;
        VariantInit(&v_);
        return r;
    }

private:
    static void Check(HRESULT hr);
    VARIANT v_;
};

// Owns one SAFEARRAY.
class SafeArray {
public:
    SafeArray() noexcept = default;
    explicit SafeArray(SAFEARRAY *psa) noexcept : a_(psa) {}
    SafeArray(const SafeArray &) = delete;
    SafeArray &operator=(const SafeArray &) = delete;
    SafeArray(SafeArray &&o) noexcept : a_(std::exchange(o.a_, nullptr)) {}
    SafeArray &operator=(SafeArray &&o) noexcept
    {
        std::swap(a_, o.a_);
        return *this;
    }
    ~SafeArray()
    {
        if (a_) SafeArrayDestroy(a_);
    }
    SAFEARRAY *Get() const noexcept { return a_; }
    SAFEARRAY *Detach() noexcept { return std::exchange(a_, nullptr); }

private:
    SAFEARRAY *a_ = nullptr;
};

}  // namespace automation
