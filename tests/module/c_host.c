/* SPDX-License-Identifier: MIT
 * A host written in C: the platform's objects and the module, every call
 * through the function tables. Arguments: the module and a workbook path to
 * export to. Exits non-zero on any failed check. */
#include <dlfcn.h>
#include <stddef.h>
#include <stdio.h>
#include <string.h>

#include "automation/automation.h"
#include "bridge/vantrel_report.h"
#include "hostseries/hostseries.h"
#include "shell/shell.h"
#include "support/c_checks.h"

static const CLSID kBridge = {0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};
static const OLECHAR kText[] = {' ', '2', '.', '5', 0x00FC, 0};

static void ErrorInfoAndValues(void)
{
    ICreateErrorInfo *create = NULL;
    IErrorInfo *info = NULL, *taken = NULL;
    BSTR description = NULL;
    VARIANT v, w;
    SAFEARRAYBOUND bounds[2] = {{2, 1}, {3, 1}};
    LONG at[2] = {2, 3};

    CHECK_HR(S_OK, CreateErrorInfo(&create));
    CHECK_HR(S_OK, create->lpVtbl->SetDescription(create, (LPOLESTR)kText));
    CHECK_HR(S_OK, create->lpVtbl->QueryInterface(create, &IID_IErrorInfo, (void **)&info));
    CHECK_HR(S_OK, SetErrorInfo(0, info));
    CHECK_HR(S_OK, GetErrorInfo(0, &taken)); /* the slot's reference goes to the caller */
    CHECK(taken == info && taken->lpVtbl->Release(taken) == 2);
    CHECK_HR(S_FALSE, GetErrorInfo(0, &taken));
    CHECK_HR(S_OK, info->lpVtbl->GetDescription(info, &description));
    CHECK(((const UINT *)description)[-1] == 10 && memcmp(description, kText, sizeof kText) == 0);
    SysFreeString(description);
    CHECK(create->lpVtbl->Release(create) == 1 && info->lpVtbl->Release(info) == 0);

    v.vt = VT_BSTR;
    v.bstrVal = SysAllocString(kText);
    w.vt = VT_ARRAY | VT_VARIANT; /* rows by columns, the first varying fastest */
    w.parray = SafeArrayCreate(VT_VARIANT, 2, bounds);
    CHECK_HR(S_OK, SafeArrayPutElement(w.parray, at, &v));
    CHECK_HR(S_OK, VariantCopy(&v, &w)); /* deep: the copy's string is its own */
    CHECK(v.parray != w.parray && ((VARIANT *)v.parray->pvData)[5].bstrVal != ((VARIANT *)w.parray->pvData)[5].bstrVal);
    CHECK_HR(S_OK, VariantClear(&v));
    CHECK_HR(S_OK, VariantClear(&w));
}

/* What the message-box hook was given. */
typedef struct ShownMessages {
    int count;
    char text[1400], caption[64];
    unsigned type;
} ShownMessages;

static void RecordMessage(const char *text, const char *caption, unsigned type, void *context)
{
    ShownMessages *shown = (ShownMessages *)context;
    shown->count++;
    snprintf(shown->text, sizeof shown->text, "%s", text);
    snprintf(shown->caption, sizeof shown->caption, "%s", caption);
    shown->type = type;
}

/* A series with the path the export goes to. */
static IHostSeries *MakeSeries(const char *path)
{
    IHostSeries *series = NULL;
    IHostConnection *connection = NULL;
    OLECHAR wide[1024] = {0};
    BSTR text;
    size_t i;

    CHECK_HR(S_OK, HostSeriesCreate(&series));
    CHECK_HR(S_OK, series->lpVtbl->GetConnection(series, &connection));
    for (i = 0; path[i] && i < 1023; ++i) wide[i] = (OLECHAR)path[i];
    text = SysAllocString(wide);
    CHECK_HR(S_OK, connection->lpVtbl->SetFilePath(connection, text));
    SysFreeString(text);
    CHECK_HR(S_OK, HostSeriesSetSilent(series, VARIANT_TRUE));
    connection->lpVtbl->Release(connection);
    return series;
}

int main(int argc, char **argv)
{
    void *module;
    HRESULT (*getClassObject)(REFCLSID, REFIID, void **);
    HRESULT (*canUnloadNow)(void);
    IClassFactory *factory = NULL;
    IVantrel *bridge = NULL;
    IHostSeries *series;
    SHORT exists = 5;
    IVantrelReport *report = NULL;
    VARIANT_BOOL opened = VARIANT_TRUE;
    BSTR message = NULL;
    ShownMessages shown = {0, "", "", 99};
    char refused[1100], expected[1400];

    CHECK(sizeof(VARIANT) == 24 && offsetof(VARIANT, lVal) == 8 && sizeof(OLECHAR) == 2);
    ErrorInfoAndValues();
    if (argc != 3 || !(module = dlopen(argv[1], RTLD_NOW))) return 2;
    *(void **)&getClassObject = dlsym(module, "DllGetClassObject");
    *(void **)&canUnloadNow = dlsym(module, "DllCanUnloadNow");
    CHECK_HR(S_OK, getClassObject(&kBridge, &IID_IClassFactory, (void **)&factory));
    CHECK_HR(S_OK, factory->lpVtbl->CreateInstance(factory, NULL, &IID_IVantrel, (void **)&bridge));
    CHECK_HR(S_FALSE, canUnloadNow());

    remove(argv[2]);
    series = MakeSeries(argv[2]);
    CHECK_HR(S_OK, bridge->lpVtbl->SetHostSeries(bridge, series));
    CHECK_HR(S_OK, bridge->lpVtbl->WriteData(bridge));
    CHECK_HR(S_OK, bridge->lpVtbl->FileExists(bridge, &exists));
    CHECK(exists == 1);
    remove(argv[2]);
    series->lpVtbl->Release(series);
    /* A refused export, while the host never asked for silence, goes to the hook set from C. */
    snprintf(refused, sizeof refused, "%s.csv", argv[2]);
    series = MakeSeries(refused);
    CHECK_HR(S_OK, bridge->lpVtbl->SetHostSeries(bridge, series));
    SetMessageBoxHook(RecordMessage, &shown);
    CHECK_HR(E_FAIL, bridge->lpVtbl->WriteData(bridge));
    SetMessageBoxHook(NULL, NULL);
    MessageBoxA(NULL, "the default again", "c_host", MB_OK);
    CHECK(shown.count == 1 && shown.type == MB_OK && strcmp(shown.caption, "Excel Vantrel") == 0);
    snprintf(expected, sizeof expected, "%s would be an .xlsx workbook under the extension .csv: workbooks are "
             "written as .xlsx or .xlsm. Give the new workbook one of those extensions.", refused);
    CHECK(strcmp(shown.text, expected) == 0);
    /* The report tells why the read of a workbook that is gone failed. */
    CHECK_HR(E_FAIL, bridge->lpVtbl->ReadData(bridge));
    CHECK_HR(S_OK, bridge->lpVtbl->QueryInterface(bridge, &IID_IVantrelReport, (void **)&report));
    CHECK_HR(S_OK, report->lpVtbl->GetOpenOutcome(report, &opened, &message));
    CHECK(opened == VARIANT_FALSE && message && message[0] == 'E');
    SysFreeString(message);
    CHECK(report->lpVtbl->Release(report) == 1);
    CHECK(bridge->lpVtbl->Release(bridge) == 0);
    factory->lpVtbl->Release(factory);
    CHECK(series->lpVtbl->Release(series) == 0);
    CHECK_HR(S_OK, canUnloadNow());
    dlclose(module);
    return CHECK_RESULT();
}
