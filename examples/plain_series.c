/* SPDX-License-Identifier: MIT
 * The host's own objects behind IHostSeries, IHostConnection, IHostTimeAxis and
 * IHostItem. The connection and the axis live inside the series and share its
 * reference count; each item counts its own. */
#include "plain_series.h"

#include <stddef.h>
#include <stdlib.h>
#include <string.h>

typedef struct PlainItem {
    IHostItem iface;
    LONG refs;
    BSTR title;
    LONG itemType, unit, valueType;
    ItemDataType dataType;
    double *values;
    LONG count;
} PlainItem;

typedef struct PlainSeries {
    IHostSeries iface;
    IHostConnection connection;
    IHostTimeAxis axis;
    LONG refs;
    BSTR path, specification;
    VARIANT_BOOL silent;
    double deleteValue;
    LONG axisKind;
    DATE *times;
    LONG steps;
    PlainItem **items;
    LONG itemCount;
} PlainSeries;

#define OWNER(pointer, member) ((PlainSeries *)(void *)((char *)(pointer) - offsetof(PlainSeries, member)))

static int SameIid(REFIID a, const IID *b) { return memcmp(a, b, sizeof *b) == 0; }

static BSTR CopyText(const OLECHAR *text) { return text ? SysAllocStringLen(text, SysStringLen((BSTR)text)) : NULL; }

/* Reads a one-dimensional number array into doubles. The array passes to us:
 * it is cleared here, whatever happens. */
static HRESULT TakeNumbers(VARIANT *array, double **values, LONG *count)
{
    HRESULT hr = DISP_E_TYPEMISMATCH;
    VARTYPE type = (VARTYPE)(array->vt & VT_TYPEMASK);
    LONG low = 0, high = -1, i;
    void *data = NULL;
    double *read = NULL;
    if ((array->vt & VT_ARRAY) && array->parray && SafeArrayGetDim(array->parray) == 1 &&
        (type == VT_R4 || type == VT_R8 || type == VT_DATE) && SUCCEEDED(SafeArrayGetLBound(array->parray, 1, &low)) &&
        SUCCEEDED(SafeArrayGetUBound(array->parray, 1, &high)) && SUCCEEDED(SafeArrayAccessData(array->parray, &data))) {
        read = malloc(sizeof *read * (size_t)(high - low + 1 > 0 ? high - low + 1 : 1));
        hr = read ? S_OK : E_OUTOFMEMORY;
        for (i = 0; read && i <= high - low; ++i)
            read[i] = type == VT_R4 ? ((const float *)data)[i] : ((const double *)data)[i];
        SafeArrayUnaccessData(array->parray);
    }
    VariantClear(array);
    if (FAILED(hr)) return hr;
    free(*values);
    *values = read;
    *count = high - low + 1;
    return S_OK;
}

/* A one-dimensional array of the item's values in its data type's element. */
static HRESULT MakeNumbers(const double *values, LONG count, VARTYPE type, VARIANT *out)
{
    LONG i;
    void *data = NULL;
    VariantInit(out);
    out->parray = SafeArrayCreateVector(type, 0, (ULONG)count);
    if (!out->parray || FAILED(SafeArrayAccessData(out->parray, &data))) return E_OUTOFMEMORY;
    for (i = 0; i < count; ++i) {
        if (type == VT_R4)
            ((float *)data)[i] = (float)values[i];
        else
            ((double *)data)[i] = values[i];
    }
    SafeArrayUnaccessData(out->parray);
    out->vt = (VARTYPE)(VT_ARRAY | type);
    return S_OK;
}

/* --- IHostItem --- */

