// SPDX-License-Identifier: MIT
// Safe arrays, variants and error info: the layout a host reads, and who
// holds which reference.
#include <cstring>
#include <thread>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "automation/com_ptr.h"
#include "support/expect_hr.h"

namespace {

// An object that only counts its references.
struct CountingUnknown final : IUnknown {
    HRESULT QueryInterface(REFIID, void **ppv) override { return *ppv = nullptr, E_NOINTERFACE; }
    ULONG AddRef() override { return ++refs; }
    ULONG Release() override { return --refs; }
    ULONG refs = 1;  // the test's own reference
};

TEST(AutomationSafeArray, FirstDimensionVariesFastestAndIndicesAreChecked)
{
    SAFEARRAYBOUND bounds[2] = {{3, 1}, {2, -1}};  // rows 1 to 3, columns -1 to 0
    SAFEARRAY *psa = SafeArrayCreate(VT_I4, 2, bounds);
    ASSERT_NE(psa, nullptr);
    EXPECT_EQ(psa->rgsabound[0].cElements, 2u) << "bounds are stored last dimension first";
    for (LONG row = 1; row <= 3; ++row)
        for (LONG col = -1; col <= 0; ++col) {
            LONG at[2] = {row, col}, value = row * 10 + col + 2;
            ASSERT_HR(S_OK, SafeArrayPutElement(psa, at, &value));
        }
    const LONG expected[6] = {11, 21, 31, 12, 22, 32};
    EXPECT_EQ(std::memcmp(psa->pvData, expected, sizeof expected), 0);
    LONG got = 0;
    for (auto [row, col] : {std::pair<LONG, LONG>{0, 0}, {4, 0}, {1, -2}, {1, 1}}) {
        LONG at[2] = {row, col};
        EXPECT_HR(DISP_E_BADINDEX, SafeArrayPutElement(psa, at, &got)) << row << "," << col;
        EXPECT_HR(DISP_E_BADINDEX, SafeArrayGetElement(psa, at, &got)) << row << "," << col;
    }
    SAFEARRAYBOUND huge[3] = {{0xFFFFFFFFu, 0}, {0xFFFFFFFFu, 0}, {0xFFFFFFFFu, 0}};
    EXPECT_EQ(SafeArrayCreate(VT_VARIANT, 3, huge), nullptr) << "a size that overflows is refused, not wrapped";
    EXPECT_HR(S_OK, SafeArrayDestroy(psa));
}

TEST(AutomationSafeArray, ElementsAndVariantsHoldTheirOwnReferences)
{
    CountingUnknown object;
    SAFEARRAY *objects = SafeArrayCreateVector(VT_UNKNOWN, 0, 1);
    LONG index = 0;
    ASSERT_HR(S_OK, SafeArrayPutElement(objects, &index, static_cast<IUnknown *>(&object)));
    SAFEARRAY *copy = nullptr;
    ASSERT_HR(S_OK, SafeArrayCopy(objects, &copy));
    IUnknown *out = nullptr;
    ASSERT_HR(S_OK, SafeArrayGetElement(copy, &index, &out));
    EXPECT_EQ(object.refs, 4u) << "one each for the two arrays and the caller";
    out->Release();
    ASSERT_HR(S_OK, SafeArrayPutElement(copy, &index, nullptr));
    EXPECT_EQ(object.refs, 2u) << "a replaced element is released";
    EXPECT_HR(S_OK, SafeArrayDestroy(copy));
    EXPECT_HR(S_OK, SafeArrayDestroy(objects));
    EXPECT_EQ(object.refs, 1u);
    VARIANT w;
    IUnknown *held = &object;
    w.vt = VT_BYREF | VT_UNKNOWN;
    w.byref = &held;
    EXPECT_HR(S_OK, VariantClear(&w));
    EXPECT_EQ(object.refs, 1u) << "a reference is not owned";
}

TEST(AutomationApartment, TheLastUninitializeDropsTheErrorInfo)
{
    std::thread([] {  // a thread of its own: apartments belong to threads
        automation::ComPtr<ICreateErrorInfo> create;
        ASSERT_HR(S_OK, CreateErrorInfo(create.Out()));
        EXPECT_HR(S_OK, CoInitialize(nullptr));
        EXPECT_HR(S_FALSE, CoInitialize(nullptr));
        automation::ComPtr<IErrorInfo> info;
        ASSERT_HR(S_OK, create.As(IID_IErrorInfo, info));
        ASSERT_HR(S_OK, SetErrorInfo(0, info.Get()));
        CoUninitialize();
        info->AddRef();
        EXPECT_EQ(info->Release(), 3u) << "still held while one call is open";
        CoUninitialize();
        info->AddRef();
        EXPECT_EQ(info->Release(), 2u) << "the slot let go; the test holds both interfaces";
    }).join();
}

}  // namespace
