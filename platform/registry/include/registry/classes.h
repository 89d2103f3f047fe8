/* SPDX-License-Identifier: MIT
 *
 * Lookups in the classes root that a host makes before it loads a module:
 * the class id a ProgID names, and the module that serves a class in process.
 * Results are HRESULTs; a class or ProgID that isn't registered gives
 * REGDB_E_CLASSNOTREG, a store that can't be read REGDB_E_READREGDB (and
 * RegistryLastFailure says why).
 */
#ifndef REGISTRY_CLASSES_H
#define REGISTRY_CLASSES_H

#include "registry/registry.h"

#ifndef REGDB_E_READREGDB
#define REGDB_E_READREGDB ((HRESULT)0x80040150)
#endif

/* The class id under "<progId>\CLSID"; CO_E_CLASSSTRING when its text isn't a
 * braced class id. */
REGISTRY_API HRESULT RegistryCLSIDFromProgID(const char *progId, CLSID *clsid);

/* The module path under "CLSID\{clsid}\InprocServer32", copied like
 * RegistryGetValue's text (REGISTRY_E_MORE_DATA when the buffer is small). */
REGISTRY_API HRESULT RegistryGetInprocServer(REFCLSID clsid, char *path, DWORD *size);

#endif /* REGISTRY_CLASSES_H */
