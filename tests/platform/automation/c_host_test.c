/* SPDX-License-Identifier: MIT */
/* A host written in C: error info through its function tables, and the
 * string, variant and array calls. Exits non-zero on any failed check. */
#include <stdio.h>
#include <string.h>

#include "automation/automation.h"

static int failures = 0;

#define CHECK(condition)                                                        \
    do {                                                                        \
        if (!(condition)) {                                                     \
            fprintf(stderr, "%s:%d: check failed: %s\n", __FILE__, __LINE__, #condition); \
            ++failures;                                                         \
        }                                                                       \
    } while (0)

#define CHECK_HR(expected, actual)                                                      \
    do {                                                                                \
        HRESULT hr_ = (actual);                                                         \
        if (hr_ != (expected)) {                                                        \
            fprintf(stderr, "%s:%d: %s is 0x%08X, expected 0x%08X\n", __FILE__, __LINE__, \
                    #actual, (unsigned)hr_, (unsigned)(expected));                      \
            ++failures;                                                                 \
        }                                                                               \
    } while (0)

static const OLECHAR kDescription[] = {'B', 'a', 'd', ' ', 'c', 'e', 'l', 'l', 0};

static void TestErrorInfo(void)
{
    ICreateErrorInfo *create = NULL;
    IErrorInfo *info = NULL;
    IErrorInfo *taken = NULL;
    IUnknown *unknownA = NULL;
    IUnknown *unknownB = NULL;
    void *none = &none;
    BSTR description = NULL;
    DWORD context = 0;

    CHECK_HR(S_OK, CreateErrorInfo(&create));
    if (!create) return;
    CHECK_HR(S_OK, create->lpVtbl->SetDescription(create, (LPOLESTR)kDescription));
    CHECK_HR(S_OK, create->lpVtbl->SetHelpContext(create, 7));
    CHECK_HR(S_OK, create->lpVtbl->QueryInterface(create, &IID_IErrorInfo, (void **)&info));
    if (!info) return;
    CHECK_HR(E_NOINTERFACE, info->lpVtbl->QueryInterface(info, &IID_IDispatch, &none));
    CHECK(none == NULL);

    CHECK_HR(S_OK, create->lpVtbl->QueryInterface(create, &IID_IUnknown, (void **)&unknownA));
    CHECK_HR(S_OK, info->lpVtbl->QueryInterface(info, &IID_IUnknown, (void **)&unknownB));
    CHECK(unknownA != NULL && unknownA == unknownB);
    CHECK(unknownA->lpVtbl->Release(unknownA) == 3);
    CHECK(unknownB->lpVtbl->Release(unknownB) == 2);

    CHECK_HR(S_OK, info->lpVtbl->GetDescription(info, &description));
    CHECK(description != NULL && SysStringLen(description) == 8 &&
          memcmp(description, kDescription, sizeof kDescription) == 0);
    SysFreeString(description);
    CHECK_HR(S_OK, info->lpVtbl->GetHelpContext(info, &context));
    CHECK(context == 7);

    CHECK_HR(S_OK, SetErrorInfo(0, info));
    CHECK_HR(S_OK, GetErrorInfo(0, &taken));
    CHECK(taken == info);
    if (taken) taken->lpVtbl->Release(taken);
    CHECK_HR(S_FALSE, GetErrorInfo(0, &taken));
    CHECK(taken == NULL);

    CHECK(create->lpVtbl->Release(create) == 1);
    CHECK(info->lpVtbl->Release(info) == 0);
}

static void TestValues(void)
{
    static const OLECHAR kNumber[] = {' ', '2', '.', '5', 0};
    static const OLECHAR kDate[] = {'2', '0', '1', '2', '/', '0', '3', '/', '0', '4', 0};
    VARIANT v, w;
    SAFEARRAYBOUND bounds[2] = {{2, 1}, {3, 1}};
    SAFEARRAY *psa;
    LONG at[2] = {2, 3};
    DATE date = 0;
    SYSTEMTIME st;

    VariantInit(&v);
    VariantInit(&w);
    v.vt = VT_BSTR;
    v.bstrVal = SysAllocString(kNumber);
    CHECK(SysStringLen(v.bstrVal) == 4 && SysStringByteLen(v.bstrVal) == 8);
    CHECK_HR(S_OK, VariantChangeType(&w, &v, 0, VT_R8));
    CHECK(w.vt == VT_R8 && w.dblVal == 2.5);
    CHECK_HR(S_OK, VariantChangeType(&v, &v, 0, VT_I4));
    CHECK(v.vt == VT_I4 && v.lVal == 2);

    CHECK_HR(S_OK, VarDateFromStr(kDate, LOCALE_USER_DEFAULT, 0, &date));
    CHECK(date == 40972.0);
    memset(&st, 0, sizeof st);
    CHECK(VariantTimeToSystemTime(date, &st) && st.wYear == 2012 && st.wMonth == 3 &&
          st.wDay == 4);

    psa = SafeArrayCreate(VT_VARIANT, 2, bounds);
    CHECK(psa != NULL);
    if (!psa) return;
    CHECK_HR(S_OK, SafeArrayPutElement(psa, at, &w));
    v.vt = VT_ARRAY | VT_VARIANT;
    v.parray = psa;
    CHECK_HR(S_OK, VariantCopy(&w, &v));
    CHECK(w.vt == (VT_ARRAY | VT_VARIANT) && w.parray != psa);
    CHECK(((VARIANT *)w.parray->pvData)[5].dblVal == 2.5);
    at[0] = 3;
    CHECK_HR(DISP_E_BADINDEX, SafeArrayPutElement(psa, at, &w));
    CHECK_HR(S_OK, VariantClear(&v));
    CHECK_HR(S_OK, VariantClear(&w));
}

int main(void)
{
    CHECK(sizeof(VARIANT) == 24 && offsetof(VARIANT, lVal) == 8 && sizeof(OLECHAR) == 2);
    TestErrorInfo();
    TestValues();
    if (failures) fprintf(stderr, "%d check(s) failed\n", failures);
    return failures ? 1 : 0;
}
