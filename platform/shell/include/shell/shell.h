/* SPDX-License-Identifier: MIT
 *
 * The platform's shell functions that the system uses: two path functions on
 * 8-bit paths and the plain message box. C layout, usable from C and C++.
 */
#ifndef SHELL_SHELL_H
#define SHELL_SHELL_H

#include "automation/automation.h"

#if defined(__cplusplus)
#define SHELL_API extern "C" __attribute__((visibility("default")))
#else
#define SHELL_API extern __attribute__((visibility("default")))
#endif

#ifndef MAX_PATH
#define MAX_PATH 260
#endif

/* Message box types and answers. Only the one OK button is offered; the icon
 * flags pick the box's icon. */
#ifndef MB_OK
#define MB_OK 0x00000000u
#endif
#ifndef MB_ICONERROR
#define MB_ICONERROR 0x00000010u
#define MB_ICONEXCLAMATION 0x00000030u
#define MB_ICONINFORMATION 0x00000040u
#define MB_ICONMASK 0x000000F0u
#endif
#ifndef IDOK
#define IDOK 1
#endif

/* 1 if the file or folder exists, else 0; a null or empty path gives 0. */
SHELL_API BOOL PathFileExistsA(const char *path);

/* Adds ext (".xml" when ext is null) to path, a buffer of MAX_PATH chars, when
 * the path has no extension yet. An extension is a '.' in the last path
 * component with no '/' and no blank after it. Returns 1 when the extension
 * was added; 0 when the path already has one, when path is null, or when the
 * result would not fit in MAX_PATH chars with its terminating zero, and then
 * the path is left unchanged. */
SHELL_API BOOL PathAddExtensionA(char *path, const char *ext);

/* Shows text with caption and waits until it is dismissed. owner is not used;
 * every type shows one OK button, and the answer is IDOK. A null text is empty;
 * a null caption is "Error". Where the text goes: shell/message_box.h. */
SHELL_API int MessageBoxA(void *owner, const char *text, const char *caption, unsigned type);

/* Receives one message box's text and caption (never null), its type (MB_OK
 * with an MB_ICON... flag) and the context given to SetMessageBoxHook. It runs
 * on the thread that shows the message; the texts last for the call only. */
typedef void (*MessageBoxHook)(const char *text, const char *caption, unsigned type, void *context);

/* Sends every message box of the process, the module's included, to hook
 * instead of stderr, replacing what was set before (from C or C++). A null
 * hook restores the default, stderr. */
SHELL_API void SetMessageBoxHook(MessageBoxHook hook, void *context);

#endif /* SHELL_SHELL_H */
