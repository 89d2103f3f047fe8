/* SPDX-License-Identifier: MIT
 *
 * IVantrelReport: what the bridge can tell a host beyond the verdict of its
 * last InspectWorkbook, ReadData or WriteData, without changing IVantrel. A host reaches
 * it by QueryInterface on the bridge object. Plain C layout, usable from C and
 * C++; out strings are the caller's to free with SysFreeString.
 */
#ifndef VANTREL_BRIDGE_VANTREL_REPORT_H
#define VANTREL_BRIDGE_VANTREL_REPORT_H

#include "automation/automation.h"

/* {6E0B8A51-3C2D-4F7E-9A14-52D8C0B7E3F9} */
#define VANTREL_REPORT_IID_INIT {0x6E0B8A51, 0x3C2D, 0x4F7E, {0x9A, 0x14, 0x52, 0xD8, 0xC0, 0xB7, 0xE3, 0xF9}}

#if defined(__cplusplus)

inline constexpr IID IID_IVantrelReport = VANTREL_REPORT_IID_INIT;

struct IVantrelReport : IUnknown {
    /* The warnings of the last run, one a line ("" when none): what was read
     * other than the workbook shows it, each naming the place and what to do. */
    virtual HRESULT GetWarnings(BSTR *warnings) = 0;
    /* Where a failure about a time step stands: the sheet and its row, both 0
     * when the last run had none. */
    virtual HRESULT GetFailurePlace(LONG *sheet, LONG *row) = 0;
    /* Whether the last run opened its workbook (VARIANT_TRUE) and, when an
     * open failed, its message with the reason; "" when no open failed. */
    virtual HRESULT GetOpenOutcome(VARIANT_BOOL *opened, BSTR *message) = 0;
};

#else /* C view */

static const IID IID_IVantrelReport __attribute__((unused)) = VANTREL_REPORT_IID_INIT;

typedef struct IVantrelReport IVantrelReport;
typedef struct IVantrelReportVtbl {
    AUTOMATION_IUNKNOWN_METHODS(IVantrelReport)
    HRESULT (*GetWarnings)(IVantrelReport *This, BSTR *warnings);
    HRESULT (*GetFailurePlace)(IVantrelReport *This, LONG *sheet, LONG *row);
    HRESULT (*GetOpenOutcome)(IVantrelReport *This, VARIANT_BOOL *opened, BSTR *message);
} IVantrelReportVtbl;
struct IVantrelReport {
    const IVantrelReportVtbl *lpVtbl;
};

#endif /* C view */

#endif /* VANTREL_BRIDGE_VANTREL_REPORT_H */
