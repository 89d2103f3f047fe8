/* SPDX-License-Identifier: MIT
 *
 * The automation runtime: the plain C layout of the component object model
 * and of automation values (HRESULT, GUID, BSTR, VARIANT, SAFEARRAY, error
 * info), usable from C and C++ alike. Widths are fixed so that a module and a
 * host built by different compilers agree on every byte.
 *
 * Text at these calls is UTF-16 (OLECHAR); inside the system it is UTF-8, and
 * automation/text.h converts between the two.
 */
#ifndef AUTOMATION_AUTOMATION_H
#define AUTOMATION_AUTOMATION_H

#include <stddef.h>
#include <stdint.h>

#if defined(__cplusplus)
#define AUTOMATION_EXTERN_C extern "C"
#else
#define AUTOMATION_EXTERN_C extern
#endif

#define AUTOMATION_API AUTOMATION_EXTERN_C __attribute__((visibility("default")))
/* Marks the C++ helpers (namespace automation) that the library exports. */
#define AUTOMATION_CXX_API __attribute__((visibility("default")))

/* ---- Scalar types ------------------------------------------------------ */

typedef int32_t HRESULT;
typedef int32_t SCODE;
typedef int32_t LONG;
typedef uint32_t ULONG;
typedef int32_t INT;
typedef uint32_t UINT;
typedef int32_t BOOL;
typedef uint32_t DWORD;
typedef uint16_t WORD;
typedef uint16_t USHORT;
typedef int16_t SHORT;
typedef uint8_t BYTE;
typedef int8_t CHAR;
typedef float FLOAT;
typedef double DOUBLE;
typedef uint32_t LCID;
typedef int32_t DISPID;
typedef uint16_t VARTYPE;
typedef int16_t VARIANT_BOOL;
/* Days since 30 December 1899, the time of day as the fraction. */
typedef double DATE;

#if defined(__cplusplus)
typedef char16_t OLECHAR;
#else
typedef uint16_t OLECHAR;
#endif
typedef OLECHAR *BSTR;
typedef OLECHAR *LPOLESTR;
typedef const OLECHAR *LPCOLESTR;

#define VARIANT_TRUE ((VARIANT_BOOL)-1)
#define VARIANT_FALSE ((VARIANT_BOOL)0)

#ifndef TRUE
#define TRUE 1
#define FALSE 0
#endif

/* ---- Result codes ------------------------------------------------------ */

#define SUCCEEDED(hr) (((HRESULT)(hr)) >= 0)
#define FAILED(hr) (((HRESULT)(hr)) < 0)

#define S_OK ((HRESULT)0x00000000)
#define S_FALSE ((HRESULT)0x00000001)
#define E_NOTIMPL ((HRESULT)0x80004001)
#define E_NOINTERFACE ((HRESULT)0x80004002)
#define E_POINTER ((HRESULT)0x80004003)
#define E_ABORT ((HRESULT)0x80004004)
#define E_FAIL ((HRESULT)0x80004005)
#define E_UNEXPECTED ((HRESULT)0x8000FFFF)
#define E_ACCESSDENIED ((HRESULT)0x80070005)
#define E_OUTOFMEMORY ((HRESULT)0x8007000E)
#define E_INVALIDARG ((HRESULT)0x80070057)
#define CLASS_E_NOAGGREGATION ((HRESULT)0x80040110)
#define CLASS_E_CLASSNOTAVAILABLE ((HRESULT)0x80040111)
#define REGDB_E_CLASSNOTREG ((HRESULT)0x80040154)
#define CO_E_NOTINITIALIZED ((HRESULT)0x800401F0)
#define CO_E_CLASSSTRING ((HRESULT)0x800401F3)
#define RPC_E_CHANGED_MODE ((HRESULT)0x80010106)
#define DISP_E_UNKNOWNINTERFACE ((HRESULT)0x80020001)
#define DISP_E_MEMBERNOTFOUND ((HRESULT)0x80020003)
#define DISP_E_PARAMNOTFOUND ((HRESULT)0x80020004)
#define DISP_E_TYPEMISMATCH ((HRESULT)0x80020005)
#define DISP_E_UNKNOWNNAME ((HRESULT)0x80020006)
#define DISP_E_BADVARTYPE ((HRESULT)0x80020008)
#define DISP_E_EXCEPTION ((HRESULT)0x80020009)
#define DISP_E_OVERFLOW ((HRESULT)0x8002000A)
#define DISP_E_BADINDEX ((HRESULT)0x8002000B)
#define DISP_E_ARRAYISLOCKED ((HRESULT)0x8002000D)
#define DISP_E_BADPARAMCOUNT ((HRESULT)0x8002000E)

