// SPDX-License-Identifier: MIT
// The operations of IVantrel: the session handling and the reporting around
// the import, inspection and export runs.
#include <exception>
#include <functional>
#include <new>

#include "automation/com_error.h"
#include "automation/com_ptr.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "bridge/export_layout.h"
#include "bridge/export_times.h"
#include "bridge/host_calls.h"
#include "bridge/spec_warnings.h"
#include "dialogs/open_dialog_runner.h"
#include "dialogs/save_dialog_runner.h"
#include "module/string_table.h"
#include "shell/shell.h"
#include "workbook/cell_text.h"
#include "workbook/limits.h"

using vantrel::bridge::HostCall;
using vantrel::bridge::HostObject;

namespace {

const char kEmptySpecification[] = "Specification string is empty!";

// Runs an operation's body so that nothing thrown leaves the object: the
// fault's text becomes the error info, and the session is ended so that the
// next call starts clean.
template <typename Body>
HRESULT Guarded(Body &&body, const std::function<void()> &endSession,
                const std::function<HRESULT(const std::string &, HRESULT)> &report)
{
    try {
        return body();
    } catch (const std::bad_alloc &) {
        endSession();
        return report("Out of memory.", E_OUTOFMEMORY);
    } catch (const std::exception &e) {
        endSession();
        return report(e.what(), E_FAIL);
    } catch (...) {
        endSession();
        return report("Unexpected failure.", E_FAIL);
    }
}

// Runs a dialog and, on OK, the operation that follows it. Whatever happens,
// the session ends here.
template <typename Run, typename Then>
HRESULT DialogThenOperation(Run &&run, Then &&then, const std::function<void()> &endSession,
                            const std::function<HRESULT(const std::string &, HRESULT)> &report)
{
    HRESULT hr = E_ABORT;
    try {
        std::string error;
        switch (run(error)) {
        case vantrel::dialogs::DialogOutcome::Confirmed: hr = then(); break;
        case vantrel::dialogs::DialogOutcome::Failed: hr = report(error, E_FAIL); break;
        case vantrel::dialogs::DialogOutcome::Cancelled: hr = E_ABORT; break;
        }
    } catch (const std::exception &e) {
        hr = report(e.what(), E_FAIL);
    } catch (...) {
        hr = report("Unexpected failure.", E_FAIL);
    }
    endSession();
    return hr;
}

// Whether every item's title fits in a cell the engine reads back; the
// message names the first that doesn't. Item types, units and value types
// are names of the catalogue and always fit.
bool CheckTitlesFit(IHostSeries &series, long itemCount, std::string &message)
{
    for (long i = 1; i <= itemCount; ++i) {
        automation::ComPtr<IHostItem> item;
        vantrel::bridge::HostObject(series.GetItem(automation::Variant::I4(LONG(i)).Raw(), item.Out()), item, "GetItem");
        automation::Bstr title;
        vantrel::bridge::HostCall(item->GetTitle(title.Out()), "GetTitle");
        const size_t bytes = workbook::StoredCellTextBytes(title.Utf8());
        if (bytes <= workbook::limits::kMaxCellTextBytes) continue;
        message = "The title of item " + std::to_string(i) + " takes " + std::to_string(bytes) +
                  " bytes in a cell, more than the " + std::to_string(workbook::limits::kMaxCellTextBytes) +
                  " a cell may hold. Shorten the title.";
        return false;
    }
    return true;
}

}  // namespace

HRESULT CExcelVantrel::SetHostSeries(IHostSeries *series)
{
    if (!series) return E_POINTER;
    m_series = series;
    return S_OK;
}

HRESULT CExcelVantrel::NoOperation() { return S_OK; }

HRESULT CExcelVantrel::FileExists(SHORT *exists)
{
    if (!exists) return E_POINTER;
    if (!m_series) return E_UNEXPECTED;
    return automation::ComBoundary([&] {
        const std::string path = GetFilePathString();
        *exists = (!path.empty() && PathFileExistsA(path.c_str()) == 1) ? 1 : 0;
        return S_OK;
    });
}

HRESULT CExcelVantrel::InspectWorkbook(SHORT *fits)
{
    if (!fits) return E_POINTER;
    if (!m_series) return E_UNEXPECTED;
    return Guarded([&] { return DoInspectWorkbook(fits); }, [&] { EndSession(); }, ReportError);
}

HRESULT CExcelVantrel::ReadData()
{
    if (!m_series) return E_UNEXPECTED;
    return Guarded([&] { return DoReadData(); }, [&] { EndSession(); }, ReportError);
}