static HRESULT ItemQueryInterface(IHostItem *This, REFIID riid, void **object)
{
    if (!object) return E_POINTER;
    *object = NULL;
    if (!SameIid(riid, &IID_IUnknown) && !SameIid(riid, &IID_IHostItem)) return E_NOINTERFACE;
    *object = This;
    ((PlainItem *)This)->refs++;
    return S_OK;
}
static ULONG ItemAddRef(IHostItem *This) { return (ULONG)++((PlainItem *)This)->refs; }
static ULONG ItemRelease(IHostItem *This)
{
    PlainItem *item = (PlainItem *)This;
    if (--item->refs > 0) return (ULONG)item->refs;
    SysFreeString(item->title);
    free(item->values);
    free(item);
    return 0;
}
static HRESULT GetDataType(IHostItem *This, ItemDataType *type)
{
    if (!type) return E_POINTER;
    *type = ((PlainItem *)This)->dataType;
    return S_OK;
}
static HRESULT SetDataType(IHostItem *This, ItemDataType type)
{
    ((PlainItem *)This)->dataType = type;
    return S_OK;
}
static HRESULT SetItemType(IHostItem *This, LONG sequence)
{
    ((PlainItem *)This)->itemType = sequence;
    return S_OK;
}
static HRESULT SetItemUnit(IHostItem *This, LONG sequence)
{
    ((PlainItem *)This)->unit = sequence;
    return S_OK;
}
static HRESULT GetTitle(IHostItem *This, BSTR *title)
{
    if (!title) return E_POINTER;
    *title = CopyText(((PlainItem *)This)->title);
    return S_OK;
}
static HRESULT SetTitle(IHostItem *This, BSTR title)
{
    PlainItem *item = (PlainItem *)This;
    SysFreeString(item->title);
    item->title = CopyText(title);
    return S_OK;
}
static HRESULT GetValueType(IHostItem *This, LONG *valueType)
{
    if (!valueType) return E_POINTER;
    *valueType = ((PlainItem *)This)->valueType;
    return S_OK;
}
static HRESULT SetValueType(IHostItem *This, LONG valueType)
{
    ((PlainItem *)This)->valueType = valueType;
    return S_OK;
}
static HRESULT GetData(IHostItem *This, VARIANT *data)
{
    PlainItem *item = (PlainItem *)This;
    if (!data) return E_POINTER;
    return MakeNumbers(item->values, item->count, item->dataType == ItemDataTypeFloat ? VT_R4 : VT_R8, data);
}
static HRESULT SetData(IHostItem *This, VARIANT data)
{
    PlainItem *item = (PlainItem *)This;
    return TakeNumbers(&data, &item->values, &item->count);
}
static HRESULT GetItemType(IHostItem *This, LONG *ident)
{
    if (!ident) return E_POINTER;
    *ident = ((PlainItem *)This)->itemType;
    return S_OK;
}
static HRESULT GetItemUnit(IHostItem *This, LONG *ident)
{
    if (!ident) return E_POINTER;
    *ident = ((PlainItem *)This)->unit;
    return S_OK;
}

static const IHostItemVtbl kItemTable = {ItemQueryInterface, ItemAddRef, ItemRelease, GetDataType,  SetDataType,
                                         SetItemType,        SetItemUnit, GetTitle,    SetTitle,     GetValueType,
                                         SetValueType,       GetData,     SetData,     GetItemType,  GetItemUnit};

/* --- IHostSeries --- */

static HRESULT SeriesQueryInterface(IHostSeries *This, REFIID riid, void **object)
{
    if (!object) return E_POINTER;
    *object = NULL;
    if (!SameIid(riid, &IID_IUnknown) && !SameIid(riid, &IID_IHostSeries)) return E_NOINTERFACE;
    *object = This;
    OWNER(This, iface)->refs++;
    return S_OK;
}
static ULONG SeriesAddRef(IHostSeries *This) { return (ULONG)++OWNER(This, iface)->refs; }
static HRESULT RemoveAllItems(IHostSeries *This);
static ULONG SeriesRelease(IHostSeries *This)
{
    PlainSeries *series = OWNER(This, iface);
    if (--series->refs > 0) return (ULONG)series->refs;
    RemoveAllItems(This);
    SysFreeString(series->path);
    SysFreeString(series->specification);
    free(series->times);
    free(series->items);
    free(series);
    return 0;
}
static HRESULT GetConnection(IHostSeries *This, IHostConnection **connection)
{
    if (!connection) return E_POINTER;
    *connection = &OWNER(This, iface)->connection;
    OWNER(This, iface)->refs++;
    return S_OK;
}
static HRESULT GetItemCount(IHostSeries *This, LONG *count)
{
    if (!count) return E_POINTER;
    *count = OWNER(This, iface)->itemCount;
    return S_OK;
}
static HRESULT GetDeleteValue(IHostSeries *This, DOUBLE *value)
{
    if (!value) return E_POINTER;
    *value = OWNER(This, iface)->deleteValue;
    return S_OK;
}
static HRESULT SetDeleteValue(IHostSeries *This, DOUBLE value)
{
    OWNER(This, iface)->deleteValue = value;
    return S_OK;
}
static HRESULT GetTimeAxis(IHostSeries *This, IHostTimeAxis **axis)
{
    if (!axis) return E_POINTER;
    *axis = &OWNER(This, iface)->axis;
    OWNER(This, iface)->refs++;
    return S_OK;
}
static HRESULT GetItem(IHostSeries *This, VARIANT index, IHostItem **item)
{
    PlainSeries *series = OWNER(This, iface);
    if (!item) return E_POINTER;
    *item = NULL;
    if (index.vt != VT_I4 || index.lVal < 1 || index.lVal > series->itemCount) return E_INVALIDARG;
    *item = &series->items[index.lVal - 1]->iface;
    series->items[index.lVal - 1]->refs++;
    return S_OK;
}
static HRESULT AddItem(IHostSeries *This, LONG *index, IHostItem **item)
{
    PlainSeries *series = OWNER(This, iface);
    PlainItem **grown, *made;
    if (!item) return E_POINTER;
    *item = NULL;
    grown = realloc(series->items, sizeof *grown * (size_t)(series->itemCount + 1));
    if (!grown) return E_OUTOFMEMORY;
    series->items = grown;
    made = calloc(1, sizeof *made);
    if (!made) return E_OUTOFMEMORY;
    made->iface.lpVtbl = &kItemTable;
    made->refs = 2; /* the series' and the caller's */
    made->dataType = ItemDataTypeFloat;
    series->items[series->itemCount++] = made;
    if (index) *index = series->itemCount;
    *item = &made->iface;
    return S_OK;
}
static HRESULT RemoveItem(IHostSeries *This, LONG index)
{
    PlainSeries *series = OWNER(This, iface);
    if (index < 1 || index > series->itemCount) return E_INVALIDARG;
    ItemRelease(&series->items[index - 1]->iface);
    memmove(series->items + index - 1, series->items + index, sizeof *series->items * (size_t)(series->itemCount - index));
    series->itemCount--;
    return S_OK;
}
static HRESULT RemoveAllItems(IHostSeries *This)
{
    while (OWNER(This, iface)->itemCount > 0) RemoveItem(This, OWNER(This, iface)->itemCount);
    return S_OK;
}

