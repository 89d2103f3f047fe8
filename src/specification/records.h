// SPDX-License-Identifier: MIT
// The two records of all settings of a workbook layout: OpenSpecification for
// an import, SaveSpecification for an export. A record lives only between a
// template (or a dialog) and the specification string built from it. Field
// names equal the template attributes; flags are 0 or 1.
#pragma once

#include <string>

struct OpenSpecification {
    std::string ExcelSheet = "1";
    // 0 one date/time column, 1 a time column plus GlobalDate, 2 a date
    // column plus GlobalTime.
    int DataTimeType = 0;
    int DateTimeCol = 1;
    int UseDTFormat = 0;
    std::string DateTimeFormat = "YYYY MM DD HH mm ss";
    // "Error" marks a text that nobody gave; as a date it fails the checks.
    std::string GlobalDate = "Error";
    int TimeCol = 1;
    int UseTFormat = 0;
    std::string TimeFormat = "Error";
    std::string GlobalTime = "Error";
    int DateCol = 1;
    int UseDFormat = 0;
    std::string DateFormat = "Error";
    int UseUnitTypeRow = 1;
    int UseUnitTypeOption = -1;  // 2: neither the row nor the global key is written
    std::string GlobalUnitType = "Error";
    int UnitTypeRow = 1;
    int UseUnitRow = 1;
    int UseUnitOption = -1;
    std::string GlobalUnit = "Error";
    int UnitRow = 1;
    int UseValueTypeRow = 1;
    int UseValueTypeOption = -1;
    std::string GlobalValueType = "Error";
    int ValueTypeRow = 1;
    int ItemDescriptionRow = 2;
    int UseItemTitleOption = -1;  // 1: the title row is neither written nor tested
    int StartRow = 3;
    int UseDelValNotEmpty = 0;
    int UseDeleteValueRow = 1;
    std::string DeleteValue = "Error";
    int DeleteValueRow = 2;  // key DelValRow
};

struct SaveSpecification {
    int DateTimeCol = 1;
    int UseDTFormat = 0;
    std::string DateTimeFormat = "YYYY/MM/DD HH:mm:ss";
    int UnitTypeRow = 1;
    int UnitRow = 1;
    int ValueTypeRow = 1;
    int ItemDescriptionRow = 2;
    int StartRow = 3;
    int UseDelValNotEmpty = 0;
    int DeleteValueRow = 2;  // key DelValRow
};
