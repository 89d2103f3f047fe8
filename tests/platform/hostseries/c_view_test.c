/* SPDX-License-Identifier: MIT
 *
 * Drives the series through its C view, the way a host written in C would:
 * every call goes through lpVtbl. Exits non-zero when any check fails.
 */
#include <stdio.h>
#include <string.h>

#include "hostseries/hostseries.h"

static int failures = 0;

#define CHECK(condition)                                                  \
    do {                                                                  \
        if (!(condition)) {                                               \
            fprintf(stderr, "%s:%d: check failed: %s\n", __FILE__, __LINE__, \
                    #condition);                                          \
            ++failures;                                                   \
        }                                                                 \
    } while (0)

#define CHECK_HR(expected, actual)                                                        \
    do {                                                                                  \
        HRESULT hr_ = (actual);                                                           \
        if (hr_ != (expected)) {                                                          \
            fprintf(stderr, "%s:%d: %s is 0x%08X, expected 0x%08X\n", __FILE__, __LINE__, \
                    #actual, (unsigned)hr_, (unsigned)(expected));                        \
            ++failures;                                                                   \
        }                                                                                 \
    } while (0)

static VARIANT IndexVariant(LONG number)
{
    VARIANT v;
    VariantInit(&v);
    v.vt = VT_I4;
    v.lVal = number;
    return v;
}

static void CheckInterfaces(IHostSeries *series)
{
    void *pv = (void *)series;
    CHECK_HR(E_NOINTERFACE, series->lpVtbl->QueryInterface(series, &IID_IHostItem, &pv));
    CHECK(pv == NULL);
    CHECK_HR(E_POINTER, series->lpVtbl->QueryInterface(series, &IID_IHostSeries, NULL));
    CHECK_HR(S_OK, series->lpVtbl->QueryInterface(series, &IID_IUnknown, &pv));
    CHECK(pv == (void *)series);
    CHECK(series->lpVtbl->AddRef(series) == 3);
    CHECK(series->lpVtbl->Release(series) == 2);
    CHECK(((IUnknown *)pv)->lpVtbl->Release((IUnknown *)pv) == 1);
}

static void CheckConnection(IHostSeries *series)
{
    static const OLECHAR pathText[] = {'/', 't', 'm', 'p', '/', 0x00FC, '.', 'x', 'l', 's', 'x', 0};
    IHostConnection *connection = NULL;
    BSTR path = NULL;
    BSTR back = NULL;
    VARIANT_BOOL silent = VARIANT_TRUE;

    CHECK_HR(S_OK, series->lpVtbl->GetConnection(series, &connection));
    if (!connection) return;
    path = SysAllocString(pathText);
    CHECK_HR(S_OK, connection->lpVtbl->SetFilePath(connection, path));
    SysFreeString(path);
    CHECK_HR(S_OK, connection->lpVtbl->GetFilePath(connection, &back));
    CHECK(back != NULL && SysStringLen(back) == 11 && memcmp(back, pathText, sizeof pathText) == 0);
    SysFreeString(back);

    /* The preset stands until the host sets the flag. */
    CHECK_HR(S_FALSE, connection->lpVtbl->GetSilent(connection, &silent));
    CHECK(silent == VARIANT_TRUE);
    CHECK_HR(S_OK, HostSeriesSetSilent(series, VARIANT_FALSE));
    CHECK_HR(S_OK, connection->lpVtbl->GetSilent(connection, &silent));
    CHECK(silent == VARIANT_FALSE);
    connection->lpVtbl->Release(connection);
}

static void CheckItems(IHostSeries *series)
{
    static const float values[] = {1.5f, -9999.0f, 3.25f};
    IHostItem *item = NULL;
    IHostItem *found = NULL;
    LONG index = 0;
    LONG count = -1;
    LONG ident = -1;
    SAFEARRAY *psa = NULL;
    void *data = NULL;
    VARIANT in;
    VARIANT out;

    CHECK_HR(S_OK, series->lpVtbl->AddItem(series, &index, &item));
    CHECK(index == 1);
    if (!item) return;
    CHECK_HR(S_OK, item->lpVtbl->SetDataType(item, ItemDataTypeFloat));
    CHECK_HR(S_OK, item->lpVtbl->SetItemType(item, 2));
    CHECK_HR(S_OK, item->lpVtbl->GetItemType(item, &ident));
    CHECK(ident > 0 && ident != 2);

    /* The array passes to the item: it is not freed here. */
    psa = SafeArrayCreateVector(VT_R4, 0, 3);
    CHECK(psa != NULL);
    if (!psa) return;
    SafeArrayAccessData(psa, &data);
    memcpy(data, values, sizeof values);
    SafeArrayUnaccessData(psa);
    VariantInit(&in);
    in.vt = VT_ARRAY | VT_R4;
    in.parray = psa;
    CHECK_HR(S_OK, item->lpVtbl->SetData(item, in));

    VariantInit(&out);
    CHECK_HR(S_OK, item->lpVtbl->GetData(item, &out));
    CHECK(out.vt == (VT_ARRAY | VT_R4));
    if (out.vt == (VT_ARRAY | VT_R4)) {
        CHECK(SafeArrayAccessData(out.parray, &data) == S_OK);
        CHECK(memcmp(data, values, sizeof values) == 0);
        SafeArrayUnaccessData(out.parray);
    }
    VariantClear(&out);

    CHECK_HR(S_OK, series->lpVtbl->GetItem(series, IndexVariant(1), &found));
    CHECK(found == item);
    if (found) found->lpVtbl->Release(found);
    found = item; /* must be reset on failure */
    CHECK_HR(DISP_E_BADINDEX, series->lpVtbl->GetItem(series, IndexVariant(2), &found));
    CHECK(found == NULL);

    CHECK_HR(S_OK, series->lpVtbl->RemoveItem(series, 1));
    CHECK_HR(S_OK, series->lpVtbl->GetItemCount(series, &count));
    CHECK(count == 0);
    /* Removed, but still ours until released. */
    CHECK_HR(S_OK, item->lpVtbl->GetItemType(item, &ident));
    CHECK(item->lpVtbl->Release(item) == 0);
}

static void CheckTimeAxis(IHostSeries *series)
{
    static const DATE times[] = {45292.0, 45292.5};
    IHostTimeAxis *axis = NULL;
    LONG count = -1;
    VARIANT array;
    VARIANT time;
    void *data = NULL;

    CHECK_HR(S_OK, series->lpVtbl->GetTimeAxis(series, &axis));
    if (!axis) return;
    CHECK_HR(S_OK, axis->lpVtbl->SetAxisKind(axis, HOST_AXIS_KIND_EXPLICIT_TIMES));
    CHECK_HR(S_OK, axis->lpVtbl->SetStepCount(axis, 2));
    VariantInit(&array);
    array.vt = VT_ARRAY | VT_DATE;
    array.parray = SafeArrayCreateVector(VT_DATE, 0, 2);
    SafeArrayAccessData(array.parray, &data);
    memcpy(data, times, sizeof times);
    SafeArrayUnaccessData(array.parray);
    CHECK_HR(S_OK, axis->lpVtbl->SetTimes(axis, array));
    CHECK_HR(S_OK, axis->lpVtbl->GetStepCount(axis, &count));
    CHECK(count == 2);
    VariantInit(&time);
    CHECK_HR(S_OK, axis->lpVtbl->GetTime(axis, 2, &time));
    CHECK(time.vt == VT_DATE && time.date == 45292.5);
    CHECK_HR(E_INVALIDARG, axis->lpVtbl->GetTime(axis, 3, &time));
    axis->lpVtbl->Release(axis);
}

int main(void)
{
    IHostSeries *series = NULL;
    double deleteValue = 0.0;

    CHECK_HR(S_OK, HostSeriesCreate(&series));
    if (!series) return 1;
    CheckInterfaces(series);
    CHECK_HR(S_OK, series->lpVtbl->GetDeleteValue(series, &deleteValue));
    CHECK(deleteValue == -9999.0);
    CheckConnection(series);
    CheckItems(series);
    CheckTimeAxis(series);
    CHECK(series->lpVtbl->Release(series) == 0);

    if (failures) fprintf(stderr, "%d checks failed\n", failures);
    return failures ? 1 : 0;
}
