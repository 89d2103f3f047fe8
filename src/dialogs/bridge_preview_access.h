// SPDX-License-Identifier: MIT
// The preview of the open dialog reads a workbook as an import would, through
// the bridge's own session and private operations. This is the one door to
// them; the bridge names it its friend.
#pragma once

#include <string>
#include <vector>

#include "automation/values.h"
#include "bridge/excel_vantrel.h"

struct CBridgePreviewAccess {
    // The session an inspection left running; null when none runs.
    static CExcelObj *Session(CExcelVantrel &bridge);
    static IHostSeries *Series(CExcelVantrel &bridge);
    static bool ParseRowTime(SAFEARRAY *cells, const std::string &spec, automation::Variant &time);
    static void ApplyDeleteValue(CExcelVantrel &bridge, int dateTimeColumn, const std::string &spec);
    static bool ResolveTypesAndUnits(CExcelVantrel &bridge, const std::string &spec, int firstColumn,
                                     int columnCount, std::vector<int> &typeSequences,
                                     std::vector<int> &unitSequences);
    static bool ResolveValueTypes(CExcelVantrel &bridge, const std::string &spec, int firstColumn,
                                  int columnCount, std::vector<int> &valueTypes);
};