HRESULT CExcelVantrel::WriteData()
{
    if (!m_series) return E_UNEXPECTED;
    return Guarded([&] { return DoWriteData(); }, [&] { EndSession(); }, ReportError);
}

HRESULT CExcelVantrel::OpenDialog()
{
    if (!m_series) return E_UNEXPECTED;
    // The dialog stores the string and path in the host object on OK; the
    // read takes them from there.
    return DialogThenOperation([&](std::string &error) { return vantrel::dialogs::RunOpenDialog(*m_series, *this, error); },
                               [&] { return static_cast<IVantrel *>(this)->ReadData(); },
                               [&] { EndSession(); }, ReportError);
}

HRESULT CExcelVantrel::SaveDialog()
{
    if (!m_series) return E_UNEXPECTED;
    return DialogThenOperation([&](std::string &error) { return vantrel::dialogs::RunSaveDialog(*m_series, *this, error); },
                               [&] { return static_cast<IVantrel *>(this)->WriteData(); },
                               [&] { EndSession(); }, ReportError);
}

// The connection of the host object, with its specification string.
IHostConnection &CExcelVantrel::Connection(automation::ComPtr<IHostConnection> &connection, std::string &spec)
{
    HostObject(m_series->GetConnection(connection.Out()), connection, "GetConnection");
    automation::Bstr specText;
    HostCall(connection->GetSpecification(specText.Out()), "GetSpecification");
    spec = specText.Utf8();
    return *connection.Get();
}

std::string CExcelVantrel::FilePath(IHostConnection &connection)
{
    automation::Bstr pathText;
    HostCall(connection.GetFilePath(pathText.Out()), "GetFilePath");
    return pathText.Utf8();
}

HRESULT CExcelVantrel::DoInspectWorkbook(SHORT *fits)
{
    *fits = VARIANT_TRUE;
    m_report.Reset();
    automation::ComPtr<IHostConnection> connection;
    std::string spec;
    Connection(connection, spec);
    VARIANT_BOOL silent = VARIANT_TRUE;  // silence is the default, also when the host doesn't say
    if (FAILED(connection->GetSilent(&silent))) silent = VARIANT_TRUE;
    m_silent = silent == VARIANT_TRUE ? 1 : 0;

    if (spec.empty()) return ReportError(kEmptySpecification, E_FAIL);
    // Expand a template reference; a template that fails to load fails the
    // inspection once the session runs.
    const bool templateLoaded = ExpandOpenTemplate(*connection.Get(), spec);
    vantrel::bridge::WarnAboutSpecification(spec, m_report);
    const std::string path = FilePath(*connection.Get());
    connection.Reset();

    std::string message;
    if (!EnsureSession(message) || !templateLoaded) {
        *fits = 0;
        return E_FAIL;
    }

    // A workbook that doesn't open is no verdict on the layout: the read that
    // follows reports it, and the report tells why.
    if (!m_excel->OpenWorkbook(path, message)) {
        m_report.OpenFailed(message);
    } else {
        m_report.Opened();
        const bool fitsLayout = CheckWorkbook(spec, message);
        m_excel->CloseWorkbook(0);
        if (!m_excel->SheetReadFailure().empty()) {
            m_report.OpenFailed(m_excel->SheetReadFailure());
        } else if (!fitsLayout) {
            *fits = 0;
            return E_FAIL;
        }
    }
    return S_OK;
}

HRESULT CExcelVantrel::DoReadData()
{
    m_report.Reset();
    std::string message;
    if (!EnsureSession(message)) return ReportError(message, E_FAIL);

    automation::ComPtr<IHostConnection> connection;
    std::string spec;
    Connection(connection, spec);
    m_itemTitles.clear();
    m_itemTypes.clear();
    m_itemUnits.clear();
    m_valueTypes.clear();
    m_selectedItems.clear();

    if (spec.empty()) return ReportError(kEmptySpecification, E_FAIL);
    // Expand a template reference; a template that fails leaves the string as it stood.
    ExpandOpenTemplate(*connection.Get(), spec);
    vantrel::bridge::WarnAboutSpecification(spec, m_report);
    const std::string path = FilePath(*connection.Get());
    // The items go first, so a run that fails leaves the object without items.
    HostCall(m_series->RemoveAllItems(), "RemoveAllItems");

    bool ok = m_excel->OpenWorkbook(path, message);
    if (!ok) m_report.OpenFailed(message);
    if (ok) {
        m_report.Opened();
        ok = ReadSheets(spec, message);
        m_excel->CloseWorkbook(0);
        if (!m_excel->SheetReadFailure().empty()) m_report.OpenFailed(message = m_excel->SheetReadFailure());
    }
    connection.Reset();
    EndSession();
    return ok ? S_OK : ReportError(message, E_FAIL);
}

