/* SPDX-License-Identifier: MIT
 * A host in plain C: it loads the module with dlopen, makes the bridge through
 * DllGetClassObject, hands it the host's own series object (plain_series.c),
 * imports a workbook and prints what came in.
 *
 *     vantrel_import_summary WORKBOOK SPECIFICATION [MODULE]
 *
 * Exit status 0 when the import worked, 1 when it failed (the reason on
 * stderr), 2 for wrong arguments or a module that doesn't load. */
#include <dlfcn.h>
#include <stdio.h>
#include <stdlib.h>

#include "automation/automation.h"
#include "hostseries/hostseries.h"
#include "plain_series.h"
#include "shell/shell.h"

/* {4C2698C4-93A5-4D02-8642-B1C2705C538F}, the bridge's class */
static const CLSID kBridgeClass = {0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};

/* UTF-16 to UTF-8 on a stream, for the texts the bridge gives. */
static void PrintText(FILE *out, const OLECHAR *text)
{
    for (; text && *text; ++text) {
        unsigned c = *text;
        if (c < 0x80) {
            fputc((int)c, out);
        } else if (c < 0x800) {
            fputc((int)(0xC0 | (c >> 6)), out);
            fputc((int)(0x80 | (c & 0x3F)), out);
        } else {
            fputc((int)(0xE0 | (c >> 12)), out);
            fputc((int)(0x80 | ((c >> 6) & 0x3F)), out);
            fputc((int)(0x80 | (c & 0x3F)), out);
        }
    }
}

static void PrintTime(DATE time)
{
    SYSTEMTIME parts;
    if (VariantTimeToSystemTime(time, &parts))
        printf("%04u-%02u-%02u %02u:%02u:%02u", parts.wYear, parts.wMonth, parts.wDay, parts.wHour, parts.wMinute,
               parts.wSecond);
    else
        printf("(no time)");
}

/* The bridge's message boxes, when the host isn't silent: here on stderr. */
static void ShowMessage(const char *text, const char *caption, unsigned type, void *context)
{
    fprintf((FILE *)context, "%s%s: %s\n", (type & MB_ICONMASK) == MB_ICONEXCLAMATION ? "warning: " : "", caption, text);
}

static void PrintSummary(IHostSeries *series)
{
    const LONG steps = PlainSeriesStepCount(series), items = PlainSeriesItemCount(series);
    const double missing = PlainSeriesDeleteValue(series);
    LONG i, k;
    printf("time steps: %ld", (long)steps);
    if (steps > 0) {
        printf(", from ");
        PrintTime(PlainSeriesTime(series, 0));
        printf(" to ");
        PrintTime(PlainSeriesTime(series, steps - 1));
    }
    printf("\nitems: %ld\n", (long)items);
    for (i = 0; i < items; ++i) {
        const PlainItemView item = PlainSeriesItem(series, i);
        LONG present = 0;
        double low = 0, high = 0, sum = 0;
        for (k = 0; k < item.count; ++k) {
            const double value = item.values[k];
            if (value == missing) continue;
            low = present == 0 || value < low ? value : low;
            high = present == 0 || value > high ? value : high;
            sum += value;
            ++present;
        }
        printf("%ld. \"", (long)i + 1);
        PrintText(stdout, item.title);
        printf("\" (item type %ld, unit %ld, value type %ld): %ld values, %ld missing", (long)item.itemType,
               (long)item.unit, (long)item.valueType, (long)item.count, (long)(item.count - present));
        if (present > 0) printf(", from %g to %g, mean %g", low, high, sum / (double)present);
        printf("\n");
    }
}

int main(int argc, char **argv)
{
    const char *modulePath = argc > 3 ? argv[3] : VANTREL_MODULE;
    void *module;
    HRESULT (*getClassObject)(REFCLSID, REFIID, void **);
    HRESULT (*canUnloadNow)(void);
    IClassFactory *factory = NULL;
    IVantrel *bridge = NULL;
    IHostSeries *series;
    HRESULT hr;

    if (argc < 3 || argc > 4) {
        fprintf(stderr, "usage: %s WORKBOOK SPECIFICATION [MODULE]\n", argv[0]);
        return 2;
    }
    SetMessageBoxHook(ShowMessage, stderr);
    module = dlopen(modulePath, RTLD_NOW | RTLD_LOCAL);
    if (!module) {
        fprintf(stderr, "cannot load the module: %s\n", dlerror());
        return 2;
    }
    *(void **)&getClassObject = dlsym(module, "DllGetClassObject");
    *(void **)&canUnloadNow = dlsym(module, "DllCanUnloadNow");
    if (!getClassObject || !canUnloadNow || FAILED(getClassObject(&kBridgeClass, &IID_IClassFactory, (void **)&factory)) ||
        FAILED(factory->lpVtbl->CreateInstance(factory, NULL, &IID_IVantrel, (void **)&bridge))) {
        fprintf(stderr, "%s makes no bridge\n", modulePath);
        if (factory) factory->lpVtbl->Release(factory);
        dlclose(module);
        return 2;
    }

    series = PlainSeriesCreate(argv[1], argv[2], VARIANT_FALSE);
    hr = series ? bridge->lpVtbl->SetHostSeries(bridge, series) : E_OUTOFMEMORY;
    if (SUCCEEDED(hr)) hr = bridge->lpVtbl->ReadData(bridge);
    if (SUCCEEDED(hr)) {
        PrintSummary(series);
    } else {
        /* The reason is the description of the thread's error info. */
        IErrorInfo *info = NULL;
        BSTR description = NULL;
        fprintf(stderr, "the import failed (0x%08X)", (unsigned)hr);
        if (GetErrorInfo(0, &info) == S_OK && info && SUCCEEDED(info->lpVtbl->GetDescription(info, &description))) {
            fputs(": ", stderr);
            PrintText(stderr, description);
        }
        fputc('\n', stderr);
        SysFreeString(description);
        if (info) info->lpVtbl->Release(info);
    }

    bridge->lpVtbl->Release(bridge);
    factory->lpVtbl->Release(factory);
    if (series) series->lpVtbl->Release(series);
    /* Every object is gone, so the module may go. */
    if (canUnloadNow() == S_OK) dlclose(module);
    SetMessageBoxHook(NULL, NULL);
    return SUCCEEDED(hr) ? 0 : 1;
}
