// SPDX-License-Identifier: MIT
#include <cstdint>
#include <cstring>

#include <gtest/gtest.h>

#include "automation/automation.h"
#include "counting_unknown.h"
#include "expect_hr.h"

namespace {

using automation::testing::CountingUnknown;

// An Excel-like block: 3 rows by 2 columns, both counted from 1.
SAFEARRAY *RowsByColumns(VARTYPE vt)
{
    SAFEARRAYBOUND bounds[2] = {{3, 1}, {2, 1}};
    return SafeArrayCreate(vt, 2, bounds);
}

TEST(AutomationSafeArray, FirstDimensionVariesFastest)
{
    SAFEARRAY *psa = RowsByColumns(VT_I4);
    ASSERT_NE(psa, nullptr);
    EXPECT_EQ(psa->cDims, 2);
    EXPECT_EQ(psa->cbElements, 4u);
    // Bounds are stored last dimension first.
    EXPECT_EQ(psa->rgsabound[0].cElements, 2u);
    EXPECT_EQ(psa->rgsabound[1].cElements, 3u);

    for (LONG row = 1; row <= 3; ++row) {
        for (LONG col = 1; col <= 2; ++col) {
            LONG at[2] = {row, col};
            LONG value = row * 10 + col;
            ASSERT_HR(S_OK, SafeArrayPutElement(psa, at, &value));
        }
    }
    LONG *data = nullptr;
    ASSERT_HR(S_OK, SafeArrayAccessData(psa, reinterpret_cast<void **>(&data)));
    const LONG expected[6] = {11, 21, 31, 12, 22, 32};
    for (int i = 0; i < 6; ++i) EXPECT_EQ(data[i], expected[i]) << i;
    EXPECT_HR(S_OK, SafeArrayUnaccessData(psa));

    LONG at[2] = {3, 1};
    void *address = nullptr;
    ASSERT_HR(S_OK, SafeArrayPtrOfIndex(psa, at, &address));
    EXPECT_EQ(*static_cast<LONG *>(address), 31);
    LONG got = 0;
    ASSERT_HR(S_OK, SafeArrayGetElement(psa, at, &got));
    EXPECT_EQ(got, 31);
    EXPECT_HR(S_OK, SafeArrayDestroy(psa));
}

TEST(AutomationSafeArray, BoundsAndBadIndices)
{
    SAFEARRAYBOUND bounds[2] = {{3, -1}, {4, 10}};
    SAFEARRAY *psa = SafeArrayCreate(VT_R8, 2, bounds);
    ASSERT_NE(psa, nullptr);
    EXPECT_EQ(SafeArrayGetDim(psa), 2u);
    LONG lb = 0, ub = 0;
    EXPECT_HR(S_OK, SafeArrayGetLBound(psa, 1, &lb));
    EXPECT_HR(S_OK, SafeArrayGetUBound(psa, 1, &ub));
    EXPECT_EQ(lb, -1);
    EXPECT_EQ(ub, 1);
    EXPECT_HR(S_OK, SafeArrayGetLBound(psa, 2, &lb));
    EXPECT_HR(S_OK, SafeArrayGetUBound(psa, 2, &ub));
    EXPECT_EQ(lb, 10);
    EXPECT_EQ(ub, 13);
    EXPECT_HR(DISP_E_BADINDEX, SafeArrayGetLBound(psa, 0, &lb));
    EXPECT_HR(DISP_E_BADINDEX, SafeArrayGetUBound(psa, 3, &ub));
    EXPECT_HR(E_INVALIDARG, SafeArrayGetLBound(psa, 1, nullptr));
    EXPECT_HR(E_INVALIDARG, SafeArrayGetUBound(nullptr, 1, &ub));

    double value = 1.5;
    for (auto at : {std::pair<LONG, LONG>{-2, 10}, {2, 10}, {0, 9}, {0, 14}}) {
        LONG index[2] = {at.first, at.second};
        EXPECT_HR(DISP_E_BADINDEX, SafeArrayPutElement(psa, index, &value));
        EXPECT_HR(DISP_E_BADINDEX, SafeArrayGetElement(psa, index, &value));
        void *address = nullptr;
        EXPECT_HR(DISP_E_BADINDEX, SafeArrayPtrOfIndex(psa, index, &address));
    }
    LONG index[2] = {1, 13};
    EXPECT_HR(S_OK, SafeArrayPutElement(psa, index, &value));
    EXPECT_HR(E_INVALIDARG, SafeArrayPutElement(psa, index, nullptr));
    EXPECT_HR(E_INVALIDARG, SafeArrayGetElement(psa, index, nullptr));
    EXPECT_HR(E_INVALIDARG, SafeArrayGetElement(psa, nullptr, &value));
    EXPECT_HR(E_INVALIDARG, SafeArrayGetElement(nullptr, index, &value));
    EXPECT_EQ(psa->cLocks, 0u) << "element access leaves no lock behind";
    EXPECT_HR(S_OK, SafeArrayDestroy(psa));
}

TEST(AutomationSafeArray, VartypeSizeAndFeatures)
{
    struct Case {
        VARTYPE vt;
        UINT size;
        USHORT feature;
    };
    const Case cases[] = {
        {VT_VARIANT, 24, FADF_VARIANT}, {VT_BSTR, 8, FADF_BSTR}, {VT_R4, 4, 0}, {VT_R8, 8, 0},
        {VT_DATE, 8, 0},  {VT_I4, 4, 0},  {VT_I2, 2, 0},  {VT_BOOL, 2, 0},  {VT_UI1, 1, 0},
        {VT_UNKNOWN, 8, FADF_UNKNOWN}, {VT_DISPATCH, 8, FADF_DISPATCH}, {VT_ERROR, 4, 0},
    };
    for (const Case &c : cases) {
        SAFEARRAY *psa = SafeArrayCreateVector(c.vt, 0, 3);
        ASSERT_NE(psa, nullptr) << c.vt;
        EXPECT_EQ(SafeArrayGetElemsize(psa), c.size) << c.vt;
        EXPECT_EQ(psa->fFeatures, FADF_HAVEVARTYPE | c.feature) << c.vt;
        VARTYPE vt = VT_EMPTY;
        EXPECT_HR(S_OK, SafeArrayGetVartype(psa, &vt));
        EXPECT_EQ(vt, c.vt);
        // The type stands in the four bytes before the descriptor.
        uint32_t stored;
        std::memcpy(&stored, reinterpret_cast<char *>(psa) - 4, 4);
        EXPECT_EQ(stored, c.vt);
        EXPECT_HR(S_OK, SafeArrayDestroy(psa));
    }
    VARTYPE vt;
    EXPECT_HR(E_INVALIDARG, SafeArrayGetVartype(nullptr, &vt));
    EXPECT_EQ(SafeArrayGetDim(nullptr), 0u);
    EXPECT_EQ(SafeArrayGetElemsize(nullptr), 0u);
}

TEST(AutomationSafeArray, RefusedCreations)
{
    SAFEARRAYBOUND bound{2, 0};
    EXPECT_EQ(SafeArrayCreate(VT_EMPTY, 1, &bound), nullptr);
    EXPECT_EQ(SafeArrayCreate(VT_NULL, 1, &bound), nullptr);
    EXPECT_EQ(SafeArrayCreate(0x0FFF, 1, &bound), nullptr);
    EXPECT_EQ(SafeArrayCreate(VT_I4, 0, &bound), nullptr);
    EXPECT_EQ(SafeArrayCreate(VT_I4, 1, nullptr), nullptr);
    // Sizes whose product overflows are refused, not wrapped.
    SAFEARRAYBOUND huge[3] = {{0xFFFFFFFFu, 0}, {0xFFFFFFFFu, 0}, {0xFFFFFFFFu, 0}};
    EXPECT_EQ(SafeArrayCreate(VT_VARIANT, 3, huge), nullptr);

    SAFEARRAY *empty = SafeArrayCreateVector(VT_I4, 5, 0);
    ASSERT_NE(empty, nullptr);
    LONG ub = 0;
    EXPECT_HR(S_OK, SafeArrayGetUBound(empty, 1, &ub));
    EXPECT_EQ(ub, 4);
    LONG index = 5;
    LONG value = 0;
    EXPECT_HR(DISP_E_BADINDEX, SafeArrayGetElement(empty, &index, &value));
    EXPECT_HR(S_OK, SafeArrayDestroy(empty));
    EXPECT_HR(S_OK, SafeArrayDestroy(nullptr));
}

TEST(AutomationSafeArray, Locks)
{
    SAFEARRAY *psa = SafeArrayCreateVector(VT_I2, 0, 4);
    EXPECT_HR(S_OK, SafeArrayLock(psa));
    EXPECT_EQ(psa->cLocks, 1u);
    EXPECT_HR(DISP_E_ARRAYISLOCKED, SafeArrayDestroy(psa));
    EXPECT_HR(S_OK, SafeArrayUnlock(psa));
    EXPECT_HR(E_UNEXPECTED, SafeArrayUnlock(psa));

    void *data = nullptr;
    EXPECT_HR(S_OK, SafeArrayAccessData(psa, &data));
    EXPECT_EQ(data, psa->pvData);
    EXPECT_HR(DISP_E_ARRAYISLOCKED, SafeArrayDestroy(psa));
    EXPECT_HR(S_OK, SafeArrayUnaccessData(psa));
    EXPECT_HR(E_INVALIDARG, SafeArrayAccessData(psa, nullptr));
    EXPECT_HR(E_INVALIDARG, SafeArrayAccessData(nullptr, &data));
    EXPECT_HR(E_INVALIDARG, SafeArrayLock(nullptr));
    EXPECT_HR(E_INVALIDARG, SafeArrayUnlock(nullptr));
    EXPECT_HR(S_OK, SafeArrayDestroy(psa));
}

TEST(AutomationSafeArray, BstrElementsAreCopiedInAndOut)
{
    SAFEARRAY *psa = SafeArrayCreateVector(VT_BSTR, 0, 2);
    BSTR text = SysAllocString(u"one");
    LONG index = 0;
    ASSERT_HR(S_OK, SafeArrayPutElement(psa, &index, text));
    BSTR *data = static_cast<BSTR *>(psa->pvData);
    EXPECT_NE(data[0], text);
    SysFreeString(text);
    EXPECT_EQ(std::u16string_view(data[0]), u"one");

    BSTR out = nullptr;
    ASSERT_HR(S_OK, SafeArrayGetElement(psa, &index, &out));
    EXPECT_NE(out, data[0]);
    EXPECT_EQ(std::u16string_view(out), u"one");
    SysFreeString(out);

    // A null BSTR may be stored and read back.
    index = 1;
    ASSERT_HR(S_OK, SafeArrayPutElement(psa, &index, nullptr));
    out = SysAllocString(u"x");
    BSTR previous = out;
    ASSERT_HR(S_OK, SafeArrayGetElement(psa, &index, &out));
    EXPECT_EQ(out, nullptr);
    SysFreeString(previous);
    EXPECT_HR(S_OK, SafeArrayDestroy(psa));
}

TEST(AutomationSafeArray, VariantAndInterfaceElementsCountReferences)
{
    CountingUnknown object;
    SAFEARRAY *objects = SafeArrayCreateVector(VT_UNKNOWN, 0, 2);
    LONG index = 0;
    ASSERT_HR(S_OK, SafeArrayPutElement(objects, &index, static_cast<IUnknown *>(&object)));
    EXPECT_EQ(object.refs, 2u);
    IUnknown *out = nullptr;
    ASSERT_HR(S_OK, SafeArrayGetElement(objects, &index, &out));
    EXPECT_EQ(out, &object);
    EXPECT_EQ(object.refs, 3u);
    out->Release();
    ASSERT_HR(S_OK, SafeArrayPutElement(objects, &index, nullptr));
    EXPECT_EQ(object.refs, 1u) << "the replaced element is released";
    ASSERT_HR(S_OK, SafeArrayPutElement(objects, &index, static_cast<IUnknown *>(&object)));

    SAFEARRAY *copy = nullptr;
    ASSERT_HR(S_OK, SafeArrayCopy(objects, &copy));
    EXPECT_EQ(object.refs, 3u);
    EXPECT_HR(S_OK, SafeArrayDestroy(copy));
    EXPECT_HR(S_OK, SafeArrayDestroy(objects));
    EXPECT_EQ(object.refs, 1u);

    SAFEARRAY *variants = SafeArrayCreateVector(VT_VARIANT, 1, 1);
    VARIANT in;
    VariantInit(&in);
    in.vt = VT_DISPATCH;
    in.pdispVal = &object;
    index = 1;
    ASSERT_HR(S_OK, SafeArrayPutElement(variants, &index, &in));
    EXPECT_EQ(object.refs, 2u);
    VARIANT got;
    got.vt = 0x0FFF;  // taken as uninitialised: not cleared
    ASSERT_HR(S_OK, SafeArrayGetElement(variants, &index, &got));
    EXPECT_EQ(got.vt, VT_DISPATCH);
    EXPECT_EQ(object.refs, 3u);
    EXPECT_HR(S_OK, VariantClear(&got));
    EXPECT_HR(S_OK, SafeArrayDestroy(variants));
    EXPECT_EQ(object.refs, 1u);
}

TEST(AutomationSafeArray, CopyIsDeep)
{
    SAFEARRAYBOUND bounds[2] = {{2, 1}, {2, 0}};
    SAFEARRAY *psa = SafeArrayCreate(VT_VARIANT, 2, bounds);
    VARIANT cell;
    VariantInit(&cell);
    cell.vt = VT_BSTR;
    cell.bstrVal = SysAllocString(u"corner");
    LONG at[2] = {2, 0};
    ASSERT_HR(S_OK, SafeArrayPutElement(psa, at, &cell));
    VariantClear(&cell);

    SAFEARRAY *copy = nullptr;
    ASSERT_HR(S_OK, SafeArrayCopy(psa, &copy));
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(copy->cDims, 2);
    EXPECT_EQ(copy->fFeatures, psa->fFeatures);
    EXPECT_EQ(std::memcmp(copy->rgsabound, psa->rgsabound, 2 * sizeof(SAFEARRAYBOUND)), 0);
    VARTYPE vt;
    EXPECT_HR(S_OK, SafeArrayGetVartype(copy, &vt));
    EXPECT_EQ(vt, VT_VARIANT);
    const auto *a = static_cast<VARIANT *>(psa->pvData);
    const auto *b = static_cast<VARIANT *>(copy->pvData);
    EXPECT_EQ(b[1].vt, VT_BSTR);  // (2, 0) is the second element
    EXPECT_NE(b[1].bstrVal, a[1].bstrVal);
    EXPECT_EQ(std::u16string_view(b[1].bstrVal), u"corner");
    EXPECT_EQ(b[0].vt, VT_EMPTY);
    EXPECT_HR(S_OK, SafeArrayDestroy(psa));
    EXPECT_HR(S_OK, SafeArrayDestroy(copy));

    EXPECT_HR(E_INVALIDARG, SafeArrayCopy(nullptr, nullptr));
    copy = reinterpret_cast<SAFEARRAY *>(&cell);
    EXPECT_HR(S_OK, SafeArrayCopy(nullptr, &copy));
    EXPECT_EQ(copy, nullptr);
}

}  // namespace
