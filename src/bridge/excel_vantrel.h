// SPDX-License-Identifier: MIT
// CExcelVantrel: the class a host creates and calls through IVantrel. It holds
// what must last between calls: the host object, the running workbook session
// and the lists a template carries beside the specification string. The
// import and export runs are its private operations.
#pragma once

#include <atomic>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "automation/automation.h"
#include "automation/com_ptr.h"
#include "bridge/run_report.h"
#include "bridge/vantrel_report.h"
#include "hostseries/hostseries.h"
#include "workbook/excel_obj.h"

namespace vantrel::bridge {
struct ExportLayout;
struct ExportTimes;
struct SheetLayout;
}

class CExcelVantrel final : public IVantrel, public ISupportErrorInfo, public IVantrelReport {
public:
    // Creates an object, plain (outer null) or aggregated (outer given and
    // riid IID_IUnknown), and hands out riid.
    static HRESULT CreateInstance(IUnknown *outer, REFIID riid, void **object);

    // IUnknown: delegates to the controlling unknown.
    HRESULT QueryInterface(REFIID riid, void **object) override;
    ULONG AddRef() override;
    ULONG Release() override;

    // IDispatch: the eight operations by name; no type information.
    HRESULT GetTypeInfoCount(UINT *count) override;
    HRESULT GetTypeInfo(UINT index, LCID lcid, ITypeInfo **info) override;
    HRESULT GetIDsOfNames(REFIID riid, LPOLESTR *names, UINT count, LCID lcid,
                          DISPID *ids) override;
    HRESULT Invoke(DISPID id, REFIID riid, LCID lcid, WORD flags, DISPPARAMS *params,
                   VARIANT *result, EXCEPINFO *exception, UINT *argError) override;

    // IVantrel
    HRESULT SetHostSeries(IHostSeries *series) override;
    HRESULT FileExists(SHORT *exists) override;
    HRESULT InspectWorkbook(SHORT *fits) override;
    HRESULT NoOperation() override;
    HRESULT ReadData() override;
    HRESULT WriteData() override;
    HRESULT OpenDialog() override;
    HRESULT SaveDialog() override;

    // ISupportErrorInfo
    HRESULT InterfaceSupportsErrorInfo(REFIID riid) override;

    // IVantrelReport: what the last InspectWorkbook or ReadData has to tell
    HRESULT GetWarnings(BSTR *warnings) override;
    HRESULT GetFailurePlace(LONG *sheet, LONG *row) override;
    HRESULT GetOpenOutcome(VARIANT_BOOL *opened, BSTR *message) override;

private:
    // Tests reach the runs and the template lists through it.
    friend struct CExcelVantrelProbe;
    // The open dialog's preview reads through the session and the runs' steps.
    friend struct CBridgePreviewAccess;

    explicit CExcelVantrel(IUnknown *outer);
    ~CExcelVantrel();

    // The unknown that owns the object's identity and count when aggregated.
    struct InnerUnknown : IUnknown {
        CExcelVantrel *self = nullptr;
        HRESULT QueryInterface(REFIID riid, void **object) override;
        ULONG AddRef() override;
        ULONG Release() override;
    };

    // The operations' bodies; they may throw from the workbook layer.
    HRESULT DoInspectWorkbook(SHORT *fits);
    HRESULT DoReadData();
    HRESULT DoWriteData();
    // An export refused before anything was touched: the message box (unless
    // silent) and the error info.
    HRESULT RefuseExport(const std::string &message);
    // The host object's connection and specification string, and its file
    // path; a host call that fails raises ComError.
    IHostConnection &Connection(automation::ComPtr<IHostConnection> &connection, std::string &spec);
    static std::string FilePath(IHostConnection &connection);

    // The runs, each on an open workbook.
    bool CheckWorkbook(const std::string &spec, std::string &message);
    bool ReadSheets(const std::string &spec, std::string &message);
    // Lays the host object out on the current sheet, by a layout that passed its checks.
    // The times are those the layout's check made the cells of; a new
    // workbook is one of the default cell format.
    void WriteSeries(const vantrel::bridge::ExportLayout &layout, const vantrel::bridge::ExportTimes &times,
                     bool newWorkbook);

    // Warnings about cells that the read passes over: rows below a blank
    // date/time cell, and columns right of an empty column.
    void WarnAboutUnreadCells(int firstRow, int rowCount, const UsedColumns &used);
    // Stored numbers that no cell holds, read as #NUM!: the first and how many.
    void WarnAboutUnreadableNumbers();
    // The sheet the runs stand on, for the report.
    int CurrentSheet() const;

