// SPDX-License-Identifier: MIT
// CSpecification: reads the settings of an import or export out of a
// specification string ("Key=Value;" pairs, no quoting). An object lives for
// one call and holds no settings between calls.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "specification/parsing_type.h"
#include "specification/records.h"

class CXmlTemplateDoc;

class CSpecification {
public:
    CSpecification() = default;
    virtual ~CSpecification() = default;

    // The key's text for 0 to 21; false and an empty text for any other number.
    bool GetKeyName(int key, std::string &name) const;

    // True if the key stands in the string; the value may be empty. The first
    // pair with the key wins. A failed call leaves value as it was.
    bool GetKeyValue(const std::string &spec, int key, std::string &value) const;

    // True if the key is a numeric one and stands in the string; the value is
    // the text's leading integer by the rules of atoi (0 when there is none).
    bool GetKeyValueInt(const std::string &spec, int key, int &value) const;

    // Where the date/time of a specification string stands. The first present
    // key of DateTimeCol (mode 0), TimeCol (mode 2) and DateCol (mode 1) gives
    // the column, the mode and the value of its format key (empty if absent);
    // with none of them column, mode and format stay as they were. columnCount
    // is always the column count of the format as it then stands. Always true.
    bool GetDateTimeLayout(const std::string &specification, int &column, int &columnCount,
                           int &mode, std::string &format) const;

    // The sheet list: sheet numbers from 1, appended in the order written,
    // duplicates kept. sheetCount bounds the numbers. On failure the numbers
    // appended so far stay in the list.
    // A list of more items or sheets than kMaxSheetEntries is refused, with
    // the reason in refusal when it is given.
    // GetSheetList reads the ExcelSheet key (absent: sheet 1) and parses it.
    static constexpr size_t kMaxSheetEntries = 100000;
    bool GetSheetList(const std::string &spec, int sheetCount, std::vector<int32_t> &sheets,
                      std::string *refusal = nullptr) const;
    // A text that is empty after trimming gives sheet 1.
    bool ParseSheetList(const std::string &text, int sheetCount, std::vector<int32_t> &sheets,
                        std::string *refusal = nullptr) const;
    // The string with the value of every ExcelSheet pair left out, for the
    // work done once a sheet, so that its key reads don't grow with the list.
    std::string WithoutSheetList(const std::string &spec) const;
    bool ParseSheetItem(const std::string &item, int sheetCount, std::vector<int32_t> &sheets) const;
    bool AppendAllSheets(int sheetCount, std::vector<int32_t> &sheets) const;
    bool AppendSheetRange(const std::string &item, int sheetCount, std::vector<int32_t> &sheets) const;
    bool AppendSheetNumber(const std::string &item, int sheetCount, std::vector<int32_t> &sheets) const;

    // ---- Records to strings ---------------------------------------------

    // The key's value as a record gives it; true if it gives one. value is
    // emptied first in any case.
    bool GetOpenKeyValue(const OpenSpecification &record, int key, std::string &value) const;
    bool GetSaveKeyValue(const SaveSpecification &record, int key, std::string &value) const;
    // Fill KeyValues from the record and join them; true if the string isn't empty.
    bool OpenSpecificationToString(const OpenSpecification &record, std::string &spec);
    bool SaveSpecificationToString(const SaveSpecification &record, std::string &spec);
    // KeyValues as "Key=Value;" pairs in key order; true if the string isn't empty.
    bool JoinKeyValues(std::string &spec) const;

    // ---- Templates --------------------------------------------------------

    // Does the string refer to a template? Only its first piece counts: it
    // does when that piece contains "TemplateFilePath"; path is then the
    // piece's text behind "=" (empty when there is none).
    bool GetTemplateReference(const std::string &spec, std::string &path) const;
    // Load a template into a record that holds the defaults; on failure error
    // gets the message and the record (and lists) may be partly filled.
    bool LoadOpenTemplate(const std::string &path, OpenSpecification &record, std::string &error);
    bool LoadSaveTemplate(const std::string &path, SaveSpecification &record, std::string &error);
    // Every attribute that the document has goes into its field; the open
    // reader also fills the lists and SelItems. The save reader stops at the
    // first missing required attribute and then returns false.
    bool ReadOpenTemplate(CXmlTemplateDoc &document, OpenSpecification &record);
    bool ReadSaveTemplate(CXmlTemplateDoc &document, SaveSpecification &record) const;
    // GlobalTime and GlobalDate parse as dates, and the rows are in order.
    bool CheckOpenSpecification(const OpenSpecification &record) const;
    bool CheckOpenRows(const OpenSpecification &record) const;
    // Header rows above the data and apart from the title row; error gets the
    // message of the last fault found.
    bool CheckSaveRows(const SaveSpecification &record, std::string &error) const;

    // Filled only when an open template is read.
    std::vector<std::string> ItemTitles;
    std::vector<std::string> ItemTypes;
    std::vector<std::string> ItemUnits;
    std::vector<std::string> ValueTypes;
    std::string SelItems;
    // Filled by the operations that build a string from a record or a dialog.
    std::map<PARSINGTYPE, std::string> KeyValues;
};
