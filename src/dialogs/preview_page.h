// SPDX-License-Identifier: MIT
// COpenPreviewPageDlg: the page "Preview" of the open dialog. Above, the raw
// cells of the first selected sheet; below, the same sheet as an import reads
// it. The reading is COpenPreview's; the page draws its two lists.
#pragma once

#include <string>

#include <QTableWidget>
#include <QWidget>

#include "dialogs/preview_reader.h"

class CGUIOpenDlg;

class COpenPreviewPageDlg : public QWidget {
    Q_OBJECT
public:
    explicit COpenPreviewPageDlg(QWidget *parent = nullptr);
    void OnInitDialog();
    // The dialog that refreshes the page when it is shown.
    void SetOwner(CGUIOpenDlg *owner) { m_owner = owner; }

    void SetPreviewSource(CExcelVantrel &bridge, const std::string &specification);
    void SetPreviewFile(const std::string &path, int32_t sheet, CGUIOpenDlg *owner);
    // Reads through the bridge and draws both lists; true if the lower list was filled.
    bool RefreshPreview();

    const vantrel::dialogs::COpenPreview &Preview() const { return m_preview; }
    QTableWidget *SheetListControl() const { return m_sheetList; }
    QTableWidget *ResultListControl() const { return m_resultList; }

protected:
    void showEvent(QShowEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void Draw(QTableWidget *control, const vantrel::dialogs::PreviewList &list);

    vantrel::dialogs::COpenPreview m_preview;
    QTableWidget *m_sheetList;
    QTableWidget *m_resultList;
    CGUIOpenDlg *m_owner = nullptr;
};