HRESULT CExcelVantrel::RefuseExport(const std::string &message)
{
    ShowMessage(message);
    return ReportError(message, E_FAIL);
}

HRESULT CExcelVantrel::DoWriteData()
{
    m_report.Reset();
    automation::ComPtr<IHostConnection> connection;
    std::string spec, message;
    Connection(connection, spec);
    // Expand a template reference; an empty string takes the default layout.
    if (!ExpandSaveTemplate(*connection.Get(), spec, message)) return RefuseExport(message);
    const std::string path = FilePath(*connection.Get());
    connection.Reset();

    // Everything that decides whether the host object can be laid out is
    // checked before a workbook is made or opened, the kind of file first.
    if (!vantrel::bridge::CheckExportTarget(path, PathFileExistsA(path.c_str()) == 1, message)) return RefuseExport(message);
    LONG itemCount = 0;
    HostCall(m_series->GetItemCount(&itemCount), "GetItemCount");
    automation::ComPtr<IHostTimeAxis> axis;
    HostObject(m_series->GetTimeAxis(axis.Out()), axis, "GetTimeAxis");
    LONG stepCount = 0;
    HostCall(axis->GetStepCount(&stepCount), "GetStepCount");
    const long steps = stepCount > 0 ? long(stepCount) : 0;
    vantrel::bridge::ExportLayout layout;
    if (!vantrel::bridge::TakeExportLayout(spec, long(itemCount), steps, layout, message)) return RefuseExport(message);
    vantrel::bridge::ExportTimes times;
    times.times.reserve(size_t(steps));
    for (long t = 0; t < steps; ++t) {
        automation::Variant time, date;
        HostCall(axis->GetTime(LONG(t + 1), time.Out()), "GetTime");
        if (FAILED(VariantChangeType(date.Out(), &time.Raw(), 0, VT_DATE)))
            return RefuseExport("Time step " + std::to_string(t + 1) + " of the host object is no point in time.");
        times.times.push_back(date.Raw().date);
    }
    axis.Reset();
    if (!vantrel::bridge::CheckTimesReadBack(layout, times, message)) return RefuseExport(message);
    if (!CheckTitlesFit(*m_series, long(itemCount), message)) return RefuseExport(message);

    if (!EnsureSession(message)) return ReportError(message, E_FAIL);
    // Held from before the workbook is read until the session ends, after the
    // save: another export of the same workbook waits for this one.
    if (!m_excel->LockWorkbook(path, message)) {
        EndSession();
        return RefuseExport(message);
    }
    // A missing workbook is made in memory and goes to disk only whole, so a
    // run that fails leaves no file behind.
    const bool isNew = PathFileExistsA(path.c_str()) != 1;
    const bool ok = isNew ? m_excel->NewWorkbook(message) : m_excel->OpenWorkbook(path, message);
    if (!ok) {
        EndSession();
        return RefuseExport(message);
    }
    if (!m_excel->SelectSheet(1, message)) {
        m_excel->CloseWorkbook(0);
        EndSession();
        return RefuseExport(message);
    }
    WriteSeries(layout, times, isNew);
    if (isNew) {
        m_excel->SaveNewWorkbook(path);
        m_excel->CloseWorkbook(0);
    } else {
        m_excel->CloseWorkbook(1);
    }
    EndSession();
    return S_OK;
}

bool CExcelVantrel::EnsureSession(std::string &message)
{
    if (m_excel) return true;
    m_excel = std::make_unique<CExcelObj>();
    if (m_excel->StartExcel(message)) return true;
    ShowMessage(message);
    m_excel.reset();
    return false;
}

void CExcelVantrel::EndSession()
{
    if (!m_excel) return;
    try {
        m_excel->QuitExcel();
    } catch (...) {
        // Quitting only releases; a fault there leaves nothing to undo.
    }
    m_excel.reset();
}

void CExcelVantrel::ShowMessage(const std::string &text) const
{
    if (m_silent == 0)
        MessageBoxA(nullptr, text.c_str(), vantrel::LoadMessage(vantrel::kStringApplicationTitle).c_str(), MB_OK);
}
