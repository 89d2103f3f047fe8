// SPDX-License-Identifier: MIT
#include "dialogs/bridge_preview_access.h"

CExcelObj *CBridgePreviewAccess::Session(CExcelVantrel &bridge) { return bridge.m_excel.get(); }

IHostSeries *CBridgePreviewAccess::Series(CExcelVantrel &bridge) { return bridge.m_series; }

bool CBridgePreviewAccess::ParseRowTime(SAFEARRAY *cells, const std::string &spec, automation::Variant &time)
{
    return CExcelVantrel::ParseRowTime(cells, spec, time);
}

void CBridgePreviewAccess::ApplyDeleteValue(CExcelVantrel &bridge, int dateTimeColumn, const std::string &spec)
{
    bridge.ApplyDeleteValue(dateTimeColumn, spec);
}

bool CBridgePreviewAccess::ResolveTypesAndUnits(CExcelVantrel &bridge, const std::string &spec, int firstColumn,
                                                int columnCount, std::vector<int> &typeSequences,
                                                std::vector<int> &unitSequences)
{
    return bridge.ResolveTypesAndUnits(spec, firstColumn, columnCount, typeSequences, unitSequences);
}

bool CBridgePreviewAccess::ResolveValueTypes(CExcelVantrel &bridge, const std::string &spec, int firstColumn,
                                             int columnCount, std::vector<int> &valueTypes)
{
    return bridge.ResolveValueTypes(spec, firstColumn, columnCount, valueTypes);
}
