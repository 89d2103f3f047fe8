/* SPDX-License-Identifier: MIT
 *
 * The host's time-series library: the interfaces of the host object that a
 * bridge fills and reads, and the bridge interface IVantrel that a host calls.
 * Plain C layout, usable from C and C++. Every operation returns an HRESULT;
 * out references are counted and released by the caller; out strings are the
 * caller's to free; arrays passed in pass to the callee.
 */
#ifndef HOSTSERIES_HOSTSERIES_H
#define HOSTSERIES_HOSTSERIES_H

#include "automation/automation.h"

#define HOSTSERIES_API AUTOMATION_EXTERN_C __attribute__((visibility("default")))

/* Element type of an item's data array. 3 has no name and is not handled. */
typedef enum ItemDataType {
    ItemDataTypeFloat = 1,
    ItemDataTypeDouble = 2,
    ItemDataTypeInt32 = 4,
    ItemDataTypeUInt32 = 5,
    ItemDataTypeInt16 = 6,
    ItemDataTypeUInt16 = 7
} ItemDataType;

/* The axis kind a bridge sets before the step count: times given step by step. */
#define HOST_AXIS_KIND_EXPLICIT_TIMES 3

HOSTSERIES_API const GUID LIBID_Chronal; /* version 1.1 */
HOSTSERIES_API const IID IID_IVantrel;
HOSTSERIES_API const IID IID_IHostSeries;
HOSTSERIES_API const IID IID_IHostConnection;
HOSTSERIES_API const IID IID_IHostTimeAxis;
HOSTSERIES_API const IID IID_IHostItem;

#if defined(__cplusplus)

struct IHostConnection;
struct IHostTimeAxis;
struct IHostItem;

struct IHostSeries : IUnknown {
    virtual HRESULT GetConnection(IHostConnection **connection) = 0;
    virtual HRESULT GetItemCount(LONG *count) = 0;
    virtual HRESULT GetDeleteValue(DOUBLE *value) = 0;
    virtual HRESULT SetDeleteValue(DOUBLE value) = 0;
    virtual HRESULT GetTimeAxis(IHostTimeAxis **axis) = 0;
    /* index is VT_I4 (or converts to it), 1-based */
    virtual HRESULT GetItem(VARIANT index, IHostItem **item) = 0;
    /* the new item is the last; *index is its 1-based number */
    virtual HRESULT AddItem(LONG *index, IHostItem **item) = 0;
    virtual HRESULT RemoveItem(LONG index) = 0;
    virtual HRESULT RemoveAllItems() = 0;
};

struct IHostConnection : IUnknown {
    virtual HRESULT GetFilePath(BSTR *path) = 0;
    virtual HRESULT SetFilePath(BSTR path) = 0;
    virtual HRESULT GetSpecification(BSTR *specification) = 0;
    virtual HRESULT SetSpecification(BSTR specification) = 0;
    /* A host that never set the flag leaves *silent as the caller preset it. */
    virtual HRESULT GetSilent(VARIANT_BOOL *silent) = 0;
};

struct IHostTimeAxis : IUnknown {
    virtual HRESULT GetStepCount(LONG *count) = 0;
    virtual HRESULT SetStepCount(LONG count) = 0;
    virtual HRESULT SetAxisKind(LONG kind) = 0;
    /* a one-dimensional VT_DATE array, one element a step; it passes to the host */
    virtual HRESULT SetTimes(VARIANT times) = 0;
    /* step is 1-based; the time comes as VT_DATE */
    virtual HRESULT GetTime(LONG step, VARIANT *time) = 0;
};

struct IHostItem : IUnknown {
    virtual HRESULT GetDataType(ItemDataType *type) = 0;
    virtual HRESULT SetDataType(ItemDataType type) = 0;
    /* a sequence number of the units catalogue */
    virtual HRESULT SetItemType(LONG sequence) = 0;
    /* a sequence number within the item type's units */
    virtual HRESULT SetItemUnit(LONG sequence) = 0;
    virtual HRESULT GetTitle(BSTR *title) = 0;
    virtual HRESULT SetTitle(BSTR title) = 0;
    virtual HRESULT GetValueType(LONG *valueType) = 0;
    virtual HRESULT SetValueType(LONG valueType) = 0;
    /* a one-dimensional array of the item's data type, element index = step - 1;
       it passes to the caller */
    virtual HRESULT GetData(VARIANT *data) = 0;
    /* a one-dimensional array, one element a step; it passes to the host */
    virtual HRESULT SetData(VARIANT data) = 0;
    /* identifiers of the units catalogue */
    virtual HRESULT GetItemType(LONG *ident) = 0;
    virtual HRESULT GetItemUnit(LONG *ident) = 0;
};

struct IVantrel : IDispatch {
    virtual HRESULT SetHostSeries(IHostSeries *series) = 0;
    virtual HRESULT FileExists(SHORT *exists) = 0;
    virtual HRESULT InspectWorkbook(SHORT *fits) = 0;
    virtual HRESULT NoOperation() = 0;
    virtual HRESULT ReadData() = 0;
    virtual HRESULT WriteData() = 0;
    virtual HRESULT OpenDialog() = 0;
    virtual HRESULT SaveDialog() = 0;
};