/* ---- GUID -------------------------------------------------------------- */

typedef struct GUID {
    uint32_t Data1;
    uint16_t Data2;
    uint16_t Data3;
    uint8_t Data4[8];
} GUID;
typedef GUID IID;
typedef GUID CLSID;

#if defined(__cplusplus)
typedef const GUID &REFGUID;
typedef const IID &REFIID;
typedef const CLSID &REFCLSID;
inline bool operator==(const GUID &a, const GUID &b)
{
    return a.Data1 == b.Data1 && a.Data2 == b.Data2 && a.Data3 == b.Data3 &&
           a.Data4[0] == b.Data4[0] && a.Data4[1] == b.Data4[1] && a.Data4[2] == b.Data4[2] &&
           a.Data4[3] == b.Data4[3] && a.Data4[4] == b.Data4[4] && a.Data4[5] == b.Data4[5] &&
           a.Data4[6] == b.Data4[6] && a.Data4[7] == b.Data4[7];
}
#else
typedef const GUID *REFGUID;
typedef const IID *REFIID;
typedef const CLSID *REFCLSID;
#endif

AUTOMATION_API const IID IID_IUnknown;
AUTOMATION_API const IID IID_IClassFactory;
AUTOMATION_API const IID IID_IDispatch;
AUTOMATION_API const IID IID_IErrorInfo;
AUTOMATION_API const IID IID_ICreateErrorInfo;
AUTOMATION_API const IID IID_ISupportErrorInfo;
AUTOMATION_API const IID IID_NULL;

/* ---- Variant types ----------------------------------------------------- */

enum VARENUM {
    VT_EMPTY = 0,
    VT_NULL = 1,
    VT_I2 = 2,
    VT_I4 = 3,
    VT_R4 = 4,
    VT_R8 = 5,
    VT_CY = 6,
    VT_DATE = 7,
    VT_BSTR = 8,
    VT_DISPATCH = 9,
    VT_ERROR = 10,
    VT_BOOL = 11,
    VT_VARIANT = 12,
    VT_UNKNOWN = 13,
    VT_I1 = 16,
    VT_UI1 = 17,
    VT_UI2 = 18,
    VT_UI4 = 19,
    VT_INT = 22,
    VT_UINT = 23,
    VT_ARRAY = 0x2000,
    VT_BYREF = 0x4000,
    VT_TYPEMASK = 0x0fff
};

typedef struct SAFEARRAYBOUND {
    ULONG cElements;
    LONG lLbound;
} SAFEARRAYBOUND;

/* Bounds stand in the order of the dimensions, the last one first, as the
 * automation runtime keeps them. The element type is kept in the four bytes
 * before the descriptor (FADF_HAVEVARTYPE). */
typedef struct SAFEARRAY {
    USHORT cDims;
    USHORT fFeatures;
    ULONG cbElements;
    ULONG cLocks;
    void *pvData;
    SAFEARRAYBOUND rgsabound[1];
} SAFEARRAY;

