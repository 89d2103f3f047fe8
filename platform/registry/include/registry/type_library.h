/* SPDX-License-Identifier: MIT
 *
 * Type library registration in the classes root. A library is recorded under
 * "TypeLib\{libid}\<major>.<minor>" (version numbers in hex):
 *
 *   default value   the library's help string
 *   0\linux64       default value: the file that holds the library
 *   FLAGS           default value: "0"
 *   HELPDIR         default value: the folder of that file
 *
 * Results are HRESULTs; a store that can't be read or written gives
 * TYPE_E_REGISTRYACCESS, and RegistryLastFailure says why.
 */
#ifndef REGISTRY_TYPE_LIBRARY_H
#define REGISTRY_TYPE_LIBRARY_H

#include "registry/registry.h"

#ifndef TYPE_E_REGISTRYACCESS
#define TYPE_E_REGISTRYACCESS ((HRESULT)0x8002801C)
#endif
#ifndef TYPE_E_LIBNOTREGISTERED
#define TYPE_E_LIBNOTREGISTERED ((HRESULT)0x8002801D)
#endif

/* Records the library; an earlier record of the same version is replaced
 * whole. file must be a non-empty path; helpString may be NULL. */
REGISTRY_API HRESULT RegistryRegisterTypeLib(REFGUID libid, WORD verMajor, WORD verMinor,
                                             const char *file, const char *helpString);

/* Removes the record of that version, and the library's key once no version
 * is left. A version that isn't recorded is no failure: afterwards it isn't
 * there either way. */
REGISTRY_API HRESULT RegistryUnRegisterTypeLib(REFGUID libid, WORD verMajor, WORD verMinor);

/* The file recorded for the version, copied like RegistryGetValue's text;
 * TYPE_E_LIBNOTREGISTERED when there is none. */
REGISTRY_API HRESULT RegistryQueryPathOfTypeLib(REFGUID libid, WORD verMajor, WORD verMinor,
                                                char *path, DWORD *size);

#endif /* REGISTRY_TYPE_LIBRARY_H */