static const IHostSeriesVtbl kSeriesTable = {SeriesQueryInterface, SeriesAddRef, SeriesRelease, GetConnection,
                                             GetItemCount,         GetDeleteValue, SetDeleteValue, GetTimeAxis,
                                             GetItem,              AddItem,      RemoveItem,    RemoveAllItems};

/* --- IHostConnection, inside the series --- */

static HRESULT ConnectionQueryInterface(IHostConnection *This, REFIID riid, void **object)
{
    if (!object) return E_POINTER;
    *object = NULL;
    if (!SameIid(riid, &IID_IUnknown) && !SameIid(riid, &IID_IHostConnection)) return E_NOINTERFACE;
    *object = This;
    OWNER(This, connection)->refs++;
    return S_OK;
}
static ULONG ConnectionAddRef(IHostConnection *This) { return SeriesAddRef(&OWNER(This, connection)->iface); }
static ULONG ConnectionRelease(IHostConnection *This) { return SeriesRelease(&OWNER(This, connection)->iface); }
static HRESULT GetFilePath(IHostConnection *This, BSTR *path)
{
    if (!path) return E_POINTER;
    *path = CopyText(OWNER(This, connection)->path);
    return S_OK;
}
static HRESULT SetFilePath(IHostConnection *This, BSTR path)
{
    SysFreeString(OWNER(This, connection)->path);
    OWNER(This, connection)->path = CopyText(path);
    return S_OK;
}
static HRESULT GetSpecification(IHostConnection *This, BSTR *specification)
{
    if (!specification) return E_POINTER;
    *specification = CopyText(OWNER(This, connection)->specification);
    return S_OK;
}
static HRESULT SetSpecification(IHostConnection *This, BSTR specification)
{
    SysFreeString(OWNER(This, connection)->specification);
    OWNER(This, connection)->specification = CopyText(specification);
    return S_OK;
}
static HRESULT GetSilent(IHostConnection *This, VARIANT_BOOL *silent)
{
    if (!silent) return E_POINTER;
    *silent = OWNER(This, connection)->silent;
    return S_OK;
}

static const IHostConnectionVtbl kConnectionTable = {ConnectionQueryInterface, ConnectionAddRef, ConnectionRelease,
                                                     GetFilePath, SetFilePath, GetSpecification, SetSpecification,
                                                     GetSilent};

/* --- IHostTimeAxis, inside the series --- */

