// SPDX-License-Identifier: MIT
// COpenPreview: what the preview page of the open dialog shows and how it is
// read. The upper list holds the raw cells of the first selected sheet as the
// workbook shows them; the lower list the same sheet as an import reads it
// under the present settings. Both show the first rows only. The page widget
// draws the two lists; everything else happens here.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

class CExcelVantrel;

namespace vantrel::dialogs {

// A list in report view: columns with headings, lines of texts.
struct PreviewList {
    struct Column {
        std::string heading;
        double widthShare = 0.0;  // of the list's width
    };
    std::vector<Column> columns;
    std::vector<std::vector<std::string>> lines;

    void Clear();
    // Inserts a column at place (clamped to the end); the lines get an empty cell.
    void InsertColumn(size_t place, const std::string &heading, double widthShare);
    // Inserts an empty line at place (clamped to the end).
    void InsertLine(size_t place);
    // Does nothing for a line or column that doesn't exist.
    void SetText(size_t line, size_t column, const std::string &text);
};

class COpenPreview {
public:
    // Both lists show at most this many rows of the sheet.
    static constexpr int kRowLimit = 20;

    void SetPreviewSource(CExcelVantrel &bridge, const std::string &specification);
    // A new file or first sheet makes the upper list out of date; the same
    // pair again changes nothing.
    void SetPreviewFile(const std::string &path, int32_t sheet);

    // Inspects the workbook through the bridge, rebuilds the upper list when
    // it is out of date and, when the inspection passed, the lower list. True
    // if the lower list was filled.
    bool RefreshPreview();

    bool FillSheetList(int limit);
    bool FillResultList(int limit);
    bool FillResultColumns(std::string &error, int limit);
    bool FillTimeColumn(std::string &error, int limit);
    bool FillItemColumns(std::string &error, int limit);

    const PreviewList &SheetList() const { return m_sheetList; }
    const PreviewList &ResultList() const { return m_resultList; }
    const std::string &FilePathShown() const { return m_filePathShown; }
    int32_t SheetShown() const { return m_sheetShown; }
    bool SheetListDone() const { return m_sheetListDone != 0; }

private:
    std::string m_filePathShown;
    int32_t m_sheetShown = 0;
    int m_sheetListDone = 0;
    PreviewList m_sheetList;
    CExcelVantrel *m_bridge = nullptr;
    std::string m_specification;
    PreviewList m_resultList;
};

}  // namespace vantrel::dialogs
