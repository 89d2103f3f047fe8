// SPDX-License-Identifier: MIT
// The session half of CExcelObj: start, open, create, close, quit and the
// choice of the current worksheet.
#include <cstdlib>
#include <exception>

#include "workbook/live_reference.h"
#include "module/string_table.h"
#include "workbook/excel_obj.h"

using vantrel::Live;

namespace {

CExcelObj::ApplicationFactory &Factory()
{
    static CExcelObj::ApplicationFactory factory = workbook::CreateApplication;
    return factory;
}

}  // namespace

void CExcelObj::SetApplicationFactory(ApplicationFactory factory) { Factory() = std::move(factory); }

void CExcelObj::ResetApplicationFactory() { Factory() = workbook::CreateApplication; }

CExcelObj::~CExcelObj()
{
    // Releases only; closing and quitting are the caller's work.
    m_sheet.reset();
    m_sheets.reset();
    m_workbooks.reset();
    m_workbook.reset();
    m_app.reset();
}

bool CExcelObj::StartExcel(std::string &error)
{
    try {
        m_app = Factory()();
    } catch (const std::exception &) {
        m_app.reset();
    }
    if (!m_app) {
        error = vantrel::LoadMessage(119);
        return false;
    }
    m_sheetIndex = 0;
    return true;
}

bool CExcelObj::OpenWorkbook(const std::string &path, std::string &error)
{
    m_sheetReadFailure.clear();
    try {
        m_workbooks = Live(m_app).GetWorkbooks();
        m_workbook = Live(m_workbooks).Open(path);
    } catch (const std::exception &e) {
        // The engine's reason (the file, the part, the cause) on a line of its own.
        error = vantrel::LoadMessage(121);
        if (*e.what()) error += std::string("\n") + e.what();
        return false;
    }
    m_sheets = Live(m_workbook).GetWorksheets();
    return true;
}

bool CExcelObj::CreateWorkbook(const std::string &path, std::string &error)
{
    try {
        m_workbooks = Live(m_app).GetWorkbooks();
        m_workbook = Live(m_workbooks).Add(automation::Variant::Missing().Raw());
        Live(m_workbook).SaveAs(path);
        Live(m_workbooks).Close();
    } catch (const std::exception &) {
        error = vantrel::LoadMessage(120);
        return false;
    }
    return true;
}

bool CExcelObj::NewWorkbook(std::string &error)
{
    try {
        m_workbooks = Live(m_app).GetWorkbooks();
        m_workbook = Live(m_workbooks).Add(automation::Variant::Missing().Raw());
        m_sheets = Live(m_workbook).GetWorksheets();
    } catch (const std::exception &) {
        error = vantrel::LoadMessage(120);
        return false;
    }
    return true;
}

void CExcelObj::SaveNewWorkbook(const std::string &path)
{
    try {
        Live(m_workbook).SaveAs(path);
    } catch (const std::exception &) {
        throw automation::ComError(E_FAIL, vantrel::LoadMessage(120));
    }
}

bool CExcelObj::LockWorkbook(const std::string &path, std::string &error)
{
    try {
        m_saveLock = std::make_unique<workbook::SaveLock>(path);
    } catch (const std::exception &e) {
        error = e.what();
        return false;
    }
    return true;
}

bool CExcelObj::CloseWorkbook(int save)
{
    if (save == 1) Live(m_workbook).Save();
    Live(m_workbook).Close(false);
    return true;
}

bool CExcelObj::QuitExcel()
{
    m_sheet.reset();
    m_sheets.reset();
    m_workbook.reset();
    m_workbooks.reset();
    if (m_app) {
        m_app->Quit();
        m_app.reset();
    }
    m_saveLock.reset();
    return true;
}

std::string CExcelObj::GetExcelVersionText() { return Live(m_app).Version(); }

int CExcelObj::GetExcelVersion() { return std::atoi(GetExcelVersionText().c_str()); }

int CExcelObj::GetSheetCount() { return Live(m_sheets).Count(); }

bool CExcelObj::SelectSheet(int number, std::string &error)
{
    if (number > Live(m_sheets).Count()) {
        error = vantrel::LoadMessage(122);
        return false;
    }
    try {
        m_sheet = Live(m_sheets).Item(number);
        // The engine reads a sheet when it is first used: a sheet that can't
        // be read keeps the workbook from opening, as it did when all were read at once.
        Live(m_sheet).UsedRange();
    } catch (const std::exception &e) {
        m_sheet.reset();
        error = vantrel::LoadMessage(121);
        if (*e.what()) error += std::string("\n") + e.what();
        m_sheetReadFailure = error;
        return false;
    }
    m_sheetIndex = number;
    return true;
}

bool CExcelObj::ClearSheet()
{
    // The whole sheet, not just its used range: merged ranges, comments,
    // tables and the like would otherwise stay over the new data.
    Live(m_sheet).Clear();
    return true;
}

bool CExcelObj::AutoFitColumns()
{
    Live(m_sheet).UsedRange()->Columns()->AutoFit();
    return true;
}
