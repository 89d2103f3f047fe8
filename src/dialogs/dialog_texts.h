// SPDX-License-Identifier: MIT
// The texts the open dialog and its pages show: title, captions, labels,
// legends and the page titles of the tab control.
#pragma once

namespace vantrel::dialogs::texts {

inline constexpr const char *kOpenTitle = "GUIOpen Dialog";
inline constexpr const char *kWarningCaption = "Warning!";

// The window.
inline constexpr const char *kFilePath = "File Path:";
inline constexpr const char *kBrowse = "...";
inline constexpr const char *kNoTemplate = "No Template File";
inline constexpr const char *kUseTemplate = "Use Template File";
inline constexpr const char *kSaveTemplate = "Save Template File";
inline constexpr const char *kExcelSheets = "Excel Sheets:";
inline constexpr const char *kSheetsHint =
    "(empty for 1st sheet or comma separated list or range like start-end or all)";
inline constexpr const char *kOk = "OK";
inline constexpr const char *kCancel = "Cancel";
inline constexpr const char *kTimePageTitle = "Time description";
inline constexpr const char *kDataPageTitle = "Data description";
inline constexpr const char *kPreviewPageTitle = "Preview";

// The choosers.
inline constexpr const char *kWorkbookFilter = "Excel Files (*.xls *.xlsx *.xlsm);;All Files (*)";
inline constexpr const char *kWorkbookSuffix = "xls";
inline constexpr const char *kTemplateFilter = "XML Files (*.xml);;All Files (*)";
inline constexpr const char *kTemplateSuffix = "xml";

// The time page.
inline constexpr const char *kTimeHeading = "Date and Time Format";
inline constexpr const char *kDateAndTimeRadio = "Date and time values in one column or across multiple columns";
inline constexpr const char *kDateTimeColumn = "Date/time column:";
inline constexpr const char *kDateTimeFormatBox = "Date/time format";
inline constexpr const char *kDateTimeLegend = "Date/time format (Char | as column separation)";
inline constexpr const char *kSameDateRadio =
    "Same date for all values and time values in one column or across multiple columns";
inline constexpr const char *kDateValue = "Date value:";
inline constexpr const char *kTimeColumn = "Time column:";
inline constexpr const char *kTimeFormatBox = "Time format";
inline constexpr const char *kTimeLegend = "Time format (Char | as column separation)";
inline constexpr const char *kSameTimeRadio =
    "Same time for all values and date values in one column or across multiple columns";
inline constexpr const char *kTimeValue = "Time value:";
inline constexpr const char *kDateColumn = "Date column:";
inline constexpr const char *kDateFormatBox = "Date format";
inline constexpr const char *kDateLegend = "Date format (Char | as column separation)";

// The data page.
inline constexpr const char *kItemTypeGroup = "Item Type";
inline constexpr const char *kUnitGroup = "Unit:";
inline constexpr const char *kValueTypeGroup = "Value Type:";
inline constexpr const char *kDataGroup = "Data Description:";
inline constexpr const char *kSameItemType = "Use same Item Type for all items:";
inline constexpr const char *kItemTypeInRow = "Item Type in row:";
inline constexpr const char *kSameUnit = "Use same Unit for all items:";
inline constexpr const char *kUnitInRow = "Unit in row:";
inline constexpr const char *kSameValueType = "Use same Value Type for all items:";
inline constexpr const char *kValueTypeInRow = "Value Type in row:";
inline constexpr const char *kItemDescriptionRow = "Item Description row:";
inline constexpr const char *kDataStartRow = "Data start row:";
inline constexpr const char *kDeleteValueBox = "Delete Value is not empty cell";
inline constexpr const char *kUseDeleteValue = "Use Delete value:";
inline constexpr const char *kDeleteValueInRow = "Delete value in row:";

}  // namespace vantrel::dialogs::texts
