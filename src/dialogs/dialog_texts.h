// SPDX-License-Identifier: MIT
// The texts the open and save dialogs show: titles, captions, labels,
// legends, the page titles of the tab control, and the boxes of a template load.
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
// The open chooser offers every kind the engine reads, all of them first.
inline constexpr const char *kWorkbookFilter =
    "All Workbooks (*.xlsx *.xlsm *.xls *.ods *.csv *.tsv *.txt);;Workbook (*.xlsx);;"
    "Macro-Enabled Workbook (*.xlsm);;Binary Workbook (*.xls);;OpenDocument Spreadsheet (*.ods);;"
    "Delimited Text (*.csv *.tsv *.txt);;All Files (*)";
inline constexpr const char *kWorkbookSuffix = "xlsx";
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

// The save dialog.
inline constexpr const char *kSaveTitle = "GUI Save";
inline constexpr const char *kDataFormatGroup = "Data Format";
inline constexpr const char *kTimeSavedAs = "Date/time values shall be saved as:";
inline constexpr const char *kSaveDateTimeColumn = "Data/time column:";
inline constexpr const char *kMultipleColumns = "Date/time in multiple columns";
inline constexpr const char *kDescriptionSavedAs = "Data description shall be saved as:";
inline constexpr const char *kUnitTypeRow = "Unit Type row:";
inline constexpr const char *kValueTypeRow = "Value Type row:";
inline constexpr const char *kUnitRow = "Unit row:";
inline constexpr const char *kDeleteValueNotEmpty = "Delete Value is not empty cell:";
inline constexpr const char *kDeleteValueRow = "Delete Value row:";
inline constexpr const char *kPreviewGroup = "Preview";
// The save chooser offers what the engine writes.
inline constexpr const char *kNewWorkbookFilter = "Workbook (*.xlsx);;Macro-Enabled Workbook (*.xlsm)";
inline constexpr const char *kNewWorkbookSuffix = "xlsx";
inline constexpr const char *kOldWorkbookFilter = "Excel Files (*.xls);;All Files (*)";
inline constexpr const char *kOldWorkbookSuffix = "xls";

// The boxes of a template load in the open dialog (and of a save dialog that
// loads an open template whose data doesn't pass).
inline constexpr const char *kXmlCannotInitialise = "Can not initialize the xml!";
inline constexpr const char *kXmlCannotOpen = "Can not Open the xml file!";
inline constexpr const char *kXmlNotValid = "The xml File is not valid!";
inline constexpr const char *kXmlDataNotValid = "The data in the xml File is not valid!";

}  // namespace vantrel::dialogs::texts