#else /* C view */

typedef struct IHostSeries IHostSeries;
typedef struct IHostConnection IHostConnection;
typedef struct IHostTimeAxis IHostTimeAxis;
typedef struct IHostItem IHostItem;
typedef struct IVantrel IVantrel;

typedef struct IHostSeriesVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IHostSeries)
    HRESULT (*GetConnection)(IHostSeries *This, IHostConnection **connection);
    HRESULT (*GetItemCount)(IHostSeries *This, LONG *count);
    HRESULT (*GetDeleteValue)(IHostSeries *This, DOUBLE *value);
    HRESULT (*SetDeleteValue)(IHostSeries *This, DOUBLE value);
    HRESULT (*GetTimeAxis)(IHostSeries *This, IHostTimeAxis **axis);
    HRESULT (*GetItem)(IHostSeries *This, VARIANT index, IHostItem **item);
    HRESULT (*AddItem)(IHostSeries *This, LONG *index, IHostItem **item);
    HRESULT (*RemoveItem)(IHostSeries *This, LONG index);
    HRESULT (*RemoveAllItems)(IHostSeries *This);
} IHostSeriesVtbl;
struct IHostSeries {
    const IHostSeriesVtbl *lpVtbl;
};

typedef struct IHostConnectionVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IHostConnection)
    HRESULT (*GetFilePath)(IHostConnection *This, BSTR *path);
    HRESULT (*SetFilePath)(IHostConnection *This, BSTR path);
    HRESULT (*GetSpecification)(IHostConnection *This, BSTR *specification);
    HRESULT (*SetSpecification)(IHostConnection *This, BSTR specification);
    HRESULT (*GetSilent)(IHostConnection *This, VARIANT_BOOL *silent);
} IHostConnectionVtbl;
struct IHostConnection {
    const IHostConnectionVtbl *lpVtbl;
};

typedef struct IHostTimeAxisVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IHostTimeAxis)
    HRESULT (*GetStepCount)(IHostTimeAxis *This, LONG *count);
    HRESULT (*SetStepCount)(IHostTimeAxis *This, LONG count);
    HRESULT (*SetAxisKind)(IHostTimeAxis *This, LONG kind);
    HRESULT (*SetTimes)(IHostTimeAxis *This, VARIANT times);
    HRESULT (*GetTime)(IHostTimeAxis *This, LONG step, VARIANT *time);
} IHostTimeAxisVtbl;
struct IHostTimeAxis {
    const IHostTimeAxisVtbl *lpVtbl;
};

typedef struct IHostItemVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IHostItem)
    HRESULT (*GetDataType)(IHostItem *This, ItemDataType *type);
    HRESULT (*SetDataType)(IHostItem *This, ItemDataType type);
    HRESULT (*SetItemType)(IHostItem *This, LONG sequence);
    HRESULT (*SetItemUnit)(IHostItem *This, LONG sequence);
    HRESULT (*GetTitle)(IHostItem *This, BSTR *title);
    HRESULT (*SetTitle)(IHostItem *This, BSTR title);
    HRESULT (*GetValueType)(IHostItem *This, LONG *valueType);
    HRESULT (*SetValueType)(IHostItem *This, LONG valueType);
    HRESULT (*GetData)(IHostItem *This, VARIANT *data);
    HRESULT (*SetData)(IHostItem *This, VARIANT data);
    HRESULT (*GetItemType)(IHostItem *This, LONG *ident);
    HRESULT (*GetItemUnit)(IHostItem *This, LONG *ident);
} IHostItemVtbl;
struct IHostItem {
    const IHostItemVtbl *lpVtbl;
};

typedef struct IVantrelVtbl {
    AUTOMATION_IDISPATCH_METHODS(IVantrel)
    HRESULT (*SetHostSeries)(IVantrel *This, IHostSeries *series);
    HRESULT (*FileExists)(IVantrel *This, SHORT *exists);
    HRESULT (*InspectWorkbook)(IVantrel *This, SHORT *fits);
    HRESULT (*NoOperation)(IVantrel *This);
    HRESULT (*ReadData)(IVantrel *This);
    HRESULT (*WriteData)(IVantrel *This);
    HRESULT (*OpenDialog)(IVantrel *This);
    HRESULT (*SaveDialog)(IVantrel *This);
} IVantrelVtbl;
struct IVantrel {
    const IVantrelVtbl *lpVtbl;
};

#endif /* C view */

/* The in-memory host object: a new series with no items, an empty axis,
 * delete value -9999, empty path and specification, the silent flag unset.
 * *series holds one reference. */
HOSTSERIES_API HRESULT HostSeriesCreate(IHostSeries **series);
/* Settings that only a host makes, on a series made by HostSeriesCreate. */
HOSTSERIES_API HRESULT HostSeriesSetSilent(IHostSeries *series, VARIANT_BOOL silent);

#endif /* HOSTSERIES_HOSTSERIES_H */