#define FADF_AUTO 0x0001
#define FADF_STATIC 0x0002
#define FADF_FIXEDSIZE 0x0010
#define FADF_BSTR 0x0100
#define FADF_UNKNOWN 0x0200
#define FADF_DISPATCH 0x0400
#define FADF_VARIANT 0x0800
#define FADF_HAVEVARTYPE 0x0080

#if defined(__cplusplus)
struct IUnknown;
struct IDispatch;
#else
typedef struct IUnknown IUnknown;
typedef struct IDispatch IDispatch;
#endif

typedef struct VARIANT VARIANT;
struct VARIANT {
    VARTYPE vt;
    WORD wReserved1;
    WORD wReserved2;
    WORD wReserved3;
    union {
        LONG lVal;
        BYTE bVal;
        SHORT iVal;
        FLOAT fltVal;
        DOUBLE dblVal;
        VARIANT_BOOL boolVal;
        SCODE scode;
        DATE date;
        BSTR bstrVal;
        INT intVal;
        UINT uintVal;
        USHORT uiVal;
        ULONG ulVal;
        CHAR cVal;
        int64_t cyVal;
#if defined(__cplusplus)
        ::IUnknown *punkVal;
        ::IDispatch *pdispVal;
#else
        IUnknown *punkVal;
        IDispatch *pdispVal;
#endif
        SAFEARRAY *parray;
        VARIANT *pvarVal;
        void *byref;
        struct {
            void *pvRecord;
            void *pRecInfo;
        } brecord;
    };
};
typedef VARIANT VARIANTARG;

/* Flags of VariantChangeType and of the date functions. */
#define VARIANT_NOVALUEPROP 0x01
#define VARIANT_ALPHABOOL 0x02
#define VAR_TIMEVALUEONLY 0x01
#define VAR_DATEVALUEONLY 0x02

/* The one locale of this runtime; see automation/locale.h. */
#define LOCALE_USER_DEFAULT ((LCID)0x0400)
#define LOCALE_SYSTEM_DEFAULT ((LCID)0x0800)

typedef struct DISPPARAMS {
    VARIANTARG *rgvarg; /* arguments in reverse order */
    DISPID *rgdispidNamedArgs;
    UINT cArgs;
    UINT cNamedArgs;
} DISPPARAMS;

typedef struct EXCEPINFO {
    WORD wCode;
    WORD wReserved;
    BSTR bstrSource;
    BSTR bstrDescription;
    BSTR bstrHelpFile;
    DWORD dwHelpContext;
    void *pvReserved;
    HRESULT(*pfnDeferredFillIn)(struct EXCEPINFO *);
    SCODE scode;
} EXCEPINFO;

#define DISPATCH_METHOD 0x1
#define DISPATCH_PROPERTYGET 0x2
#define DISPATCH_PROPERTYPUT 0x4
#define DISPID_PROPERTYPUT (-3)

typedef struct SYSTEMTIME {
    WORD wYear;
    WORD wMonth;
    WORD wDayOfWeek; /* 0 is Sunday */
    WORD wDay;
    WORD wHour;
    WORD wMinute;
    WORD wSecond;
    WORD wMilliseconds;
} SYSTEMTIME;

typedef struct UDATE {
    SYSTEMTIME st;
    USHORT wDayOfYear;
} UDATE;

/* ---- Interfaces -------------------------------------------------------- */

#if defined(__cplusplus)

struct ITypeInfo; /* type information is not offered: E_NOTIMPL */

struct IUnknown {
    virtual HRESULT QueryInterface(REFIID riid, void **ppvObject) = 0;
    virtual ULONG AddRef() = 0;
    virtual ULONG Release() = 0;
};

struct IClassFactory : IUnknown {
    virtual HRESULT CreateInstance(IUnknown *pUnkOuter, REFIID riid, void **ppvObject) = 0;
    virtual HRESULT LockServer(BOOL fLock) = 0;
};

