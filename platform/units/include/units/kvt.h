/* SPDX-License-Identifier: MIT
 *
 * The host's units library: a catalogue of item types and of the units that
 * each item type allows.
 *
 * Item types and units have an integer identifier and a 1-based sequence
 * number (a unit's within its item type); the two never coincide, so code that
 * mixes them up fails. Every function but the two counts returns nonzero on
 * success. On failure, and when an out pointer is null, the function returns
 * 0 and writes no output. Text results are plain ASCII in static storage that
 * the library owns; they stay valid for the life of the process.
 */
#ifndef UNITS_KVT_H
#define UNITS_KVT_H

#if defined(__cplusplus)
#define UNITS_API extern "C" __attribute__((visibility("default")))
#else
#define UNITS_API extern __attribute__((visibility("default")))
#endif

/* Number of item types; sequence numbers run from 1 to it. */
UNITS_API int kvtGetItemTypeCount(void);
/* Identifier and display name of the item type with sequence number seq. */
UNITS_API int kvtGetItemTypeSeq(int seq, int *ident, const char **name);
/* Success says that ident is an item type identifier; text is its name. */
UNITS_API int kvtGetItemTypeIdent(int ident, const char **text);
/* Key text of an item type, the text an export writes. */
UNITS_API int kvtGetItemTypeKey(int ident, const char **text);
/* Number of units of an item type; 0 for an unknown identifier. */
UNITS_API int kvtGetItemUnitCount(int ident);
/* Identifier and display name of the unit with sequence number seq within
 * the item type ident. */
UNITS_API int kvtGetItemUnitSeq(int ident, int seq, int *unit, const char **name);
/* Key text of a unit, the text an export writes. */
UNITS_API int kvtGetUnitKey(int unit, const char **text);
/* Abbreviation of a unit, a second spelling that an import accepts. */
UNITS_API int kvtGetUnitAbbreviation(int unit, const char **text);

#endif /* UNITS_KVT_H */