    // ---- Item attributes (item_attributes.cpp) ----
    // Identifiers of the units library, or -1; a value type number, or -1.
    static int LookupItemType(const VARIANT &value);
    static int LookupUnit(int itemType, const VARIANT &value);
    static int LookupValueType(const VARIANT &value);
    // Append one entry a column; false when a column's attribute doesn't resolve.
    bool ResolveItemTypes(const std::string &spec, int firstColumn, int columnCount,
                          std::vector<int> &itemTypes);
    bool ResolveUnits(const std::string &spec, int firstColumn, int columnCount,
                      const std::vector<int> &itemTypes, std::vector<int> &units);
    bool ResolveValueTypes(const std::string &spec, int firstColumn, int columnCount,
                           std::vector<int> &valueTypes);
    // What made the last resolver above give false, for the report.
    void NoteUnresolved(const char *attribute, const char *source, int row, int column, const VARIANT &value);
    void NoteWrongCount(const char *attribute, int row, int column, int filled, int columnCount);
    // The sequence numbers that the host takes; -1 for a unit left unresolved.
    bool ResolveTypesAndUnits(const std::string &spec, int firstColumn, int columnCount,
                              std::vector<int> &typeSequences, std::vector<int> &unitSequences);

    // ---- Sheet inspection (sheet_inspection.cpp); they speak by message box ----
    bool InspectSheet(int sheet, const std::string &spec);
    bool CheckDateTimeColumns(int firstRow, int rowCount, const vantrel::bridge::SheetLayout &layout);
    bool CheckDataColumns(int firstRow, int rowCount, int firstColumn, int columnCount);
    bool CheckTypesAndUnits(const std::string &spec, int firstColumn, int columnCount);
    bool CheckValueTypes(const std::string &spec, int firstColumn, int columnCount);
    bool CheckSheetsShareTime(const std::vector<int32_t> &sheets, const std::string &spec);
    // The cells of one row's date/time columns to a point in time.
    static bool ParseRowTime(SAFEARRAY *cells, const std::string &spec, automation::Variant &time);

    // ---- Import read (import_read.cpp) ----
    bool ReadTimeAxis(const std::string &spec, std::string &message);
    bool ReadSheetItems(const std::string &spec, std::string &message);
    void ApplyDeleteValue(int dateTimeColumn, const std::string &spec);
    // The delete value cell of the current sheet (DelValRow), as a 32-bit float;
    // told to the report, so that sheets whose cells differ are told.
    std::optional<float> ReadDeleteValueCell(int dateTimeColumn, const std::string &spec);
    // The template's selected item numbers (0-based); false when none.
    bool ParseSelectedItems(std::vector<int32_t> &items) const;

    // ---- Export write (export_write.cpp) ----
    bool WriteDeleteValueCell(int row, int col);
    bool CollectDataTypes(int itemCount, std::vector<ItemDataType> &types);
    bool CollectTitles(const std::string &format, int itemCount, std::vector<std::string> &titles);

    // ---- Template references (template_expansion.cpp) ----
    // Replace a string that names a template by the template's settings and
    // store it back in the host object; false when a named template didn't load.
    bool ExpandOpenTemplate(IHostConnection &connection, std::string &spec);
    // A save template that doesn't load leaves the string and the host object
    // as they were, and gives false with the reason.
    bool ExpandSaveTemplate(IHostConnection &connection, std::string &spec, std::string &message);

    // Starts a session when none runs; on failure shows the message (when not
    // silent), ends the half-made session and returns false with the message.
    bool EnsureSession(std::string &message);
    void EndSession();

    void ShowMessage(const std::string &text) const;
    static HRESULT ReportError(const std::string &text, HRESULT hr);

    std::string GetFilePathString() const;

    InnerUnknown m_inner;
    IUnknown *m_outer;  // &m_inner when not aggregated
    std::atomic<ULONG> m_refs{0};

    IHostSeries *m_series = nullptr;  // not counted: the host keeps it alive
    std::unique_ptr<CExcelObj> m_excel;
    int m_silent = 0;
    std::vector<std::string> m_itemTitles;
    std::vector<std::string> m_itemTypes;
    std::vector<std::string> m_itemUnits;
    std::vector<std::string> m_valueTypes;
    std::string m_selectedItems;
    // What the last InspectWorkbook or ReadData has to tell beyond its verdict.
    vantrel::bridge::RunReport m_report;
    vantrel::bridge::UnresolvedAttribute m_unresolved;
};
