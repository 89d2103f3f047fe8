// SPDX-License-Identifier: MIT
// CExcelObj: the one way the system reaches a workbook. One object is one
// engine instance, at most one open workbook and one current worksheet; all
// cell traffic acts on the current worksheet.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "workbook/engine.h"

class CExcelObj {
public:
    // Makes the engine instance that StartExcel holds. Tests replace it to
    // see a start that fails.
    using ApplicationFactory = std::function<std::shared_ptr<workbook::Application>()>;
    static void SetApplicationFactory(ApplicationFactory factory);
    static void ResetApplicationFactory();

    CExcelObj() = default;
    virtual ~CExcelObj();
    CExcelObj(const CExcelObj &) = delete;
    CExcelObj &operator=(const CExcelObj &) = delete;

    bool StartExcel(std::string &error);
    bool OpenWorkbook(const std::string &path, std::string &error);
    bool CreateWorkbook(const std::string &path, std::string &error);
    // Only save == 1 saves before closing.
    bool CloseWorkbook(int save);
    bool QuitExcel();

    std::string GetExcelVersionText();
    int GetExcelVersion();
    int GetSheetCount();
    bool SelectSheet(int number, std::string &error);
    int GetSelectedSheet() const { return m_sheetIndex; }
    bool ClearSheet();
    bool AutoFitColumns();

private:
    std::shared_ptr<workbook::Application> m_app;
    std::shared_ptr<workbook::Workbook> m_workbook;
    std::shared_ptr<workbook::Workbooks> m_workbooks;
    std::shared_ptr<workbook::Worksheets> m_sheets;
    std::shared_ptr<workbook::Worksheet> m_sheet;
    int32_t m_sheetIndex = 0;  // set by StartExcel; 0 until a sheet is selected
};