struct IDispatch : IUnknown {
    virtual HRESULT GetTypeInfoCount(UINT *pctinfo) = 0;
    virtual HRESULT GetTypeInfo(UINT iTInfo, LCID lcid, ITypeInfo **ppTInfo) = 0;
    virtual HRESULT GetIDsOfNames(REFIID riid, LPOLESTR *rgszNames, UINT cNames, LCID lcid,
                                  DISPID *rgDispId) = 0;
    virtual HRESULT Invoke(DISPID dispIdMember, REFIID riid, LCID lcid, WORD wFlags,
                           DISPPARAMS *pDispParams, VARIANT *pVarResult, EXCEPINFO *pExcepInfo,
                           UINT *puArgErr) = 0;
};

struct IErrorInfo : IUnknown {
    virtual HRESULT GetGUID(GUID *pGUID) = 0;
    virtual HRESULT GetSource(BSTR *pBstrSource) = 0;
    virtual HRESULT GetDescription(BSTR *pBstrDescription) = 0;
    virtual HRESULT GetHelpFile(BSTR *pBstrHelpFile) = 0;
    virtual HRESULT GetHelpContext(DWORD *pdwHelpContext) = 0;
};

struct ICreateErrorInfo : IUnknown {
    virtual HRESULT SetGUID(REFGUID rguid) = 0;
    virtual HRESULT SetSource(LPOLESTR szSource) = 0;
    virtual HRESULT SetDescription(LPOLESTR szDescription) = 0;
    virtual HRESULT SetHelpFile(LPOLESTR szHelpFile) = 0;
    virtual HRESULT SetHelpContext(DWORD dwHelpContext) = 0;
};

struct ISupportErrorInfo : IUnknown {
    virtual HRESULT InterfaceSupportsErrorInfo(REFIID riid) = 0;
};

#else /* C: the same objects seen as a pointer to a table of functions */

typedef struct ITypeInfo ITypeInfo;
typedef struct IClassFactory IClassFactory;
typedef struct IErrorInfo IErrorInfo;
typedef struct ICreateErrorInfo ICreateErrorInfo;
typedef struct ISupportErrorInfo ISupportErrorInfo;

#define AUTOMATION_IUNKNOWN_METHODS(T)                                  \
    HRESULT (*QueryInterface)(T * This, REFIID riid, void **ppvObject); \
    ULONG (*AddRef)(T * This);                                          \
    ULONG (*Release)(T * This);

typedef struct IUnknownVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IUnknown)
} IUnknownVtbl;
struct IUnknown {
    const IUnknownVtbl *lpVtbl;
};

typedef struct IClassFactoryVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IClassFactory)
    HRESULT (*CreateInstance)(IClassFactory *This, IUnknown *pUnkOuter, REFIID riid,
                              void **ppvObject);
    HRESULT (*LockServer)(IClassFactory *This, BOOL fLock);
} IClassFactoryVtbl;
struct IClassFactory {
    const IClassFactoryVtbl *lpVtbl;
};

#define AUTOMATION_IDISPATCH_METHODS(T)                                                        \
    AUTOMATION_IUNKNOWN_METHODS(T)                                                             \
    HRESULT (*GetTypeInfoCount)(T * This, UINT * pctinfo);                                     \
    HRESULT (*GetTypeInfo)(T * This, UINT iTInfo, LCID lcid, ITypeInfo * *ppTInfo);            \
    HRESULT (*GetIDsOfNames)(T * This, REFIID riid, LPOLESTR * rgszNames, UINT cNames,          \
                             LCID lcid, DISPID * rgDispId);                                    \
    HRESULT (*Invoke)(T * This, DISPID dispIdMember, REFIID riid, LCID lcid, WORD wFlags,       \
                      DISPPARAMS * pDispParams, VARIANT * pVarResult, EXCEPINFO * pExcepInfo,  \
                      UINT * puArgErr);

typedef struct IDispatchVtbl {
    AUTOMATION_IDISPATCH_METHODS(IDispatch)
} IDispatchVtbl;
struct IDispatch {
    const IDispatchVtbl *lpVtbl;
};

