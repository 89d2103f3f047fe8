/* SPDX-License-Identifier: MIT
 *
 * A host's own time-series object, written in plain C: an IHostSeries with its
 * connection and its time axis, and IHostItem objects, each a small struct
 * with a function table, holding its times and values in plain arrays. */
#ifndef PLAIN_SERIES_H
#define PLAIN_SERIES_H

#include "hostseries/hostseries.h"

/* A new series with one reference, or NULL when memory runs out. path and
 * specification are UTF-8; silent says whether the bridge may show messages. */
IHostSeries *PlainSeriesCreate(const char *path, const char *specification, VARIANT_BOOL silent);

/* What the series holds now, for reading it without the interfaces. */
typedef struct PlainItemView {
    const OLECHAR *title; /* may be NULL */
    LONG itemType, unit, valueType, count;
    const double *values;
} PlainItemView;

LONG PlainSeriesStepCount(IHostSeries *series);
DATE PlainSeriesTime(IHostSeries *series, LONG step); /* step from 0 */
double PlainSeriesDeleteValue(IHostSeries *series);
LONG PlainSeriesItemCount(IHostSeries *series);
PlainItemView PlainSeriesItem(IHostSeries *series, LONG index); /* index from 0 */

#endif /* PLAIN_SERIES_H */
