// SPDX-License-Identifier: MIT
// The keys of the specification string. The numbers are also the order in
// which a built string writes its pairs.
#pragma once

enum PARSINGTYPE {
    DateCol = 0,
    TimeCol = 1,
    DateTimeCol = 2,
    DateFormat = 3,
    TimeFormat = 4,
    DateTimeFormat = 5,
    GlobalDate = 6,
    GlobalTime = 7,
    StartRow = 8,
    UnitTypeRow = 9,
    UnitRow = 10,
    GlobalUnitType = 11,
    GlobalUnit = 12,
    ValueTypeRow = 13,
    GlobalValueType = 14,
    ItemDescriptionRow = 15,
    DeleteValue = 16,
    DelValRow = 17,
    ExcelSheet = 18,
    TemplateFilePath = 19,
    SaveTemplateFilePath = 20,
    FilePath = 21,
};

// Bounds every loop over the key table.
inline constexpr int kParsingTypeCount = 22;
