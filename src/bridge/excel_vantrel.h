// SPDX-License-Identifier: MIT
// CExcelVantrel: the class a host creates and calls through IVantrel. It holds
// what must last between calls: the host object, the running workbook session
// and the lists a template carries beside the specification string. The
// import and export runs are its private operations.
#pragma once

#include <atomic>
#include <memory>
#include <string>
#include <vector>

#include "automation/automation.h"
#include "hostseries/hostseries.h"
#include "workbook/excel_obj.h"

class CExcelVantrel final : public IVantrel, public ISupportErrorInfo {
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

private:
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

    // The runs, each on an open workbook.
    bool CheckWorkbook(const std::string &spec, std::string &message);
    bool ReadSheets(const std::string &spec, std::string &message);
    bool WriteSeries(const std::string &spec);

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
};