typedef struct IErrorInfoVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IErrorInfo)
    HRESULT (*GetGUID)(IErrorInfo *This, GUID *pGUID);
    HRESULT (*GetSource)(IErrorInfo *This, BSTR *pBstrSource);
    HRESULT (*GetDescription)(IErrorInfo *This, BSTR *pBstrDescription);
    HRESULT (*GetHelpFile)(IErrorInfo *This, BSTR *pBstrHelpFile);
    HRESULT (*GetHelpContext)(IErrorInfo *This, DWORD *pdwHelpContext);
} IErrorInfoVtbl;
struct IErrorInfo {
    const IErrorInfoVtbl *lpVtbl;
};

typedef struct ICreateErrorInfoVtbl {
    AUTOMATION_IUNKNOWN_METHODS(ICreateErrorInfo)
    HRESULT (*SetGUID)(ICreateErrorInfo *This, REFGUID rguid);
    HRESULT (*SetSource)(ICreateErrorInfo *This, LPOLESTR szSource);
    HRESULT (*SetDescription)(ICreateErrorInfo *This, LPOLESTR szDescription);
    HRESULT (*SetHelpFile)(ICreateErrorInfo *This, LPOLESTR szHelpFile);
    HRESULT (*SetHelpContext)(ICreateErrorInfo *This, DWORD dwHelpContext);
} ICreateErrorInfoVtbl;
struct ICreateErrorInfo {
    const ICreateErrorInfoVtbl *lpVtbl;
};

typedef struct ISupportErrorInfoVtbl {
    AUTOMATION_IUNKNOWN_METHODS(ISupportErrorInfo)
    HRESULT (*InterfaceSupportsErrorInfo)(ISupportErrorInfo *This, REFIID riid);
} ISupportErrorInfoVtbl;
struct ISupportErrorInfo {
    const ISupportErrorInfoVtbl *lpVtbl;
};

#endif /* C view */

/* ---- Functions --------------------------------------------------------- */

/* Threads and apartments. */
#define COINIT_MULTITHREADED 0x0
#define COINIT_APARTMENTTHREADED 0x2
AUTOMATION_API HRESULT CoInitialize(void *pvReserved);
AUTOMATION_API HRESULT CoInitializeEx(void *pvReserved, DWORD dwCoInit);
AUTOMATION_API void CoUninitialize(void);

/* Strings: a BSTR points at UTF-16 text preceded by its length in bytes
 * (a 32-bit count) and followed by a 16-bit zero. */
AUTOMATION_API BSTR SysAllocString(const OLECHAR *psz);
AUTOMATION_API BSTR SysAllocStringLen(const OLECHAR *strIn, UINT ui);
AUTOMATION_API BSTR SysAllocStringByteLen(const char *psz, UINT len);
AUTOMATION_API INT SysReAllocString(BSTR *pbstr, const OLECHAR *psz);
AUTOMATION_API INT SysReAllocStringLen(BSTR *pbstr, const OLECHAR *psz, UINT len);
AUTOMATION_API void SysFreeString(BSTR bstrString);
AUTOMATION_API UINT SysStringLen(BSTR pbstr);
AUTOMATION_API UINT SysStringByteLen(BSTR bstr);

/* Variants. */
AUTOMATION_API void VariantInit(VARIANT *pvarg);
AUTOMATION_API HRESULT VariantClear(VARIANT *pvarg);
AUTOMATION_API HRESULT VariantCopy(VARIANT *pvargDest, const VARIANT *pvargSrc);
AUTOMATION_API HRESULT VariantChangeType(VARIANT *pvargDest, const VARIANT *pvarSrc,
                                         USHORT wFlags, VARTYPE vt);
AUTOMATION_API HRESULT VariantChangeTypeEx(VARIANT *pvargDest, const VARIANT *pvarSrc, LCID lcid,
                                           USHORT wFlags, VARTYPE vt);

