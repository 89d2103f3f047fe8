/* SPDX-License-Identifier: MIT
 *
 * The registry store: two trees of keys and values, each kept in a plain,
 * human-readable file under one root folder.
 *
 *   REGISTRY_CLASSES_ROOT  the classes root, where modules register their
 *                          classes, ProgIDs and type libraries (classes.reg)
 *   REGISTRY_HOST_TREE     the host application's own tree (host.reg); the
 *                          host's library reaches it, nobody else should
 *
 * The root folder, first match wins:
 *   1. the folder given to RegistrySetRootFolder in this process;
 *   2. the environment variable VANTREL_REGISTRY_ROOT (for tests and tools);
 *   3. $XDG_DATA_HOME/vantrel-registry, when XDG_DATA_HOME is absolute;
 *   4. $HOME/.local/share/vantrel-registry.
 *
 * A key path is a list of key names separated by backslashes ("CLSID\\{...}");
 * the empty path is the tree's root. Names of keys and of values compare
 * without regard to ASCII case and keep the case they were first written in.
 * A value name that is NULL or empty is the key's default value. Values are
 * UTF-8 text.
 *
 * Every change is one read-modify-write of the tree's file under a lock of
 * the root folder, written to a temporary file in the same folder and renamed
 * over the old one, so a reader never sees half a file. A file that can't be
 * read as a registry file is reported with REGISTRY_CORRUPT and left as it
 * is; RegistryLastFailure says which file and line.
 *
 * C layout, usable from C and C++. Results are the codes below.
 */
#ifndef REGISTRY_REGISTRY_H
#define REGISTRY_REGISTRY_H

#include "automation/automation.h"

#if defined(__cplusplus)
#define REGISTRY_API extern "C" __attribute__((visibility("default")))
#else
#define REGISTRY_API extern __attribute__((visibility("default")))
#endif

/* Results. */
#define REGISTRY_OK 0
#define REGISTRY_NOT_FOUND 2       /* no such key or value */
#define REGISTRY_BAD_ARGUMENT 87   /* null or malformed path, name or tree */
#define REGISTRY_HAS_SUBKEYS 145   /* RegistryDeleteKey on a key with subkeys */
#define REGISTRY_MORE_DATA 234     /* the buffer is too small; *size tells the need */
#define REGISTRY_NO_MORE_ITEMS 259 /* RegistryEnumKey past the last subkey */
#define REGISTRY_CORRUPT 1015      /* a tree's file can't be read as a registry file */
#define REGISTRY_IO_FAILED 1016    /* a file or the root folder can't be read or written */

/* REGISTRY_MORE_DATA as an HRESULT, for the functions that return HRESULTs. */
#define REGISTRY_E_MORE_DATA ((HRESULT)0x800700EA)

/* A C caller may pass any int; in C++ the fixed type makes every int a value
 * of the enum (as it is in C), so the functions can refuse it, not misread it. */
typedef enum RegistryTree
#ifdef __cplusplus
    : int
#endif
{
    REGISTRY_CLASSES_ROOT = 1,
    REGISTRY_HOST_TREE = 2
} RegistryTree;

/* Sets the root folder for this process; NULL or "" goes back to the
 * environment and the user's data folder. A relative folder is taken from the
 * current folder now. The folder is made at the first change. */
REGISTRY_API LONG RegistrySetRootFolder(const char *folder);

/* The root folder in force, as a zero-terminated path in buffer of *size
 * bytes. With REGISTRY_MORE_DATA or a NULL buffer, *size is set to the bytes
 * needed, the zero included. */
REGISTRY_API LONG RegistryGetRootFolder(char *buffer, DWORD *size);

/* Makes the key and any missing key above it; an existing key is no failure. */
REGISTRY_API LONG RegistryCreateKey(RegistryTree tree, const char *keyPath);

/* REGISTRY_OK when the key exists, REGISTRY_NOT_FOUND when it doesn't. */
REGISTRY_API LONG RegistryKeyExists(RegistryTree tree, const char *keyPath);

/* Stores text as the value; makes the key first when it is missing. */
REGISTRY_API LONG RegistrySetValue(RegistryTree tree, const char *keyPath, const char *valueName,
                                   const char *text);

/* Copies the value's text, zero-terminated, into buffer of *size bytes; *size
 * becomes the bytes used (or needed, with REGISTRY_MORE_DATA or a NULL
 * buffer), the zero included. A default value that was never set is
 * REGISTRY_NOT_FOUND. */
REGISTRY_API LONG RegistryGetValue(RegistryTree tree, const char *keyPath, const char *valueName,
                                   char *buffer, DWORD *size);

REGISTRY_API LONG RegistryDeleteValue(RegistryTree tree, const char *keyPath, const char *valueName);

/* Removes a key that has no subkeys, with its values. */
REGISTRY_API LONG RegistryDeleteKey(RegistryTree tree, const char *keyPath);

/* Removes a key with all its subkeys and values. */
REGISTRY_API LONG RegistryDeleteTree(RegistryTree tree, const char *keyPath);

/* The name of the index-th subkey (from 0, in case-insensitive name order),
 * copied like RegistryGetValue's text; REGISTRY_NO_MORE_ITEMS past the last. */
REGISTRY_API LONG RegistryEnumKey(RegistryTree tree, const char *keyPath, DWORD index, char *name,
                                  DWORD *size);

/* What went wrong in this thread's last failed call, in words ("" after a
 * call that succeeded). Valid until the thread's next registry call. */
REGISTRY_API const char *RegistryLastFailure(void);

#endif /* REGISTRY_REGISTRY_H */
