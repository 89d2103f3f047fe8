// SPDX-License-Identifier: MIT
// How the bridge tells the host what went wrong: the error info of the
// calling thread, and the host object's settings it reads for that.
#include "automation/com_ptr.h"
#include "automation/text.h"
#include "automation/values.h"
#include "bridge/excel_vantrel.h"
#include "module/identifiers.h"

HRESULT CExcelVantrel::ReportError(const std::string &text, HRESULT hr)
{
    automation::ComPtr<ICreateErrorInfo> create;
    if (SUCCEEDED(CreateErrorInfo(create.Out()))) {
        std::u16string description = automation::Utf8ToUtf16(text);
        std::u16string source = automation::Utf8ToUtf16(vantrel::kProgId);
        create->SetGUID(IID_IVantrel);
        create->SetDescription(description.data());
        create->SetSource(source.data());
        create->SetHelpContext(0);
        automation::ComPtr<IErrorInfo> info;
        if (SUCCEEDED(create.As(IID_IErrorInfo, info))) SetErrorInfo(0, info.Get());
    }
    return hr;
}

std::string CExcelVantrel::GetFilePathString() const
{
    automation::ComPtr<IHostConnection> connection;
    if (FAILED(m_series->GetConnection(connection.Out())) || !connection) return std::string();
    automation::Bstr path;
    if (FAILED(connection->GetFilePath(path.Out()))) return std::string();
    return path.Utf8();
}