/* Arrays. */
AUTOMATION_API SAFEARRAY *SafeArrayCreate(VARTYPE vt, UINT cDims, SAFEARRAYBOUND *rgsabound);
AUTOMATION_API SAFEARRAY *SafeArrayCreateVector(VARTYPE vt, LONG lLbound, ULONG cElements);
AUTOMATION_API HRESULT SafeArrayDestroy(SAFEARRAY *psa);
AUTOMATION_API HRESULT SafeArrayCopy(SAFEARRAY *psa, SAFEARRAY **ppsaOut);
AUTOMATION_API UINT SafeArrayGetDim(SAFEARRAY *psa);
AUTOMATION_API UINT SafeArrayGetElemsize(SAFEARRAY *psa);
AUTOMATION_API HRESULT SafeArrayGetLBound(SAFEARRAY *psa, UINT nDim, LONG *plLbound);
AUTOMATION_API HRESULT SafeArrayGetUBound(SAFEARRAY *psa, UINT nDim, LONG *plUbound);
AUTOMATION_API HRESULT SafeArrayGetVartype(SAFEARRAY *psa, VARTYPE *pvt);
AUTOMATION_API HRESULT SafeArrayLock(SAFEARRAY *psa);
AUTOMATION_API HRESULT SafeArrayUnlock(SAFEARRAY *psa);
AUTOMATION_API HRESULT SafeArrayAccessData(SAFEARRAY *psa, void **ppvData);
AUTOMATION_API HRESULT SafeArrayUnaccessData(SAFEARRAY *psa);
/* rgIndices holds one index a dimension, the first dimension first. */
AUTOMATION_API HRESULT SafeArrayGetElement(SAFEARRAY *psa, LONG *rgIndices, void *pv);
AUTOMATION_API HRESULT SafeArrayPutElement(SAFEARRAY *psa, LONG *rgIndices, void *pv);
AUTOMATION_API HRESULT SafeArrayPtrOfIndex(SAFEARRAY *psa, LONG *rgIndices, void **ppvData);

/* Error info of the calling thread. */
AUTOMATION_API HRESULT CreateErrorInfo(ICreateErrorInfo **pperrinfo);
AUTOMATION_API HRESULT SetErrorInfo(ULONG dwReserved, IErrorInfo *perrinfo);
AUTOMATION_API HRESULT GetErrorInfo(ULONG dwReserved, IErrorInfo **pperrinfo);

/* Dates, in the runtime's one locale (automation/locale.h). SystemTimeToVariantTime
 * and VariantTimeToSystemTime return nonzero on success. */
AUTOMATION_API INT SystemTimeToVariantTime(SYSTEMTIME *lpSystemTime, DATE *pvtime);
AUTOMATION_API INT VariantTimeToSystemTime(DATE vtime, SYSTEMTIME *lpSystemTime);
AUTOMATION_API HRESULT VarDateFromStr(LPCOLESTR strIn, LCID lcid, ULONG dwFlags, DATE *pdateOut);
AUTOMATION_API HRESULT VarBstrFromDate(DATE dateIn, LCID lcid, ULONG dwFlags, BSTR *pbstrOut);
AUTOMATION_API HRESULT VarUdateFromDate(DATE dateIn, ULONG dwFlags, UDATE *pudateOut);

/* Task memory, for strings that a callee hands to its caller. */
AUTOMATION_API void *CoTaskMemAlloc(size_t cb);
AUTOMATION_API void CoTaskMemFree(void *pv);

/* GUID text in the braced form {XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}. StringFromGUID2
 * returns the count of characters written with the terminating zero, or 0. */
AUTOMATION_API INT StringFromGUID2(REFGUID rguid, LPOLESTR lpsz, INT cchMax);
AUTOMATION_API HRESULT CLSIDFromString(LPCOLESTR lpsz, CLSID *pclsid);

#endif /* AUTOMATION_AUTOMATION_H */
