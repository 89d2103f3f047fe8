/* SPDX-License-Identifier: MIT
 * A host written in C: it loads the module, makes the class through its class
 * object and calls it through the table of functions. Exits non-zero on any
 * failed check. */
#include <dlfcn.h>
#include <stdio.h>

#include "automation/automation.h"
#include "hostseries/hostseries.h"

static int failures = 0;
#define CHECK(cond)                                                   \
    do {                                                              \
        if (!(cond)) {                                                \
            fprintf(stderr, "%s:%d: failed: %s\n", __FILE__, __LINE__, #cond); \
            ++failures;                                               \
        }                                                             \
    } while (0)

static const CLSID clsid = {0x4C2698C4, 0x93A5, 0x4D02, {0x86, 0x42, 0xB1, 0xC2, 0x70, 0x5C, 0x53, 0x8F}};

typedef HRESULT (*GetClassObjectFn)(REFCLSID, REFIID, void **);
typedef HRESULT (*CanUnloadNowFn)(void);

int main(int argc, char **argv)
{
    void *module;
    GetClassObjectFn getClassObject;
    CanUnloadNowFn canUnloadNow;
    IClassFactory *factory = NULL;
    IVantrel *bridge = NULL;
    IHostSeries *series = NULL;
    SHORT exists = 5;

    if (argc < 2) return 2;
    module = dlopen(argv[1], RTLD_NOW);
    CHECK(module != NULL);
    if (!module) return 1;
    *(void **)&getClassObject = dlsym(module, "DllGetClassObject");
    *(void **)&canUnloadNow = dlsym(module, "DllCanUnloadNow");
    CHECK(getClassObject && canUnloadNow);

    CHECK(getClassObject(&clsid, &IID_IClassFactory, (void **)&factory) == S_OK);
    CHECK(factory->lpVtbl->CreateInstance(factory, NULL, &IID_IVantrel, (void **)&bridge) == S_OK);
    CHECK(canUnloadNow() == S_FALSE);

    CHECK(HostSeriesCreate(&series) == S_OK);
    CHECK(bridge->lpVtbl->SetHostSeries(bridge, series) == S_OK);
    CHECK(bridge->lpVtbl->NoOperation(bridge) == S_OK);
    CHECK(bridge->lpVtbl->FileExists(bridge, &exists) == S_OK);
    CHECK(exists == 0); /* the new series has an empty path */
    CHECK(bridge->lpVtbl->FileExists(bridge, NULL) == E_POINTER);

    CHECK(bridge->lpVtbl->Release(bridge) == 0);
    factory->lpVtbl->Release(factory);
    series->lpVtbl->Release(series);
    CHECK(canUnloadNow() == S_OK);
    dlclose(module);
    if (failures == 0) printf("c host: all checks passed\n");
    return failures == 0 ? 0 : 1;
}
