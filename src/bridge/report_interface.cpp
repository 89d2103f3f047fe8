// SPDX-License-Identifier: MIT
// IVantrelReport on the bridge object: the report of the last InspectWorkbook
// or ReadData, handed out as the host asks. Nothing thrown leaves it.
#include "automation/com_error.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"

HRESULT CExcelVantrel::GetWarnings(BSTR *warnings)
{
    if (!warnings) return E_POINTER;
    *warnings = nullptr;
    return automation::ComBoundary([&] {
        *warnings = automation::Bstr(m_report.WarningLines()).Detach();
        return S_OK;
    });
}

HRESULT CExcelVantrel::GetFailurePlace(LONG *sheet, LONG *row)
{
    if (!sheet || !row) return E_POINTER;
    *sheet = m_report.FailureSheet();
    *row = m_report.FailureRow();
    return S_OK;
}

HRESULT CExcelVantrel::GetOpenOutcome(VARIANT_BOOL *opened, BSTR *message)
{
    if (!opened || !message) return E_POINTER;
    *message = nullptr;
    *opened = m_report.WorkbookOpened() ? VARIANT_TRUE : VARIANT_FALSE;
    return automation::ComBoundary([&] {
        *message = automation::Bstr(m_report.OpenMessage()).Detach();
        return S_OK;
    });
}