static HRESULT AxisQueryInterface(IHostTimeAxis *This, REFIID riid, void **object)
{
    if (!object) return E_POINTER;
    *object = NULL;
    if (!SameIid(riid, &IID_IUnknown) && !SameIid(riid, &IID_IHostTimeAxis)) return E_NOINTERFACE;
    *object = This;
    OWNER(This, axis)->refs++;
    return S_OK;
}
static ULONG AxisAddRef(IHostTimeAxis *This) { return SeriesAddRef(&OWNER(This, axis)->iface); }
static ULONG AxisRelease(IHostTimeAxis *This) { return SeriesRelease(&OWNER(This, axis)->iface); }
static HRESULT GetStepCount(IHostTimeAxis *This, LONG *count)
{
    if (!count) return E_POINTER;
    *count = OWNER(This, axis)->steps;
    return S_OK;
}
static HRESULT SetStepCount(IHostTimeAxis *This, LONG count)
{
    PlainSeries *series = OWNER(This, axis);
    DATE *times;
    LONG i;
    if (count < 0) return E_INVALIDARG;
    times = realloc(series->times, sizeof *times * (size_t)(count > 0 ? count : 1));
    if (!times) return E_OUTOFMEMORY;
    for (i = series->steps; i < count; ++i) times[i] = 0;
    series->times = times;
    series->steps = count;
    return S_OK;
}
static HRESULT SetAxisKind(IHostTimeAxis *This, LONG kind)
{
    OWNER(This, axis)->axisKind = kind;
    return S_OK;
}
static HRESULT SetTimes(IHostTimeAxis *This, VARIANT times)
{
    PlainSeries *series = OWNER(This, axis);
    return TakeNumbers(&times, &series->times, &series->steps);
}
static HRESULT GetTime(IHostTimeAxis *This, LONG step, VARIANT *time)
{
    PlainSeries *series = OWNER(This, axis);
    if (!time) return E_POINTER;
    VariantInit(time);
    if (step < 1 || step > series->steps) return E_INVALIDARG;
    time->vt = VT_DATE;
    time->date = series->times[step - 1];
    return S_OK;
}

static const IHostTimeAxisVtbl kAxisTable = {AxisQueryInterface, AxisAddRef, AxisRelease, GetStepCount,
                                             SetStepCount,       SetAxisKind, SetTimes,   GetTime};

/* --- making and reading --- */

/* UTF-8 to a BSTR, for the texts a host keeps; enough for paths and strings
 * of the Basic Multilingual Plane. */
static BSTR TextFromUtf8(const char *text)
{
    size_t length = strlen(text), i = 0, n = 0;
    OLECHAR *wide = malloc(sizeof *wide * (length + 1));
    BSTR made;
    if (!wide) return NULL;
    while (i < length) {
        unsigned char c = (unsigned char)text[i];
        if (c < 0x80) {
            wide[n++] = c;
            i += 1;
        } else if ((c & 0xE0) == 0xC0 && i + 1 < length) {
            wide[n++] = (OLECHAR)(((c & 0x1F) << 6) | (text[i + 1] & 0x3F));
            i += 2;
        } else if ((c & 0xF0) == 0xE0 && i + 2 < length) {
            wide[n++] = (OLECHAR)(((c & 0x0F) << 12) | ((text[i + 1] & 0x3F) << 6) | (text[i + 2] & 0x3F));
            i += 3;
        } else {
            wide[n++] = 0xFFFD;
            i += 1;
        }
    }
    made = SysAllocStringLen(wide, (UINT)n);
    free(wide);
    return made;
}

IHostSeries *PlainSeriesCreate(const char *path, const char *specification, VARIANT_BOOL silent)
{
    PlainSeries *series = calloc(1, sizeof *series);
    if (!series) return NULL;
    series->iface.lpVtbl = &kSeriesTable;
    series->connection.lpVtbl = &kConnectionTable;
    series->axis.lpVtbl = &kAxisTable;
    series->refs = 1;
    series->path = TextFromUtf8(path);
    series->specification = TextFromUtf8(specification);
    series->silent = silent;
    series->deleteValue = -9999.0;
    if (!series->path || !series->specification) {
        SeriesRelease(&series->iface);
        return NULL;
    }
    return &series->iface;
}

LONG PlainSeriesStepCount(IHostSeries *series) { return OWNER(series, iface)->steps; }
DATE PlainSeriesTime(IHostSeries *series, LONG step) { return OWNER(series, iface)->times[step]; }
double PlainSeriesDeleteValue(IHostSeries *series) { return OWNER(series, iface)->deleteValue; }
LONG PlainSeriesItemCount(IHostSeries *series) { return OWNER(series, iface)->itemCount; }

PlainItemView PlainSeriesItem(IHostSeries *series, LONG index)
{
    const PlainItem *item = OWNER(series, iface)->items[index];
    PlainItemView view;
    view.title = item->title;
    view.itemType = item->itemType;
    view.unit = item->unit;
    view.valueType = item->valueType;
    view.count = item->count;
    view.values = item->values;
    return view;
}
